// The NLS object: describes encodings, hands out converters and locales,
// answers character queries and transcodes UTF forms; it owns the handle
// table and the table lock.
#include <map>
#include <memory>
#include <mutex>

#include "internal.hpp"

namespace nlssm::refhost {

namespace {

constexpr int kHostChars = 27;

struct NlsObject {
  SlotWords<42> slots;
  ObjectCounters *counters = nullptr;
  std::int64_t (*destroyCallback)(void *entry) = nullptr;
  // Transcoders behind the size query, one per pair of encodings.
  std::mutex sizeMutex;
  std::map<std::pair<int, int>, std::unique_ptr<Transcoder>> sizers;
  // Converters between encodings that need no conversion: handed out to
  // every caller (a handle borrows them) and released with the NLS object.
  std::mutex sharedMutex;
  std::map<std::pair<int, int>, void *> shared;
};

NlsObject *nls_of(void *object) {
  return self<NlsObject>(object);
}

// The described row for a number (19 reads as 25), or null.
const EncodingInfo *described(std::int64_t number) {
  if (number == 19) number = 25;
  const EncodingInfo *info = Registry::instance().find(number);
  return info != nullptr && info->described ? info : nullptr;
}

int conversion_needed(void *, std::int64_t a, std::int64_t b, void *) {
  if (a == 19) a = 25;
  if (b == 19) b = 25;
  if (a == b) return 0;
  const EncodingInfo *first = described(a);
  const EncodingInfo *second = described(b);
  return first == nullptr || second == nullptr || first->converter != second->converter;
}

std::int64_t describe(void *, std::int64_t number, const NLSHostEncodingRecord **record) {
  if (record == nullptr) return NLSHOST_E_NULL;
  *record = nullptr;
  const EncodingInfo *info = Registry::instance().find(number);
  if (info == nullptr || !info->described) return NLSHOST_E_NO_ENCODING;
  *record = &info->record;
  return 0;
}

void *converter_between(void *object, std::int64_t from, std::int64_t to, void *, void *) {
  const EncodingInfo *source = described(from);
  const EncodingInfo *target = described(to);
  if (source == nullptr || target == nullptr) return nullptr;
  NlsObject *nls = nls_of(object);
  if (!conversion_needed(object, from, to, nullptr)) {
    std::lock_guard lock(nls->sharedMutex);
    void *&converter = nls->shared[{source->number, target->number}];
    if (converter == nullptr) converter = new_shared_converter_object(*source, *target);
    return converter;
  }
  return new_converter_object(*source, *target, *nls->counters);
}

void *converter_from(void *object, std::int64_t encoding, void *, void *) {
  return converter_between(object, encoding, kHostChars, nullptr, nullptr);
}

void *converter_to(void *object, std::int64_t encoding, void *, void *) {
  return converter_between(object, kHostChars, encoding, nullptr, nullptr);
}

std::int64_t conversion_size(void *object, std::int64_t from, std::int64_t to, const void *source,
                             std::uint64_t sourceBytes, std::uint64_t *size) {
  if (size == nullptr) return NLSHOST_E_NULL;
  *size = 0;
  const EncodingInfo *a = described(from);
  const EncodingInfo *b = described(to);
  if (a == nullptr || b == nullptr) return NLSHOST_E_NO_ENCODING;
  NlsObject *nls = nls_of(object);
  Transcoder *transcoder;
  {
    std::lock_guard lock(nls->sizeMutex);
    auto &slot = nls->sizers[{a->number, b->number}];
    if (!slot) slot = std::make_unique<Transcoder>(*a, *b);
    transcoder = slot.get();
  }
  std::size_t bytes = 0;
  const std::uint32_t status =
      transcoder->size(static_cast<const std::uint8_t *>(source), sourceBytes, bytes);
  *size = bytes;
  return status;
}

std::int64_t character_info(void *, std::uint32_t character, NLSHostCharInfo *info) {
  return char_info(character, info);
}

void *locale(void *object, const std::uint32_t *name, std::int64_t length) {
  if (name == nullptr || length <= 0 || length > 64) return nullptr;
  std::string text;
  for (std::int64_t i = 0; i < length; ++i) {
    const std::uint32_t c = name[i];
    const bool allowed = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') ||
                         (c >= '0' && c <= '9') || c == '_' || c == '-';
    if (!allowed) return nullptr;
    text.push_back(static_cast<char>(c));
  }
  return new_locale_object(text, *nls_of(object)->counters);
}

}  // namespace

void *new_nls_object(PoolRegistry &pools, ObjectCounters &counters) {
  auto *nls = new NlsObject;
  nls->counters = &counters;
  SlotWords<42> &s = nls->slots;
  s.set(NLSHOST_SLOT_NLS_CONVERSION_NEEDED, &conversion_needed);
  s.set(NLSHOST_SLOT_NLS_DESCRIBE, &describe);
  s.set(NLSHOST_SLOT_NLS_CONVERTER_BETWEEN, &converter_between);
  s.set(NLSHOST_SLOT_NLS_CONVERTER_FROM, &converter_from);
  s.set(NLSHOST_SLOT_NLS_CONVERTER_TO, &converter_to);
  s.set(NLSHOST_SLOT_NLS_CONVERSION_SIZE, &conversion_size);
  s.set(NLSHOST_SLOT_NLS_INTERMEDIATE_TO_CODE_POINT, &intermediate_to_code_point);
  s.set(NLSHOST_SLOT_NLS_CODE_POINT_TO_INTERMEDIATE, &code_point_to_intermediate);
  s.set(NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8, &intermediate_to_utf8);
  s.set(NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE, &utf8_to_intermediate);
  s.set(NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTFE, &intermediate_to_utfe);
  s.set(NLSHOST_SLOT_NLS_UTFE_TO_INTERMEDIATE, &utfe_to_intermediate);
  s.set(NLSHOST_SLOT_NLS_CHAR_INFO, &character_info);
  s.set(NLSHOST_SLOT_NLS_LOCALE, &locale);
  s.words[NLSHOST_WORD_NLS_HANDLE_TABLE] = new_table_object(pools);
  s.words[NLSHOST_WORD_NLS_TABLE_LOCK] = new_lock_object();
  return nls;
}

void set_nls_module(void *object, void *, std::int64_t (*destroyCallback)(void *entry)) {
  nls_of(object)->destroyCallback = destroyCallback;
}

void destroy_nls_object(void *object) {
  NlsObject *nls = nls_of(object);
  destroy_table_object(nls->slots.words[NLSHOST_WORD_NLS_HANDLE_TABLE], nls->destroyCallback);
  destroy_lock_object(nls->slots.words[NLSHOST_WORD_NLS_TABLE_LOCK]);
  for (auto &entry : nls->shared)
    if (entry.second != nullptr) destroy_shared_converter_object(entry.second);
  delete nls;
}

}  // namespace nlssm::refhost
