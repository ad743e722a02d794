// Run-time processor features the cursor's vector paths dispatch on.
#pragma once

namespace nlssm::cursor {

inline bool cpu_has_avx2() {
#if defined(__x86_64__) || defined(__i386__)
  static const bool has = [] {
    __builtin_cpu_init();
    return __builtin_cpu_supports("avx2") && __builtin_cpu_supports("popcnt");
  }();
  return has;
#else
  return false;
#endif
}

}  // namespace nlssm::cursor
