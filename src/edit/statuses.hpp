// The statuses the editing families answer.
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>

namespace nlssm::edit {

inline constexpr int64_t kOk = 0;
inline constexpr int64_t kTooSmall = NLSSM_E_DEST_TOO_SMALL;
inline constexpr int64_t kNullArgument = NLSSM_E_NULL_ARGUMENT;
inline constexpr int64_t kNoMemory = NLSSM_E_NO_MEMORY;

}  // namespace nlssm::edit
