// Pieces of the reference host shared between its source files.
#pragma once

#include <atomic>
#include <cstdint>
#include <mutex>
#include <string>
#include <vector>

#include "nlssm/reference_host.hpp"
#include "objects.hpp"

namespace nlssm::refhost {

// Live host objects other than pools, for leak checks.
struct ObjectCounters {
  std::atomic<std::int64_t> converters{0};
  std::atomic<std::int64_t> locales{0};
};

// ---- Converters ----------------------------------------------------------------

// Converts whole texts from one described encoding into another, through
// UTF-16. Returns a host status; `produced` gets the bytes written.
class Transcoder {
 public:
  Transcoder(const EncodingInfo &from, const EncodingInfo &to);
  ~Transcoder();
  Transcoder(const Transcoder &) = delete;
  Transcoder &operator=(const Transcoder &) = delete;
  bool ok() const { return ok_; }

  std::uint32_t convert(const std::uint8_t *source, std::size_t sourceBytes,
                        std::uint8_t *destination, std::size_t capacity, std::size_t &produced);
  // The converted size without writing anything.
  std::uint32_t size(const std::uint8_t *source, std::size_t sourceBytes, std::size_t &size);

 private:
  std::uint32_t run(const std::uint8_t *source, std::size_t sourceBytes, std::string &out,
                    std::vector<std::int32_t> &offsets);
  struct Side;
  std::mutex mutex_;  // ICU converters hold state: one conversion at a time
  Side *from_;
  Side *to_;
  bool ok_ = false;
};

// The converter object handed to the module (slots 2 destroy, 4 convert).
// A converter owned by the NLS object, for encodings that need no
// conversion between them: callers may use and "destroy" it freely; the NLS
// object releases it. Not counted among live converters.
void *new_shared_converter_object(const EncodingInfo &from, const EncodingInfo &to);
void destroy_shared_converter_object(void *object);
void *new_converter_object(const EncodingInfo &from, const EncodingInfo &to,
                           ObjectCounters &counters);

// ---- Character queries ------------------------------------------------------------

std::int64_t char_info(std::uint32_t character, NLSHostCharInfo *info);
std::uint32_t fold_char(std::uint32_t character, std::int64_t options);
// The object kept in the service object's word 27 (slot 32 folds).
void *char_object();

// ---- UTF transcoders (slots 24-29 of the NLS object) --------------------------------

std::int64_t intermediate_to_code_point(void *, const void *, std::uint64_t, void *, std::uint64_t,
                                        std::uint64_t *, void *, void *);
std::int64_t code_point_to_intermediate(void *, const void *, std::uint64_t, void *, std::uint64_t,
                                        std::uint64_t *, void *, void *);
std::int64_t intermediate_to_utf8(void *, const void *, std::uint64_t, void *, std::uint64_t,
                                  std::uint64_t *, void *, void *);
std::int64_t utf8_to_intermediate(void *, const void *, std::uint64_t, void *, std::uint64_t,
                                  std::uint64_t *, void *, void *);
std::int64_t intermediate_to_utfe(void *, const void *, std::uint64_t, void *, std::uint64_t,
                                  std::uint64_t *, void *, void *);
std::int64_t utfe_to_intermediate(void *, const void *, std::uint64_t, void *, std::uint64_t,
                                  std::uint64_t *, void *, void *);

// ---- Locales ---------------------------------------------------------------------

// A locale object for an ICU locale name ("en_US"), or null when ICU has no
// data for it.
void *new_locale_object(const std::string &name, ObjectCounters &counters);

// ---- Handle table and lock ------------------------------------------------------------

class PoolRegistry;
void *new_table_object(PoolRegistry &pools);
// Passes every entry to `destroyCallback` (when not null), then frees the table.
void destroy_table_object(void *table, std::int64_t (*destroyCallback)(void *entry));
void *new_lock_object();
void destroy_lock_object(void *lock);

// ---- NLS object ---------------------------------------------------------------------

void *new_nls_object(PoolRegistry &pools, ObjectCounters &counters);
// Sets the module object whose destroy callback receives the table entries.
void set_nls_module(void *nls, void *module, std::int64_t (*destroyCallback)(void *entry));
void destroy_nls_object(void *nls);

}  // namespace nlssm::refhost
