// Allocation-failure sweep: every operation that can take memory from a
// pool runs with the reference host refusing its 1st, 2nd, ... allocation
// until a run meets no refusal. Each run must answer what the operation
// documents for a refusal (or, where it falls back to its stack area, the
// answer for that smaller room) and give back every allocation it made.
#include <gtest/gtest.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstring>
#include <memory>
#include <string>
#include <vector>

namespace {

using nlssm::refhost::ReferenceHost;
using Bytes = std::vector<uint8_t>;
using TranslitFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, const uint8_t *, int64_t, int64_t, uint8_t *, int64_t,
                               int64_t *, int64_t);

constexpr int64_t kNoMemory = NLSSM_E_NO_MEMORY;
constexpr int kWcs2Be = NLSSM_ENC_WCS2_BE;
constexpr int kLatin1 = 29;
constexpr int kModal = 129;

template <typename Fn>
Fn slot(NLSSlot s) {
  return reinterpret_cast<Fn>(s);
}

// True when the run met the refusal set for its nth allocation. The
// countdown left over (when it did not) is used up here, so that it cannot
// fire later.
bool refusal_met(ReferenceHost &host, int nth) {
  for (int i = 0; i < nth; ++i)
    if (host.pools().allocation_fails()) return false;
  return true;
}

// Runs `run` with the nth allocation refused for nth = 1, 2, ... until a run
// meets no refusal; `check(result, refused)` judges each run. At least one
// run must meet a refusal.
template <typename Run, typename Check>
void sweep(ReferenceHost &host, Run run, Check check) {
  for (int nth = 1; nth < 200; ++nth) {
    SCOPED_TRACE("refusing allocation " + std::to_string(nth));
    const int64_t live = host.pools().counts().allocations;
    host.pools().fail_allocation_after(nth);
    const auto result = run();
    const bool refused = refusal_met(host, nth);
    host.pools().fail_allocation_after(0);
    EXPECT_EQ(host.pools().counts().allocations, live);
    check(result, refused);
    if (!refused) {
      EXPECT_GE(nth, 2) << "no allocation to refuse";
      return;
    }
  }
  ADD_FAILURE() << "never ran without a refusal";
}

// ---- Handle creation -------------------------------------------------------------

class CreationSweep : public ::testing::TestWithParam<int> {};

TEST_P(CreationSweep, RefusedAllocationOrPoolFailsCleanly) {
  // A handle is made once per encoding and host, so every run starts a host.
  int runs = 0;
  for (int nth = 1; nth < 400; ++nth) {
    auto host = ReferenceHost::start(nlssm::refhost::linked_module());
    ASSERT_NE(host->module(), nullptr);
    const nlssm::refhost::PoolCounts before = host->pools().counts();
    host->pools().fail_allocation_after(nth);
    NLSSMHandle *h = nullptr;
    const int64_t status = host->create_handle(GetParam(), &h);
    const bool refused = refusal_met(*host, nth);
    host->pools().fail_allocation_after(0);
    if (!refused) {
      EXPECT_EQ(status, 0);
      EXPECT_NE(h, nullptr);
      break;
    }
    ++runs;
    EXPECT_EQ(status, kNoMemory) << "refusing allocation " << nth;
    EXPECT_EQ(h, nullptr);
    EXPECT_EQ(host->pools().counts().allocations, before.allocations) << "allocation " << nth;
    EXPECT_EQ(host->pools().counts().pools, before.pools) << "allocation " << nth;
  }
  EXPECT_GT(runs, 0);

  auto host = ReferenceHost::start(nlssm::refhost::linked_module());
  const nlssm::refhost::PoolCounts before = host->pools().counts();
  host->pools().fail_pool_creation_after(1);
  NLSSMHandle *h = nullptr;
  EXPECT_EQ(host->create_handle(GetParam(), &h), kNoMemory);
  host->pools().fail_pool_creation_after(0);
  EXPECT_EQ(h, nullptr);
  EXPECT_EQ(host->pools().counts().pools, before.pools);
  EXPECT_EQ(host->pools().counts().allocations, before.allocations);
}

INSTANTIATE_TEST_SUITE_P(EveryClass, CreationSweep,
                         ::testing::Values(29, 78, 20, 161, 25, 24, 26, 27, 129, 135, 134, 119,
                                           205),
                         [](const auto &info) { return "enc" + std::to_string(info.param); });

// ---- Operations ------------------------------------------------------------------

class OperationSweep : public ::testing::Test {
 protected:
  void SetUp() override {
    host = ReferenceHost::start(nlssm::refhost::linked_module());
    ASSERT_NE(host->module(), nullptr);
  }
  const NLSSMHandle *handle(int encoding) {
    NLSSMHandle *h = nullptr;
    EXPECT_EQ(host->create_handle(encoding, &h), 0);
    return h;
  }
  std::unique_ptr<ReferenceHost> host;
};

// `n` characters in UTF-16BE, repeating `chars`.
Bytes wide(const std::string &chars, size_t n) {
  Bytes out;
  for (size_t i = 0; i < n; ++i)
    out.insert(out.end(), {0, static_cast<uint8_t>(chars[i % chars.size()])});
  return out;
}
Bytes narrow(const std::string &chars, size_t n) {
  Bytes out;
  for (size_t i = 0; i < n; ++i) out.push_back(static_cast<uint8_t>(chars[i % chars.size()]));
  return out;
}

TEST_F(OperationSweep, WideEqualityBeyondItsStackCopiesAnswersNotEqualWhenRefused) {
  const NLSSMHandle *h = handle(kWcs2Be);
  const Bytes a = wide("Ab", 600), b = wide("aB", 600);
  using Fn =
      int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *, int64_t, int32_t);
  sweep(
      *host,
      [&] {
        return slot<Fn>(h->NLSStringEqualsS)(h, a.data(), int64_t(a.size()), b.data(),
                                             int64_t(b.size()), 0);
      },
      [](int64_t r, bool refused) { EXPECT_EQ(r, refused ? 0 : 1); });
}

TEST_F(OperationSweep, LongLiteralComparisonsAnswerTheNoMemoryCount) {
  const NLSSMHandle *h = handle(kWcs2Be);
  const Bytes text = wide("AB", 1100);
  const Bytes literal = narrow("AB", 1100);
  using Fn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *, int64_t,
                         uint32_t);
  for (NLSSlot s : {h->NLSStringCompLitS, h->NLSStringNotEqualLitS}) {
    sweep(
        *host,
        [&] {
          return slot<Fn>(s)(h, text.data(), int64_t(text.size()), literal.data(),
                             int64_t(literal.size()), 0);
        },
        [&](int64_t r, bool refused) {
          EXPECT_EQ(r, refused ? NLSSM_COUNT_NO_MEMORY : s == h->NLSStringCompLitS ? 0 : -1);
        });
  }
}

TEST_F(OperationSweep, ModalDeleteAndReverseLeaveTheTextAsItWasWhenRefused) {
  const NLSSMHandle *h = handle(kModal);
  const Bytes text = narrow("\x81\x82\x83\x84", 400);  // EBCDIC a b c d
  const Bytes list = narrow("\x82\x84\x85", 300);
  using DeleteFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t);
  using ReverseFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t);
  Bytes work;
  sweep(
      *host,
      [&] {
        work = text;
        return slot<DeleteFn>(h->NLSStringDeleteS)(h, work.data(), int64_t(work.size()),
                                                   list.data(), int64_t(list.size()));
      },
      [&](int64_t r, bool refused) {
        EXPECT_EQ(r, refused ? NLSSM_COUNT_NO_MEMORY : 200);
        if (refused) {
          EXPECT_EQ(work, text);
        }
      });
  sweep(
      *host,
      [&] {
        work = text;
        return slot<ReverseFn>(h->NLSStringReverseS)(h, work.data(), int64_t(work.size()));
      },
      [&](int64_t r, bool refused) {
        EXPECT_EQ(r, refused ? kNoMemory : NLSSM_OK);
        EXPECT_EQ(work.front(), refused ? text.front() : text.back());
      });
}

TEST_F(OperationSweep, LongLiteralDeleteDeletesNothingWhenRefused) {
  const NLSSMHandle *h = handle(kWcs2Be);
  const Bytes text = wide("ABC", 30);
  const Bytes literal = narrow("B", 200);
  using Fn =
      int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t, int64_t);
  Bytes work;
  sweep(
      *host,
      [&] {
        work = text;
        return slot<Fn>(h->NLSStringDeleteLitS)(h, work.data(), int64_t(work.size()),
                                                literal.data(), int64_t(literal.size()), 0);
      },
      [&](int64_t r, bool refused) {
        if (!refused) {
          EXPECT_EQ(r, 40);
          return;
        }
        EXPECT_TRUE(r == NLSSM_COUNT_NO_MEMORY || r == int64_t(text.size())) << r;
        EXPECT_EQ(work, text);
      });
}

// Quoting and transliterating in place need a copy of the whole room; when
// the pool refuses one, the room is cut to the stack area's 2048 bytes.
TEST_F(OperationSweep, InPlaceCopiesFallBackToTheStackRoomWhenRefused) {
  const NLSSMHandle *h = handle(kLatin1);
  const Bytes text = narrow("abcdefgh", 2500);
  constexpr int64_t kRoom = 3000, kStack = 2048;
  Bytes room;
  using QuoteFn =
      int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t, int64_t *);
  int64_t result = 0;
  sweep(
      *host,
      [&] {
        room = text;
        room.resize(kRoom, ' ');
        return slot<QuoteFn>(h->NLSStringAddQuotesS)(h, room.data(), int64_t(text.size()),
                                                     room.data(), kRoom, &result);
      },
      [&](int64_t r, bool refused) {
        EXPECT_EQ(r, refused ? NLSSM_E_DEST_TOO_SMALL : NLSSM_OK);
        EXPECT_EQ(result, refused ? -2502 : 2502);
      });

  int64_t written = 0;
  sweep(
      *host,
      [&] {
        room = text;
        room.resize(kRoom, ' ');
        return slot<TranslitFn>(h->NLSStringTransliterateS)(
            h, room.data(), int64_t(text.size()), reinterpret_cast<const uint8_t *>("X"), 1,
            reinterpret_cast<const uint8_t *>("a"), 1, 0, room.data(), kRoom, &written, 0);
      },
      [&](int64_t r, bool refused) {
        EXPECT_EQ(r, refused ? NLSSM_E_DEST_TOO_SMALL : NLSSM_OK);
        EXPECT_EQ(written, refused ? kStack : int64_t(text.size()));
        EXPECT_EQ(room[0], 'X');
      });
}

TEST_F(OperationSweep, LongLiteralListsAndSqueezeCharacterAnswerNoMemoryWhenRefused) {
  const NLSSMHandle *h = handle(kWcs2Be);
  const Bytes text = wide("aab", 20);
  const Bytes list = narrow("a", 200);
  Bytes out(200);
  int64_t written = 0, characters = 0;
  using SqueezeLitFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                   int64_t, uint8_t *, int64_t, int64_t *, int64_t *, int64_t);
  sweep(
      *host,
      [&] {
        return slot<TranslitFn>(h->NLSStringTransliterateLitS)(
            h, text.data(), int64_t(text.size()), list.data(), int64_t(list.size()), list.data(),
            int64_t(list.size()), 0, out.data(), int64_t(out.size()), &written, 0);
      },
      [&](int64_t r, bool refused) { EXPECT_EQ(r, refused ? kNoMemory : NLSSM_OK); });
  sweep(
      *host,
      [&] {
        return slot<SqueezeLitFn>(h->NLSStringSqueezeLitS)(
            h, text.data(), int64_t(text.size()), list.data(), int64_t(list.size()), out.data(),
            int64_t(out.size()), &written, &characters, 0);
      },
      [&](int64_t r, bool refused) {
        EXPECT_EQ(r, refused ? kNoMemory : NLSSM_OK);
        if (!refused) {
          EXPECT_EQ(characters, 13);  // six "ab" and a last "a"
        }
      });
}

// Reordering a line works in an area of about 70 bytes per character, from
// the pool beyond its 2 KiB on the stack.
TEST_F(OperationSweep, LongLineReorderingAnswersNoMemoryWhenRefused) {
  const NLSSMHandle *h = handle(NLSSM_ENC_UTF8);
  const Bytes line = narrow("abc def ", 200);
  using OrderFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                              int64_t *, uint8_t *);
  for (NLSSlot order : {h->NLSVisualOrderFormat, h->NLSLogicalOrderFormat}) {
    Bytes out(line.size());
    int64_t written = 0;
    sweep(
        *host,
        [&] {
          uint8_t direction = 0;
          written = -1;
          return slot<OrderFn>(order)(h, line.data(), int64_t(line.size()), out.data(),
                                      int64_t(out.size()), &written, &direction);
        },
        [&](int64_t r, bool refused) {
          EXPECT_EQ(r, refused ? kNoMemory : NLSSM_OK);
          EXPECT_LE(written, refused ? 0 : int64_t(line.size()));
          if (!refused) {
            EXPECT_EQ(out, line);  // left-to-right text keeps its order
          }
        });
  }
}

}  // namespace
