// Reference-host handles and guarded buffers for the writing edits.
#pragma once

#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

namespace editmove_test {

inline nlssm::refhost::ReferenceHost &host() {
  static auto started = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  return *started;
}

inline const NLSSMHandle *handle(int encoding) {
  NLSSMHandle *h = nullptr;
  EXPECT_EQ(host().create_handle(encoding, &h), 0) << encoding;
  return h;
}

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

// Text in a handle's encoding, by the host's converter of that encoding.
std::vector<uint8_t> encode(int encoding, const std::u16string &text);

}  // namespace editmove_test
