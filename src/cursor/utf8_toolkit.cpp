// The UTF-8 toolkit's length pieces that the counting members use: the
// sequence-length table and the byte length of a number of characters.
#include <nlssm/nlssm.h>

#include "cursor/char_model.hpp"

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
