// Level resolution and reordering (UAX #9) over arrays of classes.
#include "bidi/uba.hpp"

#include <algorithm>

namespace nlssm::bidi {
namespace {

constexpr uint32_t kNoMatch = 0xFFFFFFFFu;
constexpr int kMaxDepth = 125;
constexpr int kBracketStackSize = 63;

bool removed_by_x9(uint8_t c) {
  return c == LRE || c == RLE || c == LRO || c == RLO || c == PDF || c == BN;
}
bool isolate_initiator(uint8_t c) {
  return c == LRI || c == RLI || c == FSI;
}
bool neutral_or_isolate(uint8_t c) {
  return c == B || c == S || c == WS || c == ON || isolate_initiator(c) || c == PDI;
}
// Strong direction of a resolved type for N0 and N1: numbers count as R.
uint8_t strong_of(uint8_t t) {
  if (t == L) return L;
  if (t == R || t == AL || t == EN || t == AN) return R;
  return ON;
}
uint8_t direction_of_level(int level) {
  return (level & 1) ? R : L;
}

struct Work {
  uint32_t *match;  // initiator -> matching PDI, PDI -> its initiator
  uint32_t *seq;    // positions of the isolating run sequence in hand
  uint32_t *runs;   // first and last position of each level run
  uint32_t *pairs;  // bracket pairs: opening and closing index into seq
  uint8_t *types;   // current type of each character
};

// BD9: matching PDIs of the isolate initiators in [begin, end).
void match_isolates(const uint8_t *classes, uint32_t begin, uint32_t end, Work &w) {
  uint32_t *stack = w.seq;  // free until the run sequences are built
  uint32_t depth = 0;
  for (uint32_t i = begin; i < end; ++i) {
    w.match[i] = kNoMatch;
    if (isolate_initiator(classes[i])) {
      stack[depth++] = i;
    } else if (classes[i] == PDI && depth > 0) {
      const uint32_t opener = stack[--depth];
      w.match[opener] = i;
      w.match[i] = opener;
    }
  }
}

// P2, P3 over [begin, end): 0 or 1 from the first strong character outside
// isolates, -1 when there is none.
int first_strong(const uint8_t *classes, const uint32_t *match, uint32_t begin, uint32_t end) {
  for (uint32_t i = begin; i < end; ++i) {
    const uint8_t c = classes[i];
    if (c == L) return 0;
    if (c == R || c == AL) return 1;
    if (isolate_initiator(c)) {
      if (match[i] == kNoMatch) return -1;
      i = match[i];
    }
  }
  return -1;
}

// X1-X8: explicit levels, with overridden types in w.types and the
// characters X9 removes marked BN.
void explicit_levels(const uint8_t *classes, uint32_t begin, uint32_t end, int paragraph,
                     uint8_t *levels, Work &w) {
  struct Entry {
    uint8_t level;
    uint8_t override;  // L, R, or ON for none
    bool isolate;
  };
  Entry stack[kMaxDepth + 2];
  int top = 0;
  stack[0] = {static_cast<uint8_t>(paragraph), ON, false};
  int overflowIsolates = 0, overflowEmbeddings = 0, validIsolates = 0;
  auto next_level = [&](bool rtl) {
    const int level = stack[top].level;
    return rtl ? (level + 1) | 1 : (level + 2) & ~1;
  };
  for (uint32_t i = begin; i < end; ++i) {
    const uint8_t c = classes[i];
    uint8_t type = c;
    switch (c) {
      case RLE:
      case LRE:
      case RLO:
      case LRO: {
        levels[i] = stack[top].level;
        type = BN;
        const int level = next_level(c == RLE || c == RLO);
        if (level <= kMaxDepth && overflowIsolates == 0 && overflowEmbeddings == 0) {
          const uint8_t override = c == RLO ? R : c == LRO ? L : ON;
          stack[++top] = {static_cast<uint8_t>(level), override, false};
        } else if (overflowIsolates == 0) {
          ++overflowEmbeddings;
        }
        break;
      }
      case RLI:
      case LRI:
      case FSI: {
        levels[i] = stack[top].level;
        if (stack[top].override != ON) type = stack[top].override;
        bool rtl = c == RLI;
        if (c == FSI) {
          const uint32_t stop = w.match[i] == kNoMatch ? end : w.match[i];
          rtl = first_strong(classes, w.match, i + 1, stop) == 1;
        }
        const int level = next_level(rtl);
        if (level <= kMaxDepth && overflowIsolates == 0 && overflowEmbeddings == 0) {
          ++validIsolates;
          stack[++top] = {static_cast<uint8_t>(level), ON, true};
        } else {
          ++overflowIsolates;
        }
        break;
      }
      case PDI:
        if (overflowIsolates > 0) {
          --overflowIsolates;
        } else if (validIsolates > 0) {
          overflowEmbeddings = 0;
          while (!stack[top].isolate) --top;
          --top;
          --validIsolates;
        }
        levels[i] = stack[top].level;
        if (stack[top].override != ON) type = stack[top].override;
        break;
      case PDF:
        if (overflowIsolates > 0) {
        } else if (overflowEmbeddings > 0) {
          --overflowEmbeddings;
        } else if (!stack[top].isolate && top > 0) {
          --top;
        }
        levels[i] = stack[top].level;
        type = BN;
        break;
      case B:
        levels[i] = static_cast<uint8_t>(paragraph);
        break;
      case BN:
        levels[i] = stack[top].level;
        break;
      default:
        levels[i] = stack[top].level;
        if (stack[top].override != ON) type = stack[top].override;
        break;
    }
    w.types[i] = type;
  }
}

// W1-W7 over one isolating run sequence, the rules that need nothing but
// the types before them merged into single passes.
void resolve_weak(const uint32_t *s, uint32_t len, uint8_t sos, uint8_t *t) {
  // W1-W3: `previous` is the type W1 gave the character before, `strong`
  // the last L, R or AL after W1.
  uint8_t previous = sos, strong = sos;
  for (uint32_t k = 0; k < len; ++k) {
    uint8_t type = t[s[k]];
    if (type == NSM) type = isolate_initiator(previous) || previous == PDI ? uint8_t{ON} : previous;
    previous = type;
    if (type == L || type == R || type == AL) strong = type;
    if (type == EN && strong == AL) type = AN;
    if (type == AL) type = R;
    t[s[k]] = type;
  }
  for (uint32_t k = 1; k + 1 < len; ++k) {  // W4
    uint8_t &type = t[s[k]];
    const uint8_t before = t[s[k - 1]], after = t[s[k + 1]];
    if (type == ES && before == EN && after == EN) type = EN;
    if (type == CS && before == after && (before == EN || before == AN)) type = before;
  }
  for (uint32_t k = 0; k < len;) {  // W5
    if (t[s[k]] != ET) {
      ++k;
      continue;
    }
    uint32_t j = k;
    while (j < len && t[s[j]] == ET) ++j;
    if ((k > 0 && t[s[k - 1]] == EN) || (j < len && t[s[j]] == EN))
      for (uint32_t m = k; m < j; ++m) t[s[m]] = EN;
    k = j;
  }
  strong = sos;
  for (uint32_t k = 0; k < len; ++k) {  // W6, W7
    uint8_t &type = t[s[k]];
    if (type == ES || type == ET || type == CS) type = ON;
    if (type == L || type == R) strong = type;
    if (type == EN && strong == L) type = L;
  }
}

// N0: paired brackets of one isolating run sequence.
void resolve_brackets(const uint32_t *s, uint32_t len, uint8_t sos, uint8_t embedding,
                      const uint8_t *classes, const uint32_t *brackets, uint8_t *t,
                      uint32_t *pairs) {
  struct Open {
    uint32_t id;
    uint32_t k;
  };
  Open stack[kBracketStackSize];
  int depth = 0;
  uint32_t count = 0;
  for (uint32_t k = 0; k < len; ++k) {  // BD16
    const uint32_t word = brackets[s[k]];
    if (word == 0 || t[s[k]] != ON) continue;
    if (word & kOpeningBracket) {
      if (depth == kBracketStackSize) break;
      stack[depth++] = {word >> 2, k};
      continue;
    }
    for (int d = depth - 1; d >= 0; --d) {
      if (stack[d].id != word >> 2) continue;
      pairs[2 * count] = stack[d].k;
      pairs[2 * count + 1] = k;
      ++count;
      depth = d;
      break;
    }
  }
  // Pairs in the order of their opening brackets.
  auto *byOpening = reinterpret_cast<uint64_t *>(pairs);
  for (uint32_t p = 0; p < count; ++p)
    byOpening[p] = uint64_t{pairs[2 * p]} << 32 | pairs[2 * p + 1];
  std::sort(byOpening, byOpening + count);
  for (uint32_t p = 0; p < count; ++p) {
    const auto open = static_cast<uint32_t>(byOpening[p] >> 32);
    const auto close = static_cast<uint32_t>(byOpening[p]);
    bool embeddingInside = false, oppositeInside = false;
    for (uint32_t k = open + 1; k < close && !embeddingInside; ++k) {
      const uint8_t d = strong_of(t[s[k]]);
      if (d == embedding)
        embeddingInside = true;
      else if (d != ON)
        oppositeInside = true;
    }
    uint8_t direction;
    if (embeddingInside) {
      direction = embedding;
    } else if (oppositeInside) {
      uint8_t context = sos;
      for (uint32_t k = open; k-- > 0;) {
        const uint8_t d = strong_of(t[s[k]]);
        if (d != ON) {
          context = d;
          break;
        }
      }
      direction = context != embedding ? context : embedding;
    } else {
      continue;
    }
    for (const uint32_t at : {open, close}) {
      t[s[at]] = direction;
      for (uint32_t k = at + 1; k < len && classes[s[k]] == NSM; ++k) t[s[k]] = direction;
    }
  }
}

// N1, N2, I1, I2 over one isolating run sequence.
void resolve_neutral_and_implicit(const uint32_t *s, uint32_t len, uint8_t sos, uint8_t eos,
                                  uint8_t embedding, uint8_t *t, uint8_t *levels) {
  for (uint32_t k = 0; k < len;) {
    if (!neutral_or_isolate(t[s[k]])) {
      ++k;
      continue;
    }
    uint32_t j = k;
    while (j < len && neutral_or_isolate(t[s[j]])) ++j;
    const uint8_t before = k == 0 ? sos : strong_of(t[s[k - 1]]);
    const uint8_t after = j == len ? eos : strong_of(t[s[j]]);
    const uint8_t direction = before == after ? before : embedding;
    for (uint32_t m = k; m < j; ++m) t[s[m]] = direction;
    k = j;
  }
  for (uint32_t k = 0; k < len; ++k) {
    uint8_t &level = levels[s[k]];
    const uint8_t type = t[s[k]];
    if ((level & 1) == 0) {
      if (type == R)
        level += 1;
      else if (type == AN || type == EN)
        level += 2;
    } else if (type == L || type == EN || type == AN) {
      level += 1;
    }
  }
}

// X10 and the rules after it, for the paragraph [begin, end).
void resolve_sequences(const Line &line, uint32_t begin, uint32_t end, int paragraph,
                       uint8_t *levels, Work &w) {
  uint8_t *t = w.types;
  // Level runs over the characters X9 keeps: first and last position and
  // embedding level of each (sos and eos read the embedding levels of the
  // neighbouring runs, which resolving earlier sequences has since raised).
  uint32_t runCount = 0;
  int runLevel = -1;
  for (uint32_t i = begin; i < end; ++i) {
    if (t[i] == BN) continue;
    if (levels[i] != runLevel) {
      runLevel = levels[i];
      w.runs[3 * runCount] = i;
      w.runs[3 * runCount + 2] = static_cast<uint32_t>(runLevel);
      ++runCount;
    }
    w.runs[3 * runCount - 2] = i;
  }
  auto run_starting_at = [&](uint32_t position) {
    uint32_t lo = 0, hi = runCount;
    while (hi - lo > 1) {
      const uint32_t mid = (lo + hi) / 2;
      (w.runs[3 * mid] <= position ? lo : hi) = mid;
    }
    return lo;
  };
  auto run_level = [&](uint32_t run) { return static_cast<int>(w.runs[3 * run + 2]); };
  for (uint32_t r = 0; r < runCount; ++r) {
    const uint32_t first = w.runs[3 * r];
    if (line.classes[first] == PDI && w.match[first] != kNoMatch) continue;  // continues a sequence
    // BD13: the run, and the runs its isolate initiators resume at their PDIs.
    uint32_t len = 0, run = r;
    for (;;) {
      for (uint32_t i = w.runs[3 * run]; i <= w.runs[3 * run + 1]; ++i)
        if (t[i] != BN) w.seq[len++] = i;
      const uint32_t last = w.runs[3 * run + 1];
      if (!isolate_initiator(line.classes[last]) || w.match[last] == kNoMatch) break;
      const uint32_t resumed = run_starting_at(w.match[last]);
      if (w.runs[3 * resumed] != w.match[last]) break;
      run = resumed;
    }
    const int level = run_level(r);
    const uint32_t last = w.seq[len - 1];
    const int before = r == 0 ? paragraph : run_level(r - 1);
    const int after = isolate_initiator(line.classes[last]) || run + 1 == runCount
                          ? paragraph
                          : run_level(run + 1);
    const uint8_t sos = direction_of_level(std::max(level, before));
    const uint8_t eos = direction_of_level(std::max(level, after));
    const uint8_t embedding = direction_of_level(level);
    resolve_weak(w.seq, len, sos, t);
    if (line.brackets != nullptr)
      resolve_brackets(w.seq, len, sos, embedding, line.classes, line.brackets, t, w.pairs);
    resolve_neutral_and_implicit(w.seq, len, sos, eos, embedding, t, levels);
  }
  // Removed characters take the level of the character before them.
  for (uint32_t i = begin; i < end; ++i)
    if (t[i] == BN) levels[i] = i == begin ? static_cast<uint8_t>(paragraph) : levels[i - 1];
  // L1: separators, and the white space before them and at the line's end.
  bool reset = true;
  for (uint32_t i = end; i-- > begin;) {
    const uint8_t c = line.classes[i];
    if (c == S || c == B) {
      levels[i] = static_cast<uint8_t>(paragraph);
      reset = true;
    } else if (reset && (c == WS || isolate_initiator(c) || c == PDI || removed_by_x9(c))) {
      levels[i] = static_cast<uint8_t>(paragraph);
    } else {
      reset = false;
    }
  }
}

// L2: reverses every run at each level from the highest down to the lowest
// odd one.
void reverse_levels(const uint8_t *levels, uint32_t begin, uint32_t end, uint32_t *order) {
  uint8_t highest = 0, lowestOdd = 0xFF;
  for (uint32_t i = begin; i < end; ++i) {
    order[i] = i;
    highest = std::max(highest, levels[i]);
    if (levels[i] & 1) lowestOdd = std::min(lowestOdd, levels[i]);
  }
  for (int level = highest; level >= lowestOdd && level > 0; --level) {
    for (uint32_t v = begin; v < end;) {
      if (levels[order[v]] < level) {
        ++v;
        continue;
      }
      uint32_t j = v;
      while (j < end && levels[order[j]] >= level) ++j;
      std::reverse(order + v, order + j);
      v = j;
    }
  }
}

}  // namespace

int resolve(const Line &line, int direction, uint8_t *levels, uint32_t *order, void *work) {
  const uint32_t n = line.n;
  auto *words = static_cast<uint32_t *>(work);
  // The pairs are sorted as 64-bit words: they start at an even word.
  Work w{words, words + n, words + 2 * n, words + 5 * n + (n & 1) + 2,
         reinterpret_cast<uint8_t *>(words + 7 * n + 4)};
  int firstLevel = -1;
  for (uint32_t begin = 0; begin < n;) {
    uint32_t end = begin;
    while (end < n && line.classes[end] != B) ++end;
    if (end < n) ++end;  // the separator belongs to its paragraph
    match_isolates(line.classes, begin, end, w);
    int paragraph = direction == 0 || direction == 1 ? direction : -1;
    if (paragraph < 0) paragraph = std::max(0, first_strong(line.classes, w.match, begin, end));
    if (firstLevel < 0) firstLevel = paragraph;
    explicit_levels(line.classes, begin, end, paragraph, levels, w);
    resolve_sequences(line, begin, end, paragraph, levels, w);
    reverse_levels(levels, begin, end, order);
    begin = end;
  }
  if (firstLevel < 0) firstLevel = direction == 1 ? 1 : 0;
  return firstLevel;
}

}  // namespace nlssm::bidi
