#include "rules.hpp"

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

}  // namespace catgen
