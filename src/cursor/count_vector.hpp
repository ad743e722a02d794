// Vector kernels for the counting hot paths. Each measures the longest
// prefix of a text that it can vouch for (well-formed, ending on a
// character start with no sequence open) and leaves the rest, and anything
// unusual, to the exact byte-by-byte rules.
#pragma once

#include <cstdint>

namespace nlssm::cursor::simd {

enum class Isa : int { kScalar = 0, kSse2 = 1, kAvx2 = 2 };

// The widest instruction set this processor runs.
Isa best_isa();

// A measured prefix: `bytes` from the start, holding `chars` characters.
struct Prefix {
  int64_t bytes;
  int64_t chars;
};

// Up to four byte ranges that make up a set of byte values (the lead or
// trail flags of a double-byte code page).
struct ByteRanges {
  int count = 0;
  uint8_t low[4] = {};
  uint8_t span[4] = {};  // high - low
  // False when the flagged bytes need more than four ranges.
  bool from_flags(const uint8_t *flags, uint8_t bit);
};

// Every kernel reads only bytes [0, n) and stops before `limit` characters
// would be exceeded; with a limit it reads only bytes that belong to the
// first `limit` characters, so n may be unknown (INT64_MAX) when the caller
// guarantees the text holds that many characters.

// UTF-8: a structurally well-formed prefix; its characters are its
// non-continuation bytes.
Prefix utf8_prefix(Isa isa, const uint8_t *p, int64_t n, int64_t limit);
// Two-byte units (n in bytes): surrogate pairs count once. Always exact.
Prefix wcs2_prefix(Isa isa, const uint8_t *p, int64_t n, int64_t limit, bool big_endian);
// Double-byte code pages: a prefix in which every lead byte at a character
// start is followed by a valid trail byte.
Prefix dbcs_prefix(Isa isa, const uint8_t *p, int64_t n, int64_t limit, const ByteRanges &lead,
                   const ByteRanges &trail);

}  // namespace nlssm::cursor::simd
