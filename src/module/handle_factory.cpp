// Handle creation and release. One handle per encoding name, shared by
// every caller and kept in the host NLS object's handle table; everything
// happens under the table lock.
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstring>

#include "catalogue/catalogue.hpp"
#include "module/encoding_tables.hpp"
#include "module/host_access.hpp"
#include "module/operation_table.hpp"

namespace {

using nlssm::host::slot;

constexpr uint64_t kKeyCapacity = 13;  // UTF-8 bytes of the encoding name
constexpr int kTwoByteClass = NLSSM_CLASS_WCS2;
constexpr int kFourByteClass = NLSSM_CLASS_WCS4;

void *word(void *object, int n) {
  return static_cast<void **>(object)[n];
}

void destroy_converter(void *converter) {
  if (converter != nullptr)
    slot<NLSHostConverterDestroyFn>(converter, NLSHOST_SLOT_CONVERTER_DESTROY)(converter);
}

// Releases what a handle owns, then the handle and its pool.
void release_handle(NLSSMHandle *handle) {
  destroy_converter(handle->charConverter);
  destroy_converter(handle->ownFromConverter);
  destroy_converter(handle->ownToConverter);
  if (handle->locale != nullptr)
    slot<NLSHostLocaleDestroyFn>(handle->locale, NLSHOST_SLOT_LOCALE_DESTROY)(handle->locale);
  const nlssm::host::Pool pool{handle->pool};
  pool.free(handle);
  pool.destroy();
}

// The host NLS object's services, as creation uses them.
struct NlsObject {
  void *object;

  bool conversion_needed(int64_t a, int64_t b) const {
    return slot<NLSHostConversionNeededFn>(object, NLSHOST_SLOT_NLS_CONVERSION_NEEDED)(
               object, a, b, nullptr) != 0;
  }
  void *converter_between(int64_t from, int64_t to) const {
    return slot<NLSHostConverterBetweenFn>(object, NLSHOST_SLOT_NLS_CONVERTER_BETWEEN)(
        object, from, to, nullptr, nullptr);
  }
  void *converter_from(int64_t encoding) const {
    return slot<NLSHostConverterForFn>(object, NLSHOST_SLOT_NLS_CONVERTER_FROM)(object, encoding,
                                                                                nullptr, nullptr);
  }
  void *converter_to(int64_t encoding) const {
    return slot<NLSHostConverterForFn>(object, NLSHOST_SLOT_NLS_CONVERTER_TO)(object, encoding,
                                                                              nullptr, nullptr);
  }
};

// Converts the encoding's name to the UTF-8 cache key. False when the host
// converter reports a failure.
bool make_key(const NlsObject &nls, const NLSHostEncodingRecord &record, uint8_t *key,
              uint64_t &keyLength, bool &noConverter) {
  void *converter = nls.converter_to(NLSSM_ENC_UTF8);
  noConverter = converter == nullptr;
  if (noConverter) return false;
  const int64_t status = slot<NLSHostConverterConvertFn>(converter, NLSHOST_SLOT_CONVERTER_CONVERT)(
      converter, record.name, record.nameLength * 4, key, kKeyCapacity, &keyLength, nullptr);
  destroy_converter(converter);
  return status == 0;
}

// ORs `flag` into charClass for every byte of a (low, high) pair list; the
// list ends at a pair whose low byte is 0 or at the end of its storage.
void mark_ranges(uint8_t *charClass, const uint8_t *pairs, size_t capacity, uint8_t flag) {
  for (size_t i = 0; i + 1 < capacity && pairs[i] != 0; i += 2)
    for (int b = pairs[i]; b <= pairs[i + 1]; ++b) charClass[b] |= flag;
}

void set_blank_and_quote(NLSSMHandle &handle, const NLSHostEncodingRecord &record) {
  const uint32_t blank = record.blankValue;
  const uint8_t blankBytes[4] = {uint8_t(blank), uint8_t(blank >> 8), uint8_t(blank >> 16),
                                 uint8_t(blank >> 24)};
  std::memset(handle.blankChar, 0, sizeof handle.blankChar);
  std::memset(handle.quoteChar, 0, sizeof handle.quoteChar);
  uint64_t width = 1;
  if (handle.encodingClass == kTwoByteClass) {
    width = 2;
    handle.quoteChar[handle.encodingNumber == NLSSM_ENC_WCS2_BE ? 1 : 0] = 0x22;
  } else if (handle.encodingClass == kFourByteClass) {
    width = 4;
    handle.quoteChar[handle.encodingNumber == NLSSM_ENC_WCS4_BE ? 3 : 0] = 0x22;
  } else {
    handle.quoteChar[0] = (handle.encodingFlags & 1u) ? 0x22 : 0x7F;
  }
  std::memcpy(handle.blankChar, blankBytes, width);
  handle.blankWidth = width;
  handle.quoteWidth = width;
}

void set_char_class(NLSSMHandle &handle, const NLSHostEncodingRecord &record) {
  const NLSHostCharRanges &ranges = record.charRanges;
  const uint8_t *lead = ranges.leadRanges;
  size_t leadCapacity = sizeof ranges.leadRanges;
  const uint8_t *trail = ranges.trailRanges;
  size_t trailCapacity = sizeof ranges.trailRanges;
  // EUC-JP and the first EUC-TW number use the module's own lists; 120 and
  // 159 keep the host's lists although they share the EUC-TW operations.
  using nlssm::catalogue::euc_db1st;
  using nlssm::catalogue::euc_db2nd;
  if (handle.encodingNumber == NLSSM_ENC_EUC_JP) {
    lead = euc_db1st;
    leadCapacity = sizeof euc_db1st;
  } else if (handle.encodingNumber == 119) {
    lead = euc_db2nd;
    leadCapacity = sizeof euc_db2nd;
  }
  if (handle.encodingNumber == NLSSM_ENC_EUC_JP || handle.encodingNumber == 119) {
    trail = euc_db2nd;
    trailCapacity = sizeof euc_db2nd;
  }
  std::memset(handle.charClass, 0, sizeof handle.charClass);
  mark_ranges(handle.charClass, lead, leadCapacity, 0x44);
  mark_ranges(handle.charClass, trail, trailCapacity, 0x08);
}

// Builds the handle's converters and locale; a status on failure.
int64_t attach_host_objects(NLSSMHandle &handle, const NlsObject &nls) {
  const int64_t number = handle.encodingNumber;
  if (nls.conversion_needed(NLSSM_ENC_REFERENCE_SBCS, number)) {
    handle.charConverter = nls.converter_between(NLSSM_ENC_REFERENCE_SBCS, number);
    if (handle.charConverter == nullptr) return NLSSM_E_ENCODING;
  }
  if (nls.conversion_needed(number, NLSSM_ENC_HOST_CHARS)) {
    handle.ownFromConverter = nls.converter_from(number);
    handle.ownToConverter = nls.converter_to(number);
    if (handle.ownFromConverter == nullptr || handle.ownToConverter == nullptr)
      return NLSSM_E_ENCODING;
  }
  // Borrowed converters are never destroyed by the module; null is accepted.
  handle.fromConverter =
      handle.ownFromConverter != nullptr ? handle.ownFromConverter : nls.converter_from(number);
  handle.toConverter =
      handle.ownToConverter != nullptr ? handle.ownToConverter : nls.converter_to(number);

  static constexpr uint32_t kLocaleName[] = {'e', 'n', '_', 'U', 'S'};
  handle.locale =
      slot<NLSHostLocaleFn>(nls.object, NLSHOST_SLOT_NLS_LOCALE)(nls.object, kLocaleName, 5);
  return handle.locale == nullptr ? NLSSM_E_NO_MEMORY : 0;
}

int64_t create_locked(void *nlsObject, int64_t encodingNumber, void *reserved,
                      NLSSMHandle **outHandle) {
  const NlsObject nls{nlsObject};
  const NLSHostEncodingRecord *record = nullptr;
  const int64_t described = slot<NLSHostDescribeEncodingFn>(nlsObject, NLSHOST_SLOT_NLS_DESCRIBE)(
      nlsObject, encodingNumber, &record);
  if (described != 0) return described;

  uint8_t key[kKeyCapacity] = {};
  uint64_t keyLength = 0;
  bool noConverter = false;
  if (!make_key(nls, *record, key, keyLength, noConverter))
    return noConverter ? NLSSM_E_NO_MEMORY : 0;  // a failed key conversion stores nothing

  void *table = word(nlsObject, NLSHOST_WORD_NLS_HANDLE_TABLE);
  if (void *entry = slot<NLSHostTableFindFn>(table, NLSHOST_SLOT_TABLE_FIND)(
          table, NLSHOST_TABLE_FIND_FLAGS, nullptr, key, keyLength)) {
    auto *cached = static_cast<NLSSMHandle *>(word(entry, NLSHOST_ENTRY_WORD_HANDLE));
    slot<NLSHostTableReleaseEntryFn>(table, NLSHOST_SLOT_TABLE_RELEASE_ENTRY)(table, entry);
    *outHandle = cached;
    return 0;
  }

  void *poolObject = nlssm::host::create_pool(Exported_QVHandle, 0, nullptr, "qvnlssmobj pool");
  if (poolObject == nullptr) return NLSSM_E_NO_MEMORY;
  const nlssm::host::Pool pool{poolObject};
  if (static_cast<uint64_t>(encodingNumber) >= NLSSM_ENCODING_LIMIT) {
    pool.destroy();
    return NLSSM_E_ENCODING;
  }
  auto *handle = static_cast<NLSSMHandle *>(pool.allocate(sizeof(NLSSMHandle)));
  if (handle == nullptr) {
    pool.destroy();
    return NLSSM_E_NO_MEMORY;
  }
  // Unfilled slots and reserved words stay null.
  std::memset(static_cast<void *>(handle), 0, sizeof *handle);

  handle->pool = poolObject;
  std::memcpy(handle->magic, "nevo", 4);
  handle->name = "QVNLSSM handle";
  handle->destroy = reinterpret_cast<NLSSlot>(&NLSSMDestroy);
  handle->owner = nlsObject;
  handle->encodingNumber = encodingNumber == 19 ? 25 : static_cast<uint32_t>(encodingNumber);
  handle->encodingClass = record->encodingClass;
  handle->unitWidth = handle->encodingClass == kTwoByteClass    ? 2
                      : handle->encodingClass == kFourByteClass ? 4
                                                                : 1;
  handle->encodingFlags = record->encodingFlags;
  handle->shiftLength = record->charRanges.shiftLength;
  handle->numberForm = handle->encodingClass == kTwoByteClass ? 4 : record->numberForm;

  int64_t status = attach_host_objects(*handle, nls);
  if (status == 0) {
    set_blank_and_quote(*handle, *record);
    handle->charRanges = reinterpret_cast<const uint8_t *>(&record->charRanges);
    set_char_class(*handle, *record);
    nlssm::module::attach_encoding_tables(*handle);
    nlssm::module::fill_operation_slots(*handle);
    // The whole handle is built before the argument check.
    if (reserved != nullptr) status = NLSSM_E_BAD_ARGUMENT;
  }
  if (status == 0) {
    int64_t insertStatus = 0;
    void *entry = slot<NLSHostTableInsertFn>(table, NLSHOST_SLOT_TABLE_INSERT)(
        table, NLSHOST_TABLE_INSERT_FLAGS, nullptr, handle, nullptr, key, keyLength, &insertStatus);
    if (entry == nullptr) {
      status = NLSSM_E_NO_MEMORY;
    } else {
      slot<NLSHostTableReleaseEntryFn>(table, NLSHOST_SLOT_TABLE_RELEASE_ENTRY)(table, entry);
      *outHandle = handle;
      return 0;
    }
  }
  release_handle(handle);
  return status;
}

}  // namespace

extern "C" int64_t NLSSMCreate(void *nlsObject, int64_t encodingNumber, void *reserved,
                               NLSSMHandle **outHandle) {
  void *lock = word(nlsObject, NLSHOST_WORD_NLS_TABLE_LOCK);
  slot<NLSHostLockAcquireFn>(lock, NLSHOST_SLOT_LOCK_ACQUIRE)(lock, 1, 1);
  const int64_t status = create_locked(nlsObject, encodingNumber, reserved, outHandle);
  slot<NLSHostLockReleaseFn>(lock, NLSHOST_SLOT_LOCK_RELEASE)(lock);
  return status;
}

// A handle stays alive in the host's table; only the destroy callback
// releases it.
extern "C" int64_t NLSSMDestroy(NLSSMHandle *) {
  return 0;
}

extern "C" int64_t NLSSMDestroyCallback(void *entry) {
  if (entry == nullptr) return 0;
  auto *handle = static_cast<NLSSMHandle *>(word(entry, NLSHOST_ENTRY_WORD_HANDLE));
  if (handle != nullptr) release_handle(handle);
  return 0;
}
