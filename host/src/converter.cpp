// Converters between described encodings: source -> UTF-16 -> destination,
// with ICU converters or the built-in UTF-EBCDIC codec on either side.
#include <unicode/ucnv.h>
#include <unicode/ucnv_cb.h>
#include <unicode/ucnv_err.h>
#include <unicode/utf16.h>

#include <cstring>

#include "internal.hpp"
#include "table_pages.hpp"
#include "utf_ebcdic.hpp"

namespace nlssm::refhost {

namespace {

// Unassigned characters become the substitution character; ill-formed input
// stops the conversion (the error code stays set).
void to_unicode_callback(const void *, UConverterToUnicodeArgs *args, const char *units,
                         int32_t length, UConverterCallbackReason reason, UErrorCode *error) {
  if (reason == UCNV_UNASSIGNED)
    UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, args, units, length, reason, error);
}

void from_unicode_callback(const void *, UConverterFromUnicodeArgs *args, const UChar *units,
                           int32_t length, UChar32 character, UConverterCallbackReason reason,
                           UErrorCode *error) {
  if (reason == UCNV_UNASSIGNED)
    UCNV_FROM_U_CALLBACK_SUBSTITUTE(nullptr, args, units, length, character, reason, error);
}

std::uint32_t status_of(UErrorCode error) {
  if (U_SUCCESS(error)) return 0;
  if (error == U_TRUNCATED_CHAR_FOUND) return NLSHOST_E_TRUNCATED;
  if (error == U_MEMORY_ALLOCATION_ERROR) return NLSHOST_E_NO_MEMORY;
  return NLSHOST_E_ILL_FORMED;
}

}  // namespace

struct Transcoder::Side {
  UConverter *icu = nullptr;          // null: UTF-EBCDIC or a compiled page
  const TableCodec *table = nullptr;  // a compiled single-byte page

  explicit Side(const EncodingInfo &info, bool &ok) {
    if (info.converter == "builtin:utf-ebcdic") return;
    if (info.converter.rfind(kTablePrefix, 0) == 0) {
      table = TableCodec::find(info.converter);
      if (table == nullptr) ok = false;
      return;
    }
    UErrorCode error = U_ZERO_ERROR;
    icu = ucnv_open(info.converter.c_str(), &error);
    if (U_FAILURE(error)) {
      ok = false;
      return;
    }
    ucnv_setToUCallBack(icu, &to_unicode_callback, nullptr, nullptr, nullptr, &error);
    ucnv_setFromUCallBack(icu, &from_unicode_callback, nullptr, nullptr, nullptr, &error);
    if (U_FAILURE(error)) ok = false;
  }
  ~Side() {
    if (icu != nullptr) ucnv_close(icu);
  }

  std::uint32_t decode(const std::uint8_t *source, std::size_t length, std::u16string &out) {
    out.clear();
    if (table != nullptr) {
      table->decode(source, length, out);
      return 0;
    }
    if (icu == nullptr) return decode_utfe(source, length, out);
    ucnv_resetToUnicode(icu);
    out.resize(2 * length + 8);  // no byte yields more than two UTF-16 units
    UChar *target = out.data();
    const char *from = reinterpret_cast<const char *>(source);
    UErrorCode error = U_ZERO_ERROR;
    ucnv_toUnicode(icu, &target, out.data() + out.size(), &from, from + length, nullptr, true,
                   &error);
    out.resize(static_cast<std::size_t>(target - out.data()));
    return status_of(error);
  }

  std::uint32_t encode(const std::u16string &text, std::string &out,
                       std::vector<std::int32_t> &offsets) {
    out.clear();
    offsets.clear();
    if (table != nullptr) return table->encode(text, out, offsets) ? 0 : NLSHOST_E_ILL_FORMED;
    if (icu == nullptr) return encode_utfe(text, out, offsets);
    ucnv_resetFromUnicode(icu);
    // Each unit gives at most the longest character plus a shift sequence.
    const std::size_t room = text.size() * (ucnv_getMaxCharSize(icu) + 2) + 8;
    out.resize(room);
    offsets.resize(room);
    char *target = out.data();
    const UChar *from = text.data();
    UErrorCode error = U_ZERO_ERROR;
    ucnv_fromUnicode(icu, &target, out.data() + out.size(), &from, text.data() + text.size(),
                     offsets.data(), true, &error);
    out.resize(static_cast<std::size_t>(target - out.data()));
    offsets.resize(out.size());
    return status_of(error);
  }

  static std::uint32_t decode_utfe(const std::uint8_t *source, std::size_t length,
                                   std::u16string &out) {
    std::size_t at = 0;
    while (at < length) {
      std::uint32_t c = 0;
      std::size_t used = 0;
      if (const std::int64_t status = utfe::decode_status(source + at, length - at, c, used))
        return static_cast<std::uint32_t>(status);
      if (c > 0xFFFF) {
        out.push_back(static_cast<char16_t>(U16_LEAD(c)));
        out.push_back(static_cast<char16_t>(U16_TRAIL(c)));
      } else {
        out.push_back(static_cast<char16_t>(c));
      }
      at += used;
    }
    return 0;
  }

  static std::uint32_t encode_utfe(const std::u16string &text, std::string &out,
                                   std::vector<std::int32_t> &offsets) {
    std::size_t at = 0;
    while (at < text.size()) {
      const auto start = static_cast<std::int32_t>(at);
      UChar32 c;
      U16_NEXT(text.data(), at, text.size(), c);
      if (U_IS_SURROGATE(c)) return NLSHOST_E_ILL_FORMED;
      std::uint8_t bytes[5];
      utfe::encode(static_cast<std::uint32_t>(c), bytes);
      const int n = utfe::encoded_length(static_cast<std::uint32_t>(c));
      out.append(reinterpret_cast<const char *>(bytes), static_cast<std::size_t>(n));
      offsets.insert(offsets.end(), static_cast<std::size_t>(n), start);
    }
    return 0;
  }
};

Transcoder::Transcoder(const EncodingInfo &from, const EncodingInfo &to) {
  ok_ = true;
  from_ = new Side(from, ok_);
  to_ = new Side(to, ok_);
}

Transcoder::~Transcoder() {
  delete from_;
  delete to_;
}

std::uint32_t Transcoder::run(const std::uint8_t *source, std::size_t sourceBytes, std::string &out,
                              std::vector<std::int32_t> &offsets) {
  std::u16string text;
  std::lock_guard lock(mutex_);
  const std::uint32_t decoded = from_->decode(source, sourceBytes, text);
  const std::uint32_t encoded = to_->encode(text, out, offsets);
  return decoded != 0 ? decoded : encoded;
}

std::uint32_t Transcoder::convert(const std::uint8_t *source, std::size_t sourceBytes,
                                  std::uint8_t *destination, std::size_t capacity,
                                  std::size_t &produced) {
  produced = 0;
  if ((source == nullptr && sourceBytes != 0) || (destination == nullptr && capacity != 0))
    return NLSHOST_E_NULL;
  std::string out;
  std::vector<std::int32_t> offsets;
  const std::uint32_t status = run(source, sourceBytes, out, offsets);
  if (out.size() <= capacity) {
    if (!out.empty()) std::memcpy(destination, out.data(), out.size());
    produced = out.size();
    return status;
  }
  // Cut before the first byte of a character that does not fit whole.
  std::size_t cut = capacity;
  while (cut > 0 && offsets[cut] == offsets[cut - 1]) --cut;
  if (cut != 0) std::memcpy(destination, out.data(), cut);
  produced = cut;
  return NLSHOST_E_TOO_SMALL;
}

std::uint32_t Transcoder::size(const std::uint8_t *source, std::size_t sourceBytes,
                               std::size_t &size) {
  size = 0;
  if (source == nullptr && sourceBytes != 0) return NLSHOST_E_NULL;
  std::string out;
  std::vector<std::int32_t> offsets;
  const std::uint32_t status = run(source, sourceBytes, out, offsets);
  size = out.size();
  return status;
}

namespace {

struct ConverterObject {
  SlotWords<6> slots;
  Transcoder transcoder;
  ObjectCounters *counters;

  ConverterObject(const EncodingInfo &from, const EncodingInfo &to, ObjectCounters &c)
      : transcoder(from, to), counters(&c) {}
};

void converter_destroy(void *object) {
  if (object == nullptr) return;
  auto *converter = self<ConverterObject>(object);
  converter->counters->converters.fetch_sub(1);
  delete converter;
}

std::int64_t converter_convert(void *object, const void *source, std::uint64_t sourceBytes,
                               void *destination, std::uint64_t destinationSize,
                               std::uint64_t *producedBytes, void *) {
  std::size_t produced = 0;
  const std::uint32_t status = self<ConverterObject>(object)->transcoder.convert(
      static_cast<const std::uint8_t *>(source), sourceBytes,
      static_cast<std::uint8_t *>(destination), destinationSize, produced);
  if (producedBytes != nullptr) *producedBytes = produced;
  return status;
}

// Shared converters belong to the NLS object: a caller's destroy leaves them.
void shared_converter_destroy(void *) {}

}  // namespace

void *new_shared_converter_object(const EncodingInfo &from, const EncodingInfo &to) {
  static ObjectCounters uncounted;
  auto *converter = new ConverterObject(from, to, uncounted);
  if (!converter->transcoder.ok()) {
    delete converter;
    return nullptr;
  }
  converter->slots.set(NLSHOST_SLOT_CONVERTER_DESTROY, &shared_converter_destroy);
  converter->slots.set(NLSHOST_SLOT_CONVERTER_CONVERT, &converter_convert);
  return converter;
}

void destroy_shared_converter_object(void *object) {
  delete self<ConverterObject>(object);
}

void *new_converter_object(const EncodingInfo &from, const EncodingInfo &to,
                           ObjectCounters &counters) {
  auto *converter = new ConverterObject(from, to, counters);
  if (!converter->transcoder.ok()) {
    delete converter;
    return nullptr;
  }
  converter->slots.set(NLSHOST_SLOT_CONVERTER_DESTROY, &converter_destroy);
  converter->slots.set(NLSHOST_SLOT_CONVERTER_CONVERT, &converter_convert);
  counters.converters.fetch_add(1);
  return converter;
}

}  // namespace nlssm::refhost
