// Number parsing and formatting in every encoding class.
//
// Plain integers are read and written here in full. Doubles, and integers
// formatted with flags (grouping, sign, alignment), are the host locale's
// work: the members bring the text into the form the locale reads (bytes of
// an ASCII- or EBCDIC-based encoding, or 32-bit host characters) and its
// output back into the handle's encoding. Every text and destination is at
// most 152 bytes, so all work areas live on the stack.
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <algorithm>
#include <charconv>
#include <cstdint>
#include <cstring>

#include "catalogue/catalogue.hpp"
#include "module/host_access.hpp"

namespace nlssm::numeric {
namespace {

using catalogue::NLSNumSpecialChars;
using host::slot;

constexpr int64_t kMaxBytes = 152;
constexpr int64_t kMaxChars = 152;  // host characters in a work area
constexpr uint32_t kStrictTail = 0x1000;

// ---- Reading integers ----------------------------------------------------------

// The characters an integer is read with, as unit values of the text.
struct IntegerChars {
  uint32_t zero, blank, minus, plus, nul;
};

IntegerChars chars_of(const uint8_t (&table)[20]) {
  return {table[catalogue::kNumDigit0], table[catalogue::kNumBlank], table[catalogue::kNumMinus],
          table[catalogue::kNumPlus], table[catalogue::kNumNul]};
}
// 32-bit host characters are compared with the ASCII values.
const IntegerChars kAsciiChars = chars_of(catalogue::SM_ASCII_chars);
const IntegerChars kEbcdicChars = chars_of(catalogue::SM_EBCDIC_chars);

struct IntegerRead {
  uint32_t status;
  int64_t value;
  int64_t left;  // units not consumed
};

// Reads a signed 64-bit integer: blanks, an optional sign, blanks, digits.
// Without kStrictTail a blank or NUL after the digits ends the number and
// nothing after it is looked at; with it, only blanks (optionally ended by a
// NUL) may follow. On overflow the value is 0 and every digit is consumed.
template <typename Unit>
IntegerRead read_integer(const Unit *text, int64_t count, const IntegerChars &c, uint32_t flags) {
  int64_t at = 0;
  while (at < count && text[at] == c.blank) ++at;
  if (at == count) return {0, 0, 0};
  bool negative = false;
  if (text[at] == c.minus || text[at] == c.plus) {
    negative = text[at] == c.minus;
    ++at;
    while (at < count && text[at] == c.blank) ++at;
    if (at == count) return {NLSSM_E_NOT_A_NUMBER, 0, 0};
  }
  // The largest magnitude is 9223372036854775807, or ...808 when negative.
  constexpr uint64_t kTenth = 922337203685477580u;
  const uint64_t lastDigit = negative ? 8 : 7;
  uint64_t magnitude = 0;
  auto digit_at = [&](int64_t i) { return static_cast<uint64_t>(text[i]) - c.zero; };
  for (; at < count && digit_at(at) <= 9; ++at) {
    const uint64_t d = digit_at(at);
    if (magnitude >= kTenth && (magnitude > kTenth || d > lastDigit)) {
      while (at < count && digit_at(at) <= 9) ++at;
      return {NLSSM_E_INT_OVERFLOW, 0, count - at};
    }
    magnitude = magnitude * 10 + d;
  }
  const int64_t value = static_cast<int64_t>(negative ? 0 - magnitude : magnitude);
  if (at == count || text[at] == c.nul) return {0, value, count - at};
  if (text[at] != c.blank) return {NLSSM_E_NOT_A_NUMBER, value, count - at};
  if (!(flags & kStrictTail)) return {0, value, count - at};
  const int64_t digitsEnd = at;
  while (at < count && text[at] == c.blank) ++at;
  if (at == count || text[at] == c.nul) return {0, value, count - at};
  return {NLSSM_E_NOT_A_NUMBER, value, count - digitsEnd};
}

// Consumed units as the module reports them: the count is taken in 8 bits
// (the 152-byte limit keeps every real count below 256).
int64_t consumed_units(int64_t count, int64_t left) {
  return (count & 0xFF) - left;
}

// Checks shared by every member: the 152-byte limit before anything is read,
// then the pointers.
uint32_t check_text(const void *text, int64_t bytes, const void *out1, const void *out2) {
  if (bytes < 0 || bytes > kMaxBytes) return NLSSM_E_NUMBER_TOO_LONG;
  if (text == nullptr || out1 == nullptr || out2 == nullptr) return NLSSM_E_NULL_ARGUMENT;
  return 0;
}

uint32_t check_destination(const void *destination, int64_t capacity, const void *written) {
  if (capacity < 0 || capacity > kMaxBytes) return NLSSM_E_NUMBER_TOO_LONG;
  if (destination == nullptr || written == nullptr) return NLSSM_E_NULL_ARGUMENT;
  return 0;
}

void *locale_or_handles(const NLSSMHandle *handle, void *locale) {
  return locale != nullptr ? locale : handle->locale;
}

// ---- 32-bit host characters ------------------------------------------------------

// Host characters read from text of 4-byte units, each unit's bytes either
// as they are or reversed within its 2- or 4-byte groups.
enum class Order { kHost, kSwap2, kSwap4 };

uint32_t load_unit(const uint8_t *p, Order order) {
  uint8_t b[4] = {p[0], p[1], p[2], p[3]};
  if (order == Order::kSwap2) {
    std::swap(b[0], b[1]);
    std::swap(b[2], b[3]);
  } else if (order == Order::kSwap4) {
    std::swap(b[0], b[3]);
    std::swap(b[1], b[2]);
  }
  uint32_t unit;
  std::memcpy(&unit, b, 4);
  return unit;
}

// The text's whole 4-byte units (bytes / 4 of them, for both swap forms).
int64_t load_units(const void *text, int64_t bytes, Order order, uint32_t *units) {
  const int64_t count = bytes / 4;
  const auto *p = static_cast<const uint8_t *>(text);
  for (int64_t i = 0; i < count; ++i) units[i] = load_unit(p + 4 * i, order);
  return count;
}

void store_units(const uint32_t *units, int64_t count, Order order, void *destination) {
  auto *p = static_cast<uint8_t *>(destination);
  for (int64_t i = 0; i < count; ++i) {
    // Reversing is its own inverse: reading the unit back reverses it.
    std::memcpy(p + 4 * i, &units[i], 4);
    const uint32_t stored = load_unit(p + 4 * i, order);
    std::memcpy(p + 4 * i, &stored, 4);
  }
}

// Text of the handle's encoding as host characters, through ownFromConverter.
uint32_t transcode_from(const NLSSMHandle *handle, const void *text, int64_t bytes, uint32_t *chars,
                        int64_t &count) {
  void *converter = handle->ownFromConverter;
  if (converter == nullptr) return NLSSM_E_ENCODING;
  uint64_t produced = 0;
  const int64_t status = slot<NLSHostConverterConvertFn>(converter, NLSHOST_SLOT_CONVERTER_CONVERT)(
      converter, text, static_cast<uint64_t>(bytes), chars, kMaxChars * 4, &produced, nullptr);
  count = static_cast<int64_t>(produced / 4);
  return static_cast<uint32_t>(status);
}

// ---- Parse members ----------------------------------------------------------------

int64_t to_intmax_bytes(const void *text, int64_t bytes, uint32_t flags, int64_t *value,
                        int32_t *consumed, const IntegerChars &chars) {
  if (uint32_t status = check_text(text, bytes, value, consumed)) return status;
  const IntegerRead r = read_integer(static_cast<const uint8_t *>(text), bytes, chars, flags);
  *value = r.value;
  *consumed = static_cast<int32_t>(consumed_units(bytes, r.left));
  return r.status;
}

// Reads host characters; the consumed count is reported as characters times
// `unitBytes`.
int64_t to_intmax_chars(const uint32_t *chars, int64_t count, uint32_t flags, int64_t *value,
                        int32_t *consumed, int64_t unitBytes) {
  const IntegerRead r = read_integer(chars, count, kAsciiChars, flags);
  *value = r.value;
  *consumed = static_cast<int32_t>(consumed_units(count, r.left) * unitBytes);
  return r.status;
}

int64_t to_intmax_units(const void *text, int64_t bytes, uint32_t flags, int64_t *value,
                        int32_t *consumed, Order order) {
  if (uint32_t status = check_text(text, bytes, value, consumed)) return status;
  uint32_t units[kMaxBytes / 4];
  const int64_t count = load_units(text, bytes, order, units);
  return to_intmax_chars(units, count, flags, value, consumed, 4);
}

int64_t to_double_bytes(const NLSSMHandle *handle, void *locale, const void *text, int64_t bytes,
                        uint32_t options, double *value, int32_t *consumed, int hostSlot) {
  if (uint32_t status = check_text(text, bytes, value, consumed)) return status;
  locale = locale_or_handles(handle, locale);
  int32_t read = 0;
  const int64_t status = slot<NLSHostParseDoubleBytesFn>(locale, hostSlot)(
      locale, static_cast<const uint8_t *>(text), bytes, handle->ownToConverter, options, value,
      &read);
  if (status == 0) *consumed = read;
  return status;
}

int64_t to_double_chars(const NLSSMHandle *handle, void *locale, const uint32_t *chars,
                        int64_t count, uint32_t options, double *value, int32_t *consumed,
                        int64_t unitBytes) {
  locale = locale_or_handles(handle, locale);
  int32_t read = 0;
  const int64_t status = slot<NLSHostParseDoubleCharsFn>(
      locale, NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_CHARS)(locale, chars, count, options, value, &read);
  if (status == 0) *consumed = static_cast<int32_t>(read * unitBytes);
  return status;
}

int64_t to_double_units(const NLSSMHandle *handle, void *locale, const void *text, int64_t bytes,
                        uint32_t options, double *value, int32_t *consumed, Order order) {
  if (uint32_t status = check_text(text, bytes, value, consumed)) return status;
  uint32_t units[kMaxBytes / 4];
  const int64_t count = load_units(text, bytes, order, units);
  return to_double_chars(handle, locale, units, count, options, value, consumed, 4);
}

// ---- Writing integers ----------------------------------------------------------------

struct Field {
  uint32_t chars[kMaxChars];
  int64_t count = 0;
  uint32_t status = 0;

  void stars(int64_t n) {
    std::fill_n(chars, n, uint32_t{'*'});
    count = n;
  }
};

// The module's own integer field: right-aligned in `width` characters with
// blanks on the left, the minus sign directly left of the leading digit; a
// field of '*' when the number does not fit. A width of 0 or less asks for
// the number's own width.
void own_integer_field(int64_t value, int64_t width, int64_t capacity, Field &field) {
  // The digits of the magnitude (2^63 at most: 19 digits).
  char buffer[20];
  const uint64_t magnitude =
      value < 0 ? 0 - static_cast<uint64_t>(value) : static_cast<uint64_t>(value);
  const char *const end = std::to_chars(buffer, buffer + sizeof buffer, magnitude).ptr;
  const int64_t n = end - buffer;
  const int64_t needed = n + (value < 0 ? 1 : 0);
  if (width <= 0) width = std::min(needed, capacity);
  if (needed > width) {
    field.stars(width);
    field.status = NLSSM_E_NUMBER_DOES_NOT_FIT;
    return;
  }
  std::fill_n(field.chars, width - needed, uint32_t{' '});
  uint32_t *p = field.chars + (width - needed);
  if (value < 0) *p++ = '-';
  std::copy(buffer, buffer + n, p);
  field.count = width;
  field.status = 0;
}

// An integer as host characters in at most `capacity` characters: '*' when
// the width exceeds the capacity, the locale's formatter when there are
// flags and the value is not 0, else the module's own field.
void integer_field(const NLSSMHandle *handle, void *locale, int64_t value, int64_t width,
                   uint32_t flags, int64_t capacity, Field &field) {
  if (width > capacity) {
    field.stars(capacity);
    field.status = NLSSM_E_NUMBER_DOES_NOT_FIT;
    return;
  }
  if (flags != 0 && value != 0) {
    width = std::max<int64_t>(width, 0);  // the locale's "as wide as the number"
    locale = locale_or_handles(handle, locale);
    int32_t count = 0;
    field.status = static_cast<uint32_t>(
        slot<NLSHostFormatIntegerCharsFn>(locale, NLSHOST_SLOT_LOCALE_FORMAT_INTEGER_CHARS)(
            locale, value, width, 0, flags, field.chars, capacity, &count));
    field.count = std::clamp<int64_t>(count, 0, capacity);
    return;
  }
  own_integer_field(value, width, capacity, field);
}

void double_field(const NLSSMHandle *handle, void *locale, double value, int64_t width,
                  int64_t decimals, uint32_t flags, int64_t capacity, Field &field) {
  locale = locale_or_handles(handle, locale);
  int32_t count = 0;
  field.status = static_cast<uint32_t>(
      slot<NLSHostFormatDoubleCharsFn>(locale, NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_CHARS)(
          locale, value, width, decimals, flags, field.chars, capacity, &count));
  field.count = std::clamp<int64_t>(count, 0, capacity);
}

// ---- Narrowing into ASCII- and EBCDIC-based encodings -----------------------------

enum class Family { kAscii, kEbcdic };

// Bytes for the host characters 0-255 of a formatted number: the byte
// itself, kNoBreakSpace (the encoding's substitute) or, in EBCDIC, the
// row's apostrophe; characters from 256 up take the table's `other` byte.
constexpr int16_t kNoBreakSpace = -1;
constexpr int16_t kRowApostrophe = -2;

struct NarrowTable {
  int16_t bytes[256];
  uint8_t other;
  uint8_t star;
};

constexpr NarrowTable make_narrow_table(Family family, bool keepExponent) {
  const bool ascii = family == Family::kAscii;
  NarrowTable t{};
  t.other = ascii ? '?' : 0x6F;
  t.star = ascii ? '*' : 0x5C;
  for (int16_t &b : t.bytes) b = t.other;
  for (int d = 0; d <= 9; ++d) t.bytes['0' + d] = static_cast<int16_t>(ascii ? '0' + d : 0xF0 + d);
  const struct {
    char c;
    uint8_t ebcdic;
  } kept[] = {{' ', 0x40}, {'*', 0x5C}, {'+', 0x4E}, {',', 0x6B},
              {'-', 0x60}, {'.', 0x4B}, {'E', 0xC5}, {'e', 0x85}};
  for (const auto &k : kept)
    if (keepExponent || (k.c != 'E' && k.c != 'e'))
      t.bytes[static_cast<uint8_t>(k.c)] = ascii ? k.c : k.ebcdic;
  t.bytes[static_cast<uint8_t>('\'')] = ascii ? '\'' : kRowApostrophe;
  t.bytes[0xA0] = kNoBreakSpace;
  return t;
}

// ASCII keeps 'E' and 'e' in doubles only; EBCDIC keeps them in both.
constexpr NarrowTable kAsciiInteger = make_narrow_table(Family::kAscii, false);
constexpr NarrowTable kAsciiDouble = make_narrow_table(Family::kAscii, true);
constexpr NarrowTable kEbcdicNumber = make_narrow_table(Family::kEbcdic, true);

struct Narrowed {
  int64_t bytes;
  bool substituteCut;  // a multi-byte no-break space did not fit
};

// Writes the field one byte per character up to the capacity. A single-byte
// member writes the first byte of the no-break-space substitute; a
// multi-byte member copies the substitute whole, and when it does not fit
// fills the rest of the destination with '*'.
Narrowed narrow(const NLSSMHandle *handle, const Field &field, const NarrowTable &table,
                bool wholeSubstitute, uint8_t *out, int64_t capacity) {
  const catalogue::NumSpecialChars &row = NLSNumSpecialChars[handle->encodingNumber];
  int64_t at = 0;
  for (int64_t i = 0; i < field.count && at < capacity; ++i) {
    const uint32_t c = field.chars[i];
    const int16_t b = c < 256 ? table.bytes[c] : table.other;
    if (b >= 0) {
      out[at++] = static_cast<uint8_t>(b);
    } else if (b == kRowApostrophe) {
      out[at++] = row.apostrophe;
    } else if (!wholeSubstitute) {
      out[at++] = row.noBreakSpace[0];
    } else if (row.noBreakSpaceLength <= capacity - at) {
      std::memcpy(out + at, row.noBreakSpace, row.noBreakSpaceLength);
      at += row.noBreakSpaceLength;
    } else {
      std::fill(out + at, out + capacity, table.star);
      return {capacity, true};
    }
  }
  return {at, false};
}

// Narrowing members: host characters into bytes of an ASCII- or EBCDIC-based
// encoding. The integer members report a 16-bit count, the double members an
// 8-bit one (both exact under the 152-byte limit).
struct NarrowForm {
  Family family;
  bool wholeSubstitute;
};

int64_t finish_narrow(const NLSSMHandle *handle, const Field &field, NarrowForm form, bool isDouble,
                      void *destination, int64_t capacity, int32_t *written) {
  const NarrowTable &table = form.family == Family::kEbcdic ? kEbcdicNumber
                             : isDouble                     ? kAsciiDouble
                                                            : kAsciiInteger;
  const Narrowed n = narrow(handle, field, table, form.wholeSubstitute,
                            static_cast<uint8_t *>(destination), capacity);
  *written = isDouble ? static_cast<uint8_t>(n.bytes) : static_cast<uint16_t>(n.bytes);
  return n.substituteCut ? NLSSM_E_DEST_TOO_SMALL : field.status;
}

int64_t from_intmax_narrow(const NLSSMHandle *handle, void *locale, int64_t value, int64_t width,
                           uint32_t flags, void *destination, int64_t capacity, int32_t *written,
                           NarrowForm form) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  Field field;
  integer_field(handle, locale, value, width, flags, capacity, field);
  return finish_narrow(handle, field, form, false, destination, capacity, written);
}

int64_t from_double_narrow(const NLSSMHandle *handle, void *locale, double value, int64_t width,
                           int64_t decimals, uint32_t flags, void *destination, int64_t capacity,
                           int32_t *written, NarrowForm form) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  Field field;
  double_field(handle, locale, value, width, decimals, flags, capacity, field);
  return finish_narrow(handle, field, form, true, destination, capacity, written);
}

// ---- Wide output ------------------------------------------------------------------

// Host characters written as 4-byte units (in the host's order, or with the
// bytes of every 2- or 4-byte group reversed); written = characters x 4.
int64_t store_field(const Field &field, Order order, void *destination, int32_t *written) {
  store_units(field.chars, field.count, order, destination);
  *written = static_cast<int32_t>(field.count * 4);
  return field.status;
}

// Host characters transcoded into the handle's encoding with ownToConverter.
int64_t transcode_field(const NLSSMHandle *handle, const Field &field, void *destination,
                        int64_t capacity, int32_t *written) {
  void *converter = handle->ownToConverter;
  if (converter == nullptr) return NLSSM_E_ENCODING;
  uint64_t produced = 0;
  const int64_t status = slot<NLSHostConverterConvertFn>(converter, NLSHOST_SLOT_CONVERTER_CONVERT)(
      converter, field.chars, static_cast<uint64_t>(field.count) * 4, destination,
      static_cast<uint64_t>(capacity), &produced, nullptr);
  *written = static_cast<int32_t>(produced);
  return status != 0 ? status : field.status;
}

int64_t unit_width(const NLSSMHandle *handle) {
  return handle->unitWidth == 2 || handle->unitWidth == 4 ? handle->unitWidth : 1;
}

}  // namespace
}  // namespace nlssm::numeric

using namespace nlssm::numeric;

// ---- Parse integer ---------------------------------------------------------------------

extern "C" int64_t NLSStringToIntmax_ASCII(const NLSSMHandle *, void *, const void *text,
                                           int64_t textBytes, uint32_t flags, int64_t *value,
                                           int32_t *consumed) {
  return to_intmax_bytes(text, textBytes, flags, value, consumed, kAsciiChars);
}

extern "C" int64_t NLSStringToIntmax_EBCDIC(const NLSSMHandle *, void *, const void *text,
                                            int64_t textBytes, uint32_t flags, int64_t *value,
                                            int32_t *consumed) {
  return to_intmax_bytes(text, textBytes, flags, value, consumed, kEbcdicChars);
}

extern "C" int64_t NLSStringToIntmax_QVChar(const NLSSMHandle *, void *, const void *text,
                                            int64_t textBytes, uint32_t flags, int64_t *value,
                                            int32_t *consumed) {
  return to_intmax_units(text, textBytes, flags, value, consumed, Order::kHost);
}

extern "C" int64_t NLSStringToIntmax_swap2(const NLSSMHandle *, void *, const void *text,
                                           int64_t textBytes, uint32_t flags, int64_t *value,
                                           int32_t *consumed) {
  return to_intmax_units(text, textBytes, flags, value, consumed, Order::kSwap2);
}

extern "C" int64_t NLSStringToIntmax_swap4(const NLSSMHandle *, void *, const void *text,
                                           int64_t textBytes, uint32_t flags, int64_t *value,
                                           int32_t *consumed) {
  return to_intmax_units(text, textBytes, flags, value, consumed, Order::kSwap4);
}

extern "C" int64_t NLSStringToIntmax_toQVChar(const NLSSMHandle *handle, void *, const void *text,
                                              int64_t textBytes, uint32_t flags, int64_t *value,
                                              int32_t *consumed) {
  if (uint32_t status = check_text(text, textBytes, value, consumed)) return status;
  uint32_t chars[kMaxChars];
  int64_t count = 0;
  if (uint32_t status = transcode_from(handle, text, textBytes, chars, count)) return status;
  return to_intmax_chars(chars, count, flags, value, consumed, unit_width(handle));
}

// ---- Parse double ----------------------------------------------------------------------

extern "C" int64_t NLSStringToDouble_ASCII(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, int64_t,
                                           uint32_t options, double *value, int32_t *consumed) {
  const int hostSlot = handle->encodingNumber == NLSSM_ENC_UTF8
                           ? NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_UTF8
                           : NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_ASCII;
  return to_double_bytes(handle, locale, text, textBytes, options, value, consumed, hostSlot);
}

extern "C" int64_t NLSStringToDouble_EBCDIC(const NLSSMHandle *handle, void *locale,
                                            const void *text, int64_t textBytes, int64_t,
                                            uint32_t options, double *value, int32_t *consumed) {
  return to_double_bytes(handle, locale, text, textBytes, options, value, consumed,
                         NLSHOST_SLOT_LOCALE_PARSE_DOUBLE_EBCDIC);
}

extern "C" int64_t NLSStringToDouble_QVChar(const NLSSMHandle *handle, void *locale,
                                            const void *text, int64_t textBytes, int64_t,
                                            uint32_t options, double *value, int32_t *consumed) {
  return to_double_units(handle, locale, text, textBytes, options, value, consumed, Order::kHost);
}

extern "C" int64_t NLSStringToDouble_swap2(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, int64_t,
                                           uint32_t options, double *value, int32_t *consumed) {
  return to_double_units(handle, locale, text, textBytes, options, value, consumed, Order::kSwap2);
}

extern "C" int64_t NLSStringToDouble_swap4(const NLSSMHandle *handle, void *locale,
                                           const void *text, int64_t textBytes, int64_t,
                                           uint32_t options, double *value, int32_t *consumed) {
  return to_double_units(handle, locale, text, textBytes, options, value, consumed, Order::kSwap4);
}

extern "C" int64_t NLSStringToDouble_toQVChar(const NLSSMHandle *handle, void *locale,
                                              const void *text, int64_t textBytes, int64_t,
                                              uint32_t options, double *value, int32_t *consumed) {
  if (uint32_t status = check_text(text, textBytes, value, consumed)) return status;
  uint32_t chars[kMaxChars];  // 608 bytes
  int64_t count = 0;
  if (uint32_t status = transcode_from(handle, text, textBytes, chars, count)) return status;
  return to_double_chars(handle, locale, chars, count, options, value, consumed,
                         unit_width(handle));
}

// ---- Format integer --------------------------------------------------------------------

extern "C" int64_t NLSStringFromIntmax_ASCII_SBCS(const NLSSMHandle *handle, void *locale,
                                                  int64_t value, int64_t width, uint32_t flags,
                                                  void *destination, int64_t capacity,
                                                  int32_t *written) {
  return from_intmax_narrow(handle, locale, value, width, flags, destination, capacity, written,
                            {Family::kAscii, false});
}

extern "C" int64_t NLSStringFromIntmax_EBCDIC_SBCS(const NLSSMHandle *handle, void *locale,
                                                   int64_t value, int64_t width, uint32_t flags,
                                                   void *destination, int64_t capacity,
                                                   int32_t *written) {
  return from_intmax_narrow(handle, locale, value, width, flags, destination, capacity, written,
                            {Family::kEbcdic, false});
}

extern "C" int64_t NLSStringFromIntmax_ASCII_MBCS(const NLSSMHandle *handle, void *locale,
                                                  int64_t value, int64_t width, uint32_t flags,
                                                  void *destination, int64_t capacity,
                                                  int32_t *written) {
  return from_intmax_narrow(handle, locale, value, width, flags, destination, capacity, written,
                            {Family::kAscii, true});
}

extern "C" int64_t NLSStringFromIntmax_EBCDIC_MBCS(const NLSSMHandle *handle, void *locale,
                                                   int64_t value, int64_t width, uint32_t flags,
                                                   void *destination, int64_t capacity,
                                                   int32_t *written) {
  return from_intmax_narrow(handle, locale, value, width, flags, destination, capacity, written,
                            {Family::kEbcdic, true});
}

namespace {
int64_t from_intmax_units(const NLSSMHandle *handle, void *locale, int64_t value, int64_t width,
                          uint32_t flags, void *destination, int64_t capacity, int32_t *written,
                          Order order) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  Field field;
  integer_field(handle, locale, value, width, flags, capacity / 4, field);
  return store_field(field, order, destination, written);
}

int64_t from_double_units(const NLSSMHandle *handle, void *locale, double value, int64_t width,
                          int64_t decimals, uint32_t flags, void *destination, int64_t capacity,
                          int32_t *written, Order order) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  Field field;
  double_field(handle, locale, value, width, decimals, flags, capacity / 4, field);
  return store_field(field, order, destination, written);
}
}  // namespace

extern "C" int64_t NLSStringFromIntmax_QVChar(const NLSSMHandle *handle, void *locale,
                                              int64_t value, int64_t width, uint32_t flags,
                                              void *destination, int64_t capacity,
                                              int32_t *written) {
  return from_intmax_units(handle, locale, value, width, flags, destination, capacity, written,
                           Order::kHost);
}

extern "C" int64_t NLSStringFromIntmax_swap2(const NLSSMHandle *handle, void *locale, int64_t value,
                                             int64_t width, uint32_t flags, void *destination,
                                             int64_t capacity, int32_t *written) {
  return from_intmax_units(handle, locale, value, width, flags, destination, capacity, written,
                           Order::kSwap2);
}

extern "C" int64_t NLSStringFromIntmax_swap4(const NLSSMHandle *handle, void *locale, int64_t value,
                                             int64_t width, uint32_t flags, void *destination,
                                             int64_t capacity, int32_t *written) {
  return from_intmax_units(handle, locale, value, width, flags, destination, capacity, written,
                           Order::kSwap4);
}

extern "C" int64_t NLSStringFromIntmax_fromQVChar(const NLSSMHandle *handle, void *locale,
                                                  int64_t value, int64_t width, uint32_t flags,
                                                  void *destination, int64_t capacity,
                                                  int32_t *written) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  Field field;
  integer_field(handle, locale, value, width, flags, capacity / unit_width(handle), field);
  return transcode_field(handle, field, destination, capacity, written);
}

// ---- Format double ---------------------------------------------------------------------

extern "C" int64_t NLSStringFromDouble_ASCII_SBCS(const NLSSMHandle *handle, void *locale,
                                                  double value, int64_t width, int64_t decimals,
                                                  uint32_t flags, void *destination,
                                                  int64_t capacity, int32_t *written) {
  return from_double_narrow(handle, locale, value, width, decimals, flags, destination, capacity,
                            written, {Family::kAscii, false});
}

extern "C" int64_t NLSStringFromDouble_EBCDIC_SBCS(const NLSSMHandle *handle, void *locale,
                                                   double value, int64_t width, int64_t decimals,
                                                   uint32_t flags, void *destination,
                                                   int64_t capacity, int32_t *written) {
  return from_double_narrow(handle, locale, value, width, decimals, flags, destination, capacity,
                            written, {Family::kEbcdic, false});
}

extern "C" int64_t NLSStringFromDouble_ASCII_MBCS(const NLSSMHandle *handle, void *locale,
                                                  double value, int64_t width, int64_t decimals,
                                                  uint32_t flags, void *destination,
                                                  int64_t capacity, int32_t *written) {
  return from_double_narrow(handle, locale, value, width, decimals, flags, destination, capacity,
                            written, {Family::kAscii, true});
}

extern "C" int64_t NLSStringFromDouble_EBCDIC_MBCS(const NLSSMHandle *handle, void *locale,
                                                   double value, int64_t width, int64_t decimals,
                                                   uint32_t flags, void *destination,
                                                   int64_t capacity, int32_t *written) {
  return from_double_narrow(handle, locale, value, width, decimals, flags, destination, capacity,
                            written, {Family::kEbcdic, true});
}

extern "C" int64_t NLSStringFromDouble_UTF8(const NLSSMHandle *handle, void *locale, double value,
                                            int64_t width, int64_t decimals, uint32_t flags,
                                            void *destination, int64_t capacity, int32_t *written) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  locale = locale_or_handles(handle, locale);
  return slot<NLSHostFormatDoubleUtf8Fn>(locale, NLSHOST_SLOT_LOCALE_FORMAT_DOUBLE_UTF8)(
      locale, value, width, decimals, flags, static_cast<uint8_t *>(destination), capacity,
      written);
}

extern "C" int64_t NLSStringFromDouble_QVChar(const NLSSMHandle *handle, void *locale, double value,
                                              int64_t width, int64_t decimals, uint32_t flags,
                                              void *destination, int64_t capacity,
                                              int32_t *written) {
  return from_double_units(handle, locale, value, width, decimals, flags, destination, capacity,
                           written, Order::kHost);
}

extern "C" int64_t NLSStringFromDouble_swap2(const NLSSMHandle *handle, void *locale, double value,
                                             int64_t width, int64_t decimals, uint32_t flags,
                                             void *destination, int64_t capacity,
                                             int32_t *written) {
  return from_double_units(handle, locale, value, width, decimals, flags, destination, capacity,
                           written, Order::kSwap2);
}

extern "C" int64_t NLSStringFromDouble_swap4(const NLSSMHandle *handle, void *locale, double value,
                                             int64_t width, int64_t decimals, uint32_t flags,
                                             void *destination, int64_t capacity,
                                             int32_t *written) {
  return from_double_units(handle, locale, value, width, decimals, flags, destination, capacity,
                           written, Order::kSwap4);
}

extern "C" int64_t NLSStringFromDouble_fromQVChar(const NLSSMHandle *handle, void *locale,
                                                  double value, int64_t width, int64_t decimals,
                                                  uint32_t flags, void *destination,
                                                  int64_t capacity, int32_t *written) {
  if (uint32_t status = check_destination(destination, capacity, written)) return status;
  Field field;
  double_field(handle, locale, value, width, decimals, flags, capacity / unit_width(handle), field);
  return transcode_field(handle, field, destination, capacity, written);
}
