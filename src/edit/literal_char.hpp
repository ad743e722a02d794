// The fill character and the separator arrive as a literal in the host's
// literal encoding; the writing edits take its first character, converted
// into the handle's encoding (a modal double-byte character comes with its
// shift sequences). One character is at most a few bytes: the stack buffer
// holds it.
#pragma once

#include "edit/text_model.hpp"
#include "module/literal.hpp"

namespace nlssm::edit {

using LiteralChar = module::ConvertedLiteral<16>;

// Converts the first byte of `literal` into `c`; 0 or the failure status.
inline int64_t convert_first_char(const NLSSMHandle *h, LiteralChar &c, const uint8_t *literal) {
  switch (c.convert(h, literal, 1)) {
    case module::LiteralOutcome::kNoMemory:
      return kNoMemory;
    case module::LiteralOutcome::kFailed:
      return c.status();
    default:
      return kOk;
  }
}

}  // namespace nlssm::edit
