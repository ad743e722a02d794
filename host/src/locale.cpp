// Locale objects: number parsing and formatting over bytes (UTF-8,
// ASCII-based, EBCDIC-based) and 32-bit characters. Doubles go through
// std::from_chars (correctly rounded) and std::to_chars (shortest text that
// reads back, or fixed decimals), with the separators of the locale's ICU
// number format; integers through the ICU format itself.
#include <unicode/uloc.h>
#include <unicode/unum.h>
#include <unicode/utf16.h>
#include <unicode/utf8.h>

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstring>
#include <iterator>
#include <limits>
#include <memory>
#include <string>
#include <string_view>

#include "internal.hpp"

namespace nlssm::refhost {

namespace {

constexpr char16_t kBlank = u' ';
constexpr char16_t kUnknown = 0xFFFD;
constexpr std::uint32_t kFormatFlags =
    NLSHOST_NUMBER_GROUPING | NLSHOST_NUMBER_SCIENTIFIC | NLSHOST_NUMBER_SIGN | NLSHOST_NUMBER_LEFT;
constexpr std::int64_t kMaxDecimals = 16;

struct LocaleObject {
  SlotWords<10> slots;
  ObjectCounters *counters = nullptr;
  std::mutex mutex;  // number formats are reconfigured per call
  UNumberFormat *decimal = nullptr;
  std::u16string decimalSeparator;
  std::u16string groupingSeparator;
  std::u16string plusSign;

  ~LocaleObject() {
    if (decimal != nullptr) unum_close(decimal);
  }
};

LocaleObject *locale_of(void *object) {
  return self<LocaleObject>(object);
}

std::u16string symbol(const UNumberFormat *format, UNumberFormatSymbol which) {
  UChar buffer[32];
  UErrorCode error = U_ZERO_ERROR;
  int32_t n = unum_getSymbol(format, which, buffer, 32, &error);
  return U_SUCCESS(error)
             ? std::u16string(reinterpret_cast<char16_t *>(buffer), static_cast<std::size_t>(n))
             : std::u16string();
}

// ---- Parsing -----------------------------------------------------------------------

// Text to parse with, for each UTF-16 unit, the source offset it came from
// (one more entry: the source length).
struct Units {
  std::u16string text;
  std::vector<std::int32_t> offsets;

  void add(char16_t unit, std::int32_t offset) {
    text.push_back(unit);
    offsets.push_back(offset);
  }
};

// The number at the start of a text, rewritten in the notation std::from_chars
// reads ('.' for the locale's decimal separator, grouping separators between
// digits dropped), with the text position of every character kept so that
// what from_chars consumes maps back to the text.
struct Scanned {
  std::string ascii;
  std::vector<std::size_t> positions;  // one more entry: where the scan stopped

  // Parses correctly rounded; a value beyond the double range becomes a
  // signed infinity or zero. The text position after the number, or the
  // starting position when there is no number.
  std::size_t read(double &value) const {
    const char *first = ascii.data();
    const char *last = first + ascii.size();
    const char *digits = first + (ascii.starts_with('-') ? 1 : 0);
    // from_chars takes a sign of its own: a second one is no number.
    if (digits == last || *digits == '-' || *digits == '+') return positions.front();
    auto [end, error] = std::from_chars(first, last, value, std::chars_format::general);
    if (error == std::errc::invalid_argument) return positions.front();
    if (error == std::errc::result_out_of_range) {
      const std::size_t mark = ascii.find_first_of("eE");
      const bool tiny =
          mark != std::string::npos && mark + 1 < ascii.size() && ascii[mark + 1] == '-';
      value = tiny ? 0.0 : std::numeric_limits<double>::infinity();
      if (digits != first) value = -value;
    }
    return positions[static_cast<std::size_t>(end - first)];
  }
};

Scanned scan_number(const LocaleObject *locale, const std::u16string &text, std::size_t at,
                    bool signAllowed) {
  Scanned out;
  auto take = [&](char c, std::size_t position) {
    out.ascii.push_back(c);
    out.positions.push_back(position);
  };
  const std::u16string &point = locale->decimalSeparator;
  const std::u16string &group = locale->groupingSeparator;
  auto is_digit = [&](std::size_t i) {
    return i < text.size() && text[i] >= u'0' && text[i] <= u'9';
  };
  if (signAllowed && at < text.size() && text[at] == u'-') take('-', at++);
  bool fraction = false;
  while (at < text.size()) {
    const char16_t unit = text[at];
    const bool letter = (unit >= u'a' && unit <= u'z') || (unit >= u'A' && unit <= u'Z');
    if (is_digit(at) || letter ||
        ((unit == u'+' || unit == u'-') && !out.ascii.empty() &&
         (out.ascii.back() == 'E' || out.ascii.back() == 'e'))) {
      take(static_cast<char>(unit), at++);
    } else if (!fraction && !point.empty() && text.compare(at, point.size(), point) == 0) {
      take('.', at);
      at += point.size();
      fraction = true;
    } else if (!fraction && !group.empty() && !out.ascii.empty() && out.ascii.back() >= '0' &&
               out.ascii.back() <= '9' && text.compare(at, group.size(), group) == 0 &&
               is_digit(at + group.size())) {
      at += group.size();  // grouping between digits of the whole part
    } else {
      break;
    }
  }
  out.positions.push_back(at);
  return out;
}

std::int64_t parse_units(LocaleObject *locale, Units &units, std::int32_t sourceLength,
                         std::uint32_t options, double *value, std::int32_t *consumed) {
  if (value == nullptr || consumed == nullptr) return NLSHOST_E_NULL;
  if (options & ~NLSHOST_PARSE_STRICT_TAIL) return NLSHOST_E_BAD_OPTIONS;
  // A NUL ends the text.
  const std::size_t nul = units.text.find(u'\0');
  const std::size_t length = nul == std::u16string::npos ? units.text.size() : nul;
  const std::int32_t end = nul == std::u16string::npos ? sourceLength : units.offsets[nul];
  units.text.resize(length);
  units.offsets.resize(length);
  units.offsets.push_back(end);
  // The exponent mark is accepted in either case.
  for (char16_t &unit : units.text)
    if (unit == u'e') unit = u'E';

  std::size_t at = 0;
  while (at < length && units.text[at] == kBlank) ++at;
  *value = 0.0;
  if (at == length) {
    *consumed = units.offsets[length];
    return 0;
  }
  // A plus sign is stepped over; a minus sign is kept for the number itself.
  std::size_t start = at;
  const std::u16string &plus = locale->plusSign;
  if (!plus.empty() && units.text.compare(at, plus.size(), plus) == 0) start += plus.size();
  const Scanned scanned = scan_number(locale, units.text, start, start == at);
  double parsed = 0.0;
  const std::size_t position = scanned.read(parsed);
  if (position == start) {
    *consumed = units.offsets[at];
    return NLSHOST_E_NOT_A_NUMBER;
  }
  *value = parsed;
  const std::size_t stop = position;
  std::size_t tail = stop;
  while (tail < length && units.text[tail] == kBlank) ++tail;
  if ((options & NLSHOST_PARSE_STRICT_TAIL) && tail != length) {
    *consumed = units.offsets[stop];
    return NLSHOST_E_NOT_A_NUMBER;
  }
  *consumed = units.offsets[tail];
  return 0;
}

// The separators of the locale in the text's encoding, found through the
// converter from host characters; empty when there is no converter or the
// separator cannot be written in the encoding.
std::string encoded(void *converter, const std::u16string &text) {
  if (converter == nullptr || text.empty()) return {};
  std::u32string wide;
  for (std::size_t i = 0; i < text.size();) {
    UChar32 c;
    U16_NEXT(text.data(), i, text.size(), c);
    wide.push_back(static_cast<char32_t>(c));
  }
  std::uint8_t out[16];
  std::uint64_t produced = 0;
  auto convert = reinterpret_cast<NLSHostConverterConvertFn>(
      NLSSM_HOST_SLOT(converter, NLSHOST_SLOT_CONVERTER_CONVERT));
  if (convert(converter, wide.data(), wide.size() * 4, out, sizeof out, &produced, nullptr) != 0)
    return {};
  // A substitution character means the encoding lacks the separator.
  if (produced == 1 && (out[0] == 0x1A || out[0] == 0x3F || out[0] == 0x6F)) return {};
  return {reinterpret_cast<const char *>(out), static_cast<std::size_t>(produced)};
}

// Bytes of an ASCII- or EBCDIC-based text into units; `single` maps one byte
// to a unit (kUnknown when it is not one of the characters of a number).
template <typename Single>
Units byte_units(LocaleObject *locale, const std::uint8_t *text, std::int64_t length,
                 void *converter, Single single) {
  const std::string separators[2] = {encoded(converter, locale->decimalSeparator),
                                     encoded(converter, locale->groupingSeparator)};
  const std::u16string *symbols[2] = {&locale->decimalSeparator, &locale->groupingSeparator};
  Units units;
  for (std::int64_t at = 0; at < length;) {
    const char16_t unit = single(text[at]);
    bool matched = false;
    if (unit == kUnknown) {
      for (int s = 0; s < 2 && !matched; ++s) {
        const std::string &bytes = separators[s];
        if (bytes.empty() || static_cast<std::size_t>(length - at) < bytes.size() ||
            std::memcmp(text + at, bytes.data(), bytes.size()) != 0)
          continue;
        for (char16_t u : *symbols[s]) units.add(u, static_cast<std::int32_t>(at));
        at += static_cast<std::int64_t>(bytes.size());
        matched = true;
      }
    }
    if (!matched) units.add(unit, static_cast<std::int32_t>(at++));
  }
  return units;
}

// The EBCDIC invariant characters a number uses.
char16_t ebcdic_unit(std::uint8_t byte) {
  if (byte >= 0xF0 && byte <= 0xF9) return static_cast<char16_t>(u'0' + (byte - 0xF0));
  switch (byte) {
    case 0x40:
      return u' ';
    case 0x4B:
      return u'.';
    case 0x6B:
      return u',';
    case 0x4E:
      return u'+';
    case 0x60:
      return u'-';
    case 0xC5:
      return u'E';
    case 0x85:
      return u'e';
    case 0x00:
      return u'\0';
    default:
      return kUnknown;
  }
}

bool parse_arguments_ok(const void *text, std::int64_t length) {
  return length >= 0 && (text != nullptr || length == 0);
}

std::int64_t parse_utf8(void *object, const std::uint8_t *text, std::int64_t length, void *,
                        std::uint32_t options, double *value, std::int32_t *consumed) {
  if (!parse_arguments_ok(text, length)) return NLSHOST_E_NULL;
  Units units;
  for (std::int64_t at = 0; at < length;) {
    const auto start = static_cast<std::int32_t>(at);
    UChar32 c;
    U8_NEXT(text, at, length, c);
    if (c < 0) c = kUnknown;
    if (c > 0xFFFF) {
      units.add(static_cast<char16_t>(U16_LEAD(c)), start);
      units.add(static_cast<char16_t>(U16_TRAIL(c)), start);
    } else {
      units.add(static_cast<char16_t>(c), start);
    }
  }
  return parse_units(locale_of(object), units, static_cast<std::int32_t>(length), options, value,
                     consumed);
}

std::int64_t parse_ascii(void *object, const std::uint8_t *text, std::int64_t length,
                         void *converter, std::uint32_t options, double *value,
                         std::int32_t *consumed) {
  if (!parse_arguments_ok(text, length)) return NLSHOST_E_NULL;
  Units units = byte_units(locale_of(object), text, length, converter, [](std::uint8_t byte) {
    return byte < 0x80 ? static_cast<char16_t>(byte) : kUnknown;
  });
  return parse_units(locale_of(object), units, static_cast<std::int32_t>(length), options, value,
                     consumed);
}

std::int64_t parse_ebcdic(void *object, const std::uint8_t *text, std::int64_t length,
                          void *converter, std::uint32_t options, double *value,
                          std::int32_t *consumed) {
  if (!parse_arguments_ok(text, length)) return NLSHOST_E_NULL;
  Units units = byte_units(locale_of(object), text, length, converter, &ebcdic_unit);
  return parse_units(locale_of(object), units, static_cast<std::int32_t>(length), options, value,
                     consumed);
}

std::int64_t parse_chars(void *object, const std::uint32_t *text, std::int64_t count,
                         std::uint32_t options, double *value, std::int32_t *consumed) {
  if (!parse_arguments_ok(text, count)) return NLSHOST_E_NULL;
  Units units;
  for (std::int64_t i = 0; i < count; ++i) {
    const std::uint32_t c = text[i];
    const auto at = static_cast<std::int32_t>(i);
    if (c > 0x10FFFF || U_IS_SURROGATE(c)) {
      units.add(kUnknown, at);
    } else if (c > 0xFFFF) {
      units.add(static_cast<char16_t>(U16_LEAD(c)), at);
      units.add(static_cast<char16_t>(U16_TRAIL(c)), at);
    } else {
      units.add(static_cast<char16_t>(c), at);
    }
  }
  return parse_units(locale_of(object), units, static_cast<std::int32_t>(count), options, value,
                     consumed);
}

// ---- Formatting ---------------------------------------------------------------------

struct Number {
  bool integer;
  double real;
  std::int64_t whole;
};

// A double in the locale's notation, from std::to_chars output: '.' becomes
// the decimal separator, the whole part is grouped on request, and the
// exponent is written E<n> (E-<n> below one) without leading zeros.
std::u16string localized(const LocaleObject *locale, std::string_view ascii, std::uint32_t flags) {
  std::u16string out;
  std::size_t at = 0;
  if (ascii.starts_with('-')) {
    out.push_back(u'-');
    at = 1;
  }
  const std::size_t mark = ascii.find('e');
  const std::string_view mantissa =
      ascii.substr(at, mark == std::string_view::npos ? std::string_view::npos : mark - at);
  const std::size_t point = std::min(mantissa.find('.'), mantissa.size());
  const bool numeric = !mantissa.empty() && mantissa[0] >= '0' && mantissa[0] <= '9';
  for (std::size_t i = 0; i < mantissa.size(); ++i) {
    if (i == point) {
      out += locale->decimalSeparator;
      continue;
    }
    out.push_back(static_cast<char16_t>(mantissa[i]));
    const std::size_t left = point - i - 1;  // whole-part digits still to come
    if (numeric && (flags & NLSHOST_NUMBER_GROUPING) && i < point && left > 0 && left % 3 == 0)
      out += locale->groupingSeparator;
  }
  if (mark != std::string_view::npos) {
    out.push_back(u'E');
    std::size_t e = mark + 1;
    if (ascii[e] == '-') out.push_back(u'-');
    if (ascii[e] == '-' || ascii[e] == '+') ++e;
    while (e + 1 < ascii.size() && ascii[e] == '0') ++e;
    for (; e < ascii.size(); ++e) out.push_back(static_cast<char16_t>(ascii[e]));
  }
  return out;
}

std::u16string to_text(const LocaleObject *locale, double value, std::uint32_t flags,
                       std::chars_format format, int precision) {
  char buffer[400];  // the longest fixed text of a double with 16 decimals
  // Shortest form: fixed or scientific, whichever is shorter, unless
  // scientific is asked for.
  const std::to_chars_result result =
      precision >= 0 ? std::to_chars(buffer, std::end(buffer), value, format, precision)
      : format == std::chars_format::scientific
          ? std::to_chars(buffer, std::end(buffer), value, format)
          : std::to_chars(buffer, std::end(buffer), value);
  return localized(locale, std::string_view(buffer, result.ptr), flags);
}

// A double as text: `decimals` digits after the separator (correctly rounded
// from the binary value), or with NLSHOST_DECIMALS_SHORTEST the shortest text
// that reads back as the same double. When that is wider than a non-zero
// width, fewer decimals, then fewer significant digits in scientific form,
// are tried before the number is given up as too wide.
std::u16string double_text(const LocaleObject *locale, double value, std::int64_t width,
                           std::int64_t decimals, std::uint32_t flags, std::int64_t signWidth) {
  const auto format = (flags & NLSHOST_NUMBER_SCIENTIFIC) ? std::chars_format::scientific
                                                          : std::chars_format::fixed;
  if (decimals != NLSHOST_DECIMALS_SHORTEST)
    return to_text(locale, value, flags, format, static_cast<int>(decimals));
  std::u16string text = to_text(locale, value, flags, format, -1);
  auto fits = [&](const std::u16string &t) { return std::ssize(t) + signWidth <= width; };
  if (width == 0 || fits(text) || !std::isfinite(value)) return text;
  if (!(flags & NLSHOST_NUMBER_SCIENTIFIC)) {
    for (int places = 16; places >= 0; --places) {
      std::u16string shorter = to_text(locale, value, flags, std::chars_format::fixed, places);
      if (fits(shorter)) return shorter;
    }
  }
  for (int places = 16; places >= 0; --places) {
    std::u16string shorter = to_text(locale, value, flags, std::chars_format::scientific, places);
    if (fits(shorter)) return shorter;
  }
  return text;
}

// The field as code points: the number in the locale's notation, padded to
// `width`, or '*' when it does not fit.
std::int64_t format_field(LocaleObject *locale, const Number &number, std::int64_t width,
                          std::int64_t decimals, std::uint32_t flags, std::u32string &field) {
  const bool shortest = decimals == NLSHOST_DECIMALS_SHORTEST && !number.integer;
  if ((flags & ~kFormatFlags) || width < 0 ||
      (!shortest && (decimals < 0 || decimals > kMaxDecimals)))
    return NLSHOST_E_BAD_OPTIONS;
  const bool plus =
      (flags & NLSHOST_NUMBER_SIGN) && !std::signbit(number.real) && !std::isnan(number.real);
  std::u16string text;
  if (!number.integer) {
    text = double_text(locale, number.real, width, decimals, flags,
                       plus ? std::ssize(locale->plusSign) : 0);
  } else {
    std::lock_guard lock(locale->mutex);
    UNumberFormat *format = locale->decimal;
    unum_setAttribute(format, UNUM_GROUPING_USED, (flags & NLSHOST_NUMBER_GROUPING) ? 1 : 0);
    unum_setAttribute(format, UNUM_MIN_FRACTION_DIGITS, static_cast<int32_t>(decimals));
    unum_setAttribute(format, UNUM_MAX_FRACTION_DIGITS, static_cast<int32_t>(decimals));
    UChar buffer[128];
    UErrorCode error = U_ZERO_ERROR;
    const int32_t n = unum_formatInt64(format, number.whole, buffer, 128, nullptr, &error);
    if (U_FAILURE(error)) return NLSHOST_E_NUMBER_FIELD;
    text.assign(reinterpret_cast<char16_t *>(buffer), static_cast<std::size_t>(n));
  }
  if (plus) text = locale->plusSign + text;
  std::u32string digits;
  for (std::size_t i = 0; i < text.size();) {
    UChar32 c;
    U16_NEXT(text.data(), i, text.size(), c);
    digits.push_back(static_cast<char32_t>(c));
  }
  if (width == 0) width = std::ssize(digits);
  if (std::ssize(digits) > width) {
    field.assign(static_cast<std::size_t>(width), U'*');
    return NLSHOST_E_NUMBER_FIELD;
  }
  const std::u32string pad(static_cast<std::size_t>(width) - digits.size(), U' ');
  field = (flags & NLSHOST_NUMBER_LEFT) ? digits + pad : pad + digits;
  return 0;
}

template <typename Unit>
std::int64_t write_field(std::int64_t status, const std::basic_string<Unit> &field, Unit *buffer,
                         std::int64_t capacity, std::int32_t *count) {
  if (std::ssize(field) > capacity) {
    for (std::int64_t i = 0; i < capacity; ++i) buffer[i] = static_cast<Unit>('*');
    *count = static_cast<std::int32_t>(capacity);
    return NLSHOST_E_NUMBER_FIELD;
  }
  std::copy(field.begin(), field.end(), buffer);
  *count = static_cast<std::int32_t>(field.size());
  return status;
}

bool format_arguments_ok(const void *buffer, std::int64_t capacity, const std::int32_t *count) {
  return count != nullptr && (buffer != nullptr || capacity == 0);
}

std::int64_t format_chars(LocaleObject *locale, const Number &number, std::int64_t width,
                          std::int64_t decimals, std::uint32_t flags, std::uint32_t *buffer,
                          std::int64_t capacity, std::int32_t *count) {
  if (!format_arguments_ok(buffer, capacity, count)) return NLSHOST_E_NULL;
  if (capacity < 0) return NLSHOST_E_BAD_OPTIONS;
  std::u32string field;
  const std::int64_t status = format_field(locale, number, width, decimals, flags, field);
  if (status == NLSHOST_E_BAD_OPTIONS) return status;
  std::basic_string<std::uint32_t> units(field.begin(), field.end());
  return write_field(status, units, buffer, capacity, count);
}

std::int64_t format_double_chars(void *object, double value, std::int64_t width,
                                 std::int64_t decimals, std::uint32_t flags, std::uint32_t *buffer,
                                 std::int64_t capacity, std::int32_t *count) {
  return format_chars(locale_of(object), {false, value, 0}, width, decimals, flags, buffer,
                      capacity, count);
}

std::int64_t format_integer_chars(void *object, std::int64_t value, std::int64_t width,
                                  std::int64_t decimals, std::uint32_t flags, std::uint32_t *buffer,
                                  std::int64_t capacity, std::int32_t *count) {
  return format_chars(locale_of(object), {true, static_cast<double>(value), value}, width, decimals,
                      flags, buffer, capacity, count);
}

std::int64_t format_double_utf8(void *object, double value, std::int64_t width,
                                std::int64_t decimals, std::uint32_t flags,
                                std::uint8_t *destination, std::int64_t capacity,
                                std::int32_t *count) {
  if (!format_arguments_ok(destination, capacity, count)) return NLSHOST_E_NULL;
  if (capacity < 0) return NLSHOST_E_BAD_OPTIONS;
  std::u32string field;
  const std::int64_t status =
      format_field(locale_of(object), {false, value, 0}, width, decimals, flags, field);
  if (status == NLSHOST_E_BAD_OPTIONS) return status;
  std::basic_string<std::uint8_t> bytes;
  for (char32_t c : field) {
    std::uint8_t encoded[4];
    std::size_t n = 0;
    U8_APPEND_UNSAFE(encoded, n, c);
    bytes.append(encoded, n);
  }
  return write_field(status, bytes, destination, capacity, count);
}

void locale_destroy(void *object) {
  if (object == nullptr) return;
  LocaleObject *locale = locale_of(object);
  locale->counters->locales.fetch_sub(1);
  delete locale;
}

}  // namespace

void *new_locale_object(const std::string &name, ObjectCounters &counters) {
  // Only known languages and regions: ICU would quietly fall back to its
  // default locale for anything else.
  if (*uloc_getISO3Language(name.c_str()) == '\0') return nullptr;
  char country[16];
  UErrorCode error = U_ZERO_ERROR;
  if (uloc_getCountry(name.c_str(), country, sizeof country, &error) > 0 &&
      *uloc_getISO3Country(name.c_str()) == '\0')
    return nullptr;
  auto locale = std::make_unique<LocaleObject>();
  error = U_ZERO_ERROR;
  locale->decimal = unum_open(UNUM_DECIMAL, nullptr, 0, name.c_str(), nullptr, &error);
  if (U_FAILURE(error)) return nullptr;
  locale->decimalSeparator = symbol(locale->decimal, UNUM_DECIMAL_SEPARATOR_SYMBOL);
  locale->groupingSeparator = symbol(locale->decimal, UNUM_GROUPING_SEPARATOR_SYMBOL);
  locale->plusSign = symbol(locale->decimal, UNUM_PLUS_SIGN_SYMBOL);
  locale->counters = &counters;
  locale->slots.set(NLSHOST_SLOT_LOCALE_DESTROY, &locale_destroy);
  locale->slots.set(NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_UTF8, &parse_utf8);
  locale->slots.set(NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_ASCII, &parse_ascii);
  locale->slots.set(NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_EBCDIC, &parse_ebcdic);
  locale->slots.set(NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_CHARS, &parse_chars);
  locale->slots.set(NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_CHARS, &format_double_chars);
  locale->slots.set(NLSHOST_SLOT_LOCALE_FORMAT_INTEGER_CHARS, &format_integer_chars);
  locale->slots.set(NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_UTF8, &format_double_utf8);
  counters.locales.fetch_add(1);
  return locale.release();
}

}  // namespace nlssm::refhost
