// Moves of text into a bounded destination, per class, shared by the move
// members and by concatenate (which moves each piece).
#pragma once

#include <nlssm/nlssm.h>

#include <cstdint>

#include "edit/text_model.hpp"

namespace nlssm::edit {

enum class MoveKind { kSbcs, kUtf, kWcs2, kWcs4, kModal, kDbcs, kEucJp, kEucTw, kGb18030 };

struct MoveResult {
  int64_t status = kOk;
  int64_t bytes = 0;  // bytes written, padding excluded
  int64_t chars = 0;  // characters written (counted only when asked for)
};

// Moves `srcLen` bytes (or characters, with flag 0x200) of `src` into the
// `dstLen` bytes at `dst` by the rules of `kind`. Buffers must be valid.
MoveResult move_text(const NLSSMHandle *h, MoveKind kind, const uint8_t *src, int64_t srcLen,
                     uint8_t *dst, int64_t dstLen, uint32_t flags, bool wantChars);

// The move rules of the handle's encoding.
MoveKind move_kind(const NLSSMHandle *h);

}  // namespace nlssm::edit
