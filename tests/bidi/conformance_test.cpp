// Reordering against the Unicode conformance data: BidiTest.txt (sequences
// of classes, through the level resolution) and BidiCharacterTest.txt
// (characters with brackets, through the level resolution and through the
// UTF-32 member, whose output must be the expected order with mirroring).
#include <gtest/gtest.h>

#include <fstream>
#include <map>
#include <sstream>

#include "bidi/pairs.hpp"
#include "bidi_test_support.hpp"

namespace {

using namespace bidi_test;
namespace b = nlssm::bidi;

#if defined(__SANITIZE_ADDRESS__)
constexpr int kStride = 7;  // a sample of the lines under the sanitizers
#else
constexpr int kStride = 1;
#endif

std::vector<std::string> split(const std::string &s, char separator) {
  std::vector<std::string> parts;
  std::string part;
  std::istringstream in(s);
  while (std::getline(in, part, separator)) parts.push_back(part);
  return parts;
}
std::vector<std::string> words(const std::string &s) {
  std::vector<std::string> out;
  std::istringstream in(s);
  for (std::string w; in >> w;) out.push_back(w);
  return out;
}

bool removed(uint8_t c) {
  return c == b::LRE || c == b::RLE || c == b::LRO || c == b::RLO || c == b::PDF || c == b::BN;
}

struct Result {
  int paragraph;
  std::vector<uint8_t> levels;
  std::vector<uint32_t> order;  // without the removed characters
};

Result run(const std::vector<uint8_t> &classes, const std::vector<uint32_t> *brackets,
           int direction) {
  const auto n = static_cast<uint32_t>(classes.size());
  std::vector<uint64_t> work(b::work_bytes(n) / 8 + 1);
  Result r{0, std::vector<uint8_t>(n), {}};
  std::vector<uint32_t> order(n);
  r.paragraph = b::resolve({classes.data(), brackets ? brackets->data() : nullptr, n}, direction,
                           r.levels.data(), order.data(), work.data());
  for (uint32_t i : order)
    if (!removed(classes[i])) r.order.push_back(i);
  return r;
}

// Levels written as in the data: "x" for a removed character.
bool same_levels(const std::vector<std::string> &want, const std::vector<uint8_t> &got) {
  if (want.size() != got.size()) return false;
  for (size_t i = 0; i < want.size(); ++i)
    if (want[i] != "x" && std::stoi(want[i]) != got[i]) return false;
  return true;
}
std::vector<uint32_t> numbers(const std::string &s) {
  std::vector<uint32_t> out;
  for (const std::string &w : words(s)) out.push_back(static_cast<uint32_t>(std::stoul(w)));
  return out;
}

std::ifstream open_data(const char *name) {
  return std::ifstream(std::string(NLSSM_UNICODE_DATA_DIR) + "/" + name);
}

TEST(BidiConformance, BidiTestClassSequences) {
  std::ifstream in = open_data("BidiTest.txt");
  if (!in) GTEST_SKIP() << "BidiTest.txt not found in " NLSSM_UNICODE_DATA_DIR;
  const std::map<std::string, uint8_t> names = {
      {"L", b::L},     {"R", b::R},     {"AL", b::AL},   {"EN", b::EN},   {"ES", b::ES},
      {"ET", b::ET},   {"AN", b::AN},   {"CS", b::CS},   {"NSM", b::NSM}, {"BN", b::BN},
      {"B", b::B},     {"S", b::S},     {"WS", b::WS},   {"ON", b::ON},   {"LRE", b::LRE},
      {"LRO", b::LRO}, {"RLE", b::RLE}, {"RLO", b::RLO}, {"PDF", b::PDF}, {"LRI", b::LRI},
      {"RLI", b::RLI}, {"FSI", b::FSI}, {"PDI", b::PDI}};
  std::vector<std::string> levels;
  std::vector<uint32_t> order;
  long cases = 0, passed = 0, line = 0;
  for (std::string text; std::getline(in, text);) {
    if (text.empty() || text[0] == '#') continue;
    if (text.rfind("@Levels:", 0) == 0) {
      levels = words(text.substr(8));
      continue;
    }
    if (text.rfind("@Reorder:", 0) == 0) {
      order = numbers(text.substr(9));
      continue;
    }
    if (text[0] == '@' || ++line % kStride != 0) continue;
    const auto fields = split(text, ';');
    std::vector<uint8_t> classes;
    for (const std::string &w : words(fields[0])) classes.push_back(names.at(w));
    const int set = std::stoi(fields[1]);
    for (const auto &[bit, direction] : {std::pair{1, 2}, {2, 0}, {4, 1}}) {
      if (!(set & bit)) continue;
      ++cases;
      const Result r = run(classes, nullptr, direction);
      if (same_levels(levels, r.levels) && r.order == order)
        ++passed;
      else if (cases - passed <= 10)
        ADD_FAILURE() << text << " direction " << direction;
    }
  }
  std::cout << "BidiTest.txt: " << passed << " of " << cases << " cases pass\n";
  EXPECT_EQ(passed, cases);
  EXPECT_GT(cases, 10000);
}

TEST(BidiConformance, BidiCharacterTestThroughResolutionAndMember) {
  std::ifstream in = open_data("BidiCharacterTest.txt");
  if (!in) GTEST_SKIP() << "BidiCharacterTest.txt not found in " NLSSM_UNICODE_DATA_DIR;
  const NLSSMHandle *h = handle(27);
  ASSERT_NE(h, nullptr);
  long cases = 0, passed = 0, memberPassed = 0, line = 0;
  for (std::string text; std::getline(in, text);) {
    if (text.empty() || text[0] == '#' || ++line % kStride != 0) continue;
    const auto f = split(text, ';');
    std::vector<UChar32> chars;
    std::vector<uint8_t> classes;
    std::vector<uint32_t> brackets;
    for (const std::string &w : words(f[0])) {
      chars.push_back(static_cast<UChar32>(std::stoul(w, nullptr, 16)));
      classes.push_back(icu_class(chars.back()));
      brackets.push_back(b::bracket_of(static_cast<uint32_t>(chars.back())));
    }
    const int direction = std::stoi(f[1]), paragraph = std::stoi(f[2]);
    const auto levels = words(f[3]);
    const auto order = numbers(f[4]);
    ++cases;
    const Result r = run(classes, &brackets, direction);
    const bool ok = r.paragraph == paragraph && same_levels(levels, r.levels) && r.order == order;
    passed += ok;
    // The member: the expected order, odd levels mirrored, once the removed
    // characters are dropped from its output.
    std::vector<UChar32> want;
    for (uint32_t i : order) {
      const bool odd = std::stoi(levels[i]) & 1;
      want.push_back(odd ? u_charMirror(chars[i]) : chars[i]);
    }
    const Reordered got = reorder(h, utf32(chars), direction);
    std::vector<UChar32> shown;
    for (UChar32 c : from_utf32(got.text))
      if (!removed(icu_class(c))) shown.push_back(c);
    const bool memberOk = got.status == 0 && got.direction == paragraph && shown == want;
    memberPassed += memberOk;
    if ((!ok || !memberOk) && cases - std::min(passed, memberPassed) <= 10)
      ADD_FAILURE() << text << (ok ? "" : " (levels)") << (memberOk ? "" : " (member)");
  }
  std::cout << "BidiCharacterTest.txt: " << passed << " of " << cases << " pass the resolution, "
            << memberPassed << " the UTF-32 member\n";
  EXPECT_EQ(passed, cases);
  EXPECT_EQ(memberPassed, cases);
  EXPECT_GT(cases, 10000);
}

}  // namespace
