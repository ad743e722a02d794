// Bidirectional categories of code points, asked of the host NLS object (the
// handle's owner) through its character-information query, and the
// properties the reordering reads with them.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstdint>

#include "bidi/pairs.hpp"
#include "module/host_access.hpp"

namespace nlssm::bidi {

// The category the host gives a 32-bit value, or -1 when it has none.
inline int64_t host_category(const NLSSMHandle *handle, uint32_t value) {
  NLSHostCharInfo info{};
  const auto query = host::slot<NLSHostCharInfoFn>(handle->owner, NLSHOST_SLOT_NLS_CHAR_INFO);
  if (query(handle->owner, value, &info) != 0) return -1;
  return info.bidiCategory;
}

// What the reordering needs of a character: its class (the host's category;
// a character the host does not know, or a category outside the
// algorithm's classes, counts as ON), its bracket word and mirror image
// (pairs.hpp). A small direct-mapped cache sits in front, since running
// text repeats its characters.
struct CharProperties {
  uint8_t bidiClass;
  uint32_t bracket;
  uint32_t mirror;
};

class HostProperties {
 public:
  explicit HostProperties(const NLSSMHandle *handle) : handle_(handle) {
    for (Entry &e : entries_) e.character = kEmpty;
  }
  const CharProperties &operator()(uint32_t character) {
    Entry &e = entries_[character & (kSize - 1)];
    if (e.character != character) {
      const int64_t category = host_category(handle_, character);
      e.character = character;
      e.properties.bidiClass = category >= 0 && category <= NLSHOST_BIDI_PDI
                                   ? static_cast<uint8_t>(category)
                                   : static_cast<uint8_t>(NLSHOST_BIDI_ON);
      e.properties.bracket = bracket_of(character);
      e.properties.mirror = mirror_of(character);
    }
    return e.properties;
  }

 private:
  struct Entry {
    uint32_t character;
    CharProperties properties;
  };
  static constexpr uint32_t kSize = 512;
  static constexpr uint32_t kEmpty = 0xFFFFFFFFu;
  const NLSSMHandle *handle_;
  Entry entries_[kSize];
};

}  // namespace nlssm::bidi
