// NLSGetBaseDirection: whether a text reads right-to-left, decided by its
// first strong character.
#include <nlssm/nlssm.h>

#include <cstdint>

#include "bidi/host_classes.hpp"
#include "catalogue/catalogue.hpp"
#include "cursor/char_model.hpp"

namespace nlssm::bidi {
namespace {

enum class Decision { kGoOn, kLeftToRight, kRightToLeft };

// Category 0 (L) ends the scan left-to-right, 3 (R) and 4 (AL)
// right-to-left; anything else, and a character without a category, is
// passed over.
Decision decide(int64_t category) {
  if (category == catalogue::kBidiL) return Decision::kLeftToRight;
  if (category == catalogue::kBidiR || category == catalogue::kBidiAL)
    return Decision::kRightToLeft;
  return Decision::kGoOn;
}

// The answer before any character is read, and for text that is not
// scanned: left-to-right.
int64_t left_to_right(uint8_t *direction) {
  if (direction == nullptr) return NLSSM_E_NULL_ARGUMENT;
  *direction = 0;
  return NLSSM_OK;
}

// Feeds the categories of a text's characters, in order, to the decision
// rule. `next(offset, category)` answers the offset after the character
// at `offset` and its category, or a negative offset for malformed text.
template <typename Next>
int64_t scan(const uint8_t *text, int64_t length, uint8_t *direction, Next next) {
  if (const int64_t status = left_to_right(direction); status != NLSSM_OK || length <= 0)
    return status;
  if (text == nullptr) return NLSSM_E_NULL_ARGUMENT;
  for (int64_t offset = 0; offset < length;) {
    int64_t category = -1;
    const int64_t after = next(offset, category);
    if (after < 0) return NLSSM_E_BAD_CHARACTER;
    switch (decide(category)) {
      case Decision::kLeftToRight:
        return NLSSM_OK;
      case Decision::kRightToLeft:
        *direction = 1;
        return NLSSM_OK;
      case Decision::kGoOn:
        break;
    }
    offset = after;
  }
  return NLSSM_OK;
}

uint32_t unit16(const uint8_t *p, bool little) {
  return little ? uint32_t{p[0]} | uint32_t{p[1]} << 8 : uint32_t{p[0]} << 8 | p[1];
}
uint32_t unit32(const uint8_t *p, bool little) {
  return little ? uint32_t{p[0]} | uint32_t{p[1]} << 8 | uint32_t{p[2]} << 16 | uint32_t{p[3]} << 24
                : uint32_t{p[0]} << 24 | uint32_t{p[1]} << 16 | uint32_t{p[2]} << 8 | p[3];
}

constexpr uint8_t kLeadMask[6] = {0x7F, 0x1F, 0x0F, 0x07, 0x03, 0x01};

}  // namespace
}  // namespace nlssm::bidi

using nlssm::bidi::host_category;

extern "C" {

int64_t NLSGetBaseDirection_SBCS(const NLSSMHandle *handle, const uint8_t *text, int64_t length,
                                 uint8_t *direction) {
  const auto *table = reinterpret_cast<const nlssm::catalogue::BidiTable *>(handle->bidiTable);
  if (table == nullptr) length = 0;
  return nlssm::bidi::scan(text, length, direction, [&](int64_t offset, int64_t &category) {
    category = table->categories[text[offset]];
    return offset + 1;
  });
}

// Every character is read with the length the text's first byte announces
// in the wide scheme; a continuation byte first announces six.
int64_t NLSGetBaseDirection_UTF8(const NLSSMHandle *handle, const uint8_t *text, int64_t length,
                                 uint8_t *direction) {
  namespace cursor = nlssm::cursor;
  const int64_t n = length <= 0 || text == nullptr       ? 1
                    : cursor::utf8_continuation(text[0]) ? 6
                                                         : cursor::kUtf8FormLength[text[0]];
  return nlssm::bidi::scan(text, length, direction, [&](int64_t offset, int64_t &category) {
    if (offset + n - 1 > length) return int64_t{-1};
    uint32_t value = 0;
    for (int64_t j = 0; j < n; ++j) {
      const uint8_t b = text[offset + j];
      const bool continuation = (b & 0xC0) == 0x80;
      value += continuation ? (b & 0x3Fu) : (b & nlssm::bidi::kLeadMask[n - 1 - j]);
      if (j + 1 < n) value <<= 6;
    }
    category = host_category(handle, value);
    return offset + n;
  });
}

// UTF-EBCDIC text is not scanned.
int64_t NLSGetBaseDirection_UTFE(const NLSSMHandle *, const uint8_t *, int64_t,
                                 uint8_t *direction) {
  return nlssm::bidi::left_to_right(direction);
}

// A surrogate pair goes to the host as (high << 16) | low.
int64_t NLSGetBaseDirection_WCS2(const NLSSMHandle *handle, const uint8_t *text, int64_t length,
                                 uint8_t *direction) {
  const bool little = handle->encodingNumber == NLSSM_ENC_WCS2_LE;
  length &= ~int64_t{1};
  return nlssm::bidi::scan(text, length, direction, [&](int64_t offset, int64_t &category) {
    uint32_t value = nlssm::bidi::unit16(text + offset, little);
    int64_t after = offset + 2;
    if ((value & 0xFC00) == 0xDC00) return int64_t{-1};
    if ((value & 0xFC00) == 0xD800) {
      const uint32_t low = nlssm::bidi::unit16(text + after, little);
      if ((low & 0xFC00) != 0xDC00) return int64_t{-1};
      value = value << 16 | low;
      after += 2;
    }
    category = host_category(handle, value);
    return after;
  });
}

int64_t NLSGetBaseDirection_WCS4(const NLSSMHandle *handle, const uint8_t *text, int64_t length,
                                 uint8_t *direction) {
  const bool little = handle->encodingNumber == NLSSM_ENC_HOST_CHARS;
  length &= ~int64_t{3};
  return nlssm::bidi::scan(text, length, direction, [&](int64_t offset, int64_t &category) {
    category = host_category(handle, nlssm::bidi::unit32(text + offset, little));
    return offset + 4;
  });
}

// Multi-byte text is not scanned.
int64_t NLSGetBaseDirection_MBCS(const NLSSMHandle *, const uint8_t *, int64_t,
                                 uint8_t *direction) {
  return nlssm::bidi::left_to_right(direction);
}

}  // extern "C"
