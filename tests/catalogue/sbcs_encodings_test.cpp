// The single-byte case tables as the encodings that use them see them: a
// byte's upper or lower case, where the tables change it, is the byte of the
// character's upper or lower case in the encoding's own converter.
#include <gtest/gtest.h>
#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <unicode/uchar.h>
#include <nlssm/reference_host.hpp>

namespace {

// The character a byte converts to through the handle's converter, or -1.
int64_t decode(const NLSSMHandle &h, uint8_t byte) {
  uint32_t out[2] = {};
  uint64_t produced = 0;
  auto convert = reinterpret_cast<NLSHostConverterConvertFn>(
      NLSSM_HOST_SLOT(h.fromConverter, NLSHOST_SLOT_CONVERTER_CONVERT));
  if (convert(h.fromConverter, &byte, 1, out, sizeof out, &produced, nullptr) != 0 ||
      produced != 4 || out[0] == 0x1A || out[0] == 0xFFFD)
    return -1;
  return out[0];
}

TEST(SbcsTables, CaseTablesAgreeWithEveryEncodingsConverter) {
  auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  int checked = 0;
  for (const auto &info : nlssm::refhost::ReferenceHost::registry().rows()) {
    if (!info.described || info.encodingClass != NLSSM_CLASS_SBCS) continue;
    NLSSMHandle *h = nullptr;
    ASSERT_EQ(host->create_handle(info.number, &h), 0) << info.number;
    if (h->upperTable == nullptr || h->lowerTable == nullptr) continue;
    SCOPED_TRACE(info.number);
    int bad = 0;
    for (int b = 0; b < 256 && bad < 5; ++b) {
      const int64_t c = decode(*h, uint8_t(b));
      for (bool upper : {true, false}) {
        const uint8_t mapped = (upper ? h->upperTable : h->lowerTable)[b];
        if (mapped == b || c < 0) continue;
        const UChar32 want = upper ? u_toupper(UChar32(c)) : u_tolower(UChar32(c));
        if (decode(*h, mapped) != want) {
          ADD_FAILURE() << std::hex << "byte " << b << (upper ? " upper " : " lower ")
                        << int(mapped) << ": U+" << c << " -> U+" << decode(*h, mapped);
          ++bad;
        }
      }
    }
    ++checked;
  }
  EXPECT_GE(checked, 100);
}

}  // namespace
