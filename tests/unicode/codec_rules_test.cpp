// The one-character codecs, drivers and helpers on hand-picked inputs,
// including their deliberate leniencies.
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>

#include <algorithm>
#include <array>
#include <random>
#include <vector>

#include "unicode/codec.hpp"

namespace {

struct Decoded {
  int64_t status;
  uint32_t cp;
  int64_t consumed;
};

// Decodes from a buffer padded with continuation bytes, as far as a decoder
// may read past what remains.
Decoded decode(NLSUTFDecoder fn, std::vector<uint8_t> bytes, int64_t remaining = -1) {
  if (remaining < 0) remaining = static_cast<int64_t>(bytes.size());
  bytes.resize(bytes.size() + 8, 0x80);
  Decoded d{0, 0, -1};
  d.status = fn(bytes.data(), remaining, &d.cp, &d.consumed);
  return d;
}

struct DecodeCase {
  const char *what;
  NLSUTFDecoder fn;
  std::vector<uint8_t> bytes;
  int64_t remaining;
  uint32_t status, cp;
  int64_t consumed;
};

class DecoderRules : public testing::TestWithParam<DecodeCase> {};

TEST_P(DecoderRules, Decodes) {
  const DecodeCase &c = GetParam();
  const Decoded d = decode(c.fn, c.bytes, c.remaining);
  EXPECT_EQ(d.status, c.status) << c.what;
  EXPECT_EQ(d.cp, c.cp) << c.what;
  EXPECT_EQ(d.consumed, c.consumed) << c.what;
}

constexpr uint32_t kOk = NLSSM_OK, kBad = NLSSM_E_ILL_FORMED, kShort = NLSSM_E_TRUNCATED_SEQUENCE;

INSTANTIATE_TEST_SUITE_P(
    Utf8, DecoderRules,
    testing::Values(
        DecodeCase{"bad continuation unchecked", UTF8_UTF32, {0xC3, 0x28}, -1, kOk, 0xE8, 2},
        DecodeCase{"overlong E0 accepted", UTF8_UTF32, {0xE0, 0x80, 0x80}, -1, kOk, 0, 3},
        DecodeCase{"surrogate accepted", UTF8_UTF32, {0xED, 0xA0, 0x80}, -1, kOk, 0xD800, 3},
        DecodeCase{"lone continuation", UTF8_UTF32, {0x80}, -1, kBad, 0xFFFD, 1},
        DecodeCase{"truncated", UTF8_UTF32, {0xF0, 0x9F}, 2, kShort, 0xFFFD, 2},
        DecodeCase{"C0 skips one", UTF8_UTF32, {0xC0, 0x80}, -1, kBad, 0xFFFD, 2},
        DecodeCase{
            "skip stops at non-continuation", UTF8_UTF32, {0xF8, 0x80, 0x41}, -1, kBad, 0xFFFD, 2},
        // The skip runs past the bytes remaining (the padding is 0x80).
        DecodeCase{"skip ignores remaining", UTF8_UTF32, {0xFC}, 1, kBad, 0xFFFD, 6},
        DecodeCase{"F5 announces four", UTF8_UTF32, {0xF5}, 1, kBad, 0xFFFD, 4}));

INSTANTIATE_TEST_SUITE_P(
    Utf16, DecoderRules,
    testing::Values(DecodeCase{"unpaired high swallows next",
                               UTF16_UTF32,
                               {0xD8, 0x00, 0x00, 0x41},
                               -1,
                               kBad,
                               0xFFFD,
                               4},
                    DecodeCase{"lone low", UTF16_UTF32_SWAP, {0x00, 0xDC}, -1, kBad, 0xFFFD, 2},
                    DecodeCase{
                        "high with one byte left", UTF16_UTF32, {0xD8, 0x00}, 1, kShort, 0xFFFD, 1},
                    // The truncation bound is 2 bytes, so the low unit is read past it.
                    DecodeCase{"high with two bytes left",
                               UTF16_UTF32,
                               {0xD8, 0x00, 0xDC, 0x00},
                               2,
                               kOk,
                               0x10000,
                               4}));

INSTANTIATE_TEST_SUITE_P(
    Utf32, DecoderRules,
    testing::Values(DecodeCase{
        "any value", COPY_UTF32b, {0xFF, 0xFF, 0xFF, 0xFF}, 1, kOk, 0xFFFFFFFF, 4}));

struct EncodeCase {
  const char *what;
  NLSUTFEncoder fn;
  uint32_t cp;
  int64_t capacity;
  uint32_t status;
  std::vector<uint8_t> bytes;  // written bytes; their count is `written`
};

class EncoderRules : public testing::TestWithParam<EncodeCase> {};

TEST_P(EncoderRules, Encodes) {
  const EncodeCase &c = GetParam();
  std::vector<uint8_t> out(8, 0xEE);
  int64_t written = -1;
  EXPECT_EQ(c.fn(c.cp, out.data(), c.capacity, &written), c.status) << c.what;
  const int64_t expected = c.bytes.size();
  if (c.status == NLSSM_OK || expected > 0) {
    EXPECT_EQ(written, expected) << c.what;
  }
  EXPECT_EQ(std::vector<uint8_t>(out.begin(), out.begin() + c.bytes.size()), c.bytes) << c.what;
  EXPECT_EQ(out[c.bytes.size()], 0xEE) << c.what << ": wrote past the character";
}

constexpr uint32_t kFull = NLSSM_E_DEST_TOO_SMALL;

INSTANTIATE_TEST_SUITE_P(
    Encoders, EncoderRules,
    testing::Values(
        EncodeCase{"ascii needs no capacity", UTF32_UTF8, 0x7F, 0, kOk, {0x7F}},
        EncodeCase{"two bytes in one", UTF32_UTF8, 0x80, 1, kFull, {}},
        EncodeCase{"beyond Unicode", UTF32_UTF8, 0x200000, 4, kOk, {0xF8, 0x80, 0x80, 0x80}},
        EncodeCase{"unit surrogate alone", UTF16_UTF8, 0xD800, 3, kOk, {0xED, 0xA0, 0x80}},
        EncodeCase{"unit takes low 16 bits", UTF16_UTF8, 0x10041, 3, kOk, {0x41}},
        EncodeCase{"UTF-32 too small", COPY_UTF32_SWAP, 0x41, 3, kFull, {}},
        EncodeCase{"unit LE, no check", UTF32_UTF16, 0x1F600, 0, kOk, {0x00, 0xF6}},
        EncodeCase{"unit BE, no check", UTF32_UTF16_SWAP, 0x1F600, 0, kOk, {0xF6, 0x00}},
        EncodeCase{"BMP LE, no check", UTF32_UTF16s, 0x20AC, 0, kOk, {0xAC, 0x20}}));

TEST(EncoderRules, UnfittedPairLeavesWrittenUntouched) {
  uint8_t out[4];
  int64_t written = 77;
  EXPECT_EQ(UTF32_UTF16s_SWAP(0x10000, out, 3, &written), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 77);
}

TEST(Utf8ToUtf16, AnyFailureStoresOneReplacementUnit) {
  const uint8_t emoji[] = {0xF0, 0x9F, 0x98, 0x80};
  uint16_t units[2] = {0, 0x1234};
  int64_t consumed = 0;
  EXPECT_EQ(UTF8_UTF16(emoji, 3, units, &consumed), NLSSM_E_ILL_FORMED);  // truncated
  EXPECT_EQ(units[0], 0xFFFD);
  EXPECT_EQ(units[1], 0x1234);
  EXPECT_EQ(consumed, 3);
}

TEST(CopyUtf, CopiesWhatFitsAndReportsTheRest) {
  const uint8_t src[] = {1, 2, 3, 4, 5};
  uint8_t dst[6] = {};
  int64_t written = -1;
  EXPECT_EQ(COPY_UTF(src, 5, dst, 3, &written), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 3);
  EXPECT_EQ(dst[2], 3);
  EXPECT_EQ(dst[3], 0);
  EXPECT_EQ(COPY_UTF(src, 5, dst, 6, &written), NLSSM_OK);
  EXPECT_EQ(written, 5);
  EXPECT_EQ(COPY_UTF(src, 5, dst, -1, &written), NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 0);
}

// A decoder the driver does not know, so that the generic loop runs.
int64_t utf8_via_pointer(const uint8_t *s, int64_t n, uint32_t *cp, int64_t *consumed) {
  return UTF8_UTF32(s, n, cp, consumed);
}

// The known decoder's block path is held to this loop below.
TEST(ToUtf32Driver, StopsAtLimitOrFailureAndCountsStoredCharacters) {
  const NLSUTFDecoder dec = utf8_via_pointer;
  std::vector<uint8_t> text(44, 'a');  // long enough for the ASCII bulk path
  text[40] = 0xC3;
  text[41] = 0xA9;
  text[42] = 0x80;
  std::vector<uint32_t> out(64, 0xEEEEEEEE);
  int64_t written = -1;
  // Capacity 7 holds one character.
  EXPECT_EQ(ConvertToUTF32(text.data(), text.size(), out.data(), 7, &written, dec, COPY_UTF32_SWAP),
            NLSSM_OK);
  EXPECT_EQ(written, 4);
  EXPECT_EQ(out[1], 0xEEEEEEEE);
  // The stray 0x80 stops the loop; its replacement is not stored.
  EXPECT_EQ(ConvertToUTF32(text.data(), text.size(), out.data(), 256, &written, dec, COPY_UTF32),
            NLSSM_E_ILL_FORMED);
  EXPECT_EQ(written, 41 * 4);
  EXPECT_EQ(out[39], 0x61000000u);
  EXPECT_EQ(out[40], 0xE9000000u);
  EXPECT_EQ(out[41], 0xEEEEEEEE);
  // Input that ends inside a sequence.
  EXPECT_EQ(ConvertToUTF32(text.data(), 41, out.data(), 256, &written, dec, COPY_UTF32_SWAP),
            NLSSM_E_TRUNCATED_SEQUENCE);
  EXPECT_EQ(written, 40 * 4);
  EXPECT_EQ(ConvertToUTF32(text.data(), 0, out.data(), 256, &written, dec, COPY_UTF32_SWAP),
            NLSSM_OK);
  EXPECT_EQ(written, 0);
}

// The block path of the known decoder against the one-character loop, on
// text that mixes characters of every length with the faults a block must
// stop before: invalid leads, stray and missing continuation bytes, cuts.
// The UTF-8 decoder with a chosen block step, so that every step this
// processor can run is checked, not only the best.
struct StepDecoder : nlssm::unicode::PolicyDecoder<nlssm::unicode::Utf8Decoder> {
  nlssm::unicode::Utf8BlockStep step;
  nlssm::unicode::Utf8BlockStep block_step() const { return step; }
};

template <nlssm::unicode::Order O>
int64_t to_utf32_with(nlssm::unicode::Utf8BlockStep step, const uint8_t *s, int64_t n, uint8_t *d,
                      int64_t capacity, int64_t *written) {
  namespace u = nlssm::unicode;
  return u::convert_to_utf32(s, n, d, capacity, written, StepDecoder{{}, step},
                             u::PolicyEncoder<u::Utf32Encoder<O>>{});
}

TEST(ToUtf32Driver, BlockPathMatchesTheCharacterLoopOnAnyText) {
  std::vector<nlssm::unicode::Utf8BlockStep> steps;
  for (auto isa : kernel::cpu::kAllIsas) {
    const auto step = nlssm::unicode::utf8_block_step(isa);
    if (kernel::cpu::supports(isa) && std::find(steps.begin(), steps.end(), step) == steps.end())
      steps.push_back(step);
  }
  std::mt19937 rng(20261122);
  const std::string pieces[] = {"a",
                                "Z",
                                "\xC3\xA9",
                                "\xD0\x96",
                                "\xE6\x97\xA5",
                                "\xED\xA0\x80",
                                "\xE0\x80\x80",
                                "\xF0\x9F\x98\x80",
                                "\xF4\x90\x80\x80",
                                "\x80",
                                "\xC0\x80",
                                "\xF8",
                                "\xE6\x97",
                                "\xE6xy",
                                "\xFF"};
  for (int round = 0; round < 6000; ++round) {
    std::vector<uint8_t> text;
    const size_t target = rng() % 400;
    const int faults = rng() % 4;  // 0: well-formed pieces only
    // Well-formed texts of up to two, up to three or up to four bytes a
    // character: the blocks take a different way for each.
    const size_t well_formed = std::array<size_t, 3>{5, 7, 9}[rng() % 3];
    while (text.size() < target) {
      const size_t limit = faults == 0 ? well_formed : std::size(pieces);
      const auto &piece = pieces[rng() % limit];
      // Runs of one piece give the blocks of a single shape.
      const int repeat = rng() % 4 == 0 ? 1 + rng() % 24 : 1;
      for (int r = 0; r < repeat; ++r) text.insert(text.end(), piece.begin(), piece.end());
    }
    const int64_t capacity = rng() % 3 == 0 ? int64_t(rng() % (4 * text.size() + 8)) : 4 * 512;
    // The decoder may read up to five bytes past the text's end.
    const int64_t length = static_cast<int64_t>(text.size());
    text.resize(text.size() + 5, 0);
    for (NLSUTFEncoder enc : {COPY_UTF32, COPY_UTF32_SWAP}) {
      std::vector<uint8_t> slow(4 * 512 + 16, 0xEE);
      int64_t slowWritten = -1;
      const int64_t slowStatus = ConvertToUTF32(text.data(), length, slow.data(), capacity,
                                                &slowWritten, utf8_via_pointer, enc);
      for (auto step : steps) {
        std::vector<uint8_t> fast(slow.size(), 0xEE);
        int64_t fastWritten = -1;
        const auto convert = enc == COPY_UTF32 ? &to_utf32_with<nlssm::unicode::Order::big>
                                               : &to_utf32_with<nlssm::unicode::Order::little>;
        const int64_t fastStatus =
            convert(step, text.data(), length, fast.data(), capacity, &fastWritten);
        ASSERT_EQ(fastStatus, slowStatus) << round;
        ASSERT_EQ(fastWritten, slowWritten) << round;
        ASSERT_EQ(fast, slow) << round;
      }
    }
  }
}

TEST(FromUtf32Driver, StopsWhenTheCapacityIsUsedUp) {
  const uint32_t text[] = {'a', 0xE9, 'b'};
  uint8_t out[8];
  int64_t written = -1;
  EXPECT_EQ(ConvertFromUTF32(text, 12, out, 2, &written, UTF32_UTF8, COPY_UTF32b_SWAP),
            NLSSM_E_DEST_TOO_SMALL);
  EXPECT_EQ(written, 1);
  EXPECT_EQ(ConvertFromUTF32(text, 12, out, 3, &written, UTF32_UTF8, COPY_UTF32b_SWAP), NLSSM_OK);
  EXPECT_EQ(written, 3);  // stops with the capacity spent, before 'b'
  EXPECT_EQ(ConvertFromUTF32(text, 3, out, 8, &written, UTF32_UTF8, COPY_UTF32b_SWAP), NLSSM_OK);
  EXPECT_EQ(written, 0);
}

// An encoder supplied by the caller sees the destination itself, at the
// running offset, with the capacity that remains.
struct EncoderCall {
  uint8_t *destination;
  int64_t capacity;
};
std::vector<EncoderCall> encoder_calls;
int64_t recording_encoder(uint32_t c, uint8_t *d, int64_t capacity, int64_t *written) {
  encoder_calls.push_back({d, capacity});
  const int64_t n = c < 0x80 ? 1 : 3;  // a variable-width form
  if (capacity < n) return NLSSM_E_DEST_TOO_SMALL;
  for (int64_t i = 0; i < n; ++i) d[i] = static_cast<uint8_t>(c);
  *written = n;
  return NLSSM_OK;
}

TEST(FromUtf32Driver, EveryStepEncodesIntoTheDestinationAtItsOffset) {
  const uint32_t text[] = {'a', 0x100, 'b', 0x200, 'c'};
  uint8_t out[9];
  int64_t written = -1;
  encoder_calls.clear();
  EXPECT_EQ(ConvertFromUTF32(text, sizeof text, out, sizeof out, &written, recording_encoder,
                             COPY_UTF32b_SWAP),
            NLSSM_OK);
  EXPECT_EQ(written, 9);
  ASSERT_EQ(encoder_calls.size(), 5u);
  const int64_t offsets[] = {0, 1, 4, 5, 8};
  for (size_t i = 0; i < encoder_calls.size(); ++i) {
    EXPECT_EQ(encoder_calls[i].destination, out + offsets[i]) << i;
    EXPECT_EQ(encoder_calls[i].capacity, 9 - offsets[i]) << i;
  }
  // With little room left the encoder still gets the real destination.
  encoder_calls.clear();
  EXPECT_EQ(
      ConvertFromUTF32(text, sizeof text, out, 3, &written, recording_encoder, COPY_UTF32b_SWAP),
      NLSSM_E_DEST_TOO_SMALL);
  ASSERT_EQ(encoder_calls.size(), 2u);
  EXPECT_EQ(encoder_calls[1].destination, out + 1);
  EXPECT_EQ(encoder_calls[1].capacity, 2);
  EXPECT_EQ(written, 1);
}

// Every encoder of the module, every capacity: nothing past the capacity.
TEST(FromUtf32Driver, ModuleEncodersNeverWritePastTheCapacity) {
  const uint32_t text[] = {'a', 0xE9, 0x20AC, 0x1F600, 'z', 0xD800, 0x10FFFF};
  for (NLSUTFEncoder enc : {UTF32_UTF8, UTF16_UTF8, COPY_UTF32, COPY_UTF32_SWAP, UTF32_UTF16,
                            UTF32_UTF16_SWAP, UTF32_UTF16s, UTF32_UTF16s_SWAP}) {
    for (int64_t capacity = 0; capacity <= 32; ++capacity) {
      std::vector<uint8_t> out(static_cast<size_t>(capacity) + 8, 0xEE);
      int64_t written = -1;
      ConvertFromUTF32(text, sizeof text, out.data(), capacity, &written, enc, COPY_UTF32b_SWAP);
      EXPECT_LE(written, capacity);
      for (size_t i = static_cast<size_t>(capacity); i < out.size(); ++i)
        ASSERT_EQ(out[i], 0xEE) << "capacity " << capacity << " byte " << i;
    }
  }
}

// The encoding driver with a chosen block step (null: unit by unit).
template <typename Policy>
struct StepEncoder : nlssm::unicode::PolicyEncoder<Policy> {
  nlssm::unicode::Utf32BlockStep step;
  nlssm::unicode::Utf32BlockStep block_step() const { return step; }
};

template <typename Policy, nlssm::unicode::Order In>
int64_t from_utf32_with(nlssm::unicode::Utf32BlockStep step, const std::vector<uint8_t> &units,
                        std::vector<uint8_t> &out, int64_t capacity, int64_t *written) {
  namespace u = nlssm::unicode;
  return u::convert_from_utf32(units.data(), static_cast<int64_t>(units.size()), out.data(),
                               capacity, written, StepEncoder<Policy>{{}, step},
                               u::PolicyDecoder<u::Utf32Decoder<In>>{});
}

// Every block step against the unit-by-unit loop, on runs of one UTF-8
// length (the shapes the steps special-case) and on mixtures, including
// surrogates and values past 0x10FFFF, with capacities that cut blocks.
TEST(FromUtf32Driver, BlockStepsMatchTheUnitLoop) {
  namespace u = nlssm::unicode;
  std::vector<u::Utf32BlockStep> steps;
  for (auto isa : kernel::cpu::kAllIsas) {
    const auto step = u::utf32_block_step(isa);
    if (step != nullptr && kernel::cpu::supports(isa) &&
        std::find(steps.begin(), steps.end(), step) == steps.end())
      steps.push_back(step);
  }
  std::mt19937 rng(20261122);
  auto unit = [&](int kind) -> uint32_t {
    switch (kind) {
      case 0:
        return rng() % 0x80;
      case 1:
        return 0x80 + rng() % 0x780;
      case 2:
        return 0x800 + rng() % 0xF800;  // surrogates included
      case 3:
        return 0x10000 + rng() % 0x100000;
      default:
        return rng() % 2 ? rng() : 0x110000 + rng() % 0x1000;
    }
  };
  using Convert = int64_t (*)(u::Utf32BlockStep, const std::vector<uint8_t> &,
                              std::vector<uint8_t> &, int64_t, int64_t *);
  const Convert converts[] = {&from_utf32_with<u::Utf8Encoder, u::Order::little>,
                              &from_utf32_with<u::Utf8Encoder, u::Order::big>,
                              &from_utf32_with<u::Utf16Encoder<u::Order::little>, u::Order::little>,
                              &from_utf32_with<u::Utf16Encoder<u::Order::big>, u::Order::big>};
  for (int round = 0; round < 3000; ++round) {
    const size_t count = rng() % 200;
    const int only = rng() % 6;  // 5: any mixture
    std::vector<uint8_t> units;
    for (size_t j = 0; j < count; ++j) {
      const uint32_t c = unit(only < 5 ? only : rng() % 5);
      for (int b = 0; b < 4; ++b) units.push_back(static_cast<uint8_t>(c >> (8 * b)));
    }
    if (rng() % 4 == 0) units.push_back(0x41);  // a trailing partial unit
    const int64_t capacity = rng() % 2 ? int64_t(rng() % (4 * count + 8)) : 4 * 200 + 8;
    for (Convert convert : converts) {
      std::vector<uint8_t> slow(4 * 200 + 24, 0xEE);
      int64_t slowWritten = -1;
      const int64_t slowStatus = convert(nullptr, units, slow, capacity, &slowWritten);
      for (auto step : steps) {
        std::vector<uint8_t> fast(slow.size(), 0xEE);
        int64_t fastWritten = -1;
        ASSERT_EQ(convert(step, units, fast, capacity, &fastWritten), slowStatus) << round;
        ASSERT_EQ(fastWritten, slowWritten) << round;
        ASSERT_EQ(fast, slow) << round;
      }
    }
  }
}

// Leads beyond F7 lie outside the sweep against ICU: followed by
// continuation bytes they still read as legal.
TEST(IsLegalUtf8, AcceptsALeadBeyondF7) {
  const uint8_t bytes[] = {0xFC, 0x80, 0x80, 0x80, 0x80};
  int64_t index = -1;
  EXPECT_EQ(isLegalUTF8(bytes, 5, &index), 1);
  EXPECT_EQ(index, 5);
}

TEST(Utf8Length, VectorPathsMatchTheScalarRule) {
  namespace u = nlssm::unicode;
  std::mt19937 rng(7);
  const uint32_t edges[] = {0,       0x7F,     0x80,       0x7FF,      0x800,      0xFFFF,
                            0x10000, 0x10FFFF, 0x7FFFFFFF, 0x80000000, 0xFFFFFFFF, 0x8000007F};
  std::vector<uint32_t> chars(300);
  for (auto &c : chars) c = rng() % 3 == 0 ? edges[rng() % 12] : rng() >> (rng() % 32);
  for (size_t start = 0; start < 9; ++start) {
    for (int64_t count : {0, 1, 3, 4, 7, 8, 15, 16, 17, 31, 33, 100, 291}) {
      const uint32_t *p = chars.data() + start;
      const int64_t expected = u::utf8_length_scalar(p, count);
      EXPECT_EQ(u::utf8_length_sse2(p, count), expected);
      if (u::avx2_usable()) {
        EXPECT_EQ(u::utf8_length_avx2(p, count), expected);
      }
      EXPECT_EQ(GET_UTF8_LEN_FROM_QVCHAR(p, count), expected);
    }
  }
  EXPECT_EQ(GET_UTF8_LEN_FROM_QVCHAR(nullptr, 5), 0);
  EXPECT_EQ(GET_UTF8_LEN_FROM_QVCHAR(edges, -1), 0);
  EXPECT_EQ(GET_UTF8_LEN_FROM_QVCHAR(edges, 12), 1 + 1 + 2 + 2 + 3 + 3 + 4 * 6);
}

}  // namespace
