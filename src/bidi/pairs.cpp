// Lookups in the paired-bracket and mirror tables (sorted by character).
#include "bidi/pairs.hpp"

#include <algorithm>
#include <iterator>

namespace nlssm::bidi {

template <typename Entry, std::size_t N>
static const Entry *find(const Entry (&table)[N], uint32_t character) {
  const Entry *at = std::lower_bound(std::begin(table), std::end(table), character,
                                     [](const Entry &e, uint32_t c) { return e.character < c; });
  return at != std::end(table) && at->character == character ? at : nullptr;
}

uint32_t bracket_of(uint32_t character) {
  if (character == 0x2329) character = 0x3008;
  if (character == 0x232A) character = 0x3009;
  const PairedBracket *b = find(kPairedBrackets, character);
  if (b == nullptr) return 0;
  return bracket_word(b->type == kOpening ? b->character : b->pair, b->type);
}

uint32_t mirror_of(uint32_t character) {
  const MirrorPair *m = find(kMirrorPairs, character);
  return m == nullptr ? 0 : m->mirror;
}

}  // namespace nlssm::bidi
