// Starting and stopping the whole host around the module.
#include "internal.hpp"

namespace nlssm::refhost {

namespace {

// The host object given to qvnlssm and the exported service object kept by
// qvextent: slot 6 creates pools, word 27 is the character object.
struct ServiceObject {
  SlotWords<28> slots;
  PoolRegistry *pools = nullptr;
};

void *create_pool(void *host, const NLSHostPoolOptions *options, void *, const char *name) {
  return self<ServiceObject>(host)->pools->create(name != nullptr ? name : "",
                                                  options != nullptr ? options->flags : 0);
}

using EntryCallback = std::int64_t (*)(void *entry);
using ModuleCreate = std::int64_t (*)(void *nls, std::int64_t encoding, void *reserved,
                                      void *outHandle);
using ModuleDestroy = std::int64_t (*)(void *module);

constexpr int kModuleWordRealDestroy = 6;
constexpr int kModuleWordCreate = 10;
constexpr int kModuleWordDestroyCallback = 11;

}  // namespace

struct ReferenceHost::Parts {
  ServiceObject service;
  ObjectCounters counters;
  void *nls = nullptr;
};

ReferenceHost::ReferenceHost() : parts_(std::make_unique<Parts>()) {
  parts_->service.pools = &pools_;
  parts_->service.slots.set(NLSHOST_SLOT_CREATE_POOL, &create_pool);
  parts_->service.slots.words[NLSHOST_SERVICE_WORD_CHAR_OBJECT] = char_object();
  parts_->nls = new_nls_object(pools_, parts_->counters);
}

std::unique_ptr<ReferenceHost> ReferenceHost::start(const ModuleEntry &entry,
                                                    void (*prepare)(ReferenceHost &)) {
  if (entry.extent == nullptr || entry.construct == nullptr) return nullptr;
  std::unique_ptr<ReferenceHost> host(new ReferenceHost);
  if (prepare != nullptr) prepare(*host);
  entry.extent(host->service());
  host->module_ = entry.construct(host->service(), host->journal_object());
  if (host->module_ == nullptr) return host;
  set_nls_module(
      host->nls(), host->module_,
      reinterpret_cast<EntryCallback>(NLSSM_HOST_SLOT(host->module_, kModuleWordDestroyCallback)));
  return host;
}

std::unique_ptr<ReferenceHost> ReferenceHost::standalone(std::int64_t (*destroyCallback)(void *)) {
  std::unique_ptr<ReferenceHost> host(new ReferenceHost);
  set_nls_module(host->nls(), nullptr, destroyCallback);
  return host;
}

ReferenceHost::~ReferenceHost() {
  destroy_nls_object(parts_->nls);
  if (module_ != nullptr)
    reinterpret_cast<ModuleDestroy>(NLSSM_HOST_SLOT(module_, kModuleWordRealDestroy))(module_);
}

void *ReferenceHost::service() {
  return &parts_->service;
}

void *ReferenceHost::nls() {
  return parts_->nls;
}

std::int64_t ReferenceHost::create_handle(std::int64_t encoding, void *outHandle, void *reserved) {
  if (module_ == nullptr) return NLSHOST_E_NULL;
  auto create = reinterpret_cast<ModuleCreate>(NLSSM_HOST_SLOT(module_, kModuleWordCreate));
  return create(parts_->nls, encoding, reserved, outHandle);
}

ObjectCounts ReferenceHost::object_counts() const {
  return {parts_->counters.converters.load(), parts_->counters.locales.load()};
}

}  // namespace nlssm::refhost
