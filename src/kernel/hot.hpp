// The kernel's hot paths, one table of functions per instruction set, and
// the table the processor runs best, chosen on first use.
//
// The variants take valid arguments only (a buffer for every element, no
// negative lengths); the exported sk functions check their arguments first.
#pragma once

#include <cstdint>

#include "kernel/cpu.hpp"

namespace kernel {

struct HotOps {
  void (*str_up)(uint8_t *bytes, int64_t length);
  void (*str_low)(uint8_t *bytes, int64_t length);
  void (*mem_set)(uint8_t *buffer, uint8_t value, int64_t length);
  void (*mem_tset)(uint32_t *buffer, uint32_t value, int64_t count);
  int64_t (*mem_scan)(const uint8_t *buffer, int64_t length, uint8_t byte);
  int64_t (*mem_nscan)(const uint8_t *buffer, int64_t length, uint8_t byte);
  int64_t (*mem_tnscan)(const uint32_t *buffer, int64_t count, uint32_t value);
  int64_t (*mem_mismatch)(const uint8_t *a, const uint8_t *b, int64_t length);
  // The same fills with non-temporal stores, for ranges from
  // cpu::stream_fill_min() bytes on.
  void (*mem_stream_set)(uint8_t *buffer, uint8_t value, int64_t length);
  void (*mem_stream_tset)(uint32_t *buffer, uint32_t value, int64_t count);
  // Block copies. copy_up takes disjoint ranges or a destination below its
  // source, copy_down a destination above its source; copy_stream takes
  // disjoint ranges and writes around the caches.
  void (*copy_up)(uint8_t *destination, const uint8_t *source, int64_t length);
  void (*copy_down)(uint8_t *destination, const uint8_t *source, int64_t length);
  void (*copy_stream)(uint8_t *destination, const uint8_t *source, int64_t length);
};

#define NLSSM_KERNEL_HOT_DECLS                                                   \
  void str_up(uint8_t *bytes, int64_t length);                                   \
  void str_low(uint8_t *bytes, int64_t length);                                  \
  void mem_set(uint8_t *buffer, uint8_t value, int64_t length);                  \
  void mem_tset(uint32_t *buffer, uint32_t value, int64_t count);                \
  int64_t mem_scan(const uint8_t *buffer, int64_t length, uint8_t byte);         \
  int64_t mem_nscan(const uint8_t *buffer, int64_t length, uint8_t byte);        \
  int64_t mem_tnscan(const uint32_t *buffer, int64_t count, uint32_t value);     \
  int64_t mem_mismatch(const uint8_t *a, const uint8_t *b, int64_t length);      \
  void mem_stream_set(uint8_t *buffer, uint8_t value, int64_t length);           \
  void mem_stream_tset(uint32_t *buffer, uint32_t value, int64_t count);         \
  void copy_up(uint8_t *destination, const uint8_t *source, int64_t length);     \
  void copy_down(uint8_t *destination, const uint8_t *source, int64_t length);   \
  void copy_stream(uint8_t *destination, const uint8_t *source, int64_t length); \
  extern const HotOps kHotOps;

namespace sse2 {
NLSSM_KERNEL_HOT_DECLS
}
namespace avx2 {
NLSSM_KERNEL_HOT_DECLS
}
#undef NLSSM_KERNEL_HOT_DECLS

inline constinit cpu::Dispatch<HotOps, 2> hot_ops{std::array{
    cpu::Variant<HotOps>{cpu::Isa::avx2, &avx2::kHotOps},
    cpu::Variant<HotOps>{cpu::Isa::sse2, &sse2::kHotOps},
}};

inline const HotOps &hot() noexcept {
  return hot_ops.get();
}

// Copies between disjoint ranges, around the caches when the block is too
// large for them.
inline void copy_disjoint(uint8_t *destination, const uint8_t *source, int64_t length) {
  const HotOps &ops = hot();
  (length >= cpu::stream_copy_min() ? ops.copy_stream : ops.copy_up)(destination, source, length);
}

}  // namespace kernel
