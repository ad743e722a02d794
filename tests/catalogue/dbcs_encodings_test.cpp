// The double-byte case tables as the encodings that use them see them: every
// record's code, lower and upper case is a double-byte character of the
// encoding (by its handle's lead and trail flags) and converts, through the
// encoding's converter, to characters that the case mapping pairs.
#include <gtest/gtest.h>
#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <unicode/uchar.h>
#include <nlssm/reference_host.hpp>

#include <vector>

#include "catalogue/tables.hpp"

namespace nlssm::catalogue {
namespace {

constexpr uint8_t kLead = 0x44, kTrail = 0x08;

// The one character that the code converts to, or -1.
int64_t decode(const NLSSMHandle &h, uint16_t code) {
  std::vector<uint8_t> bytes = {uint8_t(code >> 8), uint8_t(code & 0xFF)};
  if (h.encodingClass == NLSSM_CLASS_MBCS_MODAL) bytes = {0x0E, bytes[0], bytes[1], 0x0F};
  uint32_t out[4] = {};
  uint64_t produced = 0;
  auto convert = reinterpret_cast<NLSHostConverterConvertFn>(
      NLSSM_HOST_SLOT(h.fromConverter, NLSHOST_SLOT_CONVERTER_CONVERT));
  if (convert(h.fromConverter, bytes.data(), bytes.size(), out, sizeof out, &produced, nullptr) !=
          0 ||
      produced != 4)
    return -1;
  if (out[0] == 0xFFFD || out[0] == 0x1A || out[0] > 0x10FFFF) return -1;
  return out[0];
}

TEST(DbcsTables, RecordsAreCharactersOfEveryEncodingThatUsesThem) {
  auto host = refhost::ReferenceHost::start(refhost::linked_module());
  int checked = 0;
  for (const refhost::EncodingInfo &info : refhost::ReferenceHost::registry().rows()) {
    if (!info.described) continue;
    NLSSMHandle *h = nullptr;
    ASSERT_EQ(host->create_handle(info.number, &h), 0) << info.number;
    if (h->dbcsTableCount == 0 || h->dbcsTable == zero_dbtab ||
        h->encodingClass < NLSSM_CLASS_MBCS_MODAL)
      continue;
    SCOPED_TRACE(info.number);
    const auto *records = static_cast<const DbcsRecord *>(h->dbcsTable);
    int bad = 0;
    for (uint64_t i = 0; i < h->dbcsTableCount && bad < 5; ++i) {
      const DbcsRecord &r = records[i];
      for (uint16_t code : {r.code, r.lower, r.upper}) {
        const bool flagged = (h->charClass[code >> 8] & kLead) == kLead &&
                             (h->charClass[code & 0xFF] & kTrail) == kTrail;
        if (!flagged || decode(*h, code) < 0) {
          ADD_FAILURE() << std::hex << "record " << r.code << ": " << code
                        << " is not a double-byte character";
          ++bad;
        }
      }
      const int64_t c = decode(*h, r.code);
      if (c < 0) continue;
      if (r.lower != r.code) {
        EXPECT_EQ(decode(*h, r.lower), u_tolower(UChar32(c))) << std::hex << r.code;
      }
      if (r.upper != r.code) {
        EXPECT_EQ(decode(*h, r.upper), u_toupper(UChar32(c))) << std::hex << r.code;
      }
    }
    ++checked;
  }
  EXPECT_GE(checked, 30);
}

}  // namespace
}  // namespace nlssm::catalogue
