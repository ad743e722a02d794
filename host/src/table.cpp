// The NLS object's handle table (entries keyed by bytes) and its table lock.
#include <cstring>
#include <map>
#include <mutex>
#include <string>

#include "internal.hpp"

namespace nlssm::refhost {

namespace {

struct Table {
  SlotWords<19> slots;
  PoolRegistry *pools;
  std::mutex mutex;
  std::map<std::string, NLSHostTableEntry *> entries;
};

std::string key_of(const void *key, std::uint64_t length) {
  return {static_cast<const char *>(key), static_cast<std::size_t>(length)};
}

void *table_find(void *object, std::uint32_t flags, void *, const void *key,
                 std::uint64_t keyLength) {
  if (!(flags & NLSHOST_TABLE_FIND_FLAGS) || (key == nullptr && keyLength != 0)) return nullptr;
  Table *table = self<Table>(object);
  std::lock_guard lock(table->mutex);
  auto found = table->entries.find(key_of(key, keyLength));
  if (found == table->entries.end()) return nullptr;
  ++found->second->references;
  return found->second;
}

void *table_insert(void *object, std::uint32_t flags, void *, void *handle, void *, const void *key,
                   std::uint64_t keyLength, std::int64_t *status) {
  auto fail = [status](std::uint32_t code) -> void * {
    if (status != nullptr) *status = code;
    return nullptr;
  };
  if (!(flags & NLSHOST_TABLE_INSERT_FLAGS)) return fail(NLSHOST_E_BAD_OPTIONS);
  if (key == nullptr && keyLength != 0) return fail(NLSHOST_E_NULL);
  if (keyLength > NLSHOST_TABLE_KEY_MAX) return fail(NLSHOST_E_BAD_OPTIONS);
  Table *table = self<Table>(object);
  // An insertion takes host memory, so allocation fault injection covers it.
  if (table->pools->allocation_fails()) return fail(NLSHOST_E_NO_MEMORY);
  std::lock_guard lock(table->mutex);
  std::string k = key_of(key, keyLength);
  if (table->entries.count(k) != 0) return fail(NLSHOST_E_KEY_EXISTS);
  auto *entry = new NLSHostTableEntry{};
  entry->table = table;
  entry->references = 1;
  entry->handle = handle;
  entry->keyLength = keyLength;
  if (keyLength != 0) std::memcpy(entry->key, key, keyLength);
  table->entries.emplace(std::move(k), entry);
  if (status != nullptr) *status = 0;
  return entry;
}

void table_release_entry(void *object, void *entry) {
  if (entry == nullptr) return;
  Table *table = self<Table>(object);
  std::lock_guard lock(table->mutex);
  auto *e = static_cast<NLSHostTableEntry *>(entry);
  if (e->references > 0) --e->references;
}

struct Lock {
  SlotWords<5> slots;
  std::mutex mutex;
};

void lock_acquire(void *object, std::int64_t, std::int64_t) {
  self<Lock>(object)->mutex.lock();
}
void lock_release(void *object) {
  self<Lock>(object)->mutex.unlock();
}

}  // namespace

void *new_table_object(PoolRegistry &pools) {
  auto *table = new Table;
  table->pools = &pools;
  table->slots.set(NLSHOST_SLOT_TABLE_FIND, &table_find);
  table->slots.set(NLSHOST_SLOT_TABLE_INSERT, &table_insert);
  table->slots.set(NLSHOST_SLOT_TABLE_RELEASE_ENTRY, &table_release_entry);
  return table;
}

void destroy_table_object(void *object, std::int64_t (*destroyCallback)(void *entry)) {
  Table *table = self<Table>(object);
  for (auto &[key, entry] : table->entries) {
    if (destroyCallback != nullptr) destroyCallback(entry);
    delete entry;
  }
  delete table;
}

void *new_lock_object() {
  auto *lock = new Lock;
  lock->slots.set(NLSHOST_SLOT_LOCK_ACQUIRE, &lock_acquire);
  lock->slots.set(NLSHOST_SLOT_LOCK_RELEASE, &lock_release);
  return lock;
}

void destroy_lock_object(void *lock) {
  delete self<Lock>(lock);
}

}  // namespace nlssm::refhost
