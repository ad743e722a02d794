// NLSGetBaseDirection through slot 79 of reference-host handles: the first
// strong character decides, each class reading characters its own way.
#include <gtest/gtest.h>

#include "bidi_test_support.hpp"

namespace {

using namespace bidi_test;
using BaseDirection = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *);

struct Case {
  int encoding;
  std::string text;
  int64_t status;
  int direction;
  const char *why;
};

class BaseDirectionCase : public testing::TestWithParam<Case> {};

TEST_P(BaseDirectionCase, FirstStrongCharacterDecides) {
  const Case &c = GetParam();
  const NLSSMHandle *h = handle(c.encoding);
  ASSERT_NE(h, nullptr);
  // One byte beyond the text: the UTF-8 and WCS2 members may read it.
  std::string buffer = c.text + '\0';
  uint8_t direction = 0xAA;
  const auto fn = reinterpret_cast<BaseDirection>(h->NLSGetBaseDirection);
  EXPECT_EQ(fn(h, reinterpret_cast<const uint8_t *>(buffer.data()),
               static_cast<int64_t>(c.text.size()), &direction),
            c.status);
  EXPECT_EQ(direction, c.direction);
  EXPECT_EQ(fn(h, nullptr, 0, &direction), NLSSM_OK);
  EXPECT_EQ(direction, 0);
  EXPECT_EQ(fn(h, reinterpret_cast<const uint8_t *>(buffer.data()), 1, nullptr),
            NLSSM_E_NULL_ARGUMENT);
}

constexpr int64_t kBad = NLSSM_E_BAD_CHARACTER;

INSTANTIATE_TEST_SUITE_P(
    EveryClass, BaseDirectionCase,
    testing::Values(
        Case{36, "12 .\xE0", 0, 1, "digits, blank and a full stop, then a Hebrew letter"},
        Case{36, "12 a\xE0", 0, 0, "a Latin letter before the first Hebrew letter"},
        Case{36, "12, #$% /:", 0, 0, "no strong character"},
        Case{34, "1 \xC7", 0, 1, "an Arabic letter (AL)"},
        Case{87, "\xF1\x40\x41", 0, 1, "EBCDIC Hebrew page: digit, blank, alef"},
        Case{29, "\xE0\xE1", 0, 0, "a page without a table"},
        Case{20, "12 \xD7\x90", 0, 0, "steps of one byte: the lead D7 reads as 'W'"},
        Case{20, "\xD7\x90\x61\x62\x63", 0, 1, "steps of two bytes from a Hebrew start"},
        Case{20, "\xC2\xA0\xD7\x90", 0, 1, "no-break space, then alef, two bytes each"},
        Case{20, "\xC2\xA0\x31\xD7\x90", 0, 0, "'1' and D7 make U+0497, a letter"},
        Case{20, "\xE2\x82\xAC\x31", kBad, 0, "three-byte steps run past the end"},
        Case{161, "\x41\x42", 0, 0, "UTF-EBCDIC is not scanned"},
        Case{24, std::string("\x00\x31\x05\xD0", 4), 0, 1, "big-endian digit, alef"},
        Case{25, std::string("\x31\x00\xD0\x05", 4), 0, 1, "little-endian digit, alef"},
        Case{25, std::string("\x05\xD0", 2), 0, 0, "big-endian alef on a little-endian handle"},
        Case{24, std::string("\xD8\x00\xDF\x00\x05\xD0", 6), 0, 1,
             "a pair goes undecoded (D800DF00): no category, passed over"},
        Case{24, std::string("\xD8\x00\x00\x41", 4), kBad, 0, "high surrogate, then 'A'"},
        Case{24, std::string("\xDC\x00\x05\xD0", 4), kBad, 0, "lone low surrogate"},
        Case{26, std::string("\0\0\0\x31\0\0\x06\x28", 8), 0, 1, "digit, Arabic beh"},
        Case{117, "\x41\x42", 0, 0, "modal double-byte text is not scanned"},
        Case{118, "\xA4\x40", 0, 0, "non-modal double-byte text is not scanned"}),
    [](const testing::TestParamInfo<Case> &info) {
      return "enc" + std::to_string(info.param.encoding) + "_" + std::to_string(info.index);
    });

}  // namespace
