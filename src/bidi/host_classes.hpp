// Bidirectional categories of code points, asked of the host NLS object (the
// handle's owner) through its character-information query.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstdint>

#include "module/host_access.hpp"

namespace nlssm::bidi {

// The category the host gives a 32-bit value, or -1 when it has none.
inline int64_t host_category(const NLSSMHandle *handle, uint32_t value) {
  NLSHostCharInfo info{};
  const auto query = host::slot<NLSHostCharInfoFn>(handle->owner, NLSHOST_SLOT_NLS_CHAR_INFO);
  if (query(handle->owner, value, &info) != 0) return -1;
  return info.bidiCategory;
}

// Categories for one pass over a text: a small direct-mapped cache in front
// of the host query, since running text repeats its characters. A character
// the host does not know, or a category outside the algorithm's classes,
// counts as ON (other neutral).
class HostClasses {
 public:
  explicit HostClasses(const NLSSMHandle *handle) : handle_(handle) {
    for (uint32_t &tag : tags_) tag = kEmpty;
  }
  uint8_t operator()(uint32_t character) {
    const uint32_t slot = character & (kSize - 1);
    if (tags_[slot] != character) {
      const int64_t category = host_category(handle_, character);
      tags_[slot] = character;
      classes_[slot] = category >= 0 && category <= NLSHOST_BIDI_PDI
                           ? static_cast<uint8_t>(category)
                           : static_cast<uint8_t>(NLSHOST_BIDI_ON);
    }
    return classes_[slot];
  }

 private:
  static constexpr uint32_t kSize = 256;
  static constexpr uint32_t kEmpty = 0xFFFFFFFFu;
  const NLSSMHandle *handle_;
  uint32_t tags_[kSize];
  uint8_t classes_[kSize];
};

}  // namespace nlssm::bidi
