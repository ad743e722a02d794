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

// The processor's string instructions (the direction flag is clear at every
// call by the calling convention, so they work upwards).
inline void string_copy(uint8_t *destination, const uint8_t *source, int64_t length) noexcept {
  asm volatile("rep movsb" : "+D"(destination), "+S"(source), "+c"(length) : : "memory");
}
inline void string_fill(uint8_t *buffer, uint8_t value, int64_t length) noexcept {
  asm volatile("rep stosb" : "+D"(buffer), "+c"(length) : "a"(value) : "memory");
}

// Copies between disjoint ranges with the routine that is fastest for the
// block's size on this processor's caches.
inline void copy_disjoint(uint8_t *destination, const uint8_t *source, int64_t length) {
  if (length >= cpu::stream_copy_min())
    hot().copy_stream(destination, source, length);
  else if (length >= cpu::string_copy_min())
    string_copy(destination, source, length);
  else
    hot().copy_up(destination, source, length);
}

// The same for byte fills.
inline void fill_bytes(uint8_t *buffer, uint8_t value, int64_t length) {
  if (length >= cpu::stream_fill_min())
    hot().mem_stream_set(buffer, value, length);
  else if (length >= cpu::string_fill_min())
    string_fill(buffer, value, length);
  else
    hot().mem_set(buffer, value, length);
}

// 32-bit fills have no string instruction that repeats a whole unit.
inline void fill_units(uint32_t *buffer, uint32_t value, int64_t count) {
  if (count >= cpu::stream_fill_min() / int64_t{sizeof(uint32_t)})
    hot().mem_stream_tset(buffer, value, count);
  else
    hot().mem_tset(buffer, value, count);
}

}  // namespace kernel
