// Paired brackets and mirror images of the Unicode character database, for
// the reordering of UTF text (generated into pair_data.cpp).
#pragma once

#include <cstdint>

#include "bidi/uba.hpp"

namespace nlssm::bidi {

enum BracketType : uint8_t { kOpening = kOpeningBracket, kClosing = kClosingBracket };

struct PairedBracket {
  uint32_t character;
  uint32_t pair;  // the bracket that closes or opens it
  BracketType type;
};
struct MirrorPair {
  uint32_t character;
  uint32_t mirror;
};

extern const PairedBracket kPairedBrackets[128];
extern const MirrorPair kMirrorPairs[428];

// The bracket word of a character (uba.hpp), its pair known by the opening
// bracket's code point. U+2329 and U+232A pair as their canonical
// equivalents U+3008 and U+3009.
uint32_t bracket_of(uint32_t character);
// The mirror image of a character, or 0 when it has none.
uint32_t mirror_of(uint32_t character);

}  // namespace nlssm::bidi
