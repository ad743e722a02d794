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
// long as the Host that made them.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstdint>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
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

// Converts whole text between two encodings through the host NLS object.
inline Result<std::vector<std::uint8_t>> convert(void *nls, std::int64_t from, std::int64_t to,
                                                 std::span<const std::uint8_t> text) {
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
  const NLSSMHandle *handle() const { return handle_; }
  int number() const { return static_cast<int>(handle_->encodingNumber); }
  // 0 SBCS, 1 UTF-8/UTF-EBCDIC, 2 WCS2, 3 WCS4, 4 MBCS modal, 5 MBCS non-modal.
  int encoding_class() const { return static_cast<int>(handle_->encodingClass); }
  int unit_width() const { return static_cast<int>(handle_->unitWidth); }
  bool operator==(const Encoding &other) const { return handle_ == other.handle_; }

 private:
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

  // Characters in the text.
  Result<std::int64_t> count() const {
    std::int64_t n = 0;
    const auto status = detail::call<std::int64_t (*)(const NLSSMHandle *, const std::uint8_t *,
                                                      std::int64_t, std::int64_t, std::int64_t *)>(
        handle(), handle()->NLSNumCharsS, bytes_.data(), byte_length(), std::int64_t{0}, &n);
    if (status != 0) return detail::status_of(status);
    return n;
  }

 private:
  Encoding encoding_;
  std::vector<std::uint8_t> bytes_;
};

}  // namespace nlssm
