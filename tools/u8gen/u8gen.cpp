// u8gen: writes src/kernel/u8/case_tables.cpp, the UTF-8 toolkit's case
// tables, from ICU's simple mappings (u_toupper, u_tolower, u_foldCase) and
// its full, language-independent mappings of each code point on its own
// (u_strToUpper and u_strToLower in the root locale, u_strFoldCase).
//
//   u8gen --out DIR
#include <unicode/uchar.h>
#include <unicode/ustring.h>
#include <unicode/utf16.h>

#include <cstdio>
#include <cstring>
#include <fstream>
#include <map>
#include <string>
#include <tuple>
#include <vector>

#include "../../src/kernel/u8/case_tables.hpp"

namespace {

using kernel::u8::CaseRecord;
using kernel::u8::kCaseBlockShift;
using kernel::u8::kCaseBlockSize;
using kernel::u8::kCaseFullMax;
using kernel::u8::kCaseLimit;

enum class Kind { upper, lower, fold };

std::string utf8_of(const UChar *text, int32_t length) {
  char out[64];
  int32_t n = 0;
  UErrorCode ec = U_ZERO_ERROR;
  u_strToUTF8(out, sizeof out, &n, text, length, &ec);
  if (U_FAILURE(ec)) {
    std::fprintf(stderr, "u8gen: u_strToUTF8: %s\n", u_errorName(ec));
    std::exit(1);
  }
  return std::string(out, static_cast<size_t>(n));
}

std::string utf8_of(UChar32 c) {
  UChar text[2];
  int32_t n = 0;
  U16_APPEND_UNSAFE(text, n, c);
  return utf8_of(text, n);
}

std::string full_mapping(UChar32 c, Kind kind) {
  UChar src[2];
  int32_t n = 0;
  U16_APPEND_UNSAFE(src, n, c);
  UChar dst[32];
  UErrorCode ec = U_ZERO_ERROR;
  int32_t length = 0;
  switch (kind) {
    case Kind::upper:
      length = u_strToUpper(dst, 32, src, n, "", &ec);
      break;
    case Kind::lower:
      length = u_strToLower(dst, 32, src, n, "", &ec);
      break;
    case Kind::fold:
      length = u_strFoldCase(dst, 32, src, n, U_FOLD_CASE_DEFAULT, &ec);
      break;
  }
  if (U_FAILURE(ec)) {
    std::fprintf(stderr, "u8gen: full case mapping of U+%04X: %s\n", c, u_errorName(ec));
    std::exit(1);
  }
  return utf8_of(dst, length);
}

struct RecordOrder {
  bool operator()(const CaseRecord &a, const CaseRecord &b) const {
    return std::tie(a.upper, a.lower, a.fold, a.fullUpper, a.fullLower, a.fullFold) <
           std::tie(b.upper, b.lower, b.fold, b.fullUpper, b.fullLower, b.fullFold);
  }
};

struct Tables {
  std::string fullText{'\0'};  // offset 0 stands for "no full mapping"
  std::map<std::string, uint16_t> fullOffsets;
  std::vector<CaseRecord> records{CaseRecord{}};  // record 0: no mapping
  std::map<CaseRecord, uint16_t, RecordOrder> recordNumbers{{CaseRecord{}, 0}};
  std::vector<uint16_t> recordIndex;
  std::map<std::vector<uint16_t>, uint16_t> blockNumbers;
  std::vector<uint16_t> blockIndex;

  // The offset of a full mapping, or 0 when it is the simple mapping.
  uint16_t full(UChar32 c, Kind kind, UChar32 simple) {
    const std::string text = full_mapping(c, kind);
    if (text == utf8_of(simple)) return 0;
    if (text.size() > static_cast<size_t>(kCaseFullMax)) {
      std::fprintf(stderr, "u8gen: full mapping of U+%04X is too long\n", c);
      std::exit(1);
    }
    auto [it, added] = fullOffsets.emplace(text, static_cast<uint16_t>(fullText.size()));
    if (added) {
      fullText.push_back(static_cast<char>(text.size()));
      fullText += text;
    }
    return it->second;
  }

  uint16_t record_of(UChar32 c) {
    if (U_IS_SURROGATE(c)) return 0;
    const UChar32 up = u_toupper(c), low = u_tolower(c), fold = u_foldCase(c, U_FOLD_CASE_DEFAULT);
    const CaseRecord r{up - c,
                       low - c,
                       fold - c,
                       full(c, Kind::upper, up),
                       full(c, Kind::lower, low),
                       full(c, Kind::fold, fold)};
    auto [it, added] = recordNumbers.emplace(r, static_cast<uint16_t>(records.size()));
    if (added) records.push_back(r);
    return it->second;
  }

  void build() {
    for (UChar32 base = 0; base < static_cast<UChar32>(kCaseLimit); base += kCaseBlockSize) {
      std::vector<uint16_t> block;
      for (UChar32 c = base; c < base + static_cast<UChar32>(kCaseBlockSize); ++c)
        block.push_back(record_of(c));
      auto [it, added] = blockNumbers.emplace(block, static_cast<uint16_t>(blockNumbers.size()));
      if (added) recordIndex.insert(recordIndex.end(), block.begin(), block.end());
      blockIndex.push_back(it->second);
    }
    for (UChar32 c = kCaseLimit; c <= 0x10FFFF; ++c) {
      if (record_of(c) != 0) {
        std::fprintf(stderr, "u8gen: U+%04X has a case mapping above the table's limit\n", c);
        std::exit(1);
      }
    }
  }
};

template <typename T, typename Format>
void write_array(std::ofstream &out, const char *decl, const std::vector<T> &values, int perLine,
                 Format format) {
  out << decl << " = {";
  for (size_t i = 0; i < values.size(); ++i) {
    out << (i % perLine == 0 ? "\n    " : " ") << format(values[i]) << ",";
  }
  out << "\n};\n\n";
}

}  // namespace

int main(int argc, char **argv) {
  if (argc != 3 || std::strcmp(argv[1], "--out") != 0) {
    std::fprintf(stderr, "usage: u8gen --out DIR\n");
    return 2;
  }
  Tables tables;
  tables.build();

  const std::string path = std::string(argv[2]) + "/case_tables.cpp";
  std::ofstream out(path, std::ios::binary);
  out << "// Generated by tools/u8gen from ICU's case mappings (Unicode " << U_UNICODE_VERSION
      << ").\n"
         "// Do not edit: change the generator and build the regenerate_u8_case_tables\n"
         "// target.\n"
         "// clang-format off\n"
         "#include \"kernel/u8/case_tables.hpp\"\n\n"
         "namespace kernel::u8 {\n\n";
  auto num = [](auto v) { return std::to_string(v); };
  write_array(out, "const uint16_t kCaseBlockIndex[kCaseLimit >> kCaseBlockShift]",
              tables.blockIndex, 16, num);
  write_array(out, "const uint16_t kCaseRecordIndex[]", tables.recordIndex, 16, num);
  write_array(out, "const CaseRecord kCaseRecords[]", tables.records, 2, [](const CaseRecord &r) {
    return "{" + std::to_string(r.upper) + ", " + std::to_string(r.lower) + ", " +
           std::to_string(r.fold) + ", " + std::to_string(r.fullUpper) + ", " +
           std::to_string(r.fullLower) + ", " + std::to_string(r.fullFold) + "}";
  });
  std::vector<uint8_t> text(tables.fullText.begin(), tables.fullText.end());
  write_array(out, "const uint8_t kCaseFullText[]", text, 16, [](uint8_t b) {
    char hex[8];
    std::snprintf(hex, sizeof hex, "0x%02X", b);
    return std::string(hex);
  });
  out << "}  // namespace kernel::u8\n";
  out.close();
  if (!out) {
    std::fprintf(stderr, "u8gen: cannot write %s\n", path.c_str());
    return 1;
  }
  std::printf("u8gen: %zu blocks, %zu records, %zu bytes of full mappings\n",
              tables.blockNumbers.size(), tables.records.size(), tables.fullText.size());
  return 0;
}
