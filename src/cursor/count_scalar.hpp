// The exact byte-by-byte counting rules of every class. The vector kernels
// only speed up the common case and hand anything unusual back to these.
#pragma once

#include <cstdint>

#include "cursor/char_model.hpp"

namespace nlssm::cursor {

struct Counted {
  int64_t chars;
  int64_t status;
};

// UTF-8 (kUtfe false) or UTF-EBCDIC: a lead byte opens a sequence of the
// length its form announces, continuation bytes close it. A continuation
// byte nobody expects, a sequence cut short by a new lead byte or by the end
// of the text, and (UTF-EBCDIC) an unused lead byte are broken: they set
// the status and count as one character unless `flags` asks to skip them.
// Resumable: feed() may be called piece by piece; `expect` is 0 exactly at
// a point where no sequence is open.
template <bool kUtfe>
struct UtfCounter {
  int64_t chars = 0;
  int64_t status = 0;
  int expect = 0;
  bool count_broken;

  explicit UtfCounter(int64_t flags) : count_broken((flags & kSkipBroken) == 0) {}

  void broken() {
    status = kBadCharacter;
    chars += count_broken;
  }
  void feed(const uint8_t *p, int64_t n) {
    for (int64_t i = 0; i < n; ++i) {
      const uint8_t b = p[i];
      if (kUtfe ? utfe_trailing(b) : utf8_continuation(b)) {
        if (expect == 0) {
          broken();
        } else if (--expect == 0) {
          ++chars;
        }
        continue;
      }
      if (expect > 0) {
        broken();
        expect = 0;
      }
      const int length = kUtfe ? kSkipUtfe[b] : kUtf8FormLength[b];
      if (length == 0) {
        broken();
      } else if (length == 1) {
        ++chars;
      } else {
        expect = length - 1;
      }
    }
  }
  Counted finish() {
    if (expect > 0) broken();
    expect = 0;
    return {chars, status};
  }
};

template <bool kUtfe>
Counted count_utf_exact(const uint8_t *p, int64_t n, int64_t flags) {
  UtfCounter<kUtfe> counter(flags);
  counter.feed(p, n);
  return counter.finish();
}

// Two-byte units: a high surrogate followed by a low surrogate is one
// character; a trailing odd byte is not a unit.
template <bool kBig>
int64_t count_wcs2_exact(const uint8_t *p, int64_t n) {
  using M = Wcs2Model<kBig>;
  const int64_t units = n / 2;
  int64_t chars = 0;
  for (int64_t i = 0; i < units; ++i, ++chars)
    if (i + 1 < units && M::high(M::unit_at(p + 2 * i)) && M::low(M::unit_at(p + 2 * i + 2))) ++i;
  return chars;
}

// Any model with broken units (double-byte, EUC, GB18030, modal): a broken
// unit sets the status and counts as a one-byte character, or, when `flags`
// asks to skip it, is stepped over as a pair and not counted. `state` is the
// modal shift state at p.
template <class M>
Counted count_model_exact(const M &m, const uint8_t *p, int64_t n, int64_t flags,
                          uint32_t state = kModalSingle) {
  const bool skip_broken = (flags & kSkipBroken) != 0;
  int64_t chars = 0;
  int64_t status = 0;
  int64_t off = 0;
  for (;;) {
    m.skip_shifts(p, off, n, state);
    if (off >= n) break;
    const Unit u = m.unit(p + off, n - off, state);
    if (u.broken) {
      status = kBadCharacter;
      if (skip_broken) {
        off += 2;
        continue;
      }
      off += 1;
    } else {
      state = m.kind(u.size, state);
      off += u.size;
    }
    ++chars;
  }
  return {chars, status};
}

}  // namespace nlssm::cursor
