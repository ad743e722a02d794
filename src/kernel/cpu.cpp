#include "kernel/cpu.hpp"

namespace kernel::cpu {
namespace {

enum Feature : uint32_t { kAvx2 = 1u << 0, kAvx512Vbmi = 1u << 1 };

uint32_t detect() noexcept {
  // The run-time library fills its processor model in a constructor; a
  // dispatch that runs from another constructor may come first.
  __builtin_cpu_init();
  uint32_t features = 0;
  // The AVX2 paths also count bits with popcnt, which every AVX2 processor has.
  if (__builtin_cpu_supports("avx2") && __builtin_cpu_supports("popcnt")) features |= kAvx2;
  // The run-time library reports AVX-512 only where the system saves its state.
  if ((features & kAvx2) != 0 && __builtin_cpu_supports("avx512f") &&
      __builtin_cpu_supports("avx512bw") && __builtin_cpu_supports("avx512vbmi"))
    features |= kAvx512Vbmi;
  return features;
}

uint32_t features() noexcept {
  static const uint32_t detected = detect();
  return detected;
}

}  // namespace

bool supports(Isa isa) noexcept {
  switch (isa) {
    case Isa::sse2:
      return true;
    case Isa::avx2:
      return (features() & kAvx2) != 0;
    case Isa::avx512vbmi:
      return (features() & kAvx512Vbmi) != 0;
  }
  return false;
}

const char *name(Isa isa) noexcept {
  switch (isa) {
    case Isa::sse2:
      return "sse2";
    case Isa::avx2:
      return "avx2";
    case Isa::avx512vbmi:
      return "avx512vbmi";
  }
  return "?";
}

}  // namespace kernel::cpu
