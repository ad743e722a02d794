// How the catalogue derives its per-character data from Unicode properties.
#ifndef NLSSM_CATGEN_RULES_HPP
#define NLSSM_CATGEN_RULES_HPP

#include <unicode/umachine.h>

#include <cstdint>
#include <string>
#include <vector>

namespace catgen {

// Class bits of a character, with the bit values of the <set>_ccl tables:
// 0x01 upper case: Uppercase, or a lower-case letter (Ll) that has no
//      upper-case form of its own (sharp s), which serves as both cases
// 0x02 lower case: Lowercase (so also the ordinal indicators)
// 0x04 decimal digit: Nd
// 0x08 white space: White_Space except the no-break spaces
// 0x10 punctuation: printable, neither Alphabetic nor Nd
// 0x20 blank: space separators (Zs)
// 0x40 control: Cc and Cf
// 0x80 hexadecimal digit: ASCII_Hex_Digit
uint8_t class_bits(UChar32 c);

// Bidirectional category in the catalogue's numbering (kBidi* in
// src/catalogue/catalogue.hpp): L, R, AL, EN, ET, CS and WS keep their
// classes, ASCII ET and CS characters are offset by 100, and every other
// class, like an unassigned character, has none.
uint32_t bidi_category(UChar32 c);

// Whether the reduced second table keeps the category: the letters of the
// right-to-left scripts and the printable ASCII characters.
bool bidi_reorder_keeps(UChar32 c, uint32_t category);

// A run of bytes that a single-byte bidirectional table gives a fixed
// category, whatever the code page's mapping derives for them.
struct BidiByteClass {
  int first, last;
  uint32_t category;
};

// The classes every table of a family carries at that family's positions:
// letters, digits, blank and form feed, and in ASCII tables the number
// terminators and separators of ASCII.
std::vector<BidiByteClass> family_bidi_classes(bool ebcdic);

// Extra classes of one table, written in bidi_tables.tsv as space-separated
// runs of hexadecimal bytes with their category: "41-49 51-59 71:3".
std::vector<BidiByteClass> parse_bidi_classes(const std::string &text);

}  // namespace catgen

#endif  // NLSSM_CATGEN_RULES_HPP
