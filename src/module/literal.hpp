// Literals arrive in the host's literal encoding (62). The literal forms of
// the operation families convert them into the handle's encoding through the
// handle's charConverter before calling the plain form; the converted text
// lives in a work buffer sized by the owner's conversion-size query.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstdint>

#include "module/host_access.hpp"
#include "module/work_buffer.hpp"

namespace nlssm::module {

enum class LiteralOutcome {
  kConverted,  // text() is the literal in the handle's encoding
  kAsGiven,    // empty literal or no converter: text() is the literal itself
  kNoMemory,   // the work buffer could not be had from the handle's pool
  kFailed,     // the size query or the conversion failed; status() says why
};

template <std::size_t StackBytes = 256>
class ConvertedLiteral {
 public:
  LiteralOutcome convert(const NLSSMHandle *handle, const void *literal, std::uint64_t bytes) {
    text_ = static_cast<const std::uint8_t *>(literal);
    length_ = bytes;
    status_ = 0;
    if (bytes == 0 || handle->charConverter == nullptr) return LiteralOutcome::kAsGiven;
    std::uint64_t size = 0;
    status_ = host::slot<NLSHostConversionSizeFn>(handle->owner, NLSHOST_SLOT_NLS_CONVERSION_SIZE)(
        handle->owner, NLSSM_ENC_REFERENCE_SBCS, handle->encodingNumber, literal, bytes, &size);
    if (status_ != 0) return LiteralOutcome::kFailed;
    if (!buffer_.reserve(handle, size)) return LiteralOutcome::kNoMemory;
    std::uint64_t produced = 0;
    if (size != 0) {
      status_ = host::slot<NLSHostConverterConvertFn>(handle->charConverter,
                                                      NLSHOST_SLOT_CONVERTER_CONVERT)(
          handle->charConverter, literal, bytes, buffer_.data(), size, &produced, nullptr);
      if (status_ != 0) return LiteralOutcome::kFailed;
    }
    text_ = buffer_.data();
    length_ = produced;
    return LiteralOutcome::kConverted;
  }

  const std::uint8_t *text() const { return text_; }
  std::uint64_t length() const { return length_; }
  std::int64_t status() const { return status_; }

 private:
  WorkBuffer<StackBytes> buffer_;
  const std::uint8_t *text_ = nullptr;
  std::uint64_t length_ = 0;
  std::int64_t status_ = 0;
};

}  // namespace nlssm::module
