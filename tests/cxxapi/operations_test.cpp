// The C++ layer's operations on real handles of every class: each answer is
// checked as UTF-8, so a wrong slot, prototype, sizing or result reading
// shows whatever the encoding.
#include <gtest/gtest.h>

#include <nlssm/nlssm.hpp>

#include <string>

namespace {

nlssm::Host &host() {
  static nlssm::Host h = nlssm::Host::start();
  return h;
}

// An encoding, a character outside ASCII that it holds, and that
// character's upper case.
struct Sample {
  const char *name;
  const char *wide;
  const char *wide_upper;
};

class CxxOperations : public testing::TestWithParam<Sample> {
 protected:
  nlssm::Encoding enc() const { return *host().encoding(GetParam().name); }
  nlssm::Text text(const std::string &utf8) const { return *nlssm::Text::from_utf8(enc(), utf8); }
  // "A<wide>b" and friends, with the sample's own character.
  std::string w(const std::string &pattern, bool upper = false) const {
    std::string out;
    for (char c : pattern)
      out += c != '*' ? std::string(1, c) : upper ? GetParam().wide_upper : GetParam().wide;
    return out;
  }
  static std::string shown(const nlssm::Result<nlssm::Text> &t) {
    if (!t) return std::string("<") + t.status().name() + ">";
    return t->to_utf8().value_or("<not convertible>");
  }
};

TEST_P(CxxOperations, SearchesAnswerCharacterPositions) {
  const auto t = text(w("A*b*ba"));
  EXPECT_EQ(t.index(text("ba")).value_or(-2), 4);
  EXPECT_EQ(t.index(text("zz")).value_or(-2), -1);
  EXPECT_TRUE(t.contains(text(w("*b"))).value_or(false));
  EXPECT_EQ(t.find_char(text("b")).value_or(-2), 2);
  EXPECT_EQ(t.find_literal('a').value_or(-2), 5);
  EXPECT_EQ(t.verify(text(w("A*"))).value_or(-2), 2);
  EXPECT_EQ(t.verify_literal("Aab").value_or(-2), 1);
  EXPECT_TRUE(t.like(text(w("A%*ba"))).value_or(false));
  EXPECT_FALSE(t.like(text("A_a%")).value_or(true));
}

TEST_P(CxxOperations, ComparesAndClassifies) {
  const auto t = text("Abc9 ");
  EXPECT_TRUE(t.equals(text("aBC9 ")).value_or(false));
  EXPECT_TRUE(t.equals(text("abc9"), true).value_or(false));
  EXPECT_FALSE(t.equals(text("abc9")).value_or(true));
  const auto order = t.compare(text("Abd"));
  ASSERT_TRUE(order) << order.status().name();
  EXPECT_EQ(order->sign, -1);
  EXPECT_EQ(order->offset, 2 * enc().unit_width());
  EXPECT_EQ(t.compare(text("ABC9 "), {.fold = nlssm::Fold::upper})->sign, 0);
  EXPECT_EQ(t.compare(text("Abc9"), {.pad = true})->sign, 0);
  EXPECT_EQ(t.compare_literal("Abc9 ")->sign, 0);
  EXPECT_TRUE(t.is_upper(0).value_or(false));
  EXPECT_TRUE(t.is_lower(1).value_or(false));
  EXPECT_TRUE(t.is_digit(3).value_or(false));
  EXPECT_TRUE(t.is_space(4).value_or(false));
  EXPECT_TRUE(t.is_hex_digit(2).value_or(false));
  EXPECT_FALSE(t.is_graphic(4).value_or(true));
  EXPECT_FALSE(t.is_digit(9).value_or(true));  // no such character
  EXPECT_TRUE(
      text("AbC").all_are(nlssm::CharClass::upper | nlssm::CharClass::lower).value_or(false));
  EXPECT_FALSE(t.all_are(nlssm::CharClass::upper | nlssm::CharClass::lower).value_or(true));
}

TEST_P(CxxOperations, EditsInPlace) {
  auto t = text(w("ab*  "));
  ASSERT_TRUE(t.strip());
  EXPECT_EQ(t.to_utf8().value_or(""), w("ab*"));
  ASSERT_TRUE(t.reverse());
  EXPECT_EQ(t.to_utf8().value_or(""), w("*ba"));
  auto field = text("  ab  ");
  ASSERT_TRUE(field.justify(nlssm::Align::right));
  EXPECT_EQ(field.to_utf8().value_or(""), "    ab");
  auto kept = text(w("a*ba-c"));
  EXPECT_EQ(kept.erase_chars(text(w("*b"))).value_or(-1), 4 * enc().unit_width());
  EXPECT_EQ(kept.erase_literal("-").value_or(-1), kept.byte_length() - enc().unit_width());
  kept.strip();
  EXPECT_EQ(kept.to_utf8().value_or(""), "aac");
}

TEST_P(CxxOperations, MapsCaseInPlaceAndIntoCopies) {
  auto t = text(w("ab*Cd"));
  ASSERT_TRUE(t.upper());
  EXPECT_EQ(t.to_utf8().value_or(""), w("AB*CD", true));
  ASSERT_TRUE(t.lower());
  EXPECT_EQ(t.to_utf8().value_or(""), w("ab*cd"));
  EXPECT_EQ(shown(text(w("x*Y")).normalized()), w("X*Y", true));
  EXPECT_EQ(shown(text(w("X*y", true)).normalized(nlssm::Case::lower)), w("x*y"));
}

TEST_P(CxxOperations, WritesNewTexts) {
  const auto t = text(w("a*\"b"));
  EXPECT_EQ(shown(t.substr(1, 2)), w("*\""));
  EXPECT_EQ(shown(t.substr(2)), "\"b");
  EXPECT_EQ(shown(t.substr(4)), "");
  EXPECT_EQ(shown(t.quoted()), w("\"a*\"\"b\""));
  EXPECT_EQ(shown(t.quoted()->unquoted()), w("a*\"b"));
  EXPECT_EQ(shown(t.concat(text("x"), text(w("*")))), w("a*\"bx*"));
  EXPECT_EQ(shown(text("a").join(',', text("b"), text(w("*")))), w("a,b,*"));
  EXPECT_EQ(shown(t.transliterate(text(w("B*")), text(w("b\"")))), w("a**B"));
  EXPECT_EQ(shown(text("x.y..z").transliterate_literal("-", ".")), "x-y--z");
  EXPECT_EQ(shown(text(w("ab*ab")).tranword(text("ab"), text(w("[*]")))), w("[*]*[*]"));
  EXPECT_EQ(shown(text(w("a**b**")).squeeze(text(w("*")))), w("a*b*"));
  EXPECT_EQ(shown(text("a   b").squeeze_literal("")), "a b");
}

// The first room is sized from the source; these need the layer to grow it.
TEST_P(CxxOperations, GrowsTheDestinationUntilTheResultFits) {
  const std::string quotes(40, '"');
  EXPECT_EQ(shown(text(quotes).quoted()), '"' + std::string(80, '"') + '"');
  const std::string long_word(60, 'w');
  EXPECT_EQ(shown(text("x-x-x").tranword(text("x"), text(long_word))),
            long_word + "-" + long_word + "-" + long_word);
}

TEST_P(CxxOperations, FitsIntoFixedRooms) {
  const int64_t unit = enc().unit_width();
  const auto padded = text("ab").move_to(6 * unit);
  ASSERT_TRUE(padded);
  EXPECT_TRUE(padded->complete);
  EXPECT_EQ(padded->text.to_utf8().value_or(""), "ab    ");
  const auto cut = text("abcdef").move_to(4 * unit);
  ASSERT_TRUE(cut);
  EXPECT_FALSE(cut->complete);
  EXPECT_EQ(cut->text.to_utf8().value_or(""), "abcd");
  const auto stars = text("*").fill(3 * unit);
  ASSERT_TRUE(stars);
  EXPECT_EQ(stars->text.to_utf8().value_or(""), "***");
  const auto dashes = nlssm::Text::fill_literal(enc(), '-', 2 * unit);
  ASSERT_TRUE(dashes);
  EXPECT_EQ(dashes->text.to_utf8().value_or(""), "--");
}

TEST_P(CxxOperations, ParsesAndFormatsNumbers) {
  EXPECT_EQ(text("  -1234 ").to_integer(true).value_or(0), -1234);
  EXPECT_EQ(text("12x").to_integer().status().code(), NLSSM_E_NOT_A_NUMBER);
  EXPECT_DOUBLE_EQ(text("2.5e3").to_double().value_or(0), 2500.0);
  EXPECT_EQ(shown(nlssm::Text::from_integer(enc(), -42, 6)), "   -42");
  EXPECT_EQ(nlssm::Text::from_integer(enc(), 123456, 3).status().code(),
            NLSSM_E_NUMBER_DOES_NOT_FIT);
  EXPECT_EQ(shown(nlssm::Text::from_double(enc(), 3.14159, 0, 2)), "3.14");
}

TEST_P(CxxOperations, CodePointsRoundTrip) {
  const auto t = text(w("a*"));
  const auto cps = t.code_points();
  ASSERT_TRUE(cps) << cps.status().name();
  ASSERT_EQ(cps->size(), 2u);
  EXPECT_EQ((*cps)[0], U'a');
  EXPECT_EQ(nlssm::Text::from_code_points(enc(), *cps).value_or(text("")), t);
}

INSTANTIATE_TEST_SUITE_P(
    Classes, CxxOperations,
    testing::Values(Sample{"IBM-037", "é", "É"}, Sample{"ISO-8859-1", "é", "É"},
                    Sample{"UTF-8", "日", "日"}, Sample{"UTF-16BE", "日", "日"},
                    Sample{"UTF-16LE", "é", "É"}, Sample{"UTF-32BE", "ж", "Ж"},
                    Sample{"IBM-939", "日", "日"}, Sample{"Shift_JIS", "日", "日"},
                    Sample{"EUC-JP", "日", "日"}, Sample{"GB18030", "日", "日"}),
    [](const auto &info) {
      std::string name = info.param.name;
      for (char &c : name)
        if (c == '-') c = '_';
      return name;
    });

TEST(CxxStatuses, MixedEncodingsAndEmptySlotsAnswerStatuses) {
  const auto ebcdic = *nlssm::Text::from_utf8(*host().encoding("IBM-037"), "ab");
  const auto ascii = *nlssm::Text::from_utf8(*host().encoding("UTF-8"), "ab");
  EXPECT_EQ(ebcdic.index(ascii).status().code(), NLSSM_E_ENCODING);
  EXPECT_EQ(ebcdic.concat(ascii).status().code(), NLSSM_E_ENCODING);
  // UTF-EBCDIC has no raw-buffer equality.
  const auto utfe = *nlssm::Text::from_utf8(*host().encoding("UTF-EBCDIC"), "ab");
  EXPECT_EQ(utfe.equals(utfe).status().code(), NLSSM_E_UNSUPPORTED);
  EXPECT_EQ(ascii.substr(-1).status().code(), NLSSM_E_BAD_ARGUMENT);
  // Text over an encoding without a handle answers instead of crashing.
  const nlssm::Text orphan(nlssm::Encoding{}, std::vector<uint8_t>{0x41});
  EXPECT_EQ(orphan.index(orphan).status().code(), NLSSM_E_UNSUPPORTED);
  EXPECT_EQ(orphan.substr(0).status().code(), NLSSM_E_UNSUPPORTED);
  EXPECT_EQ(orphan.to_utf8().status().code(), NLSSM_E_ENCODING);
}

}  // namespace

TEST(CxxBidi, DirectionAndOrderInEveryUnicodeForm) {
  for (const char *name : {"UTF-8", "UTF-16LE", "UTF-32BE"}) {
    SCOPED_TRACE(name);
    const auto enc = *host().encoding(name);
    const auto rtl = *nlssm::Text::from_utf8(enc, "אבג abc");
    EXPECT_EQ(rtl.base_direction().value_or(nlssm::Direction::from_text),
              nlssm::Direction::right_to_left);
    const auto shown = rtl.visual_order();
    ASSERT_TRUE(shown) << shown.status().name();
    EXPECT_EQ(shown->to_utf8().value_or(""), "abc גבא");
    EXPECT_EQ(shown->logical_order(nlssm::Direction::right_to_left)->to_utf8().value_or(""),
              "אבג abc");
  }
}

TEST(CxxCase, DoubleByteLettersOnRequest) {
  for (const char *name : {"IBM-939", "Shift_JIS", "EUC-JP", "GB18030", "UTF-8", "UTF-16BE"}) {
    SCOPED_TRACE(name);
    auto t = *nlssm::Text::from_utf8(*host().encoding(name), "ａb");
    ASSERT_TRUE(t.upper());
    EXPECT_EQ(t.to_utf8().value_or(""), "ＡB");
  }
  auto kept = *nlssm::Text::from_utf8(*host().encoding("Shift_JIS"), "ａb");
  ASSERT_TRUE(kept.upper(false));
  EXPECT_EQ(kept.to_utf8().value_or(""), "ａB");
}
