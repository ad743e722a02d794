// The module constructor, its object, the version queries and destruction,
// driven through a small host whose pools can be made to fail.
#include <gtest/gtest.h>
#include <nlssm/host.h>
#include <nlssm/nlssm.h>

#include <cstdarg>
#include <cstring>
#include <string>
#include <vector>

namespace {

// A recording host: pools of malloc'd blocks, a journal that keeps statuses.
struct FakePool {
  void *slots[8] = {};
  std::vector<void *> blocks;
  struct FakeHost *host;
};

struct FakeHost {
  void *slots[8] = {};
  bool failPoolCreation = false;
  bool failAllocation = false;
  int poolsAlive = 0;
  std::vector<std::string> poolNames;
  std::vector<uint32_t> poolFlags;
};

struct FakeJournal {
  void *slots[8] = {};
  std::vector<std::pair<uint32_t, uint32_t>> entries;  // (level, status)
};

void pool_destroy(void *self) {
  auto *pool = static_cast<FakePool *>(self);
  for (void *block : pool->blocks) std::free(block);
  pool->host->poolsAlive--;
  delete pool;
}

void *pool_allocate(void *self, uint64_t size, uint32_t flags) {
  auto *pool = static_cast<FakePool *>(self);
  if (pool->host->failAllocation) return nullptr;
  void *block = (flags & NLSHOST_ALLOC_ZERO_FILL) ? std::calloc(1, size) : std::malloc(size);
  if (!(flags & NLSHOST_ALLOC_ZERO_FILL)) std::memset(block, 0xA5, size);  // poison
  pool->blocks.push_back(block);
  return block;
}

void pool_free(void *, void *) {}

void *create_pool(void *self, const NLSHostPoolOptions *options, void *, const char *name) {
  auto *host = static_cast<FakeHost *>(self);
  if (host->failPoolCreation) return nullptr;
  auto *pool = new FakePool;
  pool->host = host;
  pool->slots[NLSHOST_SLOT_POOL_DESTROY] = reinterpret_cast<void *>(&pool_destroy);
  pool->slots[NLSHOST_SLOT_POOL_ALLOCATE] = reinterpret_cast<void *>(&pool_allocate);
  pool->slots[NLSHOST_SLOT_POOL_FREE] = reinterpret_cast<void *>(&pool_free);
  host->poolsAlive++;
  host->poolNames.emplace_back(name);
  host->poolFlags.push_back(options->flags);
  return pool;
}

int64_t status_to_journal(void *self, uint32_t level, uint32_t status, va_list) {
  static_cast<FakeJournal *>(self)->entries.emplace_back(level, status);
  return 0;
}

class ModuleEntry : public ::testing::Test {
 protected:
  void SetUp() override {
    host.slots[NLSHOST_SLOT_CREATE_POOL] = reinterpret_cast<void *>(&create_pool);
    journal.slots[NLSHOST_SLOT_STATUS_TO_JNL] = reinterpret_cast<void *>(&status_to_journal);
  }
  FakeHost host;
  FakeJournal journal;
};

TEST_F(ModuleEntry, BuildsTheModuleObjectInItsOwnPool) {
  NLSSMModule *module = qvnlssm(&host, &journal);
  ASSERT_NE(module, nullptr);
  EXPECT_EQ(std::memcmp(module->magic, "nevo\0\0\0\0", 8), 0);
  EXPECT_EQ(module->host, &host);
  EXPECT_NE(module->pool, nullptr);
  EXPECT_EQ(module->reqVersion, reinterpret_cast<NLSSlot>(&reqVersion));
  EXPECT_EQ(module->version, reinterpret_cast<NLSSlot>(&version));
  EXPECT_EQ(module->realDestroy, reinterpret_cast<NLSSlot>(&NLSSMRealDestroy));
  EXPECT_EQ(module->create, reinterpret_cast<NLSSlot>(&NLSSMCreate));
  EXPECT_EQ(module->destroyCallback, reinterpret_cast<NLSSlot>(&NLSSMDestroyCallback));
  // Unnamed words are zero even though the pool poisons plain allocations.
  EXPECT_EQ(module->reserved1[0], nullptr);
  EXPECT_EQ(module->reserved1[1], nullptr);
  EXPECT_EQ(module->reserved7[0], nullptr);
  EXPECT_EQ(module->reserved7[1], nullptr);
  ASSERT_EQ(host.poolNames.size(), 1u);
  EXPECT_EQ(host.poolNames[0], "qvnlssm pool");
  EXPECT_EQ(host.poolFlags[0], 0x800000u);

  EXPECT_EQ(NLSSMRealDestroy(module), 0);
  EXPECT_EQ(host.poolsAlive, 0);
  EXPECT_TRUE(journal.entries.empty());
}

TEST_F(ModuleEntry, PoolCreationFailureIsSilent) {
  host.failPoolCreation = true;
  EXPECT_EQ(qvnlssm(&host, &journal), nullptr);
  EXPECT_TRUE(journal.entries.empty());
}

TEST_F(ModuleEntry, AllocationFailureIsJournalledAndThePoolDestroyed) {
  host.failAllocation = true;
  EXPECT_EQ(qvnlssm(&host, &journal), nullptr);
  ASSERT_EQ(journal.entries.size(), 1u);
  EXPECT_EQ(journal.entries[0].first, 4u);
  EXPECT_EQ(journal.entries[0].second, 0x803fc002u);
  EXPECT_EQ(host.poolsAlive, 0);

  // Without a journal the failure is only the null result.
  EXPECT_EQ(qvnlssm(&host, nullptr), nullptr);
  EXPECT_EQ(host.poolsAlive, 0);
}

TEST_F(ModuleEntry, VersionsIgnoreTheModuleArgument) {
  int64_t v[3] = {-1, -1, -1};
  EXPECT_EQ(reqVersion(nullptr, &v[0], &v[1], &v[2]), 0);
  EXPECT_EQ(std::vector<int64_t>(v, v + 3), (std::vector<int64_t>{6, 1, 1}));
  EXPECT_EQ(version(nullptr, &v[0], &v[1], &v[2]), 0);
  EXPECT_EQ(std::vector<int64_t>(v, v + 3), (std::vector<int64_t>{6, 0, 0}));
}

TEST_F(ModuleEntry, RealDestroyToleratesMissingModuleOrPool) {
  EXPECT_EQ(NLSSMRealDestroy(nullptr), 0);
  NLSSMModule empty{};
  EXPECT_EQ(NLSSMRealDestroy(&empty), 0);
}

TEST(VersionRecord, CopiesExactly208Bytes) {
  unsigned char buffer[208 + 16];
  std::memset(buffer, 0xEE, sizeof buffer);
  qvvercn1(buffer);
  for (size_t i = 208; i < sizeof buffer; ++i) ASSERT_EQ(buffer[i], 0xEE) << "byte " << i;

  NLSSMVersionInfo info;
  std::memcpy(&info, buffer, sizeof info);
  EXPECT_STREQ(info.version, "V.03.01M0P09072016");
  for (uint64_t word : info.reserved) EXPECT_EQ(word, 0u);
}

}  // namespace
