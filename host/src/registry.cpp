// The encoding registry: the rows of data/encodings.tsv (compiled in), each
// turned into the encoding record the describe service hands out.
#include <unicode/ucnv.h>

#include <algorithm>
#include <cctype>
#include <cstring>
#include <sstream>
#include <string>

#include "nlssm/reference_host.hpp"
#include "table_pages.hpp"

namespace nlssm::refhost {

extern const char kRegistryText[];

namespace {

constexpr int kEncodingCount = 265;

std::vector<std::string> split(const std::string &line, char separator) {
  std::vector<std::string> fields;
  std::string field;
  std::istringstream in(line);
  while (std::getline(in, field, separator)) fields.push_back(field);
  return fields;
}

unsigned hex_value(const std::string &text) {
  return std::stoul(text, nullptr, 16);
}

// "81-9F,E0-FC" into (low, high) byte pairs ended by a zero pair.
void fill_ranges(const std::string &text, std::uint8_t *out, std::size_t size) {
  std::memset(out, 0, size);
  if (text == "-") return;
  std::size_t at = 0;
  for (const std::string &range : split(text, ',')) {
    if (at + 2 >= size) throw std::runtime_error("too many byte ranges: " + text);
    out[at++] = static_cast<std::uint8_t>(hex_value(range.substr(0, 2)));
    out[at++] = static_cast<std::uint8_t>(hex_value(range.substr(3, 2)));
  }
}

// Hex digits for bytes in text order ("0E", "1B2442").
std::size_t fill_bytes(const std::string &text, std::uint8_t *out, std::size_t size) {
  std::memset(out, 0, size);
  if (text == "-") return 0;
  std::size_t n = text.size() / 2;
  if (n > size) throw std::runtime_error("byte sequence too long: " + text);
  for (std::size_t i = 0; i < n; ++i)
    out[i] = static_cast<std::uint8_t>(hex_value(text.substr(2 * i, 2)));
  return n;
}

void copy_text(char *out, std::size_t size, const std::string &text) {
  std::memset(out, 0, size);
  std::memcpy(out, text.data(), std::min(size - 1, text.size()));
}

// Whether this ICU build has the converter (with its options, if any).
bool icu_has(const std::string &name) {
  UErrorCode status = U_ZERO_ERROR;
  UConverter *converter = ucnv_open(name.c_str(), &status);
  if (converter != nullptr) ucnv_close(converter);
  return U_SUCCESS(status) && status != U_AMBIGUOUS_ALIAS_WARNING;
}

int max_char_bytes(const EncodingInfo &info) {
  if (info.converter.rfind("builtin:", 0) == 0) return 5;
  if (info.converter.rfind(kTablePrefix, 0) == 0) return 1;
  UErrorCode status = U_ZERO_ERROR;
  UConverter *converter = ucnv_open(info.converter.c_str(), &status);
  if (converter == nullptr) return 0;
  int n = ucnv_getMaxCharSize(converter);
  ucnv_close(converter);
  return n;
}

EncodingInfo parse_row(const std::vector<std::string> &f) {
  EncodingInfo info;
  info.number = std::stoi(f[0]);
  info.name = f[1];
  info.aliases = f[2] == "-" ? "" : f[2];
  info.tableSet = f[3];
  info.converter = f[8];
  info.title = f[15];
  if (f[4] == "-") {
    info.reason = info.name == "-" ? "no encoding" : "no converter";
    return info;
  }
  info.encodingClass = std::stoi(f[4]);
  info.ascii = f[5] == "A";
  info.blankValue = hex_value(f[6]);
  info.numberForm = std::stoi(f[7]);
  const bool compiled = info.converter.rfind(kTablePrefix, 0) == 0;
  if (compiled ? TableCodec::find(info.converter) == nullptr
               : info.converter.rfind("builtin:", 0) != 0 && !icu_has(info.converter)) {
    info.reason = "no converter";
    return info;
  }
  info.described = true;

  NLSHostEncodingRecord &r = info.record;
  r.number = static_cast<std::uint32_t>(info.number);
  r.encodingClass = static_cast<std::uint32_t>(info.encodingClass);
  r.encodingFlags = info.ascii ? NLSHOST_ENCODING_ASCII : 0;
  r.blankValue = info.blankValue;
  r.maxCharBytes = static_cast<std::uint32_t>(max_char_bytes(info));
  r.numberForm = static_cast<std::int8_t>(info.numberForm);
  copy_text(r.converterName, sizeof r.converterName, info.converter);
  if (info.name.size() > std::size(r.name)) throw std::runtime_error("name too long: " + info.name);
  for (std::size_t i = 0; i < info.name.size(); ++i)
    r.name[i] = static_cast<unsigned char>(info.name[i]);
  r.nameLength = info.name.size();
  copy_text(r.aliases, sizeof r.aliases, info.aliases);
  copy_text(r.title, sizeof r.title, info.title);
  NLSHostCharRanges &ranges = r.charRanges;
  r.charRanges.shiftLength = static_cast<std::uint16_t>(std::stoi(f[9]));
  fill_bytes(f[10], ranges.shiftOut, sizeof ranges.shiftOut);
  fill_bytes(f[11], ranges.shiftIn, sizeof ranges.shiftIn);
  fill_ranges(f[12], ranges.leadRanges, sizeof ranges.leadRanges);
  fill_ranges(f[13], ranges.trailRanges, sizeof ranges.trailRanges);
  fill_bytes(f[14], ranges.dbcsSpace, sizeof ranges.dbcsSpace);
  return info;
}

bool same_name(std::string_view a, std::string_view b) {
  return a.size() == b.size() && std::equal(a.begin(), a.end(), b.begin(), [](char x, char y) {
           return std::tolower(static_cast<unsigned char>(x)) ==
                  std::tolower(static_cast<unsigned char>(y));
         });
}

}  // namespace

Registry::Registry() {
  std::istringstream in{std::string(kRegistryText)};
  std::string line;
  while (std::getline(in, line)) {
    if (line.empty() || line[0] == '#') continue;
    std::vector<std::string> fields = split(line, '\t');
    if (fields.size() != 16) throw std::runtime_error("registry row needs 16 fields: " + line);
    EncodingInfo info = parse_row(fields);
    if (info.number != std::ssize(rows_)) throw std::runtime_error("registry rows out of order");
    rows_.push_back(std::move(info));
  }
  if (rows_.size() != kEncodingCount) throw std::runtime_error("registry needs 265 rows");
}

const Registry &Registry::instance() {
  static const Registry registry;
  return registry;
}

const EncodingInfo *Registry::find(std::int64_t number) const {
  if (number < 0 || number >= std::ssize(rows_)) return nullptr;
  return &rows_[static_cast<std::size_t>(number)];
}

int Registry::lookup(std::string_view name) const {
  for (const EncodingInfo &row : rows_) {
    if (row.name == "-") continue;
    if (same_name(row.name, name)) return row.number == 19 ? 25 : row.number;
    for (const std::string &alias : split(row.aliases, ','))
      if (same_name(alias, name)) return row.number;
  }
  return -1;
}

}  // namespace nlssm::refhost
