// Reference-host handles for the editing tests: text in an encoding built
// and read back through the handle's own converters, descriptors positioned
// through the handle, and calls through the handle's slots.
#pragma once

#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <cstdint>
#include <cstring>
#include <random>
#include <string>
#include <vector>

namespace edit_test {

using Bytes = std::vector<uint8_t>;
using nlssm::refhost::PoolRegistry;

using test_support::handle;
using test_support::host;

// The prototypes of the operations, for calls through their slots.
using ReverseS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t);
using Reverse = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t);
using DeleteS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t);
using Delete = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t,
                           int64_t);
using DeleteLitS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                               int64_t);
using SubStr = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t, int64_t *,
                           int64_t);
using StripS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t);
using Strip = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int64_t);

template <typename Fn, typename... Args>
auto call(const NLSSMHandle *h, NLSSlot slot, Args... args) {
  return reinterpret_cast<Fn>(slot)(h, args...);
}

// Host characters (UTF-32LE) through one of the handle's converters; false
// when the converter reports a failure. Without a converter the text is
// taken as it is.
inline bool convert(void *converter, const Bytes &in, Bytes &out) {
  if (converter == nullptr) {
    out = in;
    return true;
  }
  out.assign(in.size() * 4 + 16, 0);
  uint64_t produced = 0;
  const int64_t status = reinterpret_cast<NLSHostConverterConvertFn>(
      NLSSM_HOST_SLOT(converter, NLSHOST_SLOT_CONVERTER_CONVERT))(
      converter, in.data(), in.size(), out.data(), out.size(), &produced, nullptr);
  out.resize(produced);
  return status == 0;
}

inline Bytes encode(const NLSSMHandle *h, const std::u32string &text) {
  Bytes units(text.size() * 4), out;
  for (size_t i = 0; i < text.size(); ++i)
    for (int k = 0; k < 4; ++k) units[i * 4 + k] = static_cast<uint8_t>(text[i] >> (8 * k));
  EXPECT_TRUE(convert(h->toConverter, units, out));
  return out;
}

// The characters of p[0, n), or false when they do not convert cleanly.
inline bool decode(const NLSSMHandle *h, const uint8_t *p, size_t n, std::u32string &text) {
  Bytes out;
  if (!convert(h->fromConverter, Bytes(p, p + n), out) || out.size() % 4 != 0) return false;
  text.clear();
  for (size_t i = 0; i < out.size(); i += 4) {
    const char32_t c = out[i] | out[i + 1] << 8 | out[i + 2] << 16 | char32_t(out[i + 3]) << 24;
    if (c == 0xFFFD || c == 0x1A) return false;
    text.push_back(c);
  }
  return true;
}

// Characters that survive a round trip through the encoding.
inline std::u32string repertoire(const NLSSMHandle *h) {
  std::u32string fits;
  for (char32_t c : std::u32string_view(
           U"AaZz09,.-\u00E9\u00C4\u00DF\u03A9\u0416\u3042\u30AB\u6F22\u5B57\uFF76\u4E00"
           U"\uAC00\u20AC\U0001F600\U00020B9F")) {
    std::u32string back;
    const Bytes b = encode(h, std::u32string(1, c));
    if (!b.empty() && decode(h, b.data(), b.size(), back) && back == std::u32string(1, c))
      fits.push_back(c);
  }
  return fits;
}

inline std::u32string random_text(std::mt19937 &rng, const std::u32string &from, size_t max) {
  std::u32string text(std::uniform_int_distribution<size_t>(0, max)(rng), U'A');
  for (char32_t &c : text) c = from[std::uniform_int_distribution<size_t>(0, from.size() - 1)(rng)];
  return text;
}

// A descriptor over bytes[0, length) with the given capacity, positioned at
// character `index` through the handle (unset when there is none).
inline NLSString at_char(const NLSSMHandle *h, Bytes &bytes, size_t length, int64_t index) {
  NLSString s{bytes.data(), length, bytes.size(), 0, length == 0 ? -9 : 0, -9, -1, 0, 0, 0};
  using SetPos = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);
  if (length != 0) call<SetPos>(h, h->stringSetPos, &s, index, int64_t{0});
  return s;
}

// The handle's pool holds no more allocations than when the watch began.
struct PoolWatch {
  const NLSSMHandle *h;
  int64_t start = PoolRegistry::counts_of(h->pool).allocations;
  bool balanced() const { return PoolRegistry::counts_of(h->pool).allocations == start; }
};

inline bool guard_intact(const Bytes &b, size_t from) {
  for (size_t i = from; i < b.size(); ++i)
    if (b[i] != 0xEE) return false;
  return true;
}

inline const int kEncodings[] = {29, 78, 20, 161, 25, 24, 26, 27, 130, 135, 134, 119, 205};

inline std::string encoding_name(const ::testing::TestParamInfo<int> &info) {
  return "enc" + std::to_string(info.param);
}

}  // namespace edit_test
