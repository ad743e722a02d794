// Every handle's operation slots hold exactly the members the operation
// table names for its class and encoding: a slot whose member the library
// exports must hold it, and a slot whose member is not exported stays null.
// The handles come from the shared library, so that member names resolve
// to the addresses in the slots.
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <set>

#include "operation_slots.hpp"

namespace {

using nlssm::refhost::ReferenceHost;

TEST(OperationTable, EverySlotHoldsTheMemberItsClassNames) {
  void *library = dlopen(NLSSM_SHARED_LIBRARY, RTLD_NOW | RTLD_LOCAL);
  ASSERT_NE(library, nullptr) << dlerror();
  nlssm::refhost::ModuleEntry entry;
  entry.extent = reinterpret_cast<int64_t (*)(void *)>(dlsym(library, "qvextent"));
  entry.construct = reinterpret_cast<void *(*)(void *, void *)>(dlsym(library, "qvnlssm"));
  ASSERT_TRUE(entry.extent && entry.construct);

  const auto rows = nlssm::testing::load_operation_slots(NLSSM_OPERATION_SLOTS);
  ASSERT_EQ(rows.size(), 103u);
  std::set<int> tableSlots;
  for (const auto &row : rows) tableSlots.insert(row.slot);
  {
    auto host = ReferenceHost::start(entry);
    size_t filled = 0;
    for (const auto &info : ReferenceHost::registry().rows()) {
      if (!info.described) continue;
      NLSSMHandle *handle = nullptr;
      ASSERT_EQ(host->create_handle(info.number, &handle), 0);
      auto *words = reinterpret_cast<void *const *>(handle);
      for (const auto &row : rows) {
        const std::string name =
            nlssm::testing::expected_member(row.cells[handle->encodingClass], *handle);
        void *member = name.empty() ? nullptr : dlsym(library, name.c_str());
        EXPECT_EQ(words[row.slot], member)
            << "encoding " << info.number << " slot " << row.slot << " expects " << name;
        filled += member != nullptr;
      }
      for (int w : {22, 82, 83, 84, 85, 119, 120, 171, 172, 173, 174, 175})
        EXPECT_EQ(words[w], nullptr) << "encoding " << info.number << " word " << w;
    }
    EXPECT_GT(filled, 0u);
  }
  dlclose(library);
}

}  // namespace
