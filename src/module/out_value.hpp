// Optional out values: a caller may pass null for a result it does not want.
#pragma once

#include <cstdint>

namespace nlssm::module {

inline void store(int64_t *where, int64_t value) {
  if (where != nullptr) *where = value;
}

}  // namespace nlssm::module
