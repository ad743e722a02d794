// The C++ layer: encodings by number and name, text through UTF-8 and back,
// counts, and statuses where the C interface would answer one.
#include <gtest/gtest.h>

#include <nlssm/nlssm.hpp>

#include <algorithm>
#include <cstring>
#include <string>
#include <utility>

namespace {

nlssm::Host &host() {
  static nlssm::Host h = nlssm::Host::start();
  return h;
}

TEST(CxxText, RoundTripsThroughUtf8AndCountsInEveryClass) {
  const std::pair<const char *, const char *> samples[] = {
      {"IBM-037", "Aéx"},        {"UTF-8", "Aé\u65e5x"},  {"UTF-16BE", "A\U0001F600x"},
      {"UTF-32LE", "Aé\u65e5x"}, {"IBM-930", "A\u65e5x"}, {"Shift_JIS", "A\u65e5x"}};
  for (const auto &[name, sample] : samples) {
    SCOPED_TRACE(name);
    auto encoding = host().encoding(name);
    ASSERT_TRUE(encoding) << encoding.status().name();
    auto text = nlssm::Text::from_utf8(*encoding, sample);
    ASSERT_TRUE(text) << text.status().name();
    EXPECT_EQ(text->to_utf8().value_or(""), sample);
    const auto chars = std::count_if(sample, sample + std::strlen(sample), [](char c) {
      return (static_cast<uint8_t>(c) & 0xC0) != 0x80;
    });
    EXPECT_EQ(text->count().value_or(-1), static_cast<int64_t>(chars));
  }
}

TEST(CxxText, StatusesInsteadOfValues) {
  EXPECT_EQ(host().encoding(265).status(), nlssm::Status(NLSSM_E_ENCODING));
  EXPECT_EQ(host().encoding("no-such-encoding").status().code(), NLSSM_E_ENCODING);
  EXPECT_STREQ(nlssm::Status(NLSSM_E_DEST_TOO_SMALL).name(), "NLSSM_E_DEST_TOO_SMALL");
  auto utf8 = host().encoding(NLSSM_ENC_UTF8);
  ASSERT_TRUE(utf8);
  const nlssm::Text bad(*utf8, std::vector<uint8_t>{0x41, 0xC3});
  EXPECT_FALSE(bad.to_utf8());
}

}  // namespace
