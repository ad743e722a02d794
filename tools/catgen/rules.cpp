#include "rules.hpp"

#include <sstream>
#include <stdexcept>

#include <unicode/uchar.h>

namespace catgen {

namespace {

bool is_printable(int8_t category) {
  switch (category) {
    case U_CONTROL_CHAR:
    case U_FORMAT_CHAR:
    case U_SURROGATE:
    case U_PRIVATE_USE_CHAR:
    case U_UNASSIGNED:
    case U_SPACE_SEPARATOR:
    case U_LINE_SEPARATOR:
    case U_PARAGRAPH_SEPARATOR:
      return false;
    default:
      return true;
  }
}

}  // namespace

uint8_t class_bits(UChar32 c) {
  const int8_t category = u_charType(c);
  uint8_t bits = 0;
  if (u_hasBinaryProperty(c, UCHAR_UPPERCASE) ||
      (category == U_LOWERCASE_LETTER && u_toupper(c) == c)) {
    bits |= 0x01;
  }
  if (u_hasBinaryProperty(c, UCHAR_LOWERCASE)) bits |= 0x02;
  if (category == U_DECIMAL_DIGIT_NUMBER) bits |= 0x04;
  if (u_hasBinaryProperty(c, UCHAR_WHITE_SPACE) &&
      u_getIntPropertyValue(c, UCHAR_DECOMPOSITION_TYPE) != U_DT_NOBREAK) {
    bits |= 0x08;
  }
  if (is_printable(category) && !u_hasBinaryProperty(c, UCHAR_ALPHABETIC) &&
      category != U_DECIMAL_DIGIT_NUMBER) {
    bits |= 0x10;
  }
  if (category == U_SPACE_SEPARATOR) bits |= 0x20;
  if (category == U_CONTROL_CHAR || category == U_FORMAT_CHAR) bits |= 0x40;
  if (u_hasBinaryProperty(c, UCHAR_ASCII_HEX_DIGIT)) bits |= 0x80;
  return bits;
}

uint32_t bidi_category(UChar32 c) {
  if (u_charType(c) == U_UNASSIGNED) return 0xFFFFFFFFu;
  switch (u_charDirection(c)) {
    case U_LEFT_TO_RIGHT:
      return 0;
    case U_RIGHT_TO_LEFT:
      return 3;
    case U_RIGHT_TO_LEFT_ARABIC:
      return 4;
    case U_EUROPEAN_NUMBER:
      return 8;
    case U_EUROPEAN_NUMBER_TERMINATOR:
      return c < 0x80 ? 110 : 10;
    case U_COMMON_NUMBER_SEPARATOR:
      return c < 0x80 ? 112 : 12;
    case U_WHITE_SPACE_NEUTRAL:
      return 17;
    default:
      return 0xFFFFFFFFu;
  }
}

bool bidi_reorder_keeps(UChar32 c, uint32_t category) {
  return category == 3 || category == 4 || (c >= 0x20 && c <= 0x7E);
}

std::vector<BidiByteClass> family_bidi_classes(bool ebcdic) {
  constexpr uint32_t L = 0, EN = 8, WS = 17, AsciiET = 110, AsciiCS = 112;
  if (ebcdic) {
    return {{0x40, 0x40, WS}, {0x0C, 0x0C, WS}, {0xF0, 0xF9, EN}, {0xC1, 0xC9, L}, {0xD1, 0xD9, L},
            {0xE2, 0xE9, L},  {0x81, 0x89, L},  {0x91, 0x99, L},  {0xA2, 0xA9, L}};
  }
  return {{' ', ' ', WS},      {0x0C, 0x0C, WS},    {'0', '9', EN},
          {'A', 'Z', L},       {'a', 'z', L},       {'#', '%', AsciiET},
          {',', ',', AsciiCS}, {'.', '/', AsciiCS}, {':', ':', AsciiCS}};
}

std::vector<BidiByteClass> parse_bidi_classes(const std::string &text) {
  std::vector<BidiByteClass> classes;
  const size_t colon = text.rfind(':');
  if (text.empty()) return classes;
  if (colon == std::string::npos)
    throw std::runtime_error("bidi classes without category: " + text);
  const auto category = static_cast<uint32_t>(std::stoul(text.substr(colon + 1)));
  std::stringstream runs(text.substr(0, colon));
  for (std::string run; runs >> run;) {
    const size_t dash = run.find('-');
    const int first = std::stoi(run.substr(0, dash), nullptr, 16);
    const int last =
        dash == std::string::npos ? first : std::stoi(run.substr(dash + 1), nullptr, 16);
    if (first < 0 || last > 255 || first > last) throw std::runtime_error("bad bidi run " + run);
    classes.push_back({first, last, category});
  }
  return classes;
}

}  // namespace catgen
