// Pools: accounting, zero fill, destroy, fault injection, and the host's
// start and stop around the module.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <thread>
#include <vector>

#include "host_test_support.hpp"

using namespace hosttest;
using nlssm::refhost::PoolRegistry;
using nlssm::refhost::ReferenceHost;

namespace {

void *allocate(void *pool, std::uint64_t size, std::uint32_t flags = 0) {
  return call<NLSHostPoolAllocateFn>(pool, NLSHOST_SLOT_POOL_ALLOCATE, size, flags);
}
void release(void *pool, void *memory) {
  call<NLSHostPoolFreeFn>(pool, NLSHOST_SLOT_POOL_FREE, memory);
}
void destroy(void *pool) {
  call<NLSHostPoolDestroyFn>(pool, NLSHOST_SLOT_POOL_DESTROY);
}

void *create_through_service(ReferenceHost &host, std::uint32_t flags, const char *name) {
  NLSHostPoolOptions options{};
  options.flags = flags;
  return call<NLSHostCreatePoolFn>(host.service(), NLSHOST_SLOT_CREATE_POOL,
                                   static_cast<const NLSHostPoolOptions *>(&options),
                                   static_cast<void *>(nullptr), name);
}

}  // namespace

TEST(Pools, CountAllocationsAndReleaseThemOnDestroy) {
  auto host = standalone();
  void *pool = create_through_service(*host, 0x800000, "test pool");
  ASSERT_NE(pool, nullptr);
  EXPECT_EQ(PoolRegistry::name_of(pool), "test pool");
  EXPECT_EQ(PoolRegistry::option_flags_of(pool), 0x800000u);

  auto *zeroed = static_cast<unsigned char *>(allocate(pool, 100, NLSHOST_ALLOC_ZERO_FILL));
  ASSERT_NE(zeroed, nullptr);
  EXPECT_EQ(std::count(zeroed, zeroed + 100, 0), 100);
  void *other = allocate(pool, 28);
  EXPECT_EQ(PoolRegistry::counts_of(pool).allocations, 2);
  EXPECT_EQ(PoolRegistry::counts_of(pool).bytes, 128);
  release(pool, other);
  release(pool, nullptr);
  EXPECT_EQ(host->pools().counts().allocations, 1);
  EXPECT_EQ(host->pools().counts().bytes, 100);

  allocate(pool, 5);
  destroy(pool);
  const auto counts = host->pools().counts();
  EXPECT_EQ(counts.pools, 0);
  EXPECT_EQ(counts.allocations, 0);
  EXPECT_EQ(counts.bytes, 0);
}

TEST(Pools, FaultInjection) {
  auto host = standalone();
  PoolRegistry &pools = host->pools();
  void *pool = create_through_service(*host, 0, "faults");
  pools.fail_allocation_after(3);
  EXPECT_NE(allocate(pool, 8), nullptr);
  EXPECT_NE(allocate(pool, 8), nullptr);
  EXPECT_EQ(allocate(pool, 8), nullptr);  // the third
  EXPECT_NE(allocate(pool, 8), nullptr);  // and only the third
  pools.fail_all_allocations(true);
  EXPECT_EQ(allocate(pool, 8), nullptr);
  EXPECT_EQ(allocate(pool, 8), nullptr);
  pools.fail_all_allocations(false);
  EXPECT_NE(allocate(pool, 8), nullptr);
  EXPECT_EQ(pools.counts().allocations, 4);

  pools.fail_pool_creation_after(1);
  EXPECT_EQ(create_through_service(*host, 0, "refused"), nullptr);
  void *second = create_through_service(*host, 0, "accepted");
  EXPECT_NE(second, nullptr);
  pools.fail_all_pool_creations(true);
  EXPECT_EQ(create_through_service(*host, 0, "refused"), nullptr);
  EXPECT_EQ(pools.counts().pools, 2);
  destroy(second);
  destroy(pool);
}

TEST(Pools, EightThreadsShareOnePool) {
  auto host = standalone();
  void *pool = create_through_service(*host, 0, "shared");
  std::vector<std::thread> threads;
  for (int t = 0; t < 8; ++t) {
    threads.emplace_back([pool, t] {
      std::vector<void *> blocks;
      for (int i = 0; i < 2000; ++i) {
        blocks.push_back(allocate(pool, static_cast<std::uint64_t>(t + i % 64)));
        if (i % 3 == 0) {
          release(pool, blocks.back());
          blocks.pop_back();
        }
      }
      for (void *b : blocks) release(pool, b);
    });
  }
  for (auto &thread : threads) thread.join();
  EXPECT_EQ(host->pools().counts().allocations, 0);
  EXPECT_EQ(host->pools().counts().bytes, 0);
  destroy(pool);
}

TEST(HostStart, StartsTheModuleAndStopsIt) {
  auto host = ReferenceHost::start(nlssm::refhost::linked_module());
  ASSERT_NE(host->module(), nullptr);
  EXPECT_EQ(std::memcmp(host->module(), "nevo", 4), 0);
  EXPECT_EQ(Exported_QVHandle, host->service());
  // The module pool holds the module object.
  EXPECT_EQ(host->pools().counts().pools, 1);
  EXPECT_EQ(host->pools().counts().bytes, 96);
}

TEST(Journal, FormatsAndKeepsMessages) {
  auto host = standalone();
  void *journal = host->journal_object();
  qvlMessageToJnl(journal, 7, const_cast<char *>("%s=%d"), nullptr, "width", 12);
  qvlStatusToJnl(journal, 2, NLSSM_E_ENCODING);
  const auto records = host->journal().records();
  ASSERT_EQ(records.size(), 2u);
  EXPECT_EQ(records[0].text, "width=12");
  EXPECT_EQ(records[1].status, NLSSM_E_ENCODING);
  char buffer[64];
  std::int64_t length = 0;
  EXPECT_EQ(
      qvlStatusToBuf(journal, NLSSM_E_NO_MEMORY, buffer, reinterpret_cast<void *>(64), &length), 0);
  EXPECT_STREQ(buffer, "status 0x803fc002: out of memory");
  EXPECT_EQ(
      qvlStatusToBuf(journal, NLSSM_E_NO_MEMORY, buffer, reinterpret_cast<void *>(8), &length),
      NLSHOST_E_TOO_SMALL);
  EXPECT_STREQ(buffer, "status ");
}
