// Operations that are the same for every encoding class.
#include <nlssm/nlssm.h>

#include <cstring>

#include "module/host_access.hpp"

namespace {

using StepFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t);

// Fills `record` as a one-character descriptor over its inline buffer.
// With a character converter the byte (from encoding 62) is converted into
// this encoding; a converter failure is deliberately not reported.
void init_char_record(const NLSSMHandle *handle, const uint8_t *source, NLSChar *record) {
  uint64_t count = handle->unitWidth;
  if (handle->charConverter != nullptr) {
    uint64_t produced = 0;
    nlssm::host::slot<NLSHostConverterConvertFn>(handle->charConverter,
                                                 NLSHOST_SLOT_CONVERTER_CONVERT)(
        handle->charConverter, source, 1, record->bytes, sizeof record->bytes, &produced, nullptr);
    count = produced;
  } else {
    std::memcpy(record->bytes, source, handle->unitWidth);
  }
  NLSString &string = record->string;
  string.buffer = record->bytes;
  string.length = count;
  string.capacity = sizeof record->bytes;
  string.charIndex = 0;
  string.curOffset = 0;
  string.nextOffset = NLSSM_POS_NONE;
  string.prevOffset = NLSSM_POS_NO_PREVIOUS;
  string.charKind = 0;
  string.nextCharKind = 0;
  string.prevKind = 0;
}

}  // namespace

extern "C" int64_t NLSStringInit(const NLSSMHandle *, NLSString *) {
  return 0;
}

// Forgets the buffer; the caller owns its memory.
extern "C" int64_t NLSStringClean(const NLSSMHandle *, NLSString *string) {
  string->buffer = nullptr;
  return 0;
}

extern "C" int64_t stringDupPos(const NLSSMHandle *, const NLSString *, NLSString *) {
  return 0;
}

extern "C" int64_t stringGetPos(const NLSSMHandle *, const NLSString *string) {
  return string->curOffset >= 0 ? string->charIndex : NLSSM_POS_NONE;
}

// Steps through whatever stringNextChar the handle holds and answers with
// the new byte offset; an empty text is left where it is.
extern "C" int64_t stringNextCharB(const NLSSMHandle *handle, NLSString *string, int64_t flag) {
  if (string->length == 0) return string->curOffset;
  reinterpret_cast<StepFn>(handle->stringNextChar)(handle, string, flag);
  return string->curOffset;
}

extern "C" int64_t NLSCharInit(const NLSSMHandle *handle, const uint8_t *source, int64_t,
                               NLSChar *record) {
  init_char_record(handle, source, record);
  if (handle->encodingClass == NLSSM_CLASS_MBCS_MODAL ||
      handle->encodingClass == NLSSM_CLASS_MBCS_NONMODAL)
    record->string.charKind = NLSSM_KIND_SINGLE;
  return 0;
}

extern "C" int64_t NLSCharInit_SBCS(const NLSSMHandle *handle, const uint8_t *source, int64_t,
                                    NLSChar *record) {
  init_char_record(handle, source, record);
  return 0;
}
