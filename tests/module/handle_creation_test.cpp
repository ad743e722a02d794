// Handle creation and release on the reference host: the fields of every
// encoding's handle, sharing, the failure paths and their clean-up, and
// concurrent creation.
#include <gtest/gtest.h>
#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstring>
#include <set>
#include <thread>
#include <vector>

#include "catalogue/catalogue.hpp"

namespace {

using nlssm::refhost::EncodingInfo;
using nlssm::refhost::ReferenceHost;

std::vector<const EncodingInfo *> described_encodings() {
  std::vector<const EncodingInfo *> rows;
  for (const EncodingInfo &info : ReferenceHost::registry().rows())
    if (info.described) rows.push_back(&info);
  return rows;
}

bool in_ranges(const uint8_t *pairs, size_t capacity, int byte) {
  for (size_t i = 0; i + 1 < capacity && pairs[i] != 0; i += 2)
    if (byte >= pairs[i] && byte <= pairs[i + 1]) return true;
  return false;
}

class HandleCreation : public ::testing::Test {
 protected:
  void SetUp() override {
    host = ReferenceHost::start(nlssm::refhost::linked_module());
    ASSERT_NE(host->module(), nullptr);
  }
  NLSSMHandle *create(int64_t encoding, int64_t *status = nullptr, void *reserved = nullptr) {
    NLSSMHandle *handle = nullptr;
    const int64_t result = host->create_handle(encoding, &handle, reserved);
    if (status != nullptr) *status = result;
    return handle;
  }
  std::unique_ptr<ReferenceHost> host;
};

TEST_F(HandleCreation, EveryDescribedEncodingGetsAHandleMatchingItsRecord) {
  for (const EncodingInfo *info : described_encodings()) {
    SCOPED_TRACE(info->number);
    int64_t status = -1;
    NLSSMHandle *h = create(info->number, &status);
    ASSERT_EQ(status, 0);
    ASSERT_NE(h, nullptr);
    const uint32_t number = info->number == 19 ? 25 : info->number;
    const int cls = info->encodingClass;
    EXPECT_EQ(std::memcmp(h->magic, "nevo", 4), 0);
    EXPECT_STREQ(h->name, "QVNLSSM handle");
    EXPECT_EQ(h->destroy, reinterpret_cast<NLSSlot>(&NLSSMDestroy));
    EXPECT_EQ(h->owner, host->nls());
    EXPECT_EQ(h->encodingNumber, number);
    EXPECT_EQ(h->encodingClass, static_cast<uint32_t>(cls));
    EXPECT_EQ(h->encodingFlags & 1u, info->ascii ? 1u : 0u);

    const uint64_t width = cls == NLSSM_CLASS_WCS2 ? 2 : cls == NLSSM_CLASS_WCS4 ? 4 : 1;
    EXPECT_EQ(h->unitWidth, width);
    EXPECT_EQ(h->blankWidth, width);
    EXPECT_EQ(h->quoteWidth, width);
    for (uint64_t i = 0; i < width; ++i)
      EXPECT_EQ(h->blankChar[i], uint8_t(info->blankValue >> (8 * i)));
    uint8_t quote[4] = {};
    if (width == 1)
      quote[0] = info->ascii ? 0x22 : 0x7F;
    else if (number == NLSSM_ENC_WCS2_BE)
      quote[1] = 0x22;
    else if (number == NLSSM_ENC_WCS4_BE)
      quote[3] = 0x22;
    else
      quote[0] = 0x22;
    EXPECT_EQ(std::memcmp(h->quoteChar, quote, 4), 0);
    EXPECT_EQ(h->numberForm, cls == NLSSM_CLASS_WCS2 ? 4 : info->numberForm);
    // 19 and 25 share one handle, built from whichever record came first.
    EXPECT_EQ(std::memcmp(h->charRanges, &info->record.charRanges, sizeof(NLSHostCharRanges)), 0);
    EXPECT_EQ(h->shiftLength, info->record.charRanges.shiftLength);

    const nlssm::catalogue::TrantabRow &row = nlssm::catalogue::sm_trantab[number];
    EXPECT_EQ(h->lowerTable, row.lower);
    EXPECT_EQ(h->upperTable, row.upper);
    EXPECT_EQ(h->foldTable, row.fold);
    EXPECT_EQ(h->classTable, row.classes);
    EXPECT_EQ(h->dbcsTable, static_cast<const void *>(row.dbcs));
    EXPECT_EQ(h->dbcsTableCount, row.dbcsCount);
    EXPECT_EQ(h->dbcsExtTable, static_cast<const void *>(row.dbcsExt));
    EXPECT_EQ(h->dbcsExtCount, row.dbcsExtCount);
    EXPECT_EQ(h->bidiTable, cls == NLSSM_CLASS_SBCS ? NLSGetBIDICategorySBCSTab(number) : nullptr);

    EXPECT_NE(h->locale, nullptr);
    EXPECT_NE(h->pool, nullptr);
    EXPECT_NE(h->fromConverter, nullptr);
    EXPECT_NE(h->toConverter, nullptr);

    // Lead and trail flags come from the host's lists, except for EUC-JP
    // and the first EUC-TW number, which use the built-in lists.
    const NLSHostCharRanges &ranges = info->record.charRanges;
    for (int b = 0; b < 256; ++b) {
      bool lead = in_ranges(ranges.leadRanges, sizeof ranges.leadRanges, b);
      bool trail = in_ranges(ranges.trailRanges, sizeof ranges.trailRanges, b);
      if (number == NLSSM_ENC_EUC_JP) lead = b == 0x8E || (b >= 0xA1 && b <= 0xFE);
      if (number == 119) lead = b >= 0xA1 && b <= 0xFE;
      if (number == NLSSM_ENC_EUC_JP || number == 119) trail = b >= 0xA1 && b <= 0xFE;
      ASSERT_EQ(h->charClass[b], (lead ? 0x44 : 0) | (trail ? 0x08 : 0)) << "byte " << b;
    }
  }
}

TEST_F(HandleCreation, TheSameNameGivesTheSameHandleWithoutBuildingAnother) {
  NLSSMHandle *first = create(29);
  const auto before = host->pools().counts();
  EXPECT_EQ(create(29), first);
  EXPECT_EQ(host->pools().counts().pools, before.pools);
  EXPECT_EQ(host->pools().counts().allocations, before.allocations);
  // 19 is another name for 25's encoding: the handle says 25.
  NLSSMHandle *alias = create(19);
  ASSERT_NE(alias, nullptr);
  EXPECT_EQ(alias->encodingNumber, 25u);
}

TEST_F(HandleCreation, CharInitConvertsTheQuoteForWideHandles) {
  const uint8_t quote = 0x22;
  NLSChar record;
  NLSSMHandle *utf16be = create(NLSSM_ENC_WCS2_BE);
  ASSERT_NE(utf16be, nullptr);
  reinterpret_cast<int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, NLSChar *)>(
      utf16be->NLSCharInit)(utf16be, &quote, 0, &record);
  ASSERT_EQ(record.string.length, 2u);
  EXPECT_EQ(record.bytes[0], 0x00);
  EXPECT_EQ(record.bytes[1], 0x22);

  NLSSMHandle *reference = create(NLSSM_ENC_REFERENCE_SBCS);
  ASSERT_NE(reference, nullptr);
  EXPECT_EQ(reference->charConverter, nullptr);
  NLSCharInit_SBCS(reference, &quote, 0, &record);
  EXPECT_EQ(record.string.length, 1u);
  EXPECT_EQ(record.bytes[0], 0x22);
}

TEST_F(HandleCreation, FailuresReturnTheirStatusAndLeaveNothingBehind) {
  const auto baseline = host->pools().counts();
  const auto objects = host->object_counts();
  auto expect_clean = [&] {
    const auto now = host->pools().counts();
    EXPECT_EQ(now.pools, baseline.pools);
    EXPECT_EQ(now.allocations, baseline.allocations);
    EXPECT_EQ(now.bytes, baseline.bytes);
    EXPECT_EQ(host->object_counts().converters, objects.converters);
    EXPECT_EQ(host->object_counts().locales, objects.locales);
  };
  int64_t status = 0;
  int marker = 0;
  EXPECT_EQ(create(29, &status, &marker), nullptr);
  EXPECT_EQ(status, NLSSM_E_BAD_ARGUMENT);
  expect_clean();
  // The handle's pool, the handle itself, then the table insertion.
  for (auto fail : {+[](ReferenceHost &h) { h.pools().fail_pool_creation_after(1); },
                    +[](ReferenceHost &h) { h.pools().fail_allocation_after(1); },
                    +[](ReferenceHost &h) { h.pools().fail_allocation_after(2); }}) {
    fail(*host);
    EXPECT_EQ(create(29, &status), nullptr);
    EXPECT_EQ(status, NLSSM_E_NO_MEMORY);
    expect_clean();
  }
  host->pools().fail_allocation_after(0);

  EXPECT_EQ(create(400, &status), nullptr);
  EXPECT_NE(status, 0);  // the host's own status
  expect_clean();

  // The lock was released on every path: creation still works.
  EXPECT_NE(create(29, &status), nullptr);
  EXPECT_EQ(status, 0);
}

// An NLS object that forwards to the reference host's, with services that
// can be made to fail and a describe that accepts numbers past the table.
struct ProxyNls {
  void *words[42] = {};
  void *real = nullptr;
  bool noKeyConverter = false, noCharConverter = false, noOwnConverter = false, noLocale = false;
  int64_t describeAs = -1;  // the number described in place of any number >= 265

  static ProxyNls &of(void *self) { return *static_cast<ProxyNls *>(self); }
  template <typename Fn>
  Fn real_slot(int n) const {
    return reinterpret_cast<Fn>(static_cast<void **>(real)[n]);
  }
  static int needed(void *self, int64_t a, int64_t b, void *r) {
    auto &p = of(self);
    return p.real_slot<NLSHostConversionNeededFn>(NLSHOST_SLOT_NLS_CONVERSION_NEEDED)(p.real, a, b,
                                                                                      r);
  }
  static int64_t describe(void *self, int64_t n, const NLSHostEncodingRecord **record) {
    auto &p = of(self);
    if (n >= NLSSM_ENCODING_LIMIT && p.describeAs >= 0) n = p.describeAs;
    return p.real_slot<NLSHostDescribeEncodingFn>(NLSHOST_SLOT_NLS_DESCRIBE)(p.real, n, record);
  }
  static void *between(void *self, int64_t from, int64_t to, void *, void *) {
    auto &p = of(self);
    if (p.noCharConverter && from == NLSSM_ENC_REFERENCE_SBCS) return nullptr;
    return p.real_slot<NLSHostConverterBetweenFn>(NLSHOST_SLOT_NLS_CONVERTER_BETWEEN)(
        p.real, from, to, nullptr, nullptr);
  }
  static void *from(void *self, int64_t encoding, void *, void *) {
    auto &p = of(self);
    if (p.noOwnConverter) return nullptr;
    return p.real_slot<NLSHostConverterForFn>(NLSHOST_SLOT_NLS_CONVERTER_FROM)(p.real, encoding,
                                                                               nullptr, nullptr);
  }
  static void *to(void *self, int64_t encoding, void *, void *) {
    auto &p = of(self);
    if (encoding == NLSSM_ENC_UTF8 ? p.noKeyConverter : p.noOwnConverter) return nullptr;
    return p.real_slot<NLSHostConverterForFn>(NLSHOST_SLOT_NLS_CONVERTER_TO)(p.real, encoding,
                                                                             nullptr, nullptr);
  }
  static void *locale(void *self, const uint32_t *name, int64_t length) {
    auto &p = of(self);
    if (p.noLocale) return nullptr;
    return p.real_slot<NLSHostLocaleFn>(NLSHOST_SLOT_NLS_LOCALE)(p.real, name, length);
  }

  explicit ProxyNls(void *realNls) : real(realNls) {
    words[NLSHOST_SLOT_NLS_CONVERSION_NEEDED] = reinterpret_cast<void *>(&needed);
    words[NLSHOST_SLOT_NLS_DESCRIBE] = reinterpret_cast<void *>(&describe);
    words[NLSHOST_SLOT_NLS_CONVERTER_BETWEEN] = reinterpret_cast<void *>(&between);
    words[NLSHOST_SLOT_NLS_CONVERTER_FROM] = reinterpret_cast<void *>(&from);
    words[NLSHOST_SLOT_NLS_CONVERTER_TO] = reinterpret_cast<void *>(&to);
    words[NLSHOST_SLOT_NLS_LOCALE] = reinterpret_cast<void *>(&locale);
    for (int w : {NLSHOST_WORD_NLS_HANDLE_TABLE, NLSHOST_WORD_NLS_TABLE_LOCK})
      words[w] = static_cast<void **>(realNls)[w];
  }
};

TEST_F(HandleCreation, HostServiceFailuresMapToTheirStatuses) {
  ProxyNls proxy(host->nls());
  const auto baseline = host->pools().counts();
  const auto objects = host->object_counts();
  struct Case {
    bool ProxyNls::*fault;
    int64_t expected;
  };
  for (const Case &c : {Case{&ProxyNls::noKeyConverter, NLSSM_E_NO_MEMORY},
                        Case{&ProxyNls::noCharConverter, NLSSM_E_ENCODING},
                        Case{&ProxyNls::noOwnConverter, NLSSM_E_ENCODING},
                        Case{&ProxyNls::noLocale, NLSSM_E_NO_MEMORY}}) {
    proxy.*c.fault = true;
    NLSSMHandle *handle = nullptr;
    EXPECT_EQ(NLSSMCreate(&proxy, 29, nullptr, &handle), c.expected);
    EXPECT_EQ(handle, nullptr);
    proxy.*c.fault = false;
    EXPECT_EQ(host->pools().counts().pools, baseline.pools);
    EXPECT_EQ(host->pools().counts().allocations, baseline.allocations);
    EXPECT_EQ(host->object_counts().converters, objects.converters);
    EXPECT_EQ(host->object_counts().locales, objects.locales);
  }

  // 265 is refused only after the cache lookup: described as an encoding
  // that is already cached, it gets that handle.
  proxy.describeAs = 264;
  NLSSMHandle *handle = nullptr;
  EXPECT_EQ(NLSSMCreate(&proxy, 265, nullptr, &handle), NLSSM_E_ENCODING);
  EXPECT_EQ(handle, nullptr);
  EXPECT_EQ(host->pools().counts().pools, baseline.pools);
  proxy.describeAs = 29;
  NLSSMHandle *latin1 = create(29);
  EXPECT_EQ(NLSSMCreate(&proxy, 265, nullptr, &handle), 0);
  EXPECT_EQ(handle, latin1);
}

TEST_F(HandleCreation, ConcurrentCreatorsShareOneHandlePerEncoding) {
  const auto rows = described_encodings();
  constexpr int kThreads = 8;
  std::vector<std::vector<NLSSMHandle *>> seen(kThreads, std::vector<NLSSMHandle *>(rows.size()));
  std::vector<std::thread> threads;
  for (int t = 0; t < kThreads; ++t)
    threads.emplace_back([&, t] {
      for (size_t i = 0; i < rows.size(); ++i) {
        const size_t k = (i + t * 37) % rows.size();  // threads start at different rows
        host->create_handle(rows[k]->number, &seen[t][k]);
      }
    });
  for (std::thread &thread : threads) thread.join();
  std::set<NLSSMHandle *> distinct;
  for (size_t k = 0; k < rows.size(); ++k) {
    ASSERT_NE(seen[0][k], nullptr) << rows[k]->number;
    for (int t = 1; t < kThreads; ++t) ASSERT_EQ(seen[t][k], seen[0][k]) << rows[k]->number;
    distinct.insert(seen[0][k]);
  }
  // One handle per encoding name (19 and 25 share one).
  EXPECT_EQ(distinct.size(), rows.size() - 1);
}

// The destroy callback gives back each handle's converters, locale and pool.
ReferenceHost *g_host = nullptr;
nlssm::refhost::PoolCounts g_afterRelease;
nlssm::refhost::ObjectCounts g_objectsAfterRelease;

int64_t release_and_count(void *entry) {
  const int64_t status = NLSSMDestroyCallback(entry);
  g_afterRelease = g_host->pools().counts();
  g_objectsAfterRelease = g_host->object_counts();
  return status;
}

TEST(HandleRelease, DestroyCallbackReleasesEverythingTheHandleOwns) {
  {
    auto host = ReferenceHost::standalone(&release_and_count);
    g_host = host.get();
    qvextent(host->service());
    for (int64_t encoding : {20, 24, 29, 78, 134, 205}) {
      NLSSMHandle *handle = nullptr;
      ASSERT_EQ(NLSSMCreate(host->nls(), encoding, nullptr, &handle), 0) << encoding;
    }
    EXPECT_GT(host->pools().counts().pools, 0);
    EXPECT_GT(host->object_counts().converters, 0);
  }
  EXPECT_EQ(g_afterRelease.pools, 0);
  EXPECT_EQ(g_afterRelease.allocations, 0);
  EXPECT_EQ(g_objectsAfterRelease.converters, 0);
  EXPECT_EQ(g_objectsAfterRelease.locales, 0);
  EXPECT_EQ(NLSSMDestroyCallback(nullptr), 0);
}

}  // namespace
