// The reference host: a complete host for the nlssm module built on ICU, for
// tests, tools, benchmarks and programs that embed the module on its own.
//
//   #include <nlssm/nlssm.h>
//   #include <nlssm/reference_host.hpp>
//
//   auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
//   NLSSMHandle *latin1 = nullptr;
//   host->create_handle(29, &latin1);
//   ...
//   host.reset();  // drops every handle, then destroys the module object
//
// The host library does not link the module: start() takes the module's two
// entry points, and linked_module() names the ones linked into the program.
#pragma once

#include <nlssm/host.h>

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace nlssm::refhost {

// ---- Pools ---------------------------------------------------------------------

struct PoolCounts {
  std::int64_t pools = 0;        // live pools
  std::int64_t allocations = 0;  // live allocations
  std::int64_t bytes = 0;        // bytes in live allocations
};

// Every pool the host creates, with accounting and fault injection. Thread-safe.
class PoolRegistry {
 public:
  PoolRegistry();
  ~PoolRegistry();  // releases pools still alive
  PoolRegistry(const PoolRegistry &) = delete;
  PoolRegistry &operator=(const PoolRegistry &) = delete;

  // A new pool object (slots 2 destroy, 3 allocate, 4 free), or null when
  // pool creation is set to fail.
  void *create(std::string_view name, std::uint32_t optionFlags);

  PoolCounts counts() const;
  // Allocations and bytes live in one pool (which must be alive).
  static PoolCounts counts_of(const void *pool);
  static std::string name_of(const void *pool);
  static std::uint32_t option_flags_of(const void *pool);

  // Fault injection: the nth allocation from now fails (1 = the next one);
  // 0 clears it. fail_all_allocations makes every allocation fail until
  // cleared. The same for pool creation. Handle-table insertions count as
  // allocations.
  void fail_allocation_after(std::int64_t nth);
  void fail_all_allocations(bool on);
  void fail_pool_creation_after(std::int64_t nth);
  void fail_all_pool_creations(bool on);
  // True when the next allocation is to fail (consumes one countdown step).
  bool allocation_fails();

  struct State;

 private:
  std::unique_ptr<State> state_;
};

// ---- Journal ---------------------------------------------------------------------

struct JournalRecord {
  enum class Kind { Status, Message } kind;
  std::uint32_t number;  // level (statuses) or message number
  std::uint32_t status;  // statuses only
  std::string text;      // messages only
};

// The journal object (message and status slots 2, 3, 4, 5, 7). It keeps what
// is written to it so that callers can read it back.
class Journal {
 public:
  Journal();
  ~Journal();
  Journal(const Journal &) = delete;
  Journal &operator=(const Journal &) = delete;

  void *object();
  std::vector<JournalRecord> records() const;
  void clear();

  struct State;

 private:
  std::unique_ptr<State> state_;
};

// ---- Encoding registry -------------------------------------------------------------

struct EncodingInfo {
  int number = 0;
  bool described = false;  // describe succeeds for it
  std::string name;        // "-" when the number has no encoding
  std::string aliases;     // comma-separated
  std::string tableSet;    // the catalogue's table set for the number
  int encodingClass = -1;
  bool ascii = false;
  std::uint32_t blankValue = 0;
  int numberForm = 0;
  std::string converter;  // ICU name, "builtin:utf-ebcdic", or "-"
  std::string title;
  std::string reason;  // why describing fails, when it does
  NLSHostEncodingRecord record{};
};

// The registry: one row per encoding number 0..264.
class Registry {
 public:
  static const Registry &instance();
  const EncodingInfo *find(std::int64_t number) const;  // null outside 0..264
  // The number whose name or alias matches (case-insensitive), or -1.
  int lookup(std::string_view name) const;
  const std::vector<EncodingInfo> &rows() const { return rows_; }

 private:
  Registry();
  std::vector<EncodingInfo> rows_;
};

// ---- The NLS object ------------------------------------------------------------------

struct ObjectCounts {
  std::int64_t converters = 0;  // live converter objects
  std::int64_t locales = 0;     // live locale objects
};

// ---- The whole host --------------------------------------------------------------

// The module's entry points the host calls at start.
struct ModuleEntry {
  std::int64_t (*extent)(void *service) = nullptr;          // qvextent
  void *(*construct)(void *host, void *journal) = nullptr;  // qvnlssm
};

class ReferenceHost {
 public:
  // Builds the service object, journal and NLS object, hands the service
  // object to the module (qvextent), creates the module object (qvnlssm)
  // and wires the NLS object to it. When the module object cannot be created
  // the host is returned without one: module() is null and the journal tells
  // why. One started host per module at a time (the module keeps the service
  // object in one global).
  // `prepare`, when given, runs on the host before the module object is
  // created (to set fault injection, for example).
  static std::unique_ptr<ReferenceHost> start(const ModuleEntry &module,
                                              void (*prepare)(ReferenceHost &) = nullptr);
  // A host without a module: its NLS object passes table entries to
  // `destroyCallback` when it is destroyed (may be null).
  static std::unique_ptr<ReferenceHost> standalone(std::int64_t (*destroyCallback)(void *entry));
  // Stop: destroys the NLS object (every table entry goes to the module's
  // destroy callback), then the module object (its realDestroy slot).
  ~ReferenceHost();
  ReferenceHost(const ReferenceHost &) = delete;
  ReferenceHost &operator=(const ReferenceHost &) = delete;

  void *service();  // host object and exported service object (slot 6, word 27)
  void *journal_object() { return journal_.object(); }
  void *nls();  // the NLS object
  void *module() { return module_; }

  // The module object's create slot for this NLS object.
  std::int64_t create_handle(std::int64_t encoding, void *outHandle, void *reserved = nullptr);

  PoolRegistry &pools() { return pools_; }
  Journal &journal() { return journal_; }
  ObjectCounts object_counts() const;
  static const Registry &registry() { return Registry::instance(); }

  struct Parts;

 private:
  ReferenceHost();
  PoolRegistry pools_;
  Journal journal_;
  std::unique_ptr<Parts> parts_;
  void *module_ = nullptr;
};

}  // namespace nlssm::refhost

// The entry points of the module linked into the program (needs nlssm.h).
#ifdef NLSSM_NLSSM_H
namespace nlssm::refhost {
inline ModuleEntry linked_module() {
  ModuleEntry entry;
  entry.extent = [](void *service) -> std::int64_t { return qvextent(service); };
  entry.construct = [](void *host, void *journal) -> void * { return qvnlssm(host, journal); };
  return entry;
}
}  // namespace nlssm::refhost
#endif
