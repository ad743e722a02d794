// Reference-host handles and guarded buffers for the writing edits.
#pragma once

#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <algorithm>
#include <cstdint>
#include <ostream>
#include <string>
#include <vector>

namespace editmove_test {

using test_support::handle;
using test_support::host;

template <typename Fn>
Fn slot(NLSSlot s) {
  return reinterpret_cast<Fn>(s);
}

inline std::vector<uint8_t> bytes(const std::string &s) {
  return {s.begin(), s.end()};
}

constexpr uint8_t kGuard = 0xEE;
constexpr int64_t kGuardBytes = 8;

// A destination of `room` bytes with guard bytes on both sides.
struct Guarded {
  std::vector<uint8_t> all;
  int64_t room;
  explicit Guarded(int64_t room, uint8_t fill = 0xAA) : all(kGuardBytes, kGuard), room(room) {
    all.resize(static_cast<size_t>(kGuardBytes + room), fill);
    all.resize(all.size() + kGuardBytes, kGuard);
  }
  uint8_t *data() { return all.data() + kGuardBytes; }
  std::vector<uint8_t> text(int64_t n) const {
    return {all.begin() + kGuardBytes, all.begin() + kGuardBytes + n};
  }
  bool intact() const {
    auto guard = [](uint8_t b) { return b == kGuard; };
    return std::all_of(all.begin(), all.begin() + kGuardBytes, guard) &&
           std::all_of(all.end() - kGuardBytes, all.end(), guard);
  }
};

// The handle's blank repeated over `n` bytes.
inline std::vector<uint8_t> blanks(const NLSSMHandle *h, int64_t n) {
  std::vector<uint8_t> out;
  while (static_cast<int64_t>(out.size()) < n)
    out.insert(out.end(), h->blankChar, h->blankChar + h->blankWidth);
  return out;
}

inline std::vector<uint8_t> cat(std::vector<uint8_t> a, const std::vector<uint8_t> &b) {
  a.insert(a.end(), b.begin(), b.end());
  return a;
}

// What an edit answered: its status, a count it stored, the bytes it left.
struct Result {
  int64_t status, count;
  std::vector<uint8_t> out;
  bool operator==(const Result &) const = default;
};
inline void PrintTo(const Result &r, std::ostream *os) {
  *os << std::hex << r.status << std::dec << " count " << r.count << " out "
      << ::testing::PrintToString(r.out);
}
constexpr int64_t kShort = NLSSM_E_DEST_TOO_SMALL;

// A descriptor over `p` whose current character is at byte `at`.
inline NLSString over(uint8_t *p, int64_t length, int64_t capacity, int64_t at) {
  NLSString s{};
  s.buffer = p;
  s.length = static_cast<uint64_t>(length);
  s.capacity = static_cast<uint64_t>(capacity);
  s.charIndex = s.curOffset = at;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  return s;
}

// Text in a handle's encoding, by the host's converter of that encoding.
std::vector<uint8_t> encode(int encoding, const std::u16string &text);

}  // namespace editmove_test
