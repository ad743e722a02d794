// The integer members against strtoll and snprintf on random values written
// with random blanks and signs, and doubles through format and parse, in
// ASCII, EBCDIC, UTF-8, UTF-16 of both orders and UTF-32 of both orders.
#include <gtest/gtest.h>

#include <cerrno>
#include <cinttypes>
#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <random>
#include <string>

#include "numeric_support.hpp"

using namespace numtest;

namespace {

#if defined(__SANITIZE_ADDRESS__)
constexpr int kIntegers = 50'000;  // the sanitizers slow every call tenfold and more
constexpr int kDoubles = 5'000;
#else
constexpr int kIntegers = 1'000'000;
constexpr int kDoubles = 100'000;
#endif

constexpr int kDifferentialEncodings[] = {29, 78, 20, 24, 25, 26, 27};

int64_t random_value(std::mt19937_64 &rng, int i) {
  constexpr int64_t kEdges[] = {INT64_MIN, INT64_MIN + 1, INT64_MAX, INT64_MAX - 1, 0, -1, 1};
  if (i < std::ssize(kEdges)) return kEdges[i];
  // Every magnitude from one digit to nineteen, either sign.
  return static_cast<int64_t>(rng() >> (rng() % 64));
}

// A number text the module's rules read as written, and the same text as
// strtoll reads it (no blanks between the sign and the digits).
struct Written {
  std::string text, forStrtoll;
  int innerBlanks = 0;
  bool junkAfterDigits = false;
};

Written write(std::mt19937_64 &rng, int64_t value) {
  Written w;
  const std::string lead(rng() % 3, ' ');
  std::string sign = value < 0 ? "-" : (rng() % 3 == 0 ? "+" : "");
  std::string digits = std::to_string(value);
  if (value < 0) digits.erase(0, 1);
  digits.insert(0, std::string(rng() % 3, '0'));
  if (rng() % 20 == 0) digits += std::to_string(rng() % 1000);  // often out of range
  w.innerBlanks = sign.empty() ? 0 : static_cast<int>(rng() % 2);
  std::string tail;
  switch (rng() % 4) {
    case 0:
      tail = "  ";
      break;
    case 1:
      tail = " zz";
      break;
    case 2:
      tail = "z";
      w.junkAfterDigits = true;
      break;
    default:
      break;
  }
  w.text = lead + sign + std::string(w.innerBlanks, ' ') + digits + tail;
  w.forStrtoll = lead + sign + digits + tail;
  return w;
}

TEST(Differential, IntegersAgreeWithStrtollAndSnprintf) {
  std::mt19937_64 rng(20261122);
  const NLSSMHandle *handles[std::size(kDifferentialEncodings)];
  for (size_t e = 0; e < std::size(kDifferentialEncodings); ++e)
    ASSERT_NE(handles[e] = handle(kDifferentialEncodings[e]), nullptr);
  int failures = 0;
  for (int i = 0; i < kIntegers && failures < 10; ++i) {
    const NLSSMHandle *h = handles[i % std::size(handles)];
    const int64_t value = random_value(rng, i / static_cast<int>(std::size(handles)));
    const Written w = write(rng, value);
    errno = 0;
    char *end = nullptr;
    const long long expected = std::strtoll(w.forStrtoll.c_str(), &end, 10);
    const bool overflow = errno == ERANGE;
    const int32_t digitsEnd = static_cast<int32_t>(end - w.forStrtoll.c_str()) + w.innerBlanks;
    const uint32_t status = overflow            ? NLSSM_E_INT_OVERFLOW
                            : w.junkAfterDigits ? NLSSM_E_NOT_A_NUMBER
                                                : 0;
    int64_t parsed = 7;
    int32_t consumed = -1;
    const int64_t got = to_intmax(h, encode(h, w.text), 0, parsed, consumed);
    if (got != status || parsed != (overflow ? 0 : expected) ||
        consumed != digitsEnd * unit_bytes(h)) {
      ++failures;
      ADD_FAILURE() << h->encodingNumber << " [" << w.text << "] -> " << parsed << " status "
                    << std::hex << got << std::dec << " consumed " << consumed;
    }

    const int64_t width = static_cast<int64_t>(rng() % 23);
    char reference[32];
    const int n = std::snprintf(reference, sizeof reference, "%*" PRId64, int(width), value);
    const bool fits = width == 0 || n <= width;
    std::string out;
    const int64_t formatted = from_intmax(h, value, width, 0, out, 24 * unit_bytes(h));
    const std::string want = fits ? reference : std::string(width, '*');
    if (formatted != (fits ? 0 : NLSSM_E_NUMBER_DOES_NOT_FIT) || out != encode(h, want)) {
      ++failures;
      ADD_FAILURE() << h->encodingNumber << " " << value << " width " << width;
    }
  }
  EXPECT_EQ(failures, 0);
}

// Finite doubles only: narrowing writes the letters of "inf" as '?'.
constexpr double kDoubleEdges[] = {-0.0, 5e-324, 2.2250738585072014e-308, 1.7976931348623157e308,
                                   0.1,  -1e23};

double random_double(std::mt19937_64 &rng) {
  for (;;) {
    const uint64_t bits = rng();
    double d;
    std::memcpy(&d, &bits, 8);
    if (std::isfinite(d)) return d;
  }
}

TEST(Differential, DoublesReadBackWhereTheWidthAllows) {
  std::mt19937_64 rng(7);
  int failures = 0;
  for (int i = 0; i < kDoubles && failures < 10; ++i) {
    const NLSSMHandle *h = handle(kDifferentialEncodings[i % std::size(kDifferentialEncodings)]);
    const double value = i < std::ssize(kDoubleEdges) ? kDoubleEdges[i] : random_double(rng);
    const int64_t width = rng() % 2 ? 0 : 30;  // as wide as needed, or right-aligned in 30
    std::string text;
    double back = 0;
    int32_t consumed = -1;
    const int64_t formatted =
        from_double(h, value, width, NLSHOST_DECIMALS_SHORTEST, 0, text, 32 * unit_bytes(h));
    const int64_t parsed = to_double(h, text, back, consumed);
    if (formatted != 0 || parsed != 0 || std::memcmp(&back, &value, 8) != 0 ||
        consumed != std::ssize(text)) {
      ++failures;
      ADD_FAILURE() << h->encodingNumber << " " << value << " read back as " << back;
    }
  }
  EXPECT_EQ(failures, 0);
}

}  // namespace
