// Handle-bound one-character converters. UTF-8 and UTF-EBCDIC characters go
// to and from 32-bit code points through the UTF transcoders of the host NLS
// object that owns the handle; the module only decides, from the lead byte or
// the code point, how many bytes one character takes. GetNumBytes measures
// the next N characters through the handle's own cursor, for every class.
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <algorithm>
#include <cstdint>

#include "module/host_access.hpp"
#include "unicode/tables.hpp"

namespace {

namespace u = nlssm::unicode;

// The intermediate form of one character: one or two UTF-16 units.
constexpr uint64_t kIntermediateBytes = 4;
constexpr uint64_t kCodePointBytes = 4;

// Runs one of the owner's transcoders; answers its status and, through
// `produced`, the bytes it wrote (0 unless it says otherwise).
int64_t transcode(const NLSSMHandle *h, int slot, const void *source, uint64_t sourceBytes,
                  void *destination, uint64_t capacity, uint64_t &produced) {
  produced = 0;
  const auto fn = nlssm::host::slot<NLSHostTranscodeFn>(h->owner, slot);
  return fn(h->owner, source, sourceBytes, destination, capacity, &produced, nullptr, nullptr);
}

// `length` bytes of the handle's text (the form the `toIntermediate`
// transcoder reads) -> one code point. Answers `length`, or 0 when either
// step fails; the host judges the bytes after the lead.
int64_t decode_character(const NLSSMHandle *h, int toIntermediate, const uint8_t *source,
                         int64_t length, uint32_t *codePoint) {
  alignas(4) uint8_t intermediate[kIntermediateBytes];
  uint64_t units = 0;
  if (transcode(h, toIntermediate, source, static_cast<uint64_t>(length), intermediate,
                kIntermediateBytes, units) != NLSHOST_OK)
    return 0;
  uint64_t produced = 0;
  if (transcode(h, NLSHOST_SLOT_NLS_INTERMEDIATE_TO_CODE_POINT, intermediate,
                std::min(units, kIntermediateBytes), codePoint, kCodePointBytes,
                produced) != NLSHOST_OK)
    return 0;
  return length;
}

// One code point -> `length` bytes of the handle's text through the
// `fromIntermediate` transcoder. The host's statuses are not reported: a value
// it cannot encode (a surrogate, anything above U+10FFFF) leaves the
// destination as it was, and the caller still advances by `length`.
int64_t encode_character(const NLSSMHandle *h, int fromIntermediate, uint32_t codePoint,
                         int64_t length, uint8_t *destination) {
  alignas(4) uint8_t intermediate[kIntermediateBytes];
  uint64_t units = 0;
  transcode(h, NLSHOST_SLOT_NLS_CODE_POINT_TO_INTERMEDIATE, &codePoint, kCodePointBytes,
            intermediate, kIntermediateBytes, units);
  uint64_t produced = 0;
  transcode(h, fromIntermediate, intermediate, std::min(units, kIntermediateBytes), destination,
            static_cast<uint64_t>(length), produced);
  return length;
}

using SetPosFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);

}  // namespace

extern "C" int64_t FromUTF8(const NLSSMHandle *handle, const uint8_t *source, uint32_t *codePoint) {
  if (source == nullptr || codePoint == nullptr) return 0;
  const int64_t length = 1 + u::bound::bytesFromUTF8[source[0]];
  return decode_character(handle, NLSHOST_SLOT_NLS_UTF8_TO_INTERMEDIATE, source, length, codePoint);
}

// A trailing byte or an unused lead announces -1 trailing bytes: the host is
// handed zero bytes and the answer is 0.
extern "C" int64_t FromUTFE(const NLSSMHandle *handle, const uint8_t *source, uint32_t *codePoint) {
  if (source == nullptr || codePoint == nullptr) return 0;
  const int64_t length = 1 + u::bytesFromI8S[u::utfe_i8s[source[0]]];
  return decode_character(handle, NLSHOST_SLOT_NLS_UTFE_TO_INTERMEDIATE, source, length, codePoint);
}

extern "C" int64_t ToUTF8(const NLSSMHandle *handle, uint32_t codePoint, uint8_t *destination) {
  if (destination == nullptr) return 0;
  return encode_character(handle, NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTF8, codePoint,
                          u::utf8_wide_length(codePoint), destination);
}

extern "C" int64_t ToUTFE(const NLSSMHandle *handle, uint32_t codePoint, uint8_t *destination) {
  if (destination == nullptr) return 0;
  return encode_character(handle, NLSHOST_SLOT_NLS_INTERMEDIATE_TO_UTFE, codePoint,
                          u::utfe_length(codePoint), destination);
}

// The cursor moves on a copy, so the caller's descriptor is never changed.
extern "C" int64_t GetNumBytes(const NLSSMHandle *handle, const NLSString *string, int64_t count,
                               int64_t, int64_t *byteCount, uint32_t *state) {
  if (handle == nullptr || string == nullptr || byteCount == nullptr) return NLSSM_E_NULL_ARGUMENT;
  const auto length = static_cast<int64_t>(string->length);
  if (count == 0) {
    *byteCount = length - string->curOffset;
    if (state != nullptr) *state = string->charKind;
    return NLSSM_OK;
  }
  NLSString copy = *string;
  if (copy.length != 0) {
    const auto setPos = reinterpret_cast<SetPosFn>(handle->stringSetPos);
    if (setPos(handle, &copy, NLSSM_POS_CURRENT, count) == NLSSM_POS_OUTSIDE) {
      *byteCount = length - string->curOffset;
      return NLSSM_GETNUMBYTES_OUTSIDE;
    }
  }
  *byteCount = copy.curOffset - string->curOffset;
  if (state != nullptr) *state = copy.charKind;
  return NLSSM_OK;
}
