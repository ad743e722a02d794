// Typed access to the slots of host objects. Every host object is a flat
// record of 64-bit words whose word N holds the function for slot N.
#pragma once

#include <nlssm/host.h>

#include <cstdint>

namespace nlssm::host {

// The function stored in slot `n` of `object`, as type Fn.
template <typename Fn>
inline Fn slot(const void *object, int n) {
  return reinterpret_cast<Fn>(NLSSM_HOST_SLOT(object, n));
}

// A pool as the module uses it: allocate, free and destroy through its slots.
struct Pool {
  void *object;

  void *allocate(std::uint64_t size, std::uint32_t flags = 0) const {
    return slot<NLSHostPoolAllocateFn>(object, NLSHOST_SLOT_POOL_ALLOCATE)(object, size, flags);
  }
  void free(void *memory) const {
    slot<NLSHostPoolFreeFn>(object, NLSHOST_SLOT_POOL_FREE)(object, memory);
  }
  void destroy() const { slot<NLSHostPoolDestroyFn>(object, NLSHOST_SLOT_POOL_DESTROY)(object); }
};

// Creates a pool through slot 6 of a host object (the host itself, or the
// exported service object); null when the host refuses.
inline void *create_pool(void *creator, std::uint32_t flags, void *journal, const char *name) {
  NLSHostPoolOptions options{};
  options.flags = flags;
  return slot<NLSHostCreatePoolFn>(creator, NLSHOST_SLOT_CREATE_POOL)(creator, &options, journal,
                                                                      name);
}

}  // namespace nlssm::host
