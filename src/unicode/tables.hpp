// Constant tables of the UTF codecs, computed at compile time from the rules
// of each encoding form. All are internal to the module (not exported data).
#pragma once

#include <array>
#include <cstdint>

namespace nlssm::unicode {

namespace detail {

template <typename T, typename Fn>
constexpr std::array<T, 256> by_byte(Fn rule) {
  std::array<T, 256> table{};
  for (unsigned b = 0; b < 256; ++b) table[b] = static_cast<T>(rule(b));
  return table;
}

}  // namespace detail

// 1 for a byte that may start a well-formed UTF-8 sequence.
inline constexpr std::array<uint8_t, 256> valid_1st_utf8 =
    detail::by_byte<uint8_t>([](unsigned b) { return b < 0x80 || (b >= 0xC2 && b <= 0xF4); });

// 1 for a UTF-8 continuation byte.
inline constexpr std::array<uint8_t, 256> valid_2nd_utf8 =
    detail::by_byte<uint8_t>([](unsigned b) { return b >= 0x80 && b <= 0xBF; });

// Payload bits of a lead byte, by sequence length.
inline constexpr std::array<uint16_t, 7> utf8_mask = {0, 0x7F, 0x1F, 0x0F, 0x07, 0x03, 0x01};

namespace kit {
// Sequence length announced by a lead byte (1 for ASCII and for continuation
// bytes); read by the one-character decoders.
inline constexpr std::array<uint8_t, 256> bytesFromUTF8 = detail::by_byte<uint8_t>([](unsigned b) {
  return b < 0xC0 ? 1 : b < 0xE0 ? 2 : b < 0xF0 ? 3 : b < 0xF8 ? 4 : b < 0xFC ? 5 : 6;
});
}  // namespace kit

namespace bound {
// Trailing-byte count announced by a lead byte; read by the handle-bound
// converters, which hand the whole sequence to the host transcoder.
inline constexpr std::array<uint8_t, 256> bytesFromUTF8 =
    detail::by_byte<uint8_t>([](unsigned b) { return kit::bytesFromUTF8[b] - 1; });
}  // namespace bound

// ---- UTF-EBCDIC -------------------------------------------------------------
// UTF-EBCDIC is I8 (UTF-8 modified so that U+0000..U+009F stay single bytes)
// passed through a byte permutation. The permutation puts the 160 single-byte
// I8 values where EBCDIC code page 1047 keeps those characters (with LF at
// 0x15 and NEL at 0x25, the line-end layout of EBCDIC systems), and gives the
// 96 multi-byte I8 values 0xA0..0xFF the remaining byte values in ascending
// order.
namespace detail {

// Code point held by each EBCDIC byte 0x00..0x3F: the 64 control positions.
inline constexpr uint8_t kEbcdicControls[64] = {
    0x00, 0x01, 0x02, 0x03, 0x9C, 0x09, 0x86, 0x7F, 0x97, 0x8D, 0x8E, 0x0B, 0x0C, 0x0D, 0x0E, 0x0F,
    0x10, 0x11, 0x12, 0x13, 0x9D, 0x0A, 0x08, 0x87, 0x18, 0x19, 0x92, 0x8F, 0x1C, 0x1D, 0x1E, 0x1F,
    0x80, 0x81, 0x82, 0x83, 0x84, 0x85, 0x17, 0x1B, 0x88, 0x89, 0x8A, 0x8B, 0x8C, 0x05, 0x06, 0x07,
    0x90, 0x91, 0x16, 0x93, 0x94, 0x95, 0x96, 0x04, 0x98, 0x99, 0x9A, 0x9B, 0x14, 0x15, 0x9E, 0x1A};
// The 65th control, U+009F, sits at 0xFF.
inline constexpr uint8_t kEbcdicLastControlByte = 0xFF;

// ASCII punctuation and the EBCDIC byte of each (space, digits and letters
// follow the regular EBCDIC runs and are computed).
struct Placed {
  char ascii;
  uint8_t ebcdic;
};
inline constexpr Placed kEbcdicPunctuation[] = {
    {'.', 0x4B}, {'<', 0x4C}, {'(', 0x4D},  {'+', 0x4E}, {'|', 0x4F}, {'&', 0x50}, {'!', 0x5A},
    {'$', 0x5B}, {'*', 0x5C}, {')', 0x5D},  {';', 0x5E}, {'^', 0x5F}, {'-', 0x60}, {'/', 0x61},
    {',', 0x6B}, {'%', 0x6C}, {'_', 0x6D},  {'>', 0x6E}, {'?', 0x6F}, {'`', 0x79}, {':', 0x7A},
    {'#', 0x7B}, {'@', 0x7C}, {'\'', 0x7D}, {'=', 0x7E}, {'"', 0x7F}, {'~', 0xA1}, {'[', 0xAD},
    {']', 0xBD}, {'{', 0xC0}, {'}', 0xD0},  {'\\', 0xE0}};

struct I8Permutation {
  std::array<uint8_t, 256> to_utfe{};
  std::array<uint8_t, 256> to_i8{};
  bool complete = false;  // every I8 byte placed exactly once
};

constexpr I8Permutation make_i8_permutation() {
  I8Permutation p;
  std::array<bool, 256> byte_taken{};
  std::array<bool, 256> i8_placed{};
  bool clash = false;
  auto place = [&](unsigned i8, unsigned ebcdic) {
    clash = clash || byte_taken[ebcdic] || i8_placed[i8];
    p.to_utfe[i8] = static_cast<uint8_t>(ebcdic);
    byte_taken[ebcdic] = i8_placed[i8] = true;
  };
  for (unsigned e = 0; e < 64; ++e) place(kEbcdicControls[e], e);
  place(0x9F, kEbcdicLastControlByte);
  place(' ', 0x40);
  for (unsigned d = 0; d < 10; ++d) place('0' + d, 0xF0 + d);
  // Letters come in three runs: a-i, j-r, s-z; capitals 0x40 higher.
  for (unsigned l = 0; l < 26; ++l) {
    const unsigned e = l < 9 ? 0x81 + l : l < 18 ? 0x91 + (l - 9) : 0xA2 + (l - 18);
    place('a' + l, e);
    place('A' + l, e + 0x40);
  }
  for (const Placed &q : kEbcdicPunctuation) place(static_cast<unsigned>(q.ascii), q.ebcdic);
  unsigned next = 0;
  for (unsigned i8 = 0xA0; i8 < 0x100; ++i8) {
    while (next < 256 && byte_taken[next]) ++next;
    if (next == 256) return p;
    place(i8, next);
  }
  for (unsigned i8 = 0; i8 < 256; ++i8) p.to_i8[p.to_utfe[i8]] = static_cast<uint8_t>(i8);
  bool all = !clash;
  for (unsigned i = 0; i < 256; ++i) all = all && i8_placed[i] && byte_taken[i];
  p.complete = all;
  return p;
}

inline constexpr I8Permutation kI8Permutation = make_i8_permutation();
static_assert(kI8Permutation.complete, "the I8/UTF-EBCDIC mapping must be a permutation");

}  // namespace detail

// UTF-EBCDIC byte -> I8 byte, and its inverse.
inline constexpr std::array<uint8_t, 256> utfe_i8s = detail::kI8Permutation.to_i8;
inline constexpr std::array<uint8_t, 256> i8s_utfe = detail::kI8Permutation.to_utfe;

static_assert(utfe_i8s[0x40] == 0x20 && utfe_i8s[0x41] == 0xA0 && utfe_i8s[0xC1] == 0x41 &&
              utfe_i8s[0xF0] == 0x30 && utfe_i8s[0xFF] == 0x9F && utfe_i8s[0x15] == 0x0A);

// Trailing-byte count announced by an I8 byte; -1 for a trailing byte
// (0xA0..0xBF) and for the unused leads 0xFA..0xFF.
inline constexpr std::array<int32_t, 256> bytesFromI8S = detail::by_byte<int32_t>([](unsigned b) {
  return b < 0xA0   ? 0
         : b < 0xC0 ? -1
         : b < 0xE0 ? 1
         : b < 0xF0 ? 2
         : b < 0xF8 ? 3
         : b < 0xFA ? 4
                    : -1;
});

// Bytes of the UTF-8 form of a code point in the wide (up to six-byte)
// scheme, and of its UTF-EBCDIC form; the handle-bound encoders size the
// host's output with these.
constexpr int64_t utf8_wide_length(uint32_t c) {
  return c < 0x80 ? 1 : c < 0x800 ? 2 : c < 0x10000 ? 3 : c < 0x200000 ? 4 : c < 0x4000000 ? 5 : 6;
}
constexpr int64_t utfe_length(uint32_t c) {
  return c < 0xA0 ? 1 : c < 0x400 ? 2 : c < 0x4000 ? 3 : c < 0x40000 ? 4 : 5;
}

}  // namespace nlssm::unicode
