// The UTF-8 toolkit's lengths and positions: the sequence-length table and
// the byte length of a number of characters that the counting members use
// (both trust each first byte), and validation, the length in characters
// and the offset of a character (all three by Unicode's well-formedness
// rule, one character per ill-formed stretch).
#include <nlssm/nlssm.h>

#include "cursor/char_model.hpp"
#include "kernel/u8/utf8.hpp"

using nlssm::cursor::kUtf8FormLength;

extern "C" const uint8_t u8Length[256] = {
#define NLSSM_ROW(x) x, x, x, x, x, x, x, x, x, x, x, x, x, x, x, x
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(1),
    NLSSM_ROW(2),
    NLSSM_ROW(2),
    NLSSM_ROW(3),
#undef NLSSM_ROW
    4,
    4,
    4,
    4,
    4,
    4,
    4,
    4,
    5,
    5,
    5,
    5,
    6,
    6,
    6,
    6};

// Each character takes the length its first byte announces. A negative
// count measures up to the terminating zero byte; a character cut short by
// that zero ends there.
extern "C" int64_t qvzsu8ByteLength(const uint8_t *text, int64_t charCount) {
  if (text == nullptr) return 0;
  int64_t off = 0;
  if (charCount >= 0) {
    for (int64_t n = 0; n < charCount; ++n) off += u8Length[text[off]];
    return off;
  }
  while (text[off] != 0) {
    const int64_t end = off + u8Length[text[off]];
    ++off;
    while (off < end && text[off] != 0) ++off;
  }
  return off;
}

static_assert(kUtf8FormLength[0xBF] == 1 && kUtf8FormLength[0xC0] == 2 &&
              kUtf8FormLength[0xF8] == 5 && kUtf8FormLength[0xFC] == 6);

int64_t qvzsu8Validate(const uint8_t *text, int64_t byteLength) {
  if (byteLength < 0 || (text == nullptr && byteLength > 0)) return -1;
  if (byteLength == 0) return 0;
  return kernel::u8::valid_prefix(text, byteLength);
}

namespace {

// Characters in a well-formed stretch: its bytes that are not continuation
// bytes (10xxxxxx), eight at a time. Shifting a word left by one brings each
// byte's bit 6 to its bit 7, so a byte starts a character when bit 7 of
// ~word | word << 1 is set.
int64_t count_leads(const uint8_t *p, int64_t n) {
  constexpr uint64_t kHigh = 0x8080808080808080ull;
  int64_t count = 0;
  int64_t i = 0;
  for (; i + 8 <= n; i += 8) {
    uint64_t w;
    std::memcpy(&w, p + i, 8);
    count += static_cast<int64_t>(((((~w) | (w << 1)) & kHigh) >> 7) * 0x0101010101010101ull >> 56);
  }
  for (; i < n; ++i) count += static_cast<int8_t>(p[i]) > -65;
  return count;
}

}  // namespace

int64_t qvzsu8Length(const uint8_t *text, int64_t byteLength) {
  if (byteLength < 0 || (text == nullptr && byteLength > 0)) return -1;
  int64_t count = 0;
  int64_t off = 0;
  while (off < byteLength) {
    const int64_t valid = kernel::u8::valid_prefix(text + off, byteLength - off);
    count += count_leads(text + off, valid);
    off += valid;
    if (off < byteLength) {
      off += kernel::u8::step(text + off, byteLength - off).length;
      ++count;
    }
  }
  return count;
}

int64_t qvzsu8Offset(const uint8_t *text, int64_t byteLength, int64_t charIndex) {
  if (byteLength < 0 || charIndex < 0 || (text == nullptr && byteLength > 0)) return -1;
  int64_t off = 0;
  for (int64_t n = 0; n < charIndex; ++n) {
    if (off + 8 <= byteLength && charIndex - n >= 8 && kernel::u8::ascii_word(text + off)) {
      off += 8;
      n += 7;
      continue;
    }
    if (off >= byteLength) return -1;
    off += kernel::u8::step(text + off, byteLength - off).length;
  }
  return off;
}
