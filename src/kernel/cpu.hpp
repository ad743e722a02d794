// Processor features and run-time selection of instruction-set variants.
//
// A hot path that has vector variants gathers its functions in a table type
// (one function pointer per operation), defines one constant table per
// instruction set in its own translation unit, and selects among them with a
// Dispatch object:
//
//   inline constinit kernel::cpu::Dispatch<MyOps, 2> my_ops{
//       {{{Isa::avx2, &avx2::kMyOps}, {Isa::sse2, &sse2::kMyOps}}}};
//   my_ops.get().operation(...);
//
// The variant for a wider instruction set lives in a translation unit whose
// code sits between NLSSM_TARGET_AVX2_BEGIN and NLSSM_TARGET_AVX2_END, so the
// rest of the module stays at the x86-64 baseline (SSE2).
#pragma once

#include <array>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <span>

namespace kernel::cpu {

// Instruction sets a hot path may have a variant for, weakest first.
// avx512vbmi: AVX-512 F and BW with the byte permutes (VBMI).
// avx512vbmi2: the same with byte and word compress (VBMI2), BMI2 and popcnt.
enum class Isa : uint8_t { sse2, avx2, avx512vbmi, avx512vbmi2 };

inline constexpr std::array<Isa, 4> kAllIsas{Isa::sse2, Isa::avx2, Isa::avx512vbmi,
                                             Isa::avx512vbmi2};

// True when this processor and operating system run code built for `isa`.
// Detected once; safe to call from any thread at any time.
bool supports(Isa isa) noexcept;
const char *name(Isa isa) noexcept;

// The data caches one core sees, in bytes. `llc` is the whole last level,
// which the cores sharing it compete for; on a processor with two levels it
// is the second.
struct Caches {
  int64_t l1d;
  int64_t l2;
  int64_t llc;
  int64_t line;
};

// Read from the processor's cache descriptors, else from the C library;
// levels neither reports get typical sizes. Detected once, when the module
// is loaded.
const Caches &caches() noexcept;

// True when the processor's string instructions (rep movsb, rep stosb) move
// whole cache lines at a time (enhanced rep movsb/stosb).
bool fast_string_ops() noexcept;

// Block operations from these sizes on use the string instructions, where
// the processor has fast ones (else never): a copy once its source and
// destination no longer fit the first-level cache together, a fill once it
// no longer fits the second level. Below, the vector loops are faster.
int64_t string_copy_min() noexcept;
int64_t string_fill_min() noexcept;

// Block operations of at least this many bytes write with non-temporal
// stores: their destination (and a copy's source besides) cannot stay in the
// last-level cache, so storing through it would evict everything else and
// first read every line it is about to replace.
int64_t stream_copy_min() noexcept;
int64_t stream_fill_min() noexcept;

template <typename Table>
struct Variant {
  Isa isa;
  const Table *table;
};

// A set of variants of one operation table, best first. The first variant the
// processor supports is chosen on first use and kept. Threads that race on
// the first use all store the same pointer, so a relaxed atomic is enough:
// the tables are constants and publish no other data.
template <typename Table, std::size_t N>
class Dispatch {
 public:
  constexpr explicit Dispatch(const std::array<Variant<Table>, N> &variants)
      : variants_(variants) {}

  const Table &get() const noexcept {
    const Table *table = chosen_.load(std::memory_order_relaxed);
    if (table == nullptr) [[unlikely]]
      table = choose();
    return *table;
  }

  // Every variant, best first; tests and benchmarks filter by supports().
  std::span<const Variant<Table>, N> variants() const noexcept { return variants_; }

 private:
  const Table *choose() const noexcept {
    const Table *table = variants_[N - 1].table;
    for (const auto &variant : variants_) {
      if (supports(variant.isa)) {
        table = variant.table;
        break;
      }
    }
    chosen_.store(table, std::memory_order_relaxed);
    return table;
  }

  std::array<Variant<Table>, N> variants_;
  mutable std::atomic<const Table *> chosen_{nullptr};
};

}  // namespace kernel::cpu

// Compile the functions between these markers for AVX2 (templates included,
// so a template over an AVX2 vector policy must be defined inside a region).
// Headers with inline non-template functions must be included before the
// region, or their out-of-line copies could be built for the wrong processor.
#if defined(__clang__)
#define NLSSM_TARGET_AVX2_BEGIN \
  _Pragma("clang attribute push(__attribute__((target(\"avx2\"))), apply_to = function)")
#define NLSSM_TARGET_AVX2_END _Pragma("clang attribute pop")
#else
#define NLSSM_TARGET_AVX2_BEGIN _Pragma("GCC push_options") _Pragma("GCC target(\"avx2\")")
#define NLSSM_TARGET_AVX2_END _Pragma("GCC pop_options")
#endif

// The same for AVX-512 code with byte permutes.
#if defined(__clang__)
#define NLSSM_TARGET_AVX512VBMI_BEGIN \
  _Pragma(                            \
      "clang attribute push(__attribute__((target(\"avx512f,avx512bw,avx512vbmi\"))), \
  apply_to = function)")
#define NLSSM_TARGET_AVX512VBMI_END _Pragma("clang attribute pop")
#else
#define NLSSM_TARGET_AVX512VBMI_BEGIN \
  _Pragma("GCC push_options") _Pragma("GCC target(\"avx512f,avx512bw,avx512vbmi\")")
#define NLSSM_TARGET_AVX512VBMI_END _Pragma("GCC pop_options")
#endif

// The same for AVX-512 code that also compresses bytes and words.
#if defined(__clang__)
#define NLSSM_TARGET_AVX512VBMI2_BEGIN \
  _Pragma(                             \
      "clang attribute push(__attribute__((target(\"avx512f,avx512bw,avx512vbmi,avx512vbmi2,\
bmi,bmi2,popcnt\"))), apply_to = function)")
#define NLSSM_TARGET_AVX512VBMI2_END _Pragma("clang attribute pop")
#else
// GCC 12's AVX-512 headers start their unmasked forms from a deliberately
// undefined vector, which its flow analysis then reports.
#define NLSSM_TARGET_AVX512VBMI2_BEGIN                                                   \
  _Pragma("GCC push_options")                                                            \
      _Pragma("GCC target(\"avx512f,avx512bw,avx512vbmi,avx512vbmi2,bmi,bmi2,popcnt\")") \
          _Pragma("GCC diagnostic push")                                                 \
              _Pragma("GCC diagnostic ignored \"-Wmaybe-uninitialized\"")
#define NLSSM_TARGET_AVX512VBMI2_END _Pragma("GCC diagnostic pop") _Pragma("GCC pop_options")
#endif
