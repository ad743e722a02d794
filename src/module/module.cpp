// The module constructor and the module object's version and destroy slots.
#include <nlssm/nlssm.h>

#include <cstring>

#include "module/host_access.hpp"

namespace {

constexpr std::uint32_t kOutOfMemory = NLSSM_E_NO_MEMORY;

template <typename Fn>
NLSSlot as_slot(Fn *function) {
  return reinterpret_cast<NLSSlot>(function);
}

}  // namespace

extern "C" NLSSMModule *qvnlssm(void *host, void *journal) {
  void *pool = nlssm::host::create_pool(host, NLSHOST_POOL_MODULE_FLAGS, journal, "qvnlssm pool");
  if (pool == nullptr) return nullptr;

  const nlssm::host::Pool modulePool{pool};
  auto *module =
      static_cast<NLSSMModule *>(modulePool.allocate(sizeof(NLSSMModule), NLSHOST_ALLOC_ZERO_FILL));
  if (module == nullptr) {
    if (journal != nullptr) qvlStatusToJnl(journal, NLSHOST_JOURNAL_LEVEL_ERROR, kOutOfMemory);
    modulePool.destroy();
    return nullptr;
  }

  module->pool = pool;
  std::memcpy(module->magic, "nevo", 4);
  module->host = host;
  module->reqVersion = as_slot(&reqVersion);
  module->version = as_slot(&version);
  module->realDestroy = as_slot(&NLSSMRealDestroy);
  module->create = as_slot(&NLSSMCreate);
  module->destroyCallback = as_slot(&NLSSMDestroyCallback);
  return module;
}

extern "C" int64_t reqVersion(NLSSMModule *, int64_t *major, int64_t *minor, int64_t *patch) {
  *major = 6;
  *minor = 1;
  *patch = 1;
  return 0;
}

extern "C" int64_t version(NLSSMModule *, int64_t *major, int64_t *minor, int64_t *patch) {
  *major = 6;
  *minor = 0;
  *patch = 0;
  return 0;
}

// The module object lives inside its own pool: destroying the pool frees it.
extern "C" int64_t NLSSMRealDestroy(NLSSMModule *module) {
  if (module != nullptr && module->pool != nullptr) nlssm::host::Pool{module->pool}.destroy();
  return 0;
}
