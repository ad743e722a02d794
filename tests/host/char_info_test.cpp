// Character information over every code point, checked against ICU's property
// names, and case folding through the service object.
#include <gtest/gtest.h>
#include <unicode/uchar.h>

#include <cstring>

#include "host_test_support.hpp"

using namespace hosttest;

namespace {

// Property word bits in order, by general category short name.
constexpr const char *kCategories[] = {"Lu", "Ll", "Lt", "Mn", "Mc", "Me", "Nd", "Nl", "No", "Zs",
                                       "Zl", "Zp", "Cc", "Cf", "Cs", "Co", "Cn", "Lm", "Lo", "Pc",
                                       "Pd", "Ps", "Pe", "Pi", "Pf", "Po", "Sm", "Sc", "Sk", "So"};
// Bidirectional categories in the host's numbering.
constexpr const char *kBidi[] = {"L",  "LRE", "LRO", "R",   "AL",  "RLE", "RLO", "PDF",
                                 "EN", "ES",  "ET",  "AN",  "CS",  "NSM", "BN",  "B",
                                 "S",  "WS",  "ON",  "LRI", "RLI", "FSI", "PDI"};

template <std::size_t N>
std::uint32_t index_of(const char *const (&names)[N], const char *name) {
  for (std::size_t i = 0; i < N; ++i)
    if (std::strcmp(names[i], name) == 0) return static_cast<std::uint32_t>(i);
  return 99;
}

std::int64_t query(void *nls, std::uint32_t c, NLSHostCharInfo &info) {
  return call<NLSHostCharInfoFn>(nls, NLSHOST_SLOT_NLS_CHAR_INFO, c, &info);
}

std::uint32_t mapping(UChar32 c, UChar32 mapped) {
  return mapped == c ? 0 : static_cast<std::uint32_t>(mapped);
}

}  // namespace

TEST(CharInfo, AgreesWithIcuForEveryCodePoint) {
  auto host = standalone();
  void *nls = host->nls();
  std::uint64_t mismatches = 0;
  for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
    NLSHostCharInfo info{};
    if (query(nls, static_cast<std::uint32_t>(c), info) != 0) {
      ++mismatches;
      continue;
    }
    const char *category =
        u_getPropertyValueName(UCHAR_GENERAL_CATEGORY, u_charType(c), U_SHORT_PROPERTY_NAME);
    const char *bidi =
        u_getPropertyValueName(UCHAR_BIDI_CLASS, u_charDirection(c), U_SHORT_PROPERTY_NAME);
    const bool ok = info.properties == (1u << index_of(kCategories, category)) &&
                    info.bidiCategory == index_of(kBidi, bidi) &&
                    info.upper == mapping(c, u_toupper(c)) &&
                    info.lower == mapping(c, u_tolower(c));
    if (!ok && ++mismatches < 10) ADD_FAILURE() << "U+" << std::hex << c;
  }
  EXPECT_EQ(mismatches, 0u);
  NLSHostCharInfo info{};
  EXPECT_EQ(query(nls, 0x110000, info), NLSHOST_E_NOT_A_CHARACTER);
}

TEST(CharInfo, FoldingThroughTheServiceObject) {
  auto host = standalone();
  void *chars = static_cast<void **>(host->service())[NLSHOST_SERVICE_WORD_CHAR_OBJECT];
  auto fold = [chars](std::uint32_t c, std::int64_t options) {
    return call<NLSHostFoldCharFn>(chars, NLSHOST_SLOT_FOLD_CHAR, c, options);
  };
  EXPECT_EQ(fold('A', NLSHOST_FOLD_DEFAULT), static_cast<std::uint32_t>('a'));
  EXPECT_EQ(fold(0x03A3, NLSHOST_FOLD_DEFAULT), 0x03C3u);  // sigma
  EXPECT_EQ(fold(0x03C2, NLSHOST_FOLD_DEFAULT), 0x03C3u);  // final sigma
  EXPECT_EQ(fold('I', NLSHOST_FOLD_TURKIC), 0x0131u);
  EXPECT_EQ(fold('I', 0), static_cast<std::uint32_t>('I'));
}
