// Reference-host handles for the number tests, numbers written in each
// handle's number form, and calls through slots 29-32.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <cstdint>
#include <cstring>
#include <string>

namespace numtest {

// One host for the whole test program: the module keeps the host's service
// object in a global.
using test_support::handle;
using test_support::host;

// SBCS ASCII and EBCDIC, UTF-8, UTF-EBCDIC, UTF-16 BE and LE, UTF-32 BE, the
// host's characters, EUC-JP (non-modal) and IBM-937 (modal EBCDIC).
inline constexpr int kEncodings[] = {29, 78, 20, 161, 24, 25, 26, 27, 134, 117};

// Bytes per character of a number in the handle's encoding: wide classes
// hold one character per 4-byte unit.
inline int64_t unit_bytes(const NLSSMHandle *h) {
  return h->encodingClass == NLSSM_CLASS_WCS2 || h->encodingClass == NLSSM_CLASS_WCS4 ? 4 : 1;
}

// EBCDIC (code page 037) for the characters the tests write.
inline uint8_t ebcdic(char c) {
  static const std::string kAscii = "0123456789abcdefghijklmnopqrstuvwxyz -+.,*E'?";
  static const uint8_t kEbcdic[] = {
      0xF0, 0xF1, 0xF2, 0xF3, 0xF4, 0xF5, 0xF6, 0xF7, 0xF8, 0xF9, 0x81, 0x82, 0x83, 0x84, 0x85,
      0x86, 0x87, 0x88, 0x89, 0x91, 0x92, 0x93, 0x94, 0x95, 0x96, 0x97, 0x98, 0x99, 0xA2, 0xA3,
      0xA4, 0xA5, 0xA6, 0xA7, 0xA8, 0xA9, 0x40, 0x60, 0x4E, 0x4B, 0x6B, 0x5C, 0xC5, 0x7D, 0x6F};
  const size_t at = kAscii.find(c);
  return at == std::string::npos ? 0 : kEbcdic[at];  // NUL stays NUL
}

// A number text (ASCII characters) in the handle's number form: bytes for
// ASCII- and EBCDIC-based encodings; 4-byte units for the wide classes, as
// host characters (27), byte-reversed (26), or with the bytes of each 16-bit
// half reversed (UTF-16 encodings).
inline std::string encode(const NLSSMHandle *h, const std::string &ascii) {
  std::string out;
  for (char c : ascii) {
    if (unit_bytes(h) == 4) {
      if (h->encodingNumber == NLSSM_ENC_HOST_CHARS)
        out.append({c, 0, 0, 0});
      else
        out.append(h->encodingClass == NLSSM_CLASS_WCS4 ? std::string{0, 0, 0, c}
                                                        : std::string{0, c, 0, 0});
    } else {
      out.push_back((h->encodingFlags & 1u) ? c : static_cast<char>(ebcdic(c)));
    }
  }
  return out;
}

using ToIntmax = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, uint32_t,
                             int64_t *, int32_t *);
using ToDouble = int64_t (*)(const NLSSMHandle *, void *, const void *, int64_t, int64_t, uint32_t,
                             double *, int32_t *);
using FromIntmax = int64_t (*)(const NLSSMHandle *, void *, int64_t, int64_t, uint32_t, void *,
                               int64_t, int32_t *);
using FromDouble = int64_t (*)(const NLSSMHandle *, void *, double, int64_t, int64_t, uint32_t,
                               void *, int64_t, int32_t *);

inline int64_t to_intmax(const NLSSMHandle *h, const std::string &text, uint32_t flags,
                         int64_t &value, int32_t &consumed) {
  return reinterpret_cast<ToIntmax>(h->NLSStringToIntmax)(h, nullptr, text.data(), std::ssize(text),
                                                          flags, &value, &consumed);
}
inline int64_t to_double(const NLSSMHandle *h, const std::string &text, double &value,
                         int32_t &consumed, uint32_t options = 0) {
  return reinterpret_cast<ToDouble>(h->NLSStringToDouble)(h, nullptr, text.data(), std::ssize(text),
                                                          0, options, &value, &consumed);
}
inline int64_t from_intmax(const NLSSMHandle *h, int64_t value, int64_t width, uint32_t flags,
                           std::string &out, int64_t capacity, void *locale = nullptr) {
  char buffer[160];
  int32_t written = -1;
  const int64_t status = reinterpret_cast<FromIntmax>(h->NLSStringFromIntmax)(
      h, locale, value, width, flags, buffer, capacity, &written);
  out.assign(buffer, written < 0 ? 0 : written);
  return status;
}
inline int64_t from_double(const NLSSMHandle *h, double value, int64_t width, int64_t decimals,
                           uint32_t flags, std::string &out, int64_t capacity,
                           void *locale = nullptr) {
  char buffer[160];
  int32_t written = -1;
  const int64_t status = reinterpret_cast<FromDouble>(h->NLSStringFromDouble)(
      h, locale, value, width, decimals, flags, buffer, capacity, &written);
  out.assign(buffer, written < 0 ? 0 : written);
  return status;
}

}  // namespace numtest
