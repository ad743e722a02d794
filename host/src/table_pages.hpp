// Single-byte code pages that ICU's data lacks, compiled into the host from
// their mappings, and the conversions through them.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace nlssm::refhost {

// One page: the character of every byte (0xFFFF: unassigned) and the byte
// that stands for a character the page lacks.
struct TablePage {
  const char *name;
  std::uint8_t substitute;
  char16_t toUnicode[256];
};

extern const TablePage kTablePages[];
extern const std::size_t kTablePageCount;

// Converter names of the form "table:<page>" or "table:<page>,swaplfnl" (the
// open-systems EBCDIC variant: line feed and next line change places).
inline constexpr std::string_view kTablePrefix = "table:";

// A page ready to convert: both directions, options applied.
class TableCodec {
 public:
  // Null when the name names no compiled page.
  static const TableCodec *find(std::string_view converterName);

  // Bytes -> UTF-16; an unassigned byte becomes U+001A.
  void decode(const std::uint8_t *source, std::size_t length, std::u16string &out) const;
  // UTF-16 -> bytes, one per character; a character the page lacks becomes
  // the substitute byte. A lone surrogate stops with false.
  bool encode(const std::u16string &text, std::string &out,
              std::vector<std::int32_t> &offsets) const;

 private:
  TableCodec(const TablePage &page, bool swapLfNl);
  char16_t toUnicode_[256];
  // (character, byte) of every assigned byte, by character; where two bytes
  // carry one character the lower byte writes it.
  std::vector<std::pair<char16_t, std::uint8_t>> fromUnicode_;
  std::uint8_t substitute_;
};

}  // namespace nlssm::refhost
