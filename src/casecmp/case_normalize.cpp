// NLSStringNormalize: copy a source string into a destination string,
// mapping it to one case on the way (option bit 2: upper case, else lower).
// The byte-table classes map while they copy; the others copy and then run
// the handle's own Upper or Lower operation on the destination.
#include <nlssm/nlssm.h>

#include "casecmp/case_walk.hpp"
#include "casecmp/table_map.hpp"
#include "module/out_value.hpp"

namespace nlssm::casecmp {
namespace {

using PlainFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, uint32_t);
using BytesFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t);
using SetPosFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);
using CountFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

Case normalize_case(uint32_t options) {
  return (options & kOptUpper) != 0 ? Case::kUpper : Case::kLower;
}

// The generic members take options below 8 without both bits 1 and 2; the
// EUC-JP member takes none of bits 1, 2 and 4, so that it only ever
// lower-cases single bytes.
bool options_refused(uint32_t options, bool eucJp) {
  return options > kOptLimit || (options & 3u) == 3u || (eucJp && (options & kOptLimit) != 0);
}

// Bytes from a descriptor's current character to its end (0 when none).
int64_t remainder(const NLSString &s) {
  return s.curOffset < 0 ? 0 : std::max<int64_t>(0, static_cast<int64_t>(s.length) - s.curOffset);
}

// The checks every descriptor member makes first: nothing to do for a source
// without a current character, a full destination for one of capacity 0;
// then the destination's position is clamped to the start. Answers false
// with `status` set when the member is done.
bool open_copy(const NLSString *src, NLSString *dst, int64_t &status) {
  status = kOk;
  if (src == nullptr || dst == nullptr || dst->buffer == nullptr) {
    status = kNullArgument;
    return false;
  }
  if (src->curOffset < 0) return false;
  if (dst->capacity == 0) {
    status = kTooSmall;
    return false;
  }
  if (src->buffer == nullptr && src->length != 0) {
    status = kNullArgument;
    return false;
  }
  dst->curOffset = std::max<int64_t>(dst->curOffset, 0);
  return true;
}

int64_t room_at(const NLSString &dst, int64_t position) {
  return std::max<int64_t>(0, static_cast<int64_t>(dst.capacity) - position);
}

// The destination's length covers `end` (never past its capacity: a
// position beyond it wrote nothing).
void grow_to(NLSString &dst, int64_t end) {
  const auto covered = static_cast<uint64_t>(end);
  if (covered <= dst.capacity) dst.length = std::max(dst.length, covered);
}

// ---- Byte tables, mapped while copying ---------------------------------------

// Single byte: `count` bytes (0, or more than the source holds: all of
// them), cut to the room with NLSSM_E_DEST_TOO_SMALL; the destination grows
// to cover what was written.
int64_t normalize_sbcs(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t count,
                       uint32_t options) {
  int64_t status;
  if (!open_copy(src, dst, status)) return status;
  const int64_t available = remainder(*src);
  const int64_t wanted = count > 0 && count <= available ? count : available;
  const int64_t start = dst->curOffset;
  const int64_t n = std::min(wanted, room_at(*dst, start));
  map_bytes(case_table(h, normalize_case(options)), src->buffer + src->curOffset,
            dst->buffer + start, n);
  grow_to(*dst, start + n);
  return wanted > n ? kTooSmall : kOk;
}

// Double-byte code pages: character by character while they fit. Truncation
// is not reported and the destination's length is left as it was.
int64_t normalize_nonmodal(const NLSSMHandle *h, const NLSString *src, NLSString *dst,
                           int64_t count, uint32_t options) {
  int64_t status;
  if (!open_copy(src, dst, status)) return status;
  walk_nonmodal(ByteTables(h, normalize_case(options), options), LeadFlagSplit(h),
                src->buffer + src->curOffset, dst->buffer + dst->curOffset, remainder(*src),
                room_at(*dst, dst->curOffset), char_limit(count));
  return kOk;
}

// Shift-out/shift-in text: the destination is first brought into the
// source's mode (backing over a shift sequence it ends with, else writing
// the other one), then the source is copied with its shift sequences. An
// empty destination is never written. The destination ends where the copy
// ends.
int64_t normalize_modal(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t count,
                        uint32_t options) {
  if (src == nullptr || dst == nullptr) return kNullArgument;
  if (src->length == 0 || src->curOffset < 0 || dst->length == 0 || dst->curOffset < 0) return kOk;
  if (dst->buffer == nullptr || src->buffer == nullptr) return kNullArgument;
  if (dst->curOffset > static_cast<int64_t>(dst->capacity)) return kTooSmall;  // nothing fits
  const cursor::ModalModel m(h);
  const bool srcDouble = src->charKind != NLSSM_KIND_SINGLE;
  const bool dstDouble = dst->charKind != NLSSM_KIND_SINGLE;
  int64_t position = dst->curOffset;
  if (srcDouble != dstDouble) {
    // A destination whose text ends with the sequence into the source's
    // mode backs over it; kind 1 marks a trailing shift-out, 4 a shift-in.
    const uint32_t endsWith = srcDouble ? NLSSM_KIND_DOUBLE : NLSSM_KIND_SINGLE;
    if (dst->prevKind == endsWith && position >= m.length) {
      position -= m.length;
    } else {
      if (room_at(*dst, position) < m.length) return kTooSmall;
      std::memcpy(dst->buffer + position, srcDouble ? m.shift_out : m.shift_in,
                  static_cast<size_t>(m.length));
      position += m.length;
    }
  }
  const int64_t room = room_at(*dst, position);
  const int64_t available = remainder(*src);
  const Walked done = walk_modal<true>(
      ByteTables(h, normalize_case(options), options), m, src->buffer + src->curOffset,
      dst->buffer + position, std::min(room, available), room, char_limit(count), srcDouble);
  dst->length = static_cast<uint64_t>(position + done.written);
  return room < available ? kTooSmall : kOk;
}

// ---- Copy, then the handle's own case operation ------------------------------

// The bytes of `count` characters of the source (all of them for 0) are
// copied, cut to the room with NLSSM_E_DEST_TOO_SMALL; the destination grows
// to cover them and is repositioned on its current character. When the copy
// was cut or the source held fewer characters, the count shrinks to the
// characters copied. Then Upper or Lower runs on the destination.
int64_t normalize_generic(const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t count,
                          uint32_t options, bool eucJp) {
  if (options_refused(options, eucJp)) return kBadOptions;
  int64_t status;
  if (!open_copy(src, dst, status)) return status;
  int64_t bytes = remainder(*src);
  bool shortSource = false;
  if (count > 0) {
    int64_t counted = 0;
    const int64_t r = GetNumBytes(h, src, count, 0, &counted, nullptr);
    shortSource = static_cast<uint32_t>(r) == NLSSM_GETNUMBYTES_OUTSIDE;
    if (r == kOk || shortSource) bytes = std::clamp<int64_t>(counted, 0, bytes);
  }
  const int64_t start = dst->curOffset;
  const int64_t room = room_at(*dst, start);
  const bool cut = bytes > room;
  if (cut) {
    bytes = room;
    status = kTooSmall;
  }
  std::memmove(dst->buffer + start, src->buffer + src->curOffset, static_cast<size_t>(bytes));
  grow_to(*dst, start + bytes);
  if (dst->length != 0 && h->stringSetPos != nullptr)
    reinterpret_cast<SetPosFn>(h->stringSetPos)(h, dst, NLSSM_POS_CURRENT, 0);
  if ((cut || shortSource) && count > 0) {
    int64_t copied = bytes;
    if (h->encodingClass != NLSSM_CLASS_SBCS && h->NLSNumCharsS != nullptr)
      reinterpret_cast<CountFn>(h->NLSNumCharsS)(h, dst->buffer + start, bytes, 0, &copied);
    count = std::min(count, copied);
    if (count == 0) return status;  // nothing copied: nothing to map
  }
  const NLSSlot mapper = (options & kOptUpper) != 0 ? h->NLSStringUpper : h->NLSStringLower;
  const int64_t mapped =
      mapper == nullptr ? kOk : reinterpret_cast<PlainFn>(mapper)(h, dst, count, options);
  return mapped != kOk ? mapped : status;
}

// UTF-8 maps the destination in place with the handle's Upper or Lower; it
// copies nothing from the source.
int64_t normalize_utf8(const NLSSMHandle *h, NLSString *dst, int64_t count, uint32_t options) {
  if (options_refused(options, false)) return kBadOptions;
  const NLSSlot mapper = (options & kOptUpper) != 0 ? h->NLSStringUpper : h->NLSStringLower;
  return mapper == nullptr ? kOk : reinterpret_cast<PlainFn>(mapper)(h, dst, count, options);
}

// ---- Raw buffers ---------------------------------------------------------------
// n = the smaller of the source length and the capacity; a capacity below
// the source length gives NLSSM_E_DEST_TOO_SMALL after the part that fits.

struct RawCopy {
  int64_t n;
  int64_t status;
};
RawCopy raw_copy(int64_t sourceBytes, int64_t capacity) {
  const int64_t n = std::max<int64_t>(0, std::min(sourceBytes, capacity));
  return {n, capacity < sourceBytes ? kTooSmall : kOk};
}
bool raw_null(const uint8_t *src, const uint8_t *dst, int64_t n) {
  return n > 0 && (src == nullptr || dst == nullptr);
}
using module::store;

int64_t normalize_s_sbcs(const NLSSMHandle *h, const uint8_t *src, int64_t sourceBytes,
                         uint8_t *dst, int64_t capacity, int64_t *written, uint32_t options) {
  const RawCopy c = raw_copy(sourceBytes, capacity);
  if (raw_null(src, dst, c.n)) return kNullArgument;
  map_bytes(case_table(h, normalize_case(options)), src, dst, c.n);
  store(written, c.n);
  return c.status;
}

// A lead byte in the last position is copied as it is.
int64_t normalize_s_nonmodal(const NLSSMHandle *h, const uint8_t *src, int64_t sourceBytes,
                             uint8_t *dst, int64_t capacity, int64_t *written, uint32_t options) {
  const RawCopy c = raw_copy(sourceBytes, capacity);
  if (raw_null(src, dst, c.n)) return kNullArgument;
  walk_nonmodal(ByteTables(h, normalize_case(options), options), LeadFlagSplit(h), src, dst, c.n,
                c.n, kNoLimit);
  store(written, c.n);
  return c.status;
}

// Shift sequences change the mode but are not copied: the destination holds
// only the mapped characters. The count written is not stored.
int64_t normalize_s_modal(const NLSSMHandle *h, const uint8_t *src, int64_t sourceBytes,
                          uint8_t *dst, int64_t capacity, uint32_t options) {
  const RawCopy c = raw_copy(sourceBytes, capacity);
  if (raw_null(src, dst, c.n)) return kNullArgument;
  walk_modal<false>(ByteTables(h, normalize_case(options), options), cursor::ModalModel(h), src,
                    dst, c.n, c.n, kNoLimit, false);
  return c.status;
}

int64_t normalize_s_generic(const NLSSMHandle *h, const uint8_t *src, int64_t sourceBytes,
                            uint8_t *dst, int64_t capacity, int64_t *written, uint32_t options,
                            bool eucJp) {
  if (options_refused(options, eucJp)) return kBadOptions;
  const RawCopy c = raw_copy(sourceBytes, capacity);
  if (raw_null(src, dst, c.n)) return kNullArgument;
  if (c.n > 0) std::memmove(dst, src, static_cast<size_t>(c.n));
  const NLSSlot mapper = (options & kOptUpper) != 0 ? h->NLSStringUpperS : h->NLSStringLowerS;
  const int64_t mapped =
      mapper == nullptr ? kOk : reinterpret_cast<BytesFn>(mapper)(h, dst, c.n, options);
  store(written, c.n);
  return mapped != kOk ? mapped : c.status;
}

// UTF-8 maps the destination in place over the source's length (kept inside
// the capacity) and reports the source's length as written.
int64_t normalize_s_utf8(const NLSSMHandle *h, int64_t sourceBytes, uint8_t *dst, int64_t capacity,
                         int64_t *written, uint32_t options) {
  if (options_refused(options, false)) return kBadOptions;
  const NLSSlot mapper = (options & kOptUpper) != 0 ? h->NLSStringUpperS : h->NLSStringLowerS;
  const int64_t n = std::max<int64_t>(0, std::min(sourceBytes, capacity));
  const int64_t mapped =
      mapper == nullptr ? kOk : reinterpret_cast<BytesFn>(mapper)(h, dst, n, options);
  store(written, sourceBytes);
  return mapped;
}

}  // namespace
}  // namespace nlssm::casecmp

namespace cm = nlssm::casecmp;

#define NLSSM_NORMALIZE_PARAMS \
  (const NLSSMHandle *h, const NLSString *src, NLSString *dst, int64_t count, uint32_t options)
#define NLSSM_NORMALIZE_S_PARAMS                                                                  \
  (const NLSSMHandle *h, const uint8_t *src, int64_t sourceBytes, uint8_t *dst, int64_t capacity, \
   int64_t *written, uint32_t options)

// The generic members: plain and S form of one member per line.
#define NLSSM_NORMALIZE_GENERIC(suffix, eucJp)                                                   \
  int64_t NLSStringNormalize##suffix NLSSM_NORMALIZE_PARAMS {                                    \
    return cm::normalize_generic(h, src, dst, count, options, eucJp);                            \
  }                                                                                              \
  int64_t NLSStringNormalizeS##suffix NLSSM_NORMALIZE_S_PARAMS {                                 \
    return cm::normalize_s_generic(h, src, sourceBytes, dst, capacity, written, options, eucJp); \
  }

extern "C" {

NLSSM_NORMALIZE_GENERIC(_WCS2L, false)
NLSSM_NORMALIZE_GENERIC(_WCS2B, false)
NLSSM_NORMALIZE_GENERIC(_WCS4L, false)
NLSSM_NORMALIZE_GENERIC(_WCS4B, false)
NLSSM_NORMALIZE_GENERIC(_UTFE, false)
NLSSM_NORMALIZE_GENERIC(_MBCS_nonmodal_EUC_JP, true)
NLSSM_NORMALIZE_GENERIC(_MBCS_nonmodal_EUC_TW, false)
NLSSM_NORMALIZE_GENERIC(_MBCS_nonmodal_GB18030, false)

int64_t NLSStringNormalize_SBCS NLSSM_NORMALIZE_PARAMS {
  return cm::normalize_sbcs(h, src, dst, count, options);
}
int64_t NLSStringNormalize_MBCS_nonmodal NLSSM_NORMALIZE_PARAMS {
  return cm::normalize_nonmodal(h, src, dst, count, options);
}
int64_t NLSStringNormalize_MBCS_modal NLSSM_NORMALIZE_PARAMS {
  return cm::normalize_modal(h, src, dst, count, options);
}
int64_t NLSStringNormalize_UTF8 NLSSM_NORMALIZE_PARAMS {
  (void)src;
  return cm::normalize_utf8(h, dst, count, options);
}

int64_t NLSStringNormalizeS_SBCS NLSSM_NORMALIZE_S_PARAMS {
  return cm::normalize_s_sbcs(h, src, sourceBytes, dst, capacity, written, options);
}
int64_t NLSStringNormalizeS_MBCS_nonmodal NLSSM_NORMALIZE_S_PARAMS {
  return cm::normalize_s_nonmodal(h, src, sourceBytes, dst, capacity, written, options);
}
int64_t NLSStringNormalizeS_MBCS_modal NLSSM_NORMALIZE_S_PARAMS {
  (void)written;
  return cm::normalize_s_modal(h, src, sourceBytes, dst, capacity, options);
}
int64_t NLSStringNormalizeS_UTF8 NLSSM_NORMALIZE_S_PARAMS {
  (void)src;
  return cm::normalize_s_utf8(h, sourceBytes, dst, capacity, written, options);
}

}  // extern "C"
