// Code pages through ICU, and the tab-separated data files that name them.
// Shared by the catalogue generator and the catalogue tests.
#ifndef NLSSM_CATGEN_CODEPAGE_HPP
#define NLSSM_CATGEN_CODEPAGE_HPP

#include <unicode/ucnv.h>
#include <unicode/umachine.h>

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

namespace catgen {

using TsvRow = std::vector<std::string>;

// Rows of a tab-separated file; '#' lines and empty lines are skipped. Throws
// std::runtime_error when the file cannot be read or a row has fewer than
// `minFields` fields.
std::vector<TsvRow> read_tsv(const std::string &path, size_t minFields);

// One code page. Conversions start from the page's initial state each time
// and use round-trip mappings only when encoding.
class CodePage {
 public:
  // `cnvDir` holds converters built from data/catalogue/ucm; a name with a
  // file there is opened from it, any other name from ICU's data. Throws
  // std::runtime_error when the page cannot be opened.
  CodePage(const std::string &name, const std::string &cnvDir);
  ~CodePage();
  CodePage(const CodePage &) = delete;
  CodePage &operator=(const CodePage &) = delete;

  const std::string &name() const { return name_; }
  // The character that `bytes` decode to, or -1 when they are not exactly
  // one character of the page.
  UChar32 decode(const std::string &bytes) const;
  UChar32 decode_byte(uint8_t byte) const { return decode(std::string(1, char(byte))); }
  // The bytes that write `c`, or "" when the page has no round-trip mapping
  // for it (the bytes must decode back to `c`).
  std::string encode(UChar32 c) const;
  // The single byte that writes `c`, or -1.
  int encode_byte(UChar32 c) const;

 private:
  std::string name_;
  UConverter *cnv_ = nullptr;
};

}  // namespace catgen

#endif  // NLSSM_CATGEN_CODEPAGE_HPP
