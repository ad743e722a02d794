// The NLS object's six UTF transcoders. The intermediate form is UTF-16 in
// the host's byte order; code points are 32-bit values in the host's order.
// Each converts a whole buffer: ill-formed input stops it with what came
// before written, and a short destination stops it before the first
// character that does not fit.
#include <unicode/utf16.h>
#include <unicode/utf8.h>

#include <cstring>

#include "internal.hpp"
#include "utf_ebcdic.hpp"

namespace nlssm::refhost {

namespace {

// Runs `step` over the source until it ends or fails. A step reads at
// `source + at`, writes its character's bytes into `buffer` (at most 8) and
// returns the status; `used` gets the source units consumed.
template <typename Step>
std::int64_t drive(const void *source, std::uint64_t sourceBytes, void *destination,
                   std::uint64_t capacity, std::uint64_t *produced, Step step) {
  if (produced != nullptr) *produced = 0;
  if ((source == nullptr && sourceBytes != 0) || (destination == nullptr && capacity != 0))
    return NLSHOST_E_NULL;
  const auto *in = static_cast<const std::uint8_t *>(source);
  auto *out = static_cast<std::uint8_t *>(destination);
  std::uint64_t at = 0;
  std::uint64_t written = 0;
  std::int64_t status = 0;
  while (at < sourceBytes) {
    std::uint8_t buffer[8];
    std::size_t bytes = 0;
    std::size_t used = 0;
    status = step(in + at, sourceBytes - at, buffer, bytes, used);
    if (status != 0) break;
    if (written + bytes > capacity) {
      status = NLSHOST_E_TOO_SMALL;
      break;
    }
    std::memcpy(out + written, buffer, bytes);
    written += bytes;
    at += used;
  }
  if (produced != nullptr) *produced = written;
  return status;
}

// One UTF-16 character (host order) from the source; 0 or a status.
std::int64_t read_utf16(const std::uint8_t *in, std::uint64_t left, std::uint32_t &c,
                        std::size_t &used) {
  if (left < 2) return NLSHOST_E_TRUNCATED;
  std::uint16_t unit;
  std::memcpy(&unit, in, 2);
  used = 2;
  if (U16_IS_TRAIL(unit)) return NLSHOST_E_ILL_FORMED;
  if (U16_IS_LEAD(unit)) {
    if (left < 4) return NLSHOST_E_TRUNCATED;
    std::uint16_t trail;
    std::memcpy(&trail, in + 2, 2);
    if (!U16_IS_TRAIL(trail)) return NLSHOST_E_ILL_FORMED;
    c = U16_GET_SUPPLEMENTARY(unit, trail);
    used = 4;
    return 0;
  }
  c = unit;
  return 0;
}

std::size_t write_utf16(std::uint32_t c, std::uint8_t *out) {
  if (c <= 0xFFFF) {
    const auto unit = static_cast<std::uint16_t>(c);
    std::memcpy(out, &unit, 2);
    return 2;
  }
  const std::uint16_t units[2] = {static_cast<std::uint16_t>(U16_LEAD(c)),
                                  static_cast<std::uint16_t>(U16_TRAIL(c))};
  std::memcpy(out, units, 4);
  return 4;
}

bool is_scalar(std::uint32_t c) {
  return c <= 0x10FFFF && !U_IS_SURROGATE(c);
}

}  // namespace

std::int64_t intermediate_to_code_point(void *, const void *source, std::uint64_t sourceBytes,
                                        void *destination, std::uint64_t capacity,
                                        std::uint64_t *produced, void *, void *) {
  return drive(source, sourceBytes, destination, capacity, produced,
               [](const std::uint8_t *in, std::uint64_t left, std::uint8_t *out, std::size_t &bytes,
                  std::size_t &used) -> std::int64_t {
                 std::uint32_t c = 0;
                 if (std::int64_t status = read_utf16(in, left, c, used)) return status;
                 std::memcpy(out, &c, 4);
                 bytes = 4;
                 return 0;
               });
}

std::int64_t code_point_to_intermediate(void *, const void *source, std::uint64_t sourceBytes,
                                        void *destination, std::uint64_t capacity,
                                        std::uint64_t *produced, void *, void *) {
  return drive(source, sourceBytes, destination, capacity, produced,
               [](const std::uint8_t *in, std::uint64_t left, std::uint8_t *out, std::size_t &bytes,
                  std::size_t &used) -> std::int64_t {
                 if (left < 4) return NLSHOST_E_TRUNCATED;
                 std::uint32_t c;
                 std::memcpy(&c, in, 4);
                 if (!is_scalar(c)) return NLSHOST_E_ILL_FORMED;
                 bytes = write_utf16(c, out);
                 used = 4;
                 return 0;
               });
}

std::int64_t intermediate_to_utf8(void *, const void *source, std::uint64_t sourceBytes,
                                  void *destination, std::uint64_t capacity,
                                  std::uint64_t *produced, void *, void *) {
  return drive(source, sourceBytes, destination, capacity, produced,
               [](const std::uint8_t *in, std::uint64_t left, std::uint8_t *out, std::size_t &bytes,
                  std::size_t &used) -> std::int64_t {
                 std::uint32_t c = 0;
                 if (std::int64_t status = read_utf16(in, left, c, used)) return status;
                 std::size_t n = 0;
                 U8_APPEND_UNSAFE(out, n, c);
                 bytes = n;
                 return 0;
               });
}

std::int64_t utf8_to_intermediate(void *, const void *source, std::uint64_t sourceBytes,
                                  void *destination, std::uint64_t capacity,
                                  std::uint64_t *produced, void *, void *) {
  return drive(source, sourceBytes, destination, capacity, produced,
               [](const std::uint8_t *in, std::uint64_t left, std::uint8_t *out, std::size_t &bytes,
                  std::size_t &used) -> std::int64_t {
                 const auto length = static_cast<std::int32_t>(left < 8 ? left : 8);
                 std::int32_t at = 0;
                 UChar32 c;
                 U8_NEXT(in, at, length, c);
                 used = static_cast<std::size_t>(at);
                 if (c < 0) {
                   // A valid beginning cut off by the end of the text is truncated.
                   const int expected = 1 + U8_COUNT_TRAIL_BYTES(in[0]);
                   return expected > 1 && at == length && expected > length ? NLSHOST_E_TRUNCATED
                                                                            : NLSHOST_E_ILL_FORMED;
                 }
                 bytes = write_utf16(static_cast<std::uint32_t>(c), out);
                 return 0;
               });
}

std::int64_t intermediate_to_utfe(void *, const void *source, std::uint64_t sourceBytes,
                                  void *destination, std::uint64_t capacity,
                                  std::uint64_t *produced, void *, void *) {
  return drive(source, sourceBytes, destination, capacity, produced,
               [](const std::uint8_t *in, std::uint64_t left, std::uint8_t *out, std::size_t &bytes,
                  std::size_t &used) -> std::int64_t {
                 std::uint32_t c = 0;
                 if (std::int64_t status = read_utf16(in, left, c, used)) return status;
                 utfe::encode(c, out);
                 bytes = static_cast<std::size_t>(utfe::encoded_length(c));
                 return 0;
               });
}

std::int64_t utfe_to_intermediate(void *, const void *source, std::uint64_t sourceBytes,
                                  void *destination, std::uint64_t capacity,
                                  std::uint64_t *produced, void *, void *) {
  return drive(source, sourceBytes, destination, capacity, produced,
               [](const std::uint8_t *in, std::uint64_t left, std::uint8_t *out, std::size_t &bytes,
                  std::size_t &used) -> std::int64_t {
                 std::uint32_t c = 0;
                 if (std::int64_t status = utfe::decode_status(in, left, c, used)) return status;
                 bytes = write_utf16(c, out);
                 return 0;
               });
}

}  // namespace nlssm::refhost
