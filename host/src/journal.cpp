// The journal: keeps statuses and messages written to it, and formats
// messages and statuses into caller buffers.
#include <cstdarg>
#include <cstdio>
#include <cstring>
#include <mutex>

#include "nlssm/reference_host.hpp"
#include "objects.hpp"

namespace nlssm::refhost {

struct Journal::State {
  SlotWords<8> slots;
  mutable std::mutex mutex;
  std::vector<JournalRecord> records;
};

namespace {

const char *status_text(std::uint32_t status) {
  switch (status) {
    case 0:
      return "success";
    case NLSHOST_E_NO_MEMORY:
      return "out of memory";
    case 0x803fc004u:
      return "operation not supported";
    case NLSHOST_E_TOO_SMALL:
      return "destination too small";
    case NLSHOST_E_ILL_FORMED:
      return "ill-formed input";
    case NLSHOST_E_NO_ENCODING:
      return "encoding not supported";
    case NLSHOST_E_NUMBER_FIELD:
      return "number does not fit its field";
    case NLSHOST_E_NOT_A_NUMBER:
      return "text is not a number";
    case 0x803fe811u:
      return "integer overflow";
    case NLSHOST_E_TRUNCATED:
      return "input ends inside a character";
    case NLSHOST_E_NULL:
      return "required argument missing";
    case NLSHOST_E_BAD_OPTIONS:
      return "invalid options";
    default:
      return "unknown status";
  }
}

// Writes text into (buffer, capacity) with a terminating NUL, reporting the
// full length; NLSHOST_E_TOO_SMALL when it had to be cut.
std::int64_t to_buffer(const std::string &text, void *buffer, void *capacity, void *outLength) {
  if (buffer == nullptr) return NLSHOST_E_NULL;
  auto cap = static_cast<std::size_t>(reinterpret_cast<std::intptr_t>(capacity));
  if (outLength != nullptr) *static_cast<std::int64_t *>(outLength) = std::ssize(text);
  if (cap == 0) return NLSHOST_E_TOO_SMALL;
  std::size_t n = text.size() < cap ? text.size() : cap - 1;
  std::memcpy(buffer, text.data(), n);
  static_cast<char *>(buffer)[n] = '\0';
  return n == text.size() ? 0 : NLSHOST_E_TOO_SMALL;
}

std::string format(const char *pattern, va_list args) {
  if (pattern == nullptr) return {};
  va_list copy;
  va_copy(copy, args);
  int n = std::vsnprintf(nullptr, 0, pattern, copy);
  va_end(copy);
  if (n <= 0) return {};
  std::string text(static_cast<std::size_t>(n), '\0');
  std::vsnprintf(text.data(), text.size() + 1, pattern, args);
  return text;
}

Journal::State *state(void *object) {
  return self<Journal::State>(object);
}

// (journal, buffer, capacity, &length, printf pattern, reserved, arguments)
std::int64_t message_to_buf(void *object, void *buffer, void *capacity, void *outLength,
                            void *pattern, void *, va_list args) {
  (void)object;
  return to_buffer(format(static_cast<const char *>(pattern), args), buffer, capacity, outLength);
}

// (journal, message number, printf pattern or null, reserved, arguments)
std::int64_t message_to_jnl(void *object, std::uint32_t number, void *pattern, void *,
                            va_list args) {
  JournalRecord record{JournalRecord::Kind::Message, number, 0,
                       format(static_cast<const char *>(pattern), args)};
  std::lock_guard lock(state(object)->mutex);
  state(object)->records.push_back(std::move(record));
  return 0;
}

// (journal, status, buffer, capacity, &length, arguments): the status's text.
std::int64_t status_to_buf(void *object, std::uint32_t status, void *buffer, void *capacity,
                           void *outLength, va_list) {
  (void)object;
  char text[96];
  std::snprintf(text, sizeof text, "status 0x%08x: %s", status, status_text(status));
  return to_buffer(text, buffer, capacity, outLength);
}

// (journal, level, status, arguments)
std::int64_t status_to_jnl(void *object, std::uint32_t level, std::uint32_t status, va_list) {
  std::lock_guard lock(state(object)->mutex);
  state(object)->records.push_back({JournalRecord::Kind::Status, level, status, {}});
  return 0;
}

// (journal, arguments: char *buffer, int64 capacity): the journal's locale name.
std::int64_t get_locale(void *object, va_list args) {
  (void)object;
  char *buffer = va_arg(args, char *);
  auto capacity = va_arg(args, std::int64_t);
  return to_buffer("en_US", buffer, reinterpret_cast<void *>(static_cast<std::intptr_t>(capacity)),
                   nullptr);
}

}  // namespace

Journal::Journal() : state_(std::make_unique<State>()) {
  state_->slots.set(NLSHOST_SLOT_MESSAGE_TO_BUF, &message_to_buf);
  state_->slots.set(NLSHOST_SLOT_MESSAGE_TO_JNL, &message_to_jnl);
  state_->slots.set(NLSHOST_SLOT_STATUS_TO_BUF, &status_to_buf);
  state_->slots.set(NLSHOST_SLOT_STATUS_TO_JNL, &status_to_jnl);
  state_->slots.set(NLSHOST_SLOT_GET_LOCALE, &get_locale);
}

Journal::~Journal() = default;

void *Journal::object() {
  return state_.get();
}

std::vector<JournalRecord> Journal::records() const {
  std::lock_guard lock(state_->mutex);
  return state_->records;
}

void Journal::clear() {
  std::lock_guard lock(state_->mutex);
  state_->records.clear();
}

}  // namespace nlssm::refhost
