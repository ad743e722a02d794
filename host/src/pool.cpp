// Pools: real allocations, released one by one or all at once when the pool
// is destroyed, counted per pool and host-wide.
#include <atomic>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <unordered_map>
#include <unordered_set>

#include "nlssm/reference_host.hpp"
#include "objects.hpp"

namespace nlssm::refhost {

namespace {

// A countdown shared by allocation and pool creation fault injection.
struct Fault {
  std::atomic<std::int64_t> countdown{0};
  std::atomic<bool> always{false};

  bool fires() {
    if (always.load()) return true;
    std::int64_t n = countdown.load();
    while (n > 0) {
      if (countdown.compare_exchange_weak(n, n - 1)) return n == 1;
    }
    return false;
  }
};

struct Pool;

}  // namespace

struct PoolRegistry::State {
  std::mutex mutex;
  std::unordered_set<Pool *> live;
  std::atomic<std::int64_t> allocations{0};
  std::atomic<std::int64_t> bytes{0};
  Fault allocationFault;
  Fault creationFault;
};

namespace {

struct Pool {
  SlotWords<5> slots;
  PoolRegistry::State *owner = nullptr;
  PoolRegistry *registry = nullptr;
  std::string name;
  std::uint32_t optionFlags = 0;
  mutable std::mutex mutex;
  std::unordered_map<void *, std::uint64_t> blocks;
  std::uint64_t bytes = 0;

  void release_all() {
    std::lock_guard lock(mutex);
    for (auto &[block, size] : blocks) {
      std::free(block);
      owner->allocations.fetch_sub(1);
      owner->bytes.fetch_sub(static_cast<std::int64_t>(size));
    }
    blocks.clear();
    bytes = 0;
  }
};

void *pool_allocate(void *object, std::uint64_t size, std::uint32_t flags) {
  Pool *pool = self<Pool>(object);
  if (pool->registry->allocation_fails()) return nullptr;
  // A zero-byte request still gets its own address.
  void *block = (flags & NLSHOST_ALLOC_ZERO_FILL) ? std::calloc(1, size ? size : 1)
                                                  : std::malloc(size ? size : 1);
  if (block == nullptr) return nullptr;
  std::lock_guard lock(pool->mutex);
  pool->blocks.emplace(block, size);
  pool->bytes += size;
  pool->owner->allocations.fetch_add(1);
  pool->owner->bytes.fetch_add(static_cast<std::int64_t>(size));
  return block;
}

void pool_free(void *object, void *memory) {
  if (memory == nullptr) return;
  Pool *pool = self<Pool>(object);
  std::lock_guard lock(pool->mutex);
  auto found = pool->blocks.find(memory);
  if (found == pool->blocks.end()) return;  // not ours: leave it alone
  pool->bytes -= found->second;
  pool->owner->allocations.fetch_sub(1);
  pool->owner->bytes.fetch_sub(static_cast<std::int64_t>(found->second));
  std::free(memory);
  pool->blocks.erase(found);
}

void pool_destroy(void *object) {
  Pool *pool = self<Pool>(object);
  PoolRegistry::State *owner = pool->owner;
  {
    std::lock_guard lock(owner->mutex);
    if (owner->live.erase(pool) == 0) return;
  }
  pool->release_all();
  delete pool;
}

}  // namespace

PoolRegistry::PoolRegistry() : state_(std::make_unique<State>()) {}

PoolRegistry::~PoolRegistry() {
  for (Pool *pool : state_->live) {
    pool->release_all();
    delete pool;
  }
}

void *PoolRegistry::create(std::string_view name, std::uint32_t optionFlags) {
  if (state_->creationFault.fires()) return nullptr;
  auto *pool = new Pool;
  pool->slots.set(NLSHOST_SLOT_POOL_DESTROY, &pool_destroy);
  pool->slots.set(NLSHOST_SLOT_POOL_ALLOCATE, &pool_allocate);
  pool->slots.set(NLSHOST_SLOT_POOL_FREE, &pool_free);
  pool->owner = state_.get();
  pool->registry = this;
  pool->name = name;
  pool->optionFlags = optionFlags;
  std::lock_guard lock(state_->mutex);
  state_->live.insert(pool);
  return pool;
}

PoolCounts PoolRegistry::counts() const {
  PoolCounts counts;
  {
    std::lock_guard lock(state_->mutex);
    counts.pools = static_cast<std::int64_t>(state_->live.size());
  }
  counts.allocations = state_->allocations.load();
  counts.bytes = state_->bytes.load();
  return counts;
}

PoolCounts PoolRegistry::counts_of(const void *object) {
  const Pool *pool = static_cast<const Pool *>(object);
  std::lock_guard lock(pool->mutex);
  return {1, static_cast<std::int64_t>(pool->blocks.size()),
          static_cast<std::int64_t>(pool->bytes)};
}

std::string PoolRegistry::name_of(const void *pool) {
  return static_cast<const Pool *>(pool)->name;
}

std::uint32_t PoolRegistry::option_flags_of(const void *pool) {
  return static_cast<const Pool *>(pool)->optionFlags;
}

void PoolRegistry::fail_allocation_after(std::int64_t nth) {
  state_->allocationFault.countdown.store(nth);
}
void PoolRegistry::fail_all_allocations(bool on) {
  state_->allocationFault.always.store(on);
}
void PoolRegistry::fail_pool_creation_after(std::int64_t nth) {
  state_->creationFault.countdown.store(nth);
}
void PoolRegistry::fail_all_pool_creations(bool on) {
  state_->creationFault.always.store(on);
}
bool PoolRegistry::allocation_fails() {
  return state_->allocationFault.fires();
}

}  // namespace nlssm::refhost
