// The UTF-8 toolkit against ICU: validation offsets, lengths and character
// offsets on random well-formed and damaged text, case mappings of every
// code point, and comparison and search.
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <unicode/ucasemap.h>
#include <unicode/uchar.h>
#include <unicode/utf8.h>

#include <algorithm>
#include <random>
#include <string>
#include <vector>

#include "kernel/u8/utf8.hpp"

namespace {

using Bytes = std::string;

const uint8_t *u(const Bytes &s) {
  return reinterpret_cast<const uint8_t *>(s.data());
}
int64_t len(const Bytes &s) {
  return static_cast<int64_t>(s.size());
}

Bytes utf8(UChar32 c) {
  char out[4];
  int32_t n = 0;
  U8_APPEND_UNSAFE(out, n, c);
  return Bytes(out, static_cast<size_t>(n));
}

// ICU's view of a text: the offset of each character (U8_NEXT takes an
// ill-formed stretch as one), and the first ill-formed one's offset.
struct IcuView {
  std::vector<int64_t> starts;
  int64_t firstBad = -1;
};
IcuView icu_view(const Bytes &s) {
  IcuView v;
  int32_t i = 0;
  const int32_t n = static_cast<int32_t>(s.size());
  while (i < n) {
    v.starts.push_back(i);
    UChar32 c;
    const int32_t at = i;
    U8_NEXT(u(s), i, n, c);
    if (c < 0 && v.firstBad < 0) v.firstBad = at;
  }
  if (v.firstBad < 0) v.firstBad = n;
  return v;
}

// Random text of characters of every length, from `alphabet` when given,
// then damaged in `faults` places (a byte changed, cut out or put in).
Bytes random_text(std::mt19937 &rng, int chars, int faults,
                  const std::vector<UChar32> &alphabet = {}) {
  Bytes s;
  for (int i = 0; i < chars; ++i) {
    UChar32 c;
    if (!alphabet.empty()) {
      c = alphabet[rng() % alphabet.size()];
    } else {
      switch (rng() % 4) {
        case 0:
          c = static_cast<UChar32>(rng() % 0x80);
          break;
        case 1:
          c = static_cast<UChar32>(0x80 + rng() % 0x780);
          break;
        case 2:
          c = static_cast<UChar32>(0x800 + rng() % 0xF800);
          break;
        default:
          c = static_cast<UChar32>(0x10000 + rng() % 0x100000);
          break;
      }
      if (U_IS_SURROGATE(c)) c = 'x';
    }
    s += utf8(c);
  }
  for (int f = 0; f < faults && !s.empty(); ++f) {
    const size_t at = rng() % s.size();
    const char byte = static_cast<char>(rng() % 3 == 0 ? 0x80 + rng() % 0x80 : rng() % 0x100);
    switch (rng() % 3) {
      case 0:
        s[at] = byte;
        break;
      case 1:
        s.erase(at, 1);
        break;
      default:
        s.insert(at, 1, byte);
        break;
    }
  }
  return s;
}

// Every validation variant this processor runs, and the exported member.
void expect_valid_prefix(const Bytes &s, int64_t expected) {
  ASSERT_EQ(qvzsu8Validate(u(s), len(s)), expected);
  for (const auto &variant : kernel::u8::validate_ops.variants()) {
    if (!kernel::cpu::supports(variant.isa)) continue;
    ASSERT_EQ(variant.table->valid_prefix(u(s), len(s)), expected)
        << kernel::cpu::name(variant.isa) << " on " << s.size() << " bytes";
  }
}

TEST(Utf8Toolkit, ValidationLengthAndOffsetsMatchIcuOnRandomText) {
  std::mt19937 rng(20);
  for (int round = 0; round < 3000; ++round) {
    const Bytes s = random_text(rng, static_cast<int>(rng() % 120), round % 4 == 0 ? 0 : round % 3);
    const IcuView v = icu_view(s);
    expect_valid_prefix(s, v.firstBad);
    ASSERT_EQ(qvzsu8Length(u(s), len(s)), static_cast<int64_t>(v.starts.size()));
    for (size_t i = 0; i < v.starts.size(); ++i)
      ASSERT_EQ(qvzsu8Offset(u(s), len(s), static_cast<int64_t>(i)), v.starts[i]);
    EXPECT_EQ(qvzsu8Offset(u(s), len(s), static_cast<int64_t>(v.starts.size())), len(s));
    EXPECT_EQ(qvzsu8Offset(u(s), len(s), static_cast<int64_t>(v.starts.size()) + 1), -1);
  }
}

// Every pair, and triples and quadruples of the bytes around each boundary
// of the lead-dependent ranges, placed across a 32-byte block boundary
// after ASCII or after a complete character.
TEST(Utf8Toolkit, ValidationOfShortSequencesAcrossBlockBoundaries) {
  const std::vector<int> edges = {0x00, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC0, 0xC1,
                                  0xC2, 0xDF, 0xE0, 0xED, 0xEF, 0xF0, 0xF4, 0xF5, 0xFF};
  for (const Bytes &before : {Bytes(30, 'a'), Bytes(27, 'a') + "\xe2\x82\xac"}) {
    for (int b0 = 0; b0 < 0x100; ++b0) {
      for (int b1 = 0; b1 < 0x100; ++b1) {
        const Bytes s = before + char(b0) + char(b1) + Bytes(33, 'z');
        expect_valid_prefix(s, icu_view(s).firstBad);
      }
    }
    for (int b0 : edges)
      for (int b1 : edges)
        for (int b2 : edges)
          for (int b3 : edges) {
            const Bytes s = before + char(b0) + char(b1) + char(b2) + char(b3) + Bytes(40, 'z');
            expect_valid_prefix(s, icu_view(s).firstBad);
            expect_valid_prefix(s.substr(0, before.size() + 3),
                                icu_view(s.substr(0, before.size() + 3)).firstBad);
          }
  }
}

// ICU's UTF-8 case mapping of a text in the root locale.
enum class Kind { upper, lower, fold };
Bytes icu_map(Kind kind, const Bytes &s) {
  UErrorCode ec = U_ZERO_ERROR;
  UCaseMap *map = ucasemap_open("", 0, &ec);
  std::vector<char> out(s.size() * 3 + 16);
  const int32_t n = static_cast<int32_t>(out.size()), sn = static_cast<int32_t>(s.size());
  int32_t length = 0;
  switch (kind) {
    case Kind::upper:
      length = ucasemap_utf8ToUpper(map, out.data(), n, s.data(), sn, &ec);
      break;
    case Kind::lower:
      length = ucasemap_utf8ToLower(map, out.data(), n, s.data(), sn, &ec);
      break;
    case Kind::fold:
      length = ucasemap_utf8FoldCase(map, out.data(), n, s.data(), sn, &ec);
      break;
  }
  ucasemap_close(map);
  EXPECT_TRUE(U_SUCCESS(ec)) << u_errorName(ec);
  return Bytes(out.data(), static_cast<size_t>(length));
}

using MapFn = int64_t (*)(uint8_t *, int64_t, const uint8_t *, int64_t, uint32_t, int64_t *,
                          int64_t *);
struct Mapping {
  Kind kind;
  MapFn map;
  uint32_t (*one)(uint32_t);
  UChar32 (*icuOne)(UChar32);
};
UChar32 icu_fold(UChar32 c) {
  return u_foldCase(c, U_FOLD_CASE_DEFAULT);
}
const Mapping kMappings[] = {{Kind::upper, qvzsu8Upper, qvzsu8UpperChar, u_toupper},
                             {Kind::lower, qvzsu8Lower, qvzsu8LowerChar, u_tolower},
                             {Kind::fold, qvzsu8Fold, qvzsu8FoldChar, icu_fold}};

// Maps with room to spare; checks that the reported lengths agree.
Bytes map_text(const Mapping &m, const Bytes &s, uint32_t options, int64_t expectStatus = 0) {
  std::vector<uint8_t> out(s.size() * 3 + 16);
  int64_t written = -1, needed = -1;
  EXPECT_EQ(
      m.map(out.data(), static_cast<int64_t>(out.size()), u(s), len(s), options, &written, &needed),
      expectStatus);
  EXPECT_EQ(written, needed);
  return Bytes(reinterpret_cast<const char *>(out.data()), static_cast<size_t>(written));
}

class CaseMapping : public testing::TestWithParam<Mapping> {};

TEST_P(CaseMapping, EveryCodePointMatchesIcu) {
  const Mapping &m = GetParam();
  for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
    ASSERT_EQ(m.one(static_cast<uint32_t>(c)), static_cast<uint32_t>(m.icuOne(c))) << c;
    if (U_IS_SURROGATE(c)) continue;
    const Bytes s = utf8(c);
    ASSERT_EQ(map_text(m, s, 0), utf8(m.icuOne(c))) << c;
    ASSERT_EQ(map_text(m, s, QVZSU8_FULL), icu_map(m.kind, s)) << c;
  }
  EXPECT_EQ(m.one(0x110000), 0x110000u);
}

TEST_P(CaseMapping, RandomTextMatchesIcuAndBadBytesPassUnchanged) {
  const Mapping &m = GetParam();
  Bytes ascii;
  for (int c = 0; c < 0x80; ++c) ascii += static_cast<char>(c);
  for (size_t shift = 0; shift < 8; ++shift) {
    const Bytes s = ascii.substr(shift) + "\xc3\x9f" + ascii;
    ASSERT_EQ(map_text(m, s, QVZSU8_FULL), icu_map(m.kind, s));
  }
  std::mt19937 rng(static_cast<unsigned>(m.kind));
  for (int round = 0; round < 2000; ++round) {
    Bytes s = random_text(rng, static_cast<int>(rng() % 60), round % 2);
    // ICU lowers a final sigma by its context; the toolkit does not.
    for (size_t at; (at = s.find("\xce\xa3")) != Bytes::npos;) s.replace(at, 2, "S");
    const bool wellFormed = icu_view(s).firstBad == len(s);
    ASSERT_EQ(map_text(m, s, QVZSU8_FULL, wellFormed ? 0 : 0x803fe808), icu_map(m.kind, s));
  }
}

// However small the destination, nothing is stored past it, and what is
// stored is the mapping of whole characters.
TEST_P(CaseMapping, NeverWritesPastTheCapacity) {
  const Mapping &m = GetParam();
  const Bytes s = "a\xc3\x9f\xc4\xb0\xef\xac\x83z\xe1\xbe\x80\xc8\xba";  // aßİﬃzᾀȺ
  const Bytes full = map_text(m, s, QVZSU8_FULL);
  // Where each character's mapping ends in the whole mapping.
  std::vector<int64_t> ends = {0};
  const std::vector<int64_t> starts = icu_view(s).starts;
  for (size_t i = 0; i < starts.size(); ++i) {
    const size_t end = i + 1 < starts.size() ? static_cast<size_t>(starts[i + 1]) : s.size();
    const Bytes piece =
        s.substr(static_cast<size_t>(starts[i]), end - static_cast<size_t>(starts[i]));
    ends.push_back(ends.back() + len(icu_map(m.kind, piece)));
  }
  for (int64_t cap = 0; cap < len(full); ++cap) {
    std::vector<uint8_t> out(static_cast<size_t>(cap) + 4, 0xEE);
    int64_t written = -1, needed = -1;
    EXPECT_EQ(m.map(out.data(), cap, u(s), len(s), QVZSU8_FULL, &written, &needed), 0x803fe807);
    EXPECT_EQ(needed, len(full));
    ASSERT_LE(written, cap);
    EXPECT_EQ(Bytes(reinterpret_cast<char *>(out.data()), static_cast<size_t>(written)),
              full.substr(0, static_cast<size_t>(written)));
    EXPECT_EQ(written, *std::prev(std::upper_bound(ends.begin(), ends.end(), cap)));
    for (size_t i = static_cast<size_t>(cap); i < out.size(); ++i) ASSERT_EQ(out[i], 0xEE);
  }
  int64_t needed = -1;
  EXPECT_EQ(m.map(nullptr, 0, u(s), len(s), QVZSU8_FULL, nullptr, &needed), 0x803fe807);
  EXPECT_EQ(needed, len(full));
}

INSTANTIATE_TEST_SUITE_P(Utf8Toolkit, CaseMapping, testing::ValuesIn(kMappings),
                         [](const testing::TestParamInfo<Mapping> &info) {
                           return std::string(info.param.kind == Kind::upper   ? "Upper"
                                              : info.param.kind == Kind::lower ? "Lower"
                                                                               : "Fold");
                         });

TEST(Utf8Toolkit, CaseMappingRejectsBadArguments) {
  uint8_t out[8];
  int64_t written = 7;
  EXPECT_EQ(qvzsu8Upper(out, -1, u("a"), 1, 0, &written, nullptr), 0x803fe818);
  EXPECT_EQ(written, 0);
  EXPECT_EQ(qvzsu8Upper(out, 8, nullptr, 1, 0, nullptr, nullptr), 0x803fe82a);
  EXPECT_EQ(qvzsu8Upper(nullptr, 8, u("a"), 1, 0, nullptr, nullptr), 0x803fe82a);
  EXPECT_EQ(qvzsu8Upper(out, 8, u("a"), 1, 2, nullptr, nullptr), 0x803fe82e);
  EXPECT_EQ(qvzsu8Validate(nullptr, 3), -1);
  EXPECT_EQ(qvzsu8Length(u("a"), -1), -1);
  EXPECT_EQ(qvzsu8Offset(u("a"), 1, -1), -1);
}

// Comparison follows ICU's folding and byte order; a small alphabet of
// letters with multi-character foldings makes equal texts common.
TEST(Utf8Toolkit, CompareAndCaseCompareMatchIcu) {
  const std::vector<UChar32> alphabet = {'s', 'S',   0xDF,  0x1E9E, 0x17F, 'f',    0xFB00, 0xFB03,
                                         'i', 0x130, 0x3A3, 0x3C3,  0x3C2, 0x1F80, 0x1F08, 0x399};
  std::mt19937 rng(7);
  int equal = 0;
  for (int round = 0; round < 20000; ++round) {
    const Bytes a = random_text(rng, static_cast<int>(rng() % 5), round % 10 == 0, alphabet);
    const Bytes b = random_text(rng, static_cast<int>(rng() % 5), round % 10 == 1, alphabet);
    const int bytes = a.compare(b);
    ASSERT_EQ(qvzsu8Compare(u(a), len(a), u(b), len(b)), (bytes > 0) - (bytes < 0));
    const int folded = icu_map(Kind::fold, a).compare(icu_map(Kind::fold, b));
    ASSERT_EQ(qvzsu8CaseCompare(u(a), len(a), u(b), len(b)), (folded > 0) - (folded < 0))
        << a << " / " << b;
    equal += folded == 0;
  }
  EXPECT_GT(equal, 500);
}

TEST(Utf8Toolkit, FindGivesTheFirstOccurrence) {
  const std::vector<UChar32> alphabet = {'a', 'b', 0xE9, 0x4E2D, 0x1F600};
  std::mt19937 rng(3);
  for (int round = 0; round < 5000; ++round) {
    const Bytes text = random_text(rng, static_cast<int>(rng() % 40), 0, alphabet);
    const Bytes pattern = random_text(rng, static_cast<int>(rng() % 4), round % 7 == 0, alphabet);
    const size_t at = text.find(pattern);
    ASSERT_EQ(qvzsu8Find(u(text), len(text), u(pattern), len(pattern)),
              at == Bytes::npos ? -1 : static_cast<int64_t>(at));
  }
  EXPECT_EQ(qvzsu8Find(nullptr, 0, u("a"), 1), -1);
}

}  // namespace
