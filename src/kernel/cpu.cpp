#include "kernel/cpu.hpp"

#include <cpuid.h>
#include <unistd.h>

namespace kernel::cpu {
namespace {

enum Feature : uint32_t {
  kAvx2 = 1u << 0,
  kAvx512Vbmi = 1u << 1,
  kFastStrings = 1u << 2,
  kAvx512Vbmi2 = 1u << 3,
};

struct Processor {
  uint32_t features;
  Caches caches;
};

uint32_t detect_features() noexcept {
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
  if ((features & kAvx512Vbmi) != 0 && __builtin_cpu_supports("avx512vbmi2") &&
      __builtin_cpu_supports("bmi2"))
    features |= kAvx512Vbmi2;
  // Leaf 7, EBX bit 9: enhanced rep movsb/stosb.
  unsigned a, b, c, d;
  if (__get_cpuid_count(7, 0, &a, &b, &c, &d) != 0 && (b & (1u << 9)) != 0)
    features |= kFastStrings;
  return features;
}

// Walks a deterministic cache-parameters leaf: 4 on Intel, 0x8000001D on AMD
// and Hygon. Each subleaf describes one cache: its type (0 ends the list, 2
// is an instruction cache), level, and geometry (ways x partitions x line
// size x sets, each stored minus one).
Caches walk_cache_leaf(unsigned leaf) noexcept {
  Caches caches{};
  for (unsigned index = 0; index < 16; ++index) {
    unsigned a, b, c, d;
    if (__get_cpuid_count(leaf, index, &a, &b, &c, &d) == 0) break;
    const unsigned type = a & 0x1f;
    if (type == 0) break;
    if (type == 2) continue;
    const unsigned level = (a >> 5) & 0x7;
    const int64_t line = (b & 0xfff) + 1;
    const int64_t size =
        int64_t{(b >> 22) + 1} * (((b >> 12) & 0x3ff) + 1) * line * (int64_t{c} + 1);
    if (level == 1) {
      caches.l1d = size;
      caches.line = line;
    } else if (level == 2) {
      caches.l2 = size;
    }
    if (level >= 2 && size > caches.llc) caches.llc = size;
  }
  return caches;
}

bool has_cache_topology_leaf() noexcept {
  unsigned a, b, c, d;
  // Extended leaf 0x80000001, ECX bit 22: the topology extensions that
  // include leaf 0x8000001D.
  return __get_cpuid(0x80000001, &a, &b, &c, &d) != 0 && (c & (1u << 22)) != 0 &&
         static_cast<unsigned>(__get_cpuid_max(0x80000000, nullptr)) >= 0x8000001Du;
}

Caches detect_caches() noexcept {
  Caches caches = walk_cache_leaf(4);
  if (caches.l1d == 0 && has_cache_topology_leaf()) caches = walk_cache_leaf(0x8000001D);
    // The C library's figures come from the same leaves or from older ones
    // that some virtual machines fill inconsistently: a fallback only.
#ifdef _SC_LEVEL1_DCACHE_SIZE
  auto from_libc = [](int64_t &field, int name) {
    const long value = sysconf(name);
    if (field == 0 && value > 0) field = value;
  };
  from_libc(caches.l1d, _SC_LEVEL1_DCACHE_SIZE);
  from_libc(caches.line, _SC_LEVEL1_DCACHE_LINESIZE);
  from_libc(caches.l2, _SC_LEVEL2_CACHE_SIZE);
  from_libc(caches.llc, _SC_LEVEL3_CACHE_SIZE);
#endif
  if (caches.l1d == 0) caches.l1d = int64_t{32} << 10;
  if (caches.line == 0) caches.line = 64;
  if (caches.l2 == 0) caches.l2 = int64_t{256} << 10;
  if (caches.llc < caches.l2) caches.llc = caches.l2;
  return caches;
}

const Processor &processor() noexcept {
  static const Processor detected{detect_features(), detect_caches()};
  return detected;
}

// Detection runs while the module loads, so no caller pays for it later.
[[gnu::constructor]] void detect_at_load() {
  processor();
}

}  // namespace

bool supports(Isa isa) noexcept {
  switch (isa) {
    case Isa::sse2:
      return true;
    case Isa::avx2:
      return (processor().features & kAvx2) != 0;
    case Isa::avx512vbmi:
      return (processor().features & kAvx512Vbmi) != 0;
    case Isa::avx512vbmi2:
      return (processor().features & kAvx512Vbmi2) != 0;
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
    case Isa::avx512vbmi2:
      return "avx512vbmi2";
  }
  return "?";
}

const Caches &caches() noexcept {
  return processor().caches;
}

bool fast_string_ops() noexcept {
  return (processor().features & kFastStrings) != 0;
}

// A copy holds its source and its destination: together they overflow a
// cache level at half its size. A fill only writes.
int64_t string_copy_min() noexcept {
  return fast_string_ops() ? caches().l1d / 2 : INT64_MAX;
}
int64_t string_fill_min() noexcept {
  return fast_string_ops() ? caches().l2 : INT64_MAX;
}

int64_t stream_copy_min() noexcept {
  return caches().llc / 2;
}
int64_t stream_fill_min() noexcept {
  return caches().llc;
}

}  // namespace kernel::cpu
