// Taking every occurrence of one byte out of single-byte text, closing up
// the rest: the hot path of single-byte delete, with vector variants chosen
// for the processor at run time.
#pragma once

#include <array>
#include <cstdint>

#include "kernel/cpu.hpp"

namespace nlssm::edit {

struct DeleteByteOps {
  // Closes up p[0, bytes) without `byte`; answers the bytes kept. The bytes
  // past them are left as they happen to be.
  int64_t (*drop)(uint8_t *p, int64_t bytes, uint8_t byte);
};

// The scalar rule: every byte is stored at the write position, which moves
// on only for a byte that is kept.
inline int64_t drop_byte_scalar(uint8_t *p, int64_t bytes, uint8_t byte, int64_t w = 0,
                                int64_t r = 0) {
  for (; r < bytes; ++r) {
    const uint8_t b = p[r];
    p[w] = b;
    w += b == byte ? 0 : 1;
  }
  return w;
}

namespace sse2 {
extern const DeleteByteOps kDeleteByteOps;
}
namespace avx2 {
extern const DeleteByteOps kDeleteByteOps;
}

inline constinit kernel::cpu::Dispatch<DeleteByteOps, 2> delete_byte_ops{std::array{
    kernel::cpu::Variant<DeleteByteOps>{kernel::cpu::Isa::avx2, &avx2::kDeleteByteOps},
    kernel::cpu::Variant<DeleteByteOps>{kernel::cpu::Isa::sse2, &sse2::kDeleteByteOps},
}};

}  // namespace nlssm::edit
