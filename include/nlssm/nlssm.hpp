// nlssm for C++: a header-only layer over the C interface.
//
//   nlssm::Host host = nlssm::Host::start();          // the reference host
//   auto ebcdic = host.encoding("IBM-037");            // Result<Encoding>
//   auto t = nlssm::Text::from_utf8(*ebcdic, "Grüße"); // Result<Text>
//   t->upper();                                        // Status
//   std::string shown = t->to_utf8().value_or("?");
//
// Every operation answers a small typed result (a value or a status) and
// throws nothing. Encodings are the module's shared handles: they live as
// long as the Host that made them. A Text's operations go through its
// handle's operation slots, so each encoding gets its own class's member;
// an operation whose slot is empty for the encoding answers
// NLSSM_E_UNSUPPORTED, and an operation given a Text of another encoding
// answers NLSSM_E_ENCODING.
//
// Shapes of the results:
//   - operations that change the text in place (reverse, strip, justify,
//     erase_chars, upper, lower) change the Text and answer a Status (or a
//     count);
//   - operations that write a new text (substr, quoted, concat,
//     transliterate, ...) answer Result<Text>. The destination is sized from
//     the source (its bytes plus room for shift sequences); when the
//     operation still answers NLSSM_E_DEST_TOO_SMALL the room is grown (to
//     the size the operation reports, where it reports one, else doubled up
//     to the worst case the operation can need) and the operation is run
//     again, so a Result<Text> is never a silently shortened text;
//   - operations into a room of fixed size (move_to, fill) answer a Fitted:
//     what was written and whether all of it fitted;
//   - searches answer Result<int64_t>: a character position (0-based, from
//     the start of the text) or -1 when absent;
//   - orderings answer Result<Order>: the sign and the byte offset at which
//     the order was decided.
// Literals (the *_literal operations) are bytes of the host's literal set,
// encoding 62 (windows-1252 on the reference host, so ASCII literals read
// as written), converted into the text's encoding by the module.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <algorithm>
#include <concepts>
#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <tuple>
#include <utility>
#include <vector>

namespace nlssm {

// ---- Statuses -----------------------------------------------------------------

// A module or host status: 0 is success.
class Status {
 public:
  constexpr Status(std::uint32_t code = NLSSM_OK) : code_(code) {}
  constexpr std::uint32_t code() const { return code_; }
  constexpr bool ok() const { return code_ == NLSSM_OK; }
  constexpr explicit operator bool() const { return ok(); }
  constexpr bool operator==(const Status &) const = default;
  // The status's name ("NLSSM_E_DEST_TOO_SMALL"), or "" for an unknown code.
  const char *name() const {
    switch (code_) {
      case NLSSM_OK:
        return "NLSSM_OK";
      case NLSSM_E_NO_MEMORY:
        return "NLSSM_E_NO_MEMORY";
      case NLSSM_E_UNSUPPORTED:
        return "NLSSM_E_UNSUPPORTED";
      case NLSSM_E_DEST_TOO_SMALL:
        return "NLSSM_E_DEST_TOO_SMALL";
      case NLSSM_E_ILL_FORMED:
        return "NLSSM_E_ILL_FORMED";
      case NLSSM_E_ENCODING:
        return "NLSSM_E_ENCODING";
      case NLSSM_E_NUMBER_DOES_NOT_FIT:
        return "NLSSM_E_NUMBER_DOES_NOT_FIT";
      case NLSSM_E_NOT_A_NUMBER:
        return "NLSSM_E_NOT_A_NUMBER";
      case NLSSM_E_INT_OVERFLOW:
        return "NLSSM_E_INT_OVERFLOW";
      case NLSSM_E_TRUNCATED_SEQUENCE:
        return "NLSSM_E_TRUNCATED_SEQUENCE";
      case NLSSM_E_NUMBER_TOO_LONG:
        return "NLSSM_E_NUMBER_TOO_LONG";
      case NLSSM_E_NULL_ARGUMENT:
        return "NLSSM_E_NULL_ARGUMENT";
      case NLSSM_E_BAD_CHARACTER:
        return "NLSSM_E_BAD_CHARACTER";
      case NLSSM_E_BAD_OPTIONS:
        return "NLSSM_E_BAD_OPTIONS";
      case NLSSM_E_BAD_ARGUMENT:
        return "NLSSM_E_BAD_ARGUMENT";
      case NLSSM_E_BAD_ALIGNMENT:
        return "NLSSM_E_BAD_ALIGNMENT";
      case NLSHOST_E_NOT_A_CHARACTER:
        return "NLSHOST_E_NOT_A_CHARACTER";
      case NLSHOST_E_KEY_EXISTS:
        return "NLSHOST_E_KEY_EXISTS";
      default:
        return "";
    }
  }

 private:
  std::uint32_t code_;
};

// A value, or the status that kept it from being made.
template <typename T>
class Result {
 public:
  Result(T value) : value_(std::move(value)) {}
  Result(Status status) : status_(status.ok() ? Status(NLSSM_E_UNSUPPORTED) : status) {}
  bool ok() const { return value_.has_value(); }
  explicit operator bool() const { return ok(); }
  Status status() const { return status_; }
  // The value; only to be read when ok().
  const T &value() const & { return *value_; }
  T &value() & { return *value_; }
  T value_or(T fallback) const { return ok() ? *value_ : std::move(fallback); }
  const T &operator*() const { return *value_; }
  T &operator*() { return *value_; }
  const T *operator->() const { return &*value_; }
  T *operator->() { return &*value_; }

 private:
  std::optional<T> value_;
  Status status_{};
};

namespace detail {

// Calls the operation in a handle slot with the given prototype; an empty
// slot answers "operation not supported".
template <typename Fn, typename... Args>
std::int64_t call(const NLSSMHandle *handle, NLSSlot slot, Args... args) {
  if (slot == nullptr) return NLSSM_E_UNSUPPORTED;
  return static_cast<std::int64_t>(reinterpret_cast<Fn>(slot)(handle, args...));
}

inline Status status_of(std::int64_t result) {
  return Status(static_cast<std::uint32_t>(result));
}

constexpr std::int64_t kDestTooSmall = NLSSM_E_DEST_TOO_SMALL;

// A descriptor over `length` bytes of text in a buffer of `capacity` bytes,
// positioned at character `index` through the handle; `placed` (if given)
// tells whether that character exists. Empty text gives an unset descriptor.
inline NLSString descriptor(const NLSSMHandle *handle, const std::uint8_t *bytes,
                            std::int64_t length, std::int64_t capacity, std::int64_t index = 0,
                            bool *placed = nullptr) {
  NLSString s{const_cast<std::uint8_t *>(bytes),
              static_cast<std::uint64_t>(length),
              static_cast<std::uint64_t>(capacity),
              0,
              length == 0 ? NLSSM_POS_NONE : 0,
              NLSSM_POS_NONE,
              NLSSM_POS_NO_PREVIOUS,
              0,
              0,
              0};
  bool found = false;
  if (length != 0) {
    found = call<decltype(&stringSetPos_SBCS)>(handle, handle->stringSetPos, &s, index,
                                               std::int64_t{0}) == index;
    if (!found) s.curOffset = NLSSM_POS_NONE;
  }
  if (placed != nullptr) *placed = found;
  return s;
}

// Runs write(destination, room, &written) into a fresh buffer of `room`
// bytes. While it answers NLSSM_E_DEST_TOO_SMALL and the room is below
// `most`, the room grows, to -written when the operation reports the size
// it needs that way, else twice over, and the operation runs again. The
// answer is the bytes written.
template <typename Write>
Result<std::vector<std::uint8_t>> into_room(std::int64_t room, std::int64_t most, Write write) {
  room = std::max<std::int64_t>(room, 1);
  for (;;) {
    std::vector<std::uint8_t> out(static_cast<std::size_t>(room));
    std::int64_t written = 0;
    const std::int64_t status = write(out.data(), room, &written);
    if (status == kDestTooSmall && room < most) {
      room = written < -room ? -written : std::min(most, room * 2);
      continue;
    }
    if (status != 0) return status_of(status);
    out.resize(static_cast<std::size_t>(std::clamp<std::int64_t>(written, 0, room)));
    return out;
  }
}

// A search or count answer: a value, or the status of a failed work buffer.
inline Result<std::int64_t> counted(std::int64_t result) {
  if (result == NLSSM_COUNT_NO_MEMORY) return Status(NLSSM_E_NO_MEMORY);
  return result;
}

// Class-table bits as the classification slots read them.
inline constexpr std::int32_t kUpper = 0x01, kLower = 0x02, kDigit = 0x04, kSpace = 0x08,
                              kGraphic = 0x01 | 0x02 | 0x04 | 0x10, kHexDigit = 0x80;

// Converts whole text between two encodings through the host NLS object.
inline Result<std::vector<std::uint8_t>> convert(void *nls, std::int64_t from, std::int64_t to,
                                                 std::span<const std::uint8_t> text) {
  if (nls == nullptr) return Status(NLSSM_E_ENCODING);
  using Between = NLSHostConverterBetweenFn;
  void *converter = reinterpret_cast<Between>(
      NLSSM_HOST_SLOT(nls, NLSHOST_SLOT_NLS_CONVERTER_BETWEEN))(nls, from, to, nullptr, nullptr);
  if (converter == nullptr) return Status(NLSSM_E_ENCODING);
  auto convert = reinterpret_cast<NLSHostConverterConvertFn>(
      NLSSM_HOST_SLOT(converter, NLSHOST_SLOT_CONVERTER_CONVERT));
  auto destroy = reinterpret_cast<NLSHostConverterDestroyFn>(
      NLSSM_HOST_SLOT(converter, NLSHOST_SLOT_CONVERTER_DESTROY));
  // Every encoding takes at most 6 bytes for one byte of another, shifts
  // included, so one pass with that room suffices.
  std::vector<std::uint8_t> out(text.size() * 6 + 16);
  std::uint64_t produced = 0;
  const std::int64_t status =
      convert(converter, text.data(), text.size(), out.data(), out.size(), &produced, nullptr);
  destroy(converter);
  if (status != 0) return status_of(status);
  out.resize(produced);
  return out;
}

}  // namespace detail

// ---- Encodings -------------------------------------------------------------------

// One encoding's shared handle.
class Encoding {
 public:
  Encoding() = default;
  explicit Encoding(const NLSSMHandle *handle) : handle_(handle) {}
  // The handle; an Encoding made without one has a handle with every slot
  // empty, so that its operations answer NLSSM_E_UNSUPPORTED.
  const NLSSMHandle *handle() const { return handle_ != nullptr ? handle_ : &kNoHandle; }
  int number() const { return static_cast<int>(handle()->encodingNumber); }
  // 0 SBCS, 1 UTF-8/UTF-EBCDIC, 2 WCS2, 3 WCS4, 4 MBCS modal, 5 MBCS non-modal.
  int encoding_class() const { return static_cast<int>(handle()->encodingClass); }
  int unit_width() const { return static_cast<int>(handle()->unitWidth); }
  bool operator==(const Encoding &other) const { return handle_ == other.handle_; }

 private:
  static constexpr NLSSMHandle kNoHandle{};
  const NLSSMHandle *handle_ = nullptr;
};

// ---- Host ----------------------------------------------------------------------

// The reference host with the module linked into the program: started on
// construction, stopped (with every handle released) on destruction.
class Host {
 public:
  static Host start() { return Host(refhost::ReferenceHost::start(refhost::linked_module())); }
  bool ok() const { return host_ != nullptr && host_->module() != nullptr; }
  explicit operator bool() const { return ok(); }

  // The encoding by number (0-264) or by name or alias ("IBM-037", "utf8").
  Result<Encoding> encoding(int number) const {
    if (!ok()) return Status(NLSSM_E_ENCODING);
    NLSSMHandle *handle = nullptr;
    const std::int64_t status = host_->create_handle(number, &handle);
    if (status != 0) return detail::status_of(status);
    return Encoding(handle);
  }
  Result<Encoding> encoding(std::string_view name) const {
    const int number = refhost::ReferenceHost::registry().lookup(name);
    if (number < 0) return Status(NLSSM_E_ENCODING);
    return encoding(number);
  }

  refhost::ReferenceHost &reference_host() { return *host_; }

 private:
  explicit Host(std::unique_ptr<refhost::ReferenceHost> host) : host_(std::move(host)) {}
  std::unique_ptr<refhost::ReferenceHost> host_;
};

// ---- Operation options and results -------------------------------------------------

// Case folding of an ordering: none, through the encoding's lower-case or
// its upper-case mapping.
enum class Fold { none, lower, upper };

// How two texts are ordered: `pad` compares the shorter as if blank-padded
// to the longer's length.
struct CompareOptions {
  bool pad = false;
  Fold fold = Fold::none;
};

// An ordering: sign -1, 0 or 1, and the byte offset from each text's start
// at which it was decided (-1 when the texts are equal).
struct Order {
  int sign = 0;
  std::int64_t offset = -1;
  bool operator==(const Order &) const = default;
};

// Classes of the encoding's class table, combinable with |.
enum class CharClass : std::int32_t {
  upper = 0x01,
  lower = 0x02,
  digit = 0x04,
  space = 0x08,
  punctuation = 0x10,
  blank = 0x20,
  control = 0x40,
  hex_digit = 0x80,
};
constexpr CharClass operator|(CharClass a, CharClass b) {
  return static_cast<CharClass>(static_cast<std::int32_t>(a) | static_cast<std::int32_t>(b));
}

// A paragraph direction; from_text takes it from the text's first strong
// character.
enum class Direction : std::uint8_t { left_to_right = 0, right_to_left = 1, from_text = 2 };

// The case a text is mapped to.
enum class Case { upper, lower };

// Where justify puts the text of a field between its blanks.
enum class Align : char { left = 'L', right = 'R', centre = 'C', none = 'N' };

// A text written into a room of fixed size: what was written, and whether
// all of the source fitted.
struct Fitted;

// ---- Text ------------------------------------------------------------------------

// Bytes of text in one encoding, owned. Operations act on the whole text.
class Text {
 public:
  Text(Encoding encoding, std::vector<std::uint8_t> bytes)
      : encoding_(encoding), bytes_(std::move(bytes)) {}
  Text(Encoding encoding, std::span<const std::uint8_t> bytes)
      : encoding_(encoding), bytes_(bytes.begin(), bytes.end()) {}

  // UTF-8 text converted into the encoding through the host.
  static Result<Text> from_utf8(Encoding encoding, std::string_view utf8) {
    const auto *p = reinterpret_cast<const std::uint8_t *>(utf8.data());
    auto bytes = detail::convert(encoding.handle()->owner, NLSSM_ENC_UTF8, encoding.number(),
                                 {p, utf8.size()});
    if (!bytes) return bytes.status();
    return Text(encoding, std::move(*bytes));
  }
  // The text as UTF-8, converted through the host.
  Result<std::string> to_utf8() const {
    auto bytes = detail::convert(handle()->owner, encoding_.number(), NLSSM_ENC_UTF8, bytes_);
    if (!bytes) return bytes.status();
    return std::string(bytes->begin(), bytes->end());
  }

  Encoding encoding() const { return encoding_; }
  const NLSSMHandle *handle() const { return encoding_.handle(); }
  const std::vector<std::uint8_t> &bytes() const { return bytes_; }
  std::vector<std::uint8_t> &bytes() { return bytes_; }
  std::int64_t byte_length() const { return static_cast<std::int64_t>(bytes_.size()); }
  // The bytes, never null (operations refuse null buffers even when empty).
  const std::uint8_t *data() const { return bytes_.empty() ? &kNone : bytes_.data(); }
  std::uint8_t *data() { return bytes_.empty() ? &kNone : bytes_.data(); }
  // Same encoding, same bytes.
  bool operator==(const Text &other) const {
    return encoding_ == other.encoding_ && bytes_ == other.bytes_;
  }

  // Characters in the text.
  Result<std::int64_t> count() const {
    std::int64_t n = 0;
    const auto status = call<decltype(&NLSNumCharsS_SBCS)>(handle()->NLSNumCharsS, data(),
                                                           byte_length(), std::int64_t{0}, &n);
    if (status != 0) return detail::status_of(status);
    return n;
  }

  // ---- UTF conversions --------------------------------------------------------------

  // The text's code points. UTF-8 text is decoded by the module; other
  // encodings go to UTF-8 through the host first.
  Result<std::u32string> code_points() const {
    std::vector<std::uint8_t> utf8;
    if (encoding_.number() == NLSSM_ENC_UTF8) {
      utf8 = bytes_;
    } else {
      auto converted = to_utf8();
      if (!converted) return converted.status();
      utf8.assign(converted->begin(), converted->end());
    }
    const auto length = static_cast<std::int64_t>(utf8.size());
    utf8.resize(utf8.size() + 8);  // the decoder reads up to 6 bytes past the end
    std::u32string out(utf8.size(), U'\0');
    std::int64_t written = 0;
    const std::int64_t status =
        ConvertToUTF32(utf8.data(), length, out.data(), static_cast<std::int64_t>(out.size()) * 4,
                       &written, &UTF8_UTF32, &COPY_UTF32_SWAP);
    if (status != 0) return detail::status_of(status);
    out.resize(static_cast<std::size_t>(written / 4));
    return out;
  }
  // Code points as text of the encoding: encoded as UTF-8 by the module, then
  // converted through the host for other encodings.
  static Result<Text> from_code_points(Encoding encoding, std::u32string_view code_points) {
    const auto units = static_cast<std::int64_t>(code_points.size());
    std::vector<std::uint8_t> utf8(static_cast<std::size_t>(units * 4 + 1));
    std::int64_t written = 0;
    const std::int64_t status = ConvertFromUTF32(code_points.data(), units * 4, utf8.data(),
                                                 static_cast<std::int64_t>(utf8.size()), &written,
                                                 &UTF32_UTF8, &COPY_UTF32b_SWAP);
    if (status != 0) return detail::status_of(status);
    utf8.resize(static_cast<std::size_t>(written));
    if (encoding.number() == NLSSM_ENC_UTF8) return Text(encoding, std::move(utf8));
    return from_utf8(encoding, {reinterpret_cast<const char *>(utf8.data()), utf8.size()});
  }

  // ---- Case mapping -----------------------------------------------------------------
  // `double_byte` also maps double-byte characters through the encoding's
  // double-byte case table.

  // Upper or lower case in place. The text keeps its byte length: in UTF-8
  // a shorter mapping leaves blanks at the end, and a character whose
  // mapping would run past the end is left as it is.
  Status upper(bool double_byte = true) {
    return status(call<decltype(&NLSStringUpperS_SBCS)>(handle()->NLSStringUpperS, data(),
                                                        byte_length(), case_options(double_byte)));
  }
  Status lower(bool double_byte = true) {
    return status(call<decltype(&NLSStringLowerS_SBCS)>(handle()->NLSStringLowerS, data(),
                                                        byte_length(), case_options(double_byte)));
  }
  // A copy mapped to one case by the normalizing operation (as upper() or
  // lower() would map it).
  Result<Text> normalized(Case to = Case::upper, bool double_byte = true) const {
    Text copy = *this;
    // The modal normalizing operation leaves shift sequences out of what it
    // writes, which would leave the copy's double-byte characters without
    // their shifts: modal text is mapped in place instead.
    if (encoding_.encoding_class() == NLSSM_CLASS_MBCS_MODAL) {
      const Status done = to == Case::upper ? copy.upper(double_byte) : copy.lower(double_byte);
      if (!done) return done;
      return copy;
    }
    // The other members map a buffer onto itself when source and
    // destination are the same, so the copy is mapped where it lies.
    const std::uint32_t options = case_options(double_byte) | (to == Case::upper ? 2u : 0u);
    std::int64_t written = 0;
    const std::int64_t r = call<decltype(&NLSStringNormalizeS_SBCS)>(
        handle()->NLSStringNormalizeS, copy.data(), byte_length(), copy.data(), byte_length(),
        &written, options);
    if (r != 0) return status(r);
    return copy;
  }

  // ---- Comparison -------------------------------------------------------------------

  // Caseless equality (the encoding's lower-case folding); with `pad` the
  // longer text may carry trailing blanks. Unequal lengths are unequal
  // otherwise.
  Result<bool> equals(const Text &other, bool pad = false) const {
    if (!same_encoding(other)) return Status(NLSSM_E_ENCODING);
    return answer(
        call<decltype(&NLSStringEqualsS_SBCS)>(handle()->NLSStringEqualsS, data(), byte_length(),
                                               other.data(), other.byte_length(), pad ? 1 : 0),
        [](std::int64_t r) { return r == 1; });
  }
  // Binary order of the two texts' bytes or code units, optionally folded.
  Result<Order> compare(const Text &other, CompareOptions options = {}) const {
    if (!same_encoding(other)) return Status(NLSSM_E_ENCODING);
    return order(call<decltype(&NLSStringCompareS_SBCS)>(handle()->NLSStringCompareS, data(),
                                                         byte_length(), other.data(),
                                                         other.byte_length(), bits(options)));
  }
  // Order against a literal, over as many characters as the literal has.
  Result<Order> compare_literal(std::string_view literal, CompareOptions options = {}) const {
    const std::int64_t r =
        call<decltype(&NLSStringCompLitS_SBCS)>(handle()->NLSStringCompLitS, data(), byte_length(),
                                                lit(literal), lit_length(literal), bits(options));
    if (r == NLSSM_COUNT_NO_MEMORY) return Status(NLSSM_E_NO_MEMORY);
    return order(r);
  }

  // ---- Search -----------------------------------------------------------------------

  // The first occurrence of `pattern` (whole characters); 0 for an empty
  // pattern.
  Result<std::int64_t> index(const Text &pattern) const {
    if (!same_encoding(pattern)) return Status(NLSSM_E_ENCODING);
    return value<decltype(&NLSStringIndexS_SBCS)>(handle()->NLSStringIndexS, data(), byte_length(),
                                                  pattern.data(), pattern.byte_length());
  }
  // Whether `pattern` occurs; an empty pattern does not.
  Result<bool> contains(const Text &pattern) const {
    if (!same_encoding(pattern)) return Status(NLSSM_E_ENCODING);
    const auto at =
        value<decltype(&NLSStringContains)>(handle()->NLSStringContains, data(), byte_length(),
                                            pattern.data(), pattern.byte_length(), std::int64_t{0});
    if (!at) return at.status();
    return *at >= 0;
  }
  // The first occurrence of the first character of `character`.
  Result<std::int64_t> find_char(const Text &character) const {
    if (!same_encoding(character)) return Status(NLSSM_E_ENCODING);
    if (character.bytes_.empty()) return Status(NLSSM_E_NULL_ARGUMENT);
    // The operation reads as many bytes as the first one announces: keep
    // them readable whatever the text holds.
    std::vector<std::uint8_t> one(character.bytes_);
    one.resize(one.size() + 8);
    return value<decltype(&NLSStringFindCharLitS_SBCS)>(handle()->NLSStringFindCharS, data(),
                                                        byte_length(), one.data(), std::int64_t{0},
                                                        std::int64_t{0}, std::uint8_t{0});
  }
  // The first occurrence of one character of the literal set; -1 also when
  // the encoding has no form for it.
  Result<std::int64_t> find_literal(char literal) const {
    const auto byte = static_cast<std::uint8_t>(literal);
    return value<decltype(&NLSStringFindCharLitS_SBCS)>(handle()->NLSStringFindCharLitS, data(),
                                                        byte_length(), &byte, std::int64_t{0},
                                                        std::int64_t{0}, std::uint8_t{1});
  }
  // The first character that is not one of the characters of `set`; -1 when
  // all are (or the text is empty), 0 for an empty set.
  Result<std::int64_t> verify(const Text &set) const {
    if (!same_encoding(set)) return Status(NLSSM_E_ENCODING);
    return value<decltype(&NLSStringVerifyS_SBCS)>(handle()->NLSStringVerifyS, data(),
                                                   byte_length(), set.data(), set.byte_length());
  }
  // As verify, with the set given as a literal.
  Result<std::int64_t> verify_literal(std::string_view set) const {
    return counted(value<decltype(&NLSStringNotEqualLitS)>(handle()->NLSStringNotEqualLitS, data(),
                                                           byte_length(), lit(set), lit_length(set),
                                                           std::uint32_t{0}));
  }
  // SQL LIKE over whole characters: '%' any run, '_' one character; with
  // `escape` a backslash makes the next pattern character literal.
  Result<bool> like(const Text &pattern, bool escape = false) const {
    if (!same_encoding(pattern)) return Status(NLSSM_E_ENCODING);
    const NLSString text = at(0), pat = pattern.at(0);
    return answer(call<decltype(&NLSStringLike_SBCS_ASCII)>(handle()->NLSStringLike, &text, &pat,
                                                            std::int64_t{escape ? 1 : 0}),
                  [](std::int64_t r) { return r == 1; });
  }

  // ---- Classification ---------------------------------------------------------------
  // Of the character at `index` (0-based); false when there is none.

  // In any of the classes of `mask`.
  Result<bool> is(CharClass mask, std::int64_t index = 0) const {
    return classify(handle()->NLSStringIs, index, static_cast<std::int32_t>(mask));
  }
  Result<bool> is_upper(std::int64_t index = 0) const {
    return classify(handle()->NLSStringIsLower, index, detail::kUpper);
  }
  Result<bool> is_lower(std::int64_t index = 0) const {
    return classify(handle()->NLSStringIsLower, index, detail::kLower);
  }
  Result<bool> is_digit(std::int64_t index = 0) const {
    return classify(handle()->NLSStringIsDigit, index, detail::kDigit);
  }
  Result<bool> is_hex_digit(std::int64_t index = 0) const {
    return classify(handle()->NLSStringIsXDigit, index, detail::kHexDigit);
  }
  // A letter, digit or punctuation: not blank, control or unassigned.
  Result<bool> is_graphic(std::int64_t index = 0) const {
    return classify(handle()->NLSStringIsGraph, index, detail::kGraphic);
  }
  // White space; `strict` (Unicode encodings) leaves out the controls
  // U+0009-U+000D and U+0085.
  Result<bool> is_space(std::int64_t index = 0, bool strict = false) const {
    const int cls = encoding_.encoding_class();
    if (cls != NLSSM_CLASS_UTF8 && cls != NLSSM_CLASS_WCS2 && cls != NLSSM_CLASS_WCS4)
      return classify(handle()->NLSStringIsSpace, index, detail::kSpace);
    bool placed = false;
    const NLSString s = at(index, &placed);
    if (!placed) return false;
    return judged(value<decltype(&NLSStringIsSpace_UTF8)>(handle()->NLSStringIsSpace, &s,
                                                          std::int64_t{strict ? 1 : 0}),
                  1);
  }
  // Every character in a class of `mask` (true for empty text).
  Result<bool> all_are(CharClass mask) const {
    const NLSString s = at(0);
    return judged(value<decltype(&stringAnyNot)>(handle()->stringAnyNot, &s, std::int64_t{0},
                                                 static_cast<std::int32_t>(mask)),
                  0);
  }

  // ---- Editing in place -------------------------------------------------------------

  // Reverses the order of the characters.
  Status reverse() {
    return status(call<decltype(&NLSStringReverseS_SBCS)>(handle()->NLSStringReverseS, data(),
                                                          byte_length()));
  }
  // Takes out every character that occurs in `list`; the kept characters
  // close up and the field keeps its length, blank at the end. Answers the
  // bytes kept.
  Result<std::int64_t> erase_chars(const Text &list) {
    if (!same_encoding(list)) return Status(NLSSM_E_ENCODING);
    return counted(value<decltype(&NLSStringDeleteS_SBCS)>(
        handle()->NLSStringDeleteS, data(), byte_length(), list.data(), list.byte_length()));
  }
  // As erase_chars, with the list given as a literal.
  Result<std::int64_t> erase_literal(std::string_view list) {
    return counted(value<decltype(&NLSStringDeleteLitS)>(handle()->NLSStringDeleteLitS, data(),
                                                         byte_length(), lit(list), lit_length(list),
                                                         std::int64_t{0}));
  }
  // The bytes up to the last character that is not a blank (with
  // `whitespace`, not white space).
  Result<std::int64_t> stripped_length(bool whitespace = false) const {
    return value<decltype(&NLSStringStripS_SBCS)>(handle()->NLSStringStripS, data(), byte_length(),
                                                  std::int64_t{whitespace ? 1 : 0});
  }
  // Drops the trailing blanks (with `whitespace`, white space).
  Status strip(bool whitespace = false) {
    const auto length = stripped_length(whitespace);
    if (!length) return length.status();
    bytes_.resize(static_cast<std::size_t>(std::clamp<std::int64_t>(*length, 0, byte_length())));
    return {};
  }
  // Moves the text between the field's leading and trailing blanks to its
  // left, right or centre, blanking the places it left.
  Status justify(Align align) {
    std::int64_t length = 0, start = 0;
    return status(
        call<decltype(&NLSStringJustifyS)>(handle()->NLSStringJustifyS, data(), byte_length(),
                                           static_cast<std::uint32_t>(align), &length, &start));
  }

  // ---- Editing into a new text ------------------------------------------------------

  // Up to `count` characters from character `start` (a negative count: all
  // that remain). A start at or past the end gives empty text; a negative
  // start, NLSSM_E_BAD_ARGUMENT.
  Result<Text> substr(std::int64_t start, std::int64_t count = -1) const {
    if (start < 0) return Status(NLSSM_E_BAD_ARGUMENT);
    if (handle()->NLSStringSubStr == nullptr) return Status(NLSSM_E_UNSUPPORTED);
    bool placed = false;
    const NLSString source = at(start, &placed);
    if (!placed || count == 0) return Text(encoding_, std::vector<std::uint8_t>{});
    const std::int64_t rest = byte_length() - source.curOffset;
    return made(rest + room_for_shifts(), 4 * rest + 64,
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  NLSString d = detail::descriptor(handle(), dst, 0, room);
                  return call<decltype(&NLSStringSubStr_SBCS)>(handle()->NLSStringSubStr, &source,
                                                               &d, count < 0 ? 0 : count, written,
                                                               std::int64_t{0});
                });
  }
  // The text in quotes, every quote character in it doubled.
  Result<Text> quoted() const {
    return made(2 * byte_length() + 2 * room_for_shifts(), 4 * byte_length() + 64,
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  return call<decltype(&NLSStringAddQuotesS)>(handle()->NLSStringAddQuotesS, data(),
                                                              byte_length(), dst, room, written);
                });
  }
  // The text between its first character (the delimiter) and its last, a
  // doubled delimiter read as one: the inverse of quoted().
  Result<Text> unquoted() const {
    return made(byte_length() + room_for_shifts(), byte_length() + room_for_shifts(),
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  return call<decltype(&NLSStringRemoveDelimitersS_SBCS)>(
                      handle()->NLSStringRemoveDelimitersS, data(), byte_length(), dst, room,
                      written);
                });
  }
  // This text followed by the others.
  template <typename... More>
  requires(std::same_as<More, Text> &&...) Result<Text> concat(const More &...more)
  const { return joined(nullptr, 0, more...); }
  // This text and the others with the literal `separator` between them.
  template <typename... More>
  requires(std::same_as<More, Text> &&...) Result<Text> join(char separator, const More &...more)
  const { return joined(&separator, 1, more...); }
  // Each character found in `from` replaced by the character of `to` at the
  // same place (pairs up to the shorter list's length).
  Result<Text> transliterate(const Text &to, const Text &from) const {
    if (!same_encoding(to) || !same_encoding(from)) return Status(NLSSM_E_ENCODING);
    return translated(handle()->NLSStringTransliterateS, to.data(), to.byte_length(), from.data(),
                      from.byte_length());
  }
  // As transliterate, with the lists given as literals.
  Result<Text> transliterate_literal(std::string_view to, std::string_view from) const {
    return translated(handle()->NLSStringTransliterateLitS, lit(to), lit_length(to), lit(from),
                      lit_length(from));
  }
  // Every occurrence of the word `find` replaced by `replacement`.
  Result<Text> tranword(const Text &find, const Text &replacement) const {
    if (!same_encoding(find) || !same_encoding(replacement)) return Status(NLSSM_E_ENCODING);
    // Each occurrence of find takes at least one byte of the source.
    const std::int64_t grow = std::max<std::int64_t>(0, replacement.byte_length() - 1);
    const std::int64_t most = byte_length() * (1 + grow) + 2 * room_for_shifts() + 64;
    return made(byte_length() + replacement.byte_length() + room_for_shifts(), most,
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  return call<decltype(&NLSStringTranwordS_SBCS)>(
                      handle()->NLSStringTranwordS, data(), byte_length(), replacement.data(),
                      replacement.byte_length(), find.data(), find.byte_length(), dst, room,
                      written, std::int64_t{0});
                });
  }
  // Every run of the first character of `character` reduced to one.
  Result<Text> squeeze(const Text &character) const {
    if (!same_encoding(character)) return Status(NLSSM_E_ENCODING);
    return made(byte_length() + room_for_shifts(), 2 * byte_length() + 64,
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  return call<decltype(&NLSStringSqueezeS_SBCS)>(
                      handle()->NLSStringSqueezeS, data(), byte_length(), character.data(),
                      character.byte_length(), dst, room, written);
                });
  }
  // As squeeze, with the literal's first character; an empty literal
  // squeezes blanks.
  Result<Text> squeeze_literal(std::string_view literal) const {
    return made(byte_length() + room_for_shifts(), 2 * byte_length() + 64,
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  return call<decltype(&NLSStringSqueezeLitS)>(
                      handle()->NLSStringSqueezeLitS, data(), byte_length(), lit(literal),
                      lit_length(literal), dst, room, written, nullptr, std::int64_t{0});
                });
  }

  // ---- Bidirectional text -----------------------------------------------------------

  // Right-to-left when the first strongly directional character is.
  Result<Direction> base_direction() const {
    std::uint8_t direction = 0;
    const std::int64_t r = call<decltype(&NLSGetBaseDirection_SBCS)>(
        handle()->NLSGetBaseDirection, data(), byte_length(), &direction);
    if (r != 0) return status(r);
    return static_cast<Direction>(direction);
  }
  // The text (in reading order) in display order, left to right, as a line
  // of a paragraph of the given direction.
  Result<Text> visual_order(Direction paragraph = Direction::from_text) const {
    return reordered(handle()->NLSVisualOrderFormat, paragraph);
  }
  // A reading order that displays as this line (in display order).
  Result<Text> logical_order(Direction paragraph = Direction::from_text) const {
    return reordered(handle()->NLSLogicalOrderFormat, paragraph);
  }

  // ---- Into a room of fixed size ----------------------------------------------------

  // The text moved, in whole characters, into a field of `room` bytes;
  // with `pad` the rest of the field is blank.
  Result<Fitted> move_to(std::int64_t room, bool pad = true) const;
  // This text (one character; modal text: its first) repeated over `room`
  // bytes; not complete when bytes are left that a whole one does not fill.
  Result<Fitted> fill(std::int64_t room) const;
  // The literal character repeated over `room` bytes of the encoding.
  static Result<Fitted> fill_literal(Encoding encoding, char literal, std::int64_t room);

  // ---- Numbers ------------------------------------------------------------------------
  // Number texts are at most 152 bytes (NLSSM_E_NUMBER_TOO_LONG beyond).

  // Blanks, an optional sign, blanks, digits; a blank or NUL ends the
  // number, and with `strict_tail` only blanks may follow it.
  Result<std::int64_t> to_integer(bool strict_tail = false) const {
    std::int64_t value = 0;
    std::int32_t consumed = 0;
    auto text = number_text(handle()->NLSStringToIntmax, &NLSStringToIntmax_swap2);
    if (!text) return text.status();
    const std::int64_t r = call<decltype(&NLSStringToIntmax_ASCII)>(
        handle()->NLSStringToIntmax, nullptr, text->data(), std::ssize(*text),
        strict_tail ? NLSSM_NUMBER_STRICT_TAIL : 0u, &value, &consumed);
    if (r != 0) return detail::status_of(r);
    return value;
  }
  // A decimal or scientific number as the host's locale reads it.
  Result<double> to_double(bool strict_tail = false) const {
    double value = 0;
    std::int32_t consumed = 0;
    auto text = number_text(handle()->NLSStringToDouble, &NLSStringToDouble_swap2);
    if (!text) return text.status();
    const std::int64_t r = call<decltype(&NLSStringToDouble_ASCII)>(
        handle()->NLSStringToDouble, nullptr, text->data(), std::ssize(*text), std::int64_t{0},
        strict_tail ? NLSHOST_PARSE_STRICT_TAIL : 0u, &value, &consumed);
    if (r != 0) return detail::status_of(r);
    return value;
  }
  // The integer right-aligned in `width` characters (0: its own width);
  // flags NLSHOST_NUMBER_* have the locale format it. A number wider than
  // the field answers NLSSM_E_NUMBER_DOES_NOT_FIT.
  static Result<Text> from_integer(Encoding encoding, std::int64_t value, std::int64_t width = 0,
                                   std::uint32_t flags = 0) {
    const NLSSMHandle *h = encoding.handle();
    const bool wide = h->NLSStringFromIntmax == as_slot(&NLSStringFromIntmax_swap2);
    return number(encoding, wide, [&](std::uint8_t *dst, std::int64_t room, std::int32_t *written) {
      return detail::call<decltype(&NLSStringFromIntmax_ASCII_SBCS)>(
          h, h->NLSStringFromIntmax, nullptr, value, width, flags, dst, room, written);
    });
  }
  // The double with `decimals` digits after the point (or the shortest form
  // that reads back), formatted by the host's locale.
  static Result<Text> from_double(Encoding encoding, double value, std::int64_t width = 0,
                                  std::int64_t decimals = NLSHOST_DECIMALS_SHORTEST,
                                  std::uint32_t flags = 0) {
    const NLSSMHandle *h = encoding.handle();
    const bool wide = h->NLSStringFromDouble == as_slot(&NLSStringFromDouble_swap2);
    return number(encoding, wide, [&](std::uint8_t *dst, std::int64_t room, std::int32_t *written) {
      return detail::call<decltype(&NLSStringFromDouble_ASCII_SBCS)>(
          h, h->NLSStringFromDouble, nullptr, value, width, decimals, flags, dst, room, written);
    });
  }

 private:
  static inline std::uint8_t kNone = 0;
  static constexpr std::int64_t kNumberRoom = 152;

  template <typename Fn, typename... Args>
  std::int64_t call(NLSSlot slot, Args... args) const {
    return detail::call<Fn>(handle(), slot, args...);
  }
  // The raw answer of an operation that answers a value, or
  // NLSSM_E_UNSUPPORTED when its slot is empty.
  template <typename Fn, typename... Args>
  Result<std::int64_t> value(NLSSlot slot, Args... args) const {
    if (slot == nullptr) return Status(NLSSM_E_UNSUPPORTED);
    return detail::call<Fn>(handle(), slot, args...);
  }
  static Result<std::int64_t> counted(Result<std::int64_t> r) {
    return r ? detail::counted(*r) : r;
  }
  // Whether the operation answered `yes`.
  static Result<bool> judged(Result<std::int64_t> r, std::int64_t yes) {
    if (!r) return r.status();
    return *r == yes;
  }
  static Status status(std::int64_t r) { return detail::status_of(r); }
  static std::uint32_t case_options(bool double_byte) { return double_byte ? 4u : 0u; }
  bool same_encoding(const Text &other) const { return encoding_ == other.encoding_; }
  // The result of an operation that answers a status or a value.
  template <typename Judge>
  static Result<bool> answer(std::int64_t r, Judge judge) {
    if (r == NLSSM_E_UNSUPPORTED || r == NLSSM_E_NULL_ARGUMENT) return detail::status_of(r);
    return judge(r);
  }
  static Result<Order> order(std::int64_t r) {
    if (r == NLSSM_E_UNSUPPORTED) return detail::status_of(r);
    if (r == 0) return Order{};
    return Order{r > 0 ? 1 : -1, (r > 0 ? r : -r) - 1};
  }
  static std::uint32_t bits(CompareOptions o) {
    return (o.pad ? NLSSM_OPT_PAD : 0u) | (o.fold == Fold::lower   ? NLSSM_OPT_FOLD_LOWER
                                           : o.fold == Fold::upper ? NLSSM_OPT_FOLD_UPPER
                                                                   : 0u);
  }
  static const std::uint8_t *lit(std::string_view s) {
    return s.empty() ? &kNone : reinterpret_cast<const std::uint8_t *>(s.data());
  }
  static std::int64_t lit_length(std::string_view s) { return static_cast<std::int64_t>(s.size()); }
  NLSString at(std::int64_t index, bool *placed = nullptr) const {
    return detail::descriptor(handle(), data(), byte_length(), byte_length(), index, placed);
  }
  Result<bool> classify(NLSSlot slot, std::int64_t index, std::int32_t mask) const {
    bool placed = false;
    const NLSString s = at(index, &placed);
    if (!placed && slot != nullptr) return false;
    return judged(value<decltype(&NLSStringIs_SBCS)>(slot, &s, std::int64_t{0}, mask), 1);
  }
  // Room for a shift-out and shift-in pair and a few bytes besides.
  std::int64_t room_for_shifts() const { return 2 * handle()->shiftLength + 16; }
  // A new text of this encoding from an operation writing into a room.
  template <typename Write>
  Result<Text> made(std::int64_t room, std::int64_t most, Write write) const {
    auto bytes = detail::into_room(room, most, write);
    if (!bytes) return bytes.status();
    return Text(encoding_, std::move(*bytes));
  }
  // Two-byte text reaches the number members as the host's 32-bit
  // characters, one per 4-byte unit with the bytes of each 16-bit half
  // reversed: widened here on the way in, narrowed on the way out, so that
  // callers see numbers as ordinary text of the encoding.
  template <typename Fn>
  static NLSSlot as_slot(Fn *member) {
    return reinterpret_cast<NLSSlot>(member);
  }
  template <typename Fn>
  Result<std::vector<std::uint8_t>> number_text(NLSSlot slot, Fn *swap2) const {
    if (slot != as_slot(swap2)) return bytes_;
    const auto chars = code_points();
    if (!chars) return chars.status();
    std::vector<std::uint8_t> wide;
    for (const char32_t c : *chars)
      wide.insert(wide.end(),
                  {static_cast<std::uint8_t>(c >> 8), static_cast<std::uint8_t>(c),
                   static_cast<std::uint8_t>(c >> 24), static_cast<std::uint8_t>(c >> 16)});
    return wide;
  }
  template <typename Write>
  static Result<Text> number(Encoding encoding, bool wide, Write write) {
    std::vector<std::uint8_t> out(kNumberRoom);
    std::int32_t written = 0;
    const std::int64_t r = write(out.data(), kNumberRoom, &written);
    if (r != 0) return detail::status_of(r);
    out.resize(static_cast<std::size_t>(std::clamp<std::int32_t>(written, 0, kNumberRoom)));
    if (!wide) return Text(encoding, std::move(out));
    std::u32string chars;
    for (std::size_t i = 0; i + 4 <= out.size(); i += 4)
      chars +=
          static_cast<char32_t>(out[i] << 8 | out[i + 1] | out[i + 2] << 24 | out[i + 3] << 16);
    return from_code_points(encoding, chars);
  }
  Result<Text> translated(NLSSlot slot, const std::uint8_t *to, std::int64_t toLength,
                          const std::uint8_t *from, std::int64_t fromLength) const {
    // A character can become at most four times as long (a single byte into
    // a shifted double-byte character, or into a four-byte sequence).
    return made(byte_length() + room_for_shifts(), 4 * byte_length() + room_for_shifts(),
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  return call<decltype(&NLSStringTransliterateS_SBCS)>(
                      slot, data(), byte_length(), to, toLength, from, fromLength, std::int64_t{0},
                      dst, room, written, std::int64_t{0});
                });
  }
  // Replaced ill-formed input and mirror images may change the length:
  // room for the worst, a byte becoming four.
  Result<Text> reordered(NLSSlot slot, Direction paragraph) const {
    return made(byte_length() + 16, 4 * byte_length() + 16,
                [&](std::uint8_t *dst, std::int64_t room, std::int64_t *written) {
                  auto direction = static_cast<std::uint8_t>(paragraph);
                  return call<decltype(&NLSVisualOrderFormat_SBCS)>(slot, data(), byte_length(),
                                                                    dst, room, written, &direction);
                });
  }
  template <typename... More>
  Result<Text> joined(const char *separator, std::int64_t separatorLength,
                      const More &...more) const {
    if (!(same_encoding(more) && ...)) return Status(NLSSM_E_ENCODING);
    const std::int64_t pieces = 1 + static_cast<std::int64_t>(sizeof...(More));
    const std::int64_t total = byte_length() + (more.byte_length() + ... + 0);
    const std::int64_t room = total + pieces * (4 + room_for_shifts());
    const auto *sep = reinterpret_cast<const std::uint8_t *>(separator);
    const auto args = std::tuple_cat(std::make_tuple(data(), byte_length()),
                                     std::make_tuple(more.data(), more.byte_length())...);
    return made(room, 4 * room, [&](std::uint8_t *dst, std::int64_t size, std::int64_t *written) {
      return std::apply(
          [&](auto... piece) {
            return call<decltype(&NLSStringConcatS)>(handle()->NLSStringConcatS, dst, size, written,
                                                     sep, separatorLength, std::uint32_t{0}, pieces,
                                                     piece...);
          },
          args);
    });
  }

  Encoding encoding_;
  std::vector<std::uint8_t> bytes_;
};

struct Fitted {
  Text text;
  bool complete = true;
};

namespace detail {

// Runs write(destination, room, &written) once into `room` bytes; a
// destination too small is an incomplete fit, not a failure.
template <typename Write>
Result<Fitted> fitted(Encoding encoding, std::int64_t room, std::int64_t keep, Write write) {
  if (room < 0) return Status(NLSSM_E_BAD_ARGUMENT);
  std::vector<std::uint8_t> out(static_cast<std::size_t>(room) + 1);
  std::int64_t written = 0;
  const std::int64_t r = write(out.data(), room, &written);
  if (r != 0 && r != kDestTooSmall) return status_of(r);
  const std::int64_t size = r == 0 && keep >= 0 ? keep : written;
  out.resize(static_cast<std::size_t>(std::clamp<std::int64_t>(size, 0, room)));
  return Fitted{Text(encoding, std::move(out)), r == 0};
}

}  // namespace detail

inline Result<Fitted> Text::move_to(std::int64_t room, bool pad) const {
  return detail::fitted(encoding_, room, pad ? room : -1,
                        [&](std::uint8_t *dst, std::int64_t size, std::int64_t *written) {
                          return call<decltype(&NLSStringMoveS_SBCS)>(
                              handle()->NLSStringMoveS, data(), byte_length(), dst, size, written,
                              pad ? NLSSM_EDIT_PAD : 0u);
                        });
}

inline Result<Fitted> Text::fill(std::int64_t room) const {
  return detail::fitted(encoding_, room, -1,
                        [&](std::uint8_t *dst, std::int64_t size, std::int64_t *written) {
                          return call<decltype(&NLSStringFillS_SBCS)>(
                              handle()->NLSStringFillS, dst, size, data(), byte_length(), written);
                        });
}

inline Result<Fitted> Text::fill_literal(Encoding encoding, char literal, std::int64_t room) {
  const NLSSMHandle *h = encoding.handle();
  return detail::fitted(
      encoding, room, -1, [&](std::uint8_t *dst, std::int64_t size, std::int64_t *written) {
        return detail::call<decltype(&NLSStringFillLitS)>(
            h, h->NLSStringFillLitS, dst, size, reinterpret_cast<const std::uint8_t *>(&literal),
            std::int64_t{1}, written);
      });
}

}  // namespace nlssm
