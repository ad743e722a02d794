// Transliterate, tranword, squeeze and remove-delimiters on reference-host
// handles of every class, through the handle's slots, plain and raw-buffer
// forms alike. Texts are written in UTF-8 with W standing for a character
// of more than one byte where the encoding has one, and converted by ICU.
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <unicode/ucnv.h>
#include <unicode/utf8.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <cstring>
#include <random>
#include <string>
#include <utility>
#include <vector>

namespace {

using nlssm::refhost::ReferenceHost;
using Bytes = std::string;
constexpr int64_t kTooSmall = NLSSM_E_DEST_TOO_SMALL;
constexpr int kUtfe = 161;

using test_support::handle;
using test_support::host;

const uint8_t *u(const Bytes &b) {
  return reinterpret_cast<const uint8_t *>(b.data());
}
int64_t len(const Bytes &b) {
  return static_cast<int64_t>(b.size());
}

template <typename Fn>
Fn slot(NLSSlot s) {
  return reinterpret_cast<Fn>(s);
}

Bytes icu_convert(const char *to, const char *from, const Bytes &text) {
  std::vector<char> out(text.size() * 4 + 16);
  UErrorCode e = U_ZERO_ERROR;
  const int32_t n = ucnv_convert(to, from, out.data(), static_cast<int32_t>(out.size()),
                                 text.data(), static_cast<int32_t>(text.size()), &e);
  EXPECT_TRUE(U_SUCCESS(e)) << u_errorName(e);
  return Bytes(out.data(), static_cast<size_t>(n));
}

// UTF-8 text into an encoding, and back.
Bytes encode(int encoding, const Bytes &utf8) {
  if (encoding != kUtfe)
    return icu_convert(ReferenceHost::registry().find(encoding)->converter.c_str(), "UTF-8", utf8);
  Bytes out;
  for (int32_t i = 0; i < static_cast<int32_t>(utf8.size());) {
    UChar32 c;
    U8_NEXT(utf8.data(), i, static_cast<int32_t>(utf8.size()), c);
    uint8_t b[8];
    out.append(reinterpret_cast<char *>(b), static_cast<size_t>(ToUTFE(handle(kUtfe), c, b)));
  }
  return out;
}

Bytes decode(int encoding, const Bytes &text) {
  if (encoding != kUtfe)
    return icu_convert("UTF-8", ReferenceHost::registry().find(encoding)->converter.c_str(), text);
  Bytes out;
  for (size_t i = 0; i < text.size();) {
    uint32_t c = 0;
    const int64_t n = FromUTFE(handle(kUtfe), reinterpret_cast<const uint8_t *>(&text[i]), &c);
    if (n <= 0) return out + "?";
    i += static_cast<size_t>(n);
    char b[4];
    int32_t k = 0;
    U8_APPEND_UNSAFE(b, k, c);
    out.append(b, static_cast<size_t>(k));
  }
  return out;
}

// A destination of `capacity` bytes followed by guard bytes.
struct Dest {
  std::vector<uint8_t> bytes;
  NLSString d{};
  explicit Dest(int64_t capacity) : bytes(static_cast<size_t>(capacity) + 16, 0xEE) {
    d.buffer = bytes.data();
    d.capacity = static_cast<uint64_t>(capacity);
    d.curOffset = d.nextOffset = NLSSM_POS_NONE;
    d.prevOffset = NLSSM_POS_NO_PREVIOUS;
  }
  bool guards_intact() const {
    for (size_t i = d.capacity; i < bytes.size(); ++i)
      if (bytes[i] != 0xEE) return false;
    return true;
  }
  Bytes text() const { return Bytes(reinterpret_cast<const char *>(bytes.data()), d.length); }
};

struct Out {
  int64_t status;
  Bytes text;
};

struct Case {
  int encoding;
  const char *wide;  // replaces W in the texts
};

class CopyEdits : public ::testing::TestWithParam<Case> {
 protected:
  void SetUp() override {
    h = handle(GetParam().encoding);
    ASSERT_NE(h, nullptr);
  }
  Bytes utf8(std::string s) const {
    for (size_t at; (at = s.find('W')) != std::string::npos;) s.replace(at, 1, GetParam().wide);
    return s;
  }
  Bytes enc(const std::string &s) const { return encode(GetParam().encoding, utf8(s)); }
  Bytes dec(const Bytes &text) const { return decode(GetParam().encoding, text); }

  // A descriptor over `text` at its first character.
  NLSString over(const Bytes &text, int64_t at = 0) const {
    NLSString s{};
    s.buffer = reinterpret_cast<uint8_t *>(const_cast<char *>(text.data()));
    s.length = s.capacity = text.size();
    s.curOffset = text.empty() ? NLSSM_POS_NONE : 0;
    s.nextOffset = NLSSM_POS_NONE;
    s.prevOffset = NLSSM_POS_NO_PREVIOUS;
    if (!text.empty()) slot<SetPosFn>(h->stringSetPos)(h, &s, at, 0);
    return s;
  }

  // Runs an operation through its plain slot into a fresh destination, and,
  // when `raw` is given, through its S slot too, expecting the same result.
  template <typename Plain, typename Raw>
  Out run(int64_t capacity, Plain plain, Raw raw) const {
    Dest dst(capacity);
    int64_t written = -1;
    const int64_t status = plain(&dst.d, &written);
    EXPECT_TRUE(dst.guards_intact());
    EXPECT_EQ(written, static_cast<int64_t>(dst.d.length));
    if constexpr (!std::is_same_v<Raw, std::nullptr_t>) {
      Dest raw_dst(capacity);
      int64_t raw_written = -1;
      EXPECT_EQ(raw(raw_dst.bytes.data(), capacity, &raw_written), status);
      EXPECT_TRUE(raw_dst.guards_intact());
      EXPECT_EQ(Bytes(reinterpret_cast<char *>(raw_dst.bytes.data()), raw_written), dst.text());
    }
    return {status, dst.text()};
  }

  Out translit(const Bytes &s, const Bytes &to, const Bytes &from, int64_t pairs = 0,
               int64_t capacity = 64, int64_t n = 0) const {
    const Bytes src = enc(s), t = enc(to), f = enc(from);
    const NLSString sd = over(src), td = over(t), fd = over(f);
    auto plain = [&](NLSString *d, int64_t *w) {
      return slot<decltype(&NLSStringTransliterate_SBCS)>(h->NLSStringTransliterate)(
          h, &sd, n, &td, &fd, pairs, d, w, 0);
    };
    auto raw = [&](uint8_t *d, int64_t cap, int64_t *w) {
      return slot<decltype(&NLSStringTransliterateS_SBCS)>(h->NLSStringTransliterateS)(
          h, u(src), len(src), u(t), len(t), u(f), len(f), pairs, d, cap, w, 0);
    };
    return n == 0 ? run(capacity, plain, raw) : run(capacity, plain, nullptr);
  }

  Out tranword(const Bytes &s, const Bytes &find, const Bytes &repl, int64_t findLength,
               int64_t n = 0, int64_t capacity = 64) const {
    const Bytes src = enc(s), f = enc(find), r = enc(repl);
    const NLSString sd = over(src), fd = over(f), rd = over(r);
    auto plain = [&](NLSString *d, int64_t *w) {
      return slot<decltype(&NLSStringTranword_SBCS)>(h->NLSStringTranword)(h, &sd, n, &rd, 0, &fd,
                                                                           findLength, d, w, 0);
    };
    auto raw = [&](uint8_t *d, int64_t cap, int64_t *w) {
      return slot<decltype(&NLSStringTranwordS_SBCS)>(h->NLSStringTranwordS)(
          h, u(src), len(src), u(r), len(r), u(f), len(f), d, cap, w, 0);
    };
    // The raw form counts n down by the find word itself; compare where that agrees.
    const bool whole = n == 0 && findLength > 0;
    return whole ? run(capacity, plain, raw) : run(capacity, plain, nullptr);
  }

  Out squeeze(const Bytes &s, const Bytes &ch, int64_t n = 0, int64_t capacity = 64) const {
    const Bytes src = enc(s), c = enc(ch);
    const NLSString sd = over(src), cd = over(c);
    auto plain = [&](NLSString *d, int64_t *w) {
      return slot<decltype(&NLSStringSqueeze_SBCS)>(h->NLSStringSqueeze)(h, &sd, n, &cd, d, w);
    };
    auto raw = [&](uint8_t *d, int64_t cap, int64_t *w) {
      return slot<decltype(&NLSStringSqueezeS_SBCS)>(h->NLSStringSqueezeS)(h, u(src), len(src),
                                                                           u(c), len(c), d, cap, w);
    };
    return n == 0 ? run(capacity, plain, raw) : run(capacity, plain, nullptr);
  }

  Out unquote(const Bytes &s, int64_t capacity = 64) const {
    const Bytes src = enc(s);
    const NLSString sd = over(src);
    auto plain = [&](NLSString *d, int64_t *w) {
      return slot<decltype(&NLSStringRemoveDelimiters_SBCS)>(h->NLSStringRemoveDelimiters)(h, &sd,
                                                                                           d, w);
    };
    auto raw = [&](uint8_t *d, int64_t cap, int64_t *w) {
      return slot<decltype(&NLSStringRemoveDelimitersS_SBCS)>(h->NLSStringRemoveDelimitersS)(
          h, u(src), len(src), d, cap, w);
    };
    return run(capacity, plain, raw);
  }

  void expect(const Out &out, int64_t status, const Bytes &text) const {
    EXPECT_EQ(out.status, status);
    EXPECT_EQ(dec(out.text), utf8(text));
    EXPECT_EQ(out.text, enc(text));  // whole characters, balanced shifts
  }

  using SetPosFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);

  const NLSSMHandle *h = nullptr;
};

TEST_P(CopyEdits, TransliterateReplacesByPairsFirstMatchWinning) {
  expect(translit("abc", "X", "ab"), 0, "Xbc");  // pair count 0: the shorter list
  expect(translit("aWba", "Wa", "aW"), 0, "WabW");
  expect(translit("aab", "XY", "aa"), 0, "XXb");
  expect(translit("ab", "XY", "ab", 1), 0, "Xb");
  expect(translit("ab", "XY", "ab", 99), 0, "XY");
  expect(translit("abab", "X", "a", 0, 64, 3), 0, "XbX");
  expect(translit("abW", std::string(68, 'c') + "XY", std::string(68, 'b') + "aW"), 0, "XcY");
}

TEST_P(CopyEdits, TranwordReplacesWholeWordsWithoutOverlap) {
  expect(tranword("aaaa", "aa", "b", 2, 4), 0, "bb");
  expect(tranword("aaaa", "aa", "b", 0, 4), 0, "b");  // find length 0 uses n up at once
  expect(tranword("aaa", "aa", "a", 2), 0, "aa");
  expect(tranword("aWWbWW", "WW", "c", 2), 0, "acbc");
  expect(tranword("abcab", "ab", "", 2), 0, "c");
  expect(tranword("abcab", "", "x", 1), 0, "abcab");
  expect(tranword("abcabc", "c", "WW", 1, 4), 0, "abWWa");
  expect(tranword("xab", "ab", "c", 2, 2), 0, "xc");  // a match that n reaches is replaced whole
}

TEST_P(CopyEdits, SqueezeReducesRunsOfOneCharacter) {
  expect(squeeze("a   b", " "), 0, "a b");
  expect(squeeze("WWWxWW", "W"), 0, "WxW");
  expect(squeeze("aaab", "a", 2), 0, "a");
  expect(squeeze("aa  b", ""), 0, "aa  b");
}

TEST_P(CopyEdits, RemoveDelimitersUndoublesAndDropsTheClosingOne) {
  expect(unquote("\"a\"\"b\""), 0, "a\"b");
  expect(unquote("WaWWbW"), 0, "aWb");
  expect(unquote("\"\""), 0, "");
  expect(unquote("\""), kTooSmall, "");
  expect(unquote(""), kTooSmall, "");
}

// Every room from none to enough: whole characters only, shift sequences
// balanced, and the status each operation gives for a full destination.
TEST_P(CopyEdits, SmallDestinationsHoldWholeCharacters) {
  const Bytes full = enc("aWbW \"");
  for (int64_t cap = 0; cap <= len(full) + 4; ++cap) {
    const Out t = translit("aWbW \"", "X", "Y", 0, cap);
    const Out s = squeeze("aWbW \"", "Y", 0, cap);
    const Out q = unquote("\"aWbW \"\"\"", cap);
    for (const Out &o : {t, s, q}) {
      EXPECT_EQ(o.text, encode(GetParam().encoding, dec(o.text))) << cap;
      EXPECT_EQ(utf8("aWbW \"").rfind(dec(o.text), 0), 0u) << cap;
    }
    const bool fits = cap >= len(full);
    EXPECT_EQ(t.status, fits ? 0 : kTooSmall) << cap;
    EXPECT_EQ(s.status, fits ? 0 : kTooSmall) << cap;
    EXPECT_EQ(q.status, 0) << cap;
    // A replacement that does not fit: the source is copied on as far as it fits.
    const Out w = tranword("aWbW", "b", "WWWWWW", 1, 0, cap);
    if (cap >= len(enc("aWWWWWWWW"))) {
      expect(w, 0, "aWWWWWWWW");
    } else {
      EXPECT_EQ(w.status, kTooSmall) << cap;
      const bool replaced = utf8("aWWWWWWWW").rfind(dec(w.text), 0) == 0;
      EXPECT_TRUE(replaced || utf8("aWbW").rfind(dec(w.text), 0) == 0) << cap;
    }
  }
}

TEST_P(CopyEdits, DestinationUpdateFromItsPosition) {
  const Bytes src = enc("ab"), c = enc("Y"), base = enc("xWz");
  const NLSString sd = over(src), cd = over(c);
  auto squeeze_into = [&](NLSString *d) {
    int64_t w = 0;
    EXPECT_EQ(slot<decltype(&NLSStringSqueeze_SBCS)>(h->NLSStringSqueeze)(h, &sd, 0, &cd, d, &w),
              0);
    return w;
  };
  Dest unset(16);
  EXPECT_EQ(squeeze_into(&unset.d), len(src));
  EXPECT_EQ(unset.d.curOffset, 0);
  EXPECT_EQ(unset.d.nextOffset, 1);
  EXPECT_EQ(unset.text(), src);

  Bytes positioned = base + Bytes(16, '\0');
  NLSString pd = over(positioned, 2);  // at z
  pd.length = base.size();
  const int64_t at = pd.curOffset;
  EXPECT_EQ(squeeze_into(&pd), len(src));
  EXPECT_EQ(pd.nextOffset, at + 1);
  EXPECT_EQ(positioned.substr(0, pd.length), base.substr(0, static_cast<size_t>(at)) + src);

  // Written over a character inside a double-byte run, the text still reads.
  positioned = base + Bytes(16, '\0');
  pd = over(positioned, 1);
  pd.length = base.size();
  squeeze_into(&pd);
  EXPECT_EQ(dec(positioned.substr(0, pd.length)), "xab");
}

// A destination over the source's own text: the result is built in a work
// buffer (the pool's beyond 2048 bytes, given back; the stack's when the
// pool refuses, with the room cut to 2048) and lands at the buffer's start.
TEST_P(CopyEdits, OverlappingDestinationWorksInACopy) {
  const Bytes unit = enc("a");
  for (int64_t count : {3, 3000}) {
    for (bool refuse : {false, true}) {
      Bytes text;
      for (int64_t i = 0; i < count; ++i) text += unit;
      text = enc("b") + text;
      NLSString s = over(text, 1);
      NLSString d = over(text);
      const Bytes x = enc("X"), a = enc("a");
      const NLSString xd = over(x), ad = over(a);
      const auto before = nlssm::refhost::PoolRegistry::counts_of(h->pool);
      host().pools().fail_all_allocations(refuse);
      int64_t w = 0;
      const int64_t status = slot<decltype(&NLSStringTransliterate_SBCS)>(
          h->NLSStringTransliterate)(h, &s, 0, &xd, &ad, 0, &d, &w, 0);
      host().pools().fail_all_allocations(false);
      const auto after = nlssm::refhost::PoolRegistry::counts_of(h->pool);
      EXPECT_EQ(after.allocations, before.allocations);
      const bool cut = refuse && len(text) > 2048;
      EXPECT_EQ(status, cut ? kTooSmall : 0);
      EXPECT_EQ(d.charIndex, 0);
      EXPECT_EQ(d.curOffset, 0);
      EXPECT_LE(d.length, cut ? 2048u : text.size());
      EXPECT_EQ(w, static_cast<int64_t>(d.length));
      const Bytes got = dec(text.substr(0, d.length));
      EXPECT_EQ(got.find_first_not_of('X'), std::string::npos);
      if (!cut) {
        EXPECT_EQ(static_cast<int64_t>(got.size()), count);
      }
    }
  }
}

INSTANTIATE_TEST_SUITE_P(
    EveryClass, CopyEdits,
    ::testing::Values(Case{29, "é"}, Case{78, "é"}, Case{20, "日"}, Case{kUtfe, "日"},
                      Case{25, "😀"}, Case{24, "日"}, Case{26, "😀"}, Case{27, "日"}, Case{129, "日"},
                      Case{135, "日"}, Case{134, "日"}, Case{119, "日"}, Case{205, "😀"}),
    [](const auto &info) { return "enc" + std::to_string(info.param.encoding); });

// ---- Literal forms -------------------------------------------------------------

TEST(CopyEditLiterals, ListsAndSqueezeCharacterArriveInTheLiteralEncoding) {
  for (int encoding : {78, 24, 129}) {
    const NLSSMHandle *h = handle(encoding);
    const Bytes src = encode(encoding, "abba  c");
    NLSString sd{};
    sd.buffer = reinterpret_cast<uint8_t *>(const_cast<char *>(src.data()));
    sd.length = sd.capacity = src.size();
    sd.curOffset = 0;
    Dest dst(32);
    int64_t w = 0, chars = 0;
    EXPECT_EQ(slot<decltype(&NLSStringTransliterateLit)>(h->NLSStringTransliterateLit)(
                  h, &sd, 0, reinterpret_cast<const uint8_t *>("XY"), 2,
                  reinterpret_cast<const uint8_t *>("ab"), 2, 0, &dst.d, &w, 0),
              0);
    EXPECT_EQ(decode(encoding, dst.text()), "XYYX  c");
    uint8_t out[32];
    EXPECT_EQ(slot<decltype(&NLSStringSqueezeLitS)>(h->NLSStringSqueezeLitS)(
                  h, reinterpret_cast<const uint8_t *>(src.data()), len(src), nullptr, 0, out, 32,
                  &w, &chars, 0),
              0);  // an empty literal squeezes blanks
    EXPECT_EQ(decode(encoding, Bytes(reinterpret_cast<char *>(out), w)), "abba c");
    EXPECT_EQ(chars, 6);
  }
}

TEST(CopyEditLiterals, SqueezeLiteralBufferComesFromThePool) {
  const NLSSMHandle *h = handle(20);
  const std::string literal(400, 'b');  // beyond the stack area once converted
  const Bytes src = "abbbc";
  uint8_t out[16];
  int64_t w = 0, chars = 0;
  const auto squeeze = [&] {
    return slot<decltype(&NLSStringSqueezeLitS)>(h->NLSStringSqueezeLitS)(
        h, reinterpret_cast<const uint8_t *>(src.data()), len(src),
        reinterpret_cast<const uint8_t *>(literal.data()), len(literal), out, 16, &w, &chars, 0);
  };
  const auto before = nlssm::refhost::PoolRegistry::counts_of(h->pool);
  EXPECT_EQ(squeeze(), 0);
  EXPECT_EQ(Bytes(reinterpret_cast<char *>(out), w), "abc");
  EXPECT_EQ(nlssm::refhost::PoolRegistry::counts_of(h->pool).allocations, before.allocations);
  host().pools().fail_all_allocations(true);
  EXPECT_EQ(squeeze(), NLSSM_E_NO_MEMORY);
  host().pools().fail_all_allocations(false);
}

}  // namespace

// UTF text, broken sequences included, through both tranword paths: the
// block scan (no limit) and the character walk (an explicit n).
TEST(CopyEditTranword, ScanAndWalkAgreeOnAnyBytes) {
  std::mt19937 rng(15);
  for (int encoding : {20, kUtfe}) {
    const NLSSMHandle *h = handle(encoding);
    const Bytes alphabet = encoding == 20 ? Bytes("ab\xC3\xA9\xE6\x97\xA5\x80\xF0")
                                          : Bytes("\x81\x82\xB8\x41\x73\xDC\x68\x56\x46\xFF");
    auto random = [&](size_t n) {
      Bytes s;
      while (s.size() < n) s += alphabet[rng() % alphabet.size()];
      return s;
    };
    for (int round = 0; round < 2000; ++round) {
      const Bytes src = random(rng() % 24), find = random(1 + rng() % 3), repl = random(rng() % 3);
      NLSString sd{}, fd{}, rd{};
      for (auto [d, b] : {std::pair{&sd, &src}, {&fd, &find}, {&rd, &repl}}) {
        d->buffer = const_cast<uint8_t *>(u(*b));
        d->length = d->capacity = b->size();
        d->curOffset = b->empty() ? NLSSM_POS_NONE : 0;
      }
      int64_t chars = 0, find_chars = 0;
      reinterpret_cast<decltype(&NLSNumCharsS_UTF8)>(h->NLSNumCharsS)(h, u(find), len(find), 0,
                                                                      &find_chars);
      reinterpret_cast<decltype(&NLSNumCharsS_UTF8)>(h->NLSNumCharsS)(h, u(src), len(src), 0,
                                                                      &chars);
      Dest walk(64);
      uint8_t scan[64];
      int64_t wn = 0, sn = 0;
      const int64_t ws =
          NLSStringTranword_UTF8(h, &sd, chars + 1, &rd, 1, &fd, find_chars, &walk.d, &wn, 0);
      const int64_t ss = NLSStringTranwordS_UTF8(h, u(src), len(src), u(repl), len(repl), u(find),
                                                 len(find), scan, 64, &sn, 0);
      ASSERT_EQ(ws, ss);
      ASSERT_EQ(walk.text(), Bytes(reinterpret_cast<char *>(scan), static_cast<size_t>(sn)))
          << encoding << " round " << round;
    }
  }
}
