// Level resolution and reordering of one line of bidirectional text, after
// the Unicode Bidirectional Algorithm (UAX #9): paragraph level (P2, P3),
// explicit embeddings, overrides and isolates (X1-X10), weak types (W1-W7),
// paired brackets (N0), neutrals (N1, N2), implicit levels (I1, I2), the
// line's trailing white space (L1) and the reversal of levels (L2). The
// caller supplies each character's class and bracket word; characters are
// positions 0..n-1 in logical order.
#pragma once

#include <cstddef>
#include <cstdint>

namespace nlssm::bidi {

// Bidirectional classes in the host's numbering (NLSHOST_BIDI_*).
enum Class : uint8_t {
  L = 0,
  LRE,
  LRO,
  R,
  AL,
  RLE,
  RLO,
  PDF,
  EN,
  ES,
  ET,
  AN,
  CS,
  NSM,
  BN,
  B,
  S,
  WS,
  ON,
  LRI,
  RLI,
  FSI,
  PDI,
  kClassCount
};

// Paragraph direction requested by a caller: 0 left-to-right, 1
// right-to-left, anything else from the first strong character (P2, P3).
inline constexpr int kDirectionFromText = 2;

// Bytes of work area that resolve() needs for n characters.
constexpr std::size_t work_bytes(std::size_t n) {
  return n * 30 + 64;
}

// Bracket word of a character: 0 when it is no paired bracket, else an id
// that the two brackets of a pair share, shifted left by 2, or'ed with
// kOpeningBracket or kClosingBracket.
inline constexpr uint32_t kOpeningBracket = 1;
inline constexpr uint32_t kClosingBracket = 2;
constexpr uint32_t bracket_word(uint32_t id, uint32_t kind) {
  return id << 2 | kind;
}

struct Line {
  const uint8_t *classes;    // n classes
  const uint32_t *brackets;  // n bracket words, or null: no brackets
  uint32_t n;
};

// Resolves the levels of every character (levels[n]) and the visual order
// (order[v] = logical position shown at visual position v). A paragraph
// separator (B) ends a paragraph: each paragraph takes its own level (the
// requested one, or its own first strong character) and is reordered on its
// own. Characters that the algorithm removes (embedding controls, BN) keep
// the level of the character before them. Returns the level of the first
// paragraph (0 or 1). `work` holds work_bytes(n) bytes, 8-byte aligned.
int resolve(const Line &line, int direction, uint8_t *levels, uint32_t *order, void *work);

}  // namespace nlssm::bidi
