// The handle table and the table lock, from eight threads.
#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

#include "host_test_support.hpp"

using namespace hosttest;

namespace {

std::atomic<int> gCallbacks{0};
std::int64_t count_callback(void *entry) {
  EXPECT_NE(static_cast<NLSHostTableEntry *>(entry)->handle, nullptr);
  ++gCallbacks;
  return 0;
}

void *table_of(void *nls) {
  return static_cast<void **>(nls)[NLSHOST_WORD_NLS_HANDLE_TABLE];
}
void *lock_of(void *nls) {
  return static_cast<void **>(nls)[NLSHOST_WORD_NLS_TABLE_LOCK];
}

void *find(void *table, const std::string &key, std::uint32_t flags = NLSHOST_TABLE_FIND_FLAGS) {
  return call<NLSHostTableFindFn>(
      table, NLSHOST_SLOT_TABLE_FIND, flags, static_cast<void *>(nullptr),
      static_cast<const void *>(key.data()), static_cast<std::uint64_t>(key.size()));
}

void *insert(void *table, const std::string &key, void *handle, std::int64_t *status) {
  return call<NLSHostTableInsertFn>(
      table, NLSHOST_SLOT_TABLE_INSERT, NLSHOST_TABLE_INSERT_FLAGS, static_cast<void *>(nullptr),
      handle, static_cast<void *>(nullptr), static_cast<const void *>(key.data()),
      static_cast<std::uint64_t>(key.size()), status);
}

void release(void *table, void *entry) {
  call<NLSHostTableReleaseEntryFn>(table, NLSHOST_SLOT_TABLE_RELEASE_ENTRY, entry);
}

}  // namespace

TEST(HandleTable, FindInsertReleaseAndDestroyCallback) {
  gCallbacks = 0;
  {
    auto host = nlssm::refhost::ReferenceHost::standalone(&count_callback);
    void *table = table_of(host->nls());
    int handle = 0;
    std::int64_t status = -1;
    EXPECT_EQ(find(table, "UTF-8"), nullptr);
    void *entry = insert(table, "UTF-8", &handle, &status);
    ASSERT_NE(entry, nullptr);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(static_cast<void **>(entry)[NLSHOST_ENTRY_WORD_HANDLE], &handle);
    release(table, entry);
    void *found = find(table, "UTF-8");
    EXPECT_EQ(found, entry);
    release(table, found);
    EXPECT_EQ(find(table, "UTF-8", 0), nullptr);                 // not a find request
    EXPECT_EQ(find(table, std::string("UTF-8\0", 6)), nullptr);  // keys are bytes
    EXPECT_EQ(insert(table, "UTF-8", &handle, &status), nullptr);
    EXPECT_EQ(status, NLSHOST_E_KEY_EXISTS);
    host->pools().fail_allocation_after(1);
    EXPECT_EQ(insert(table, "GB18030", &handle, &status), nullptr);
    EXPECT_EQ(status, NLSHOST_E_NO_MEMORY);
    EXPECT_NE(insert(table, "GB18030", &handle, &status), nullptr);
  }
  EXPECT_EQ(gCallbacks, 2);
}

TEST(HandleTable, EightThreadsUnderTheLock) {
  gCallbacks = 0;
  constexpr int kThreads = 8;
  constexpr int kRounds = 400;
  {
    auto host = nlssm::refhost::ReferenceHost::standalone(&count_callback);
    void *table = table_of(host->nls());
    void *lock = lock_of(host->nls());
    long counter = 0;  // guarded by the table lock only
    std::atomic<int> created{0};
    static int handles[kRounds];
    std::vector<std::thread> threads;
    for (int t = 0; t < kThreads; ++t) {
      threads.emplace_back([&, t] {
        for (int i = 0; i < kRounds; ++i) {
          // Every thread asks for the same keys: find, else insert, under the lock,
          // as the module's create does.
          const std::string key = "key" + std::to_string((i + t) % kRounds);
          call<NLSHostLockAcquireFn>(lock, NLSHOST_SLOT_LOCK_ACQUIRE, std::int64_t{1},
                                     std::int64_t{1});
          ++counter;
          void *entry = find(table, key);
          if (entry == nullptr) {
            std::int64_t status = -1;
            entry = insert(table, key, &handles[(i + t) % kRounds], &status);
            EXPECT_EQ(status, 0);
            ++created;
          }
          EXPECT_EQ(static_cast<NLSHostTableEntry *>(entry)->handle, &handles[(i + t) % kRounds]);
          release(table, entry);
          call<NLSHostLockReleaseFn>(lock, NLSHOST_SLOT_LOCK_RELEASE);
        }
      });
    }
    for (auto &thread : threads) thread.join();
    EXPECT_EQ(counter, kThreads * kRounds);
    EXPECT_EQ(created, kRounds);
  }
  EXPECT_EQ(gCallbacks, kRounds);
}
