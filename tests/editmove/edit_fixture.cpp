#include "edit_fixture.hpp"

#include <unicode/ucnv.h>

namespace editmove_test {

std::vector<uint8_t> encode(int encoding, const std::u16string &text) {
  const auto *info = nlssm::refhost::ReferenceHost::registry().find(encoding);
  UErrorCode err = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open(info->converter.c_str(), &err);
  std::vector<uint8_t> out(text.size() * 4 + 8);
  const int32_t n =
      ucnv_fromUChars(cnv, reinterpret_cast<char *>(out.data()), static_cast<int32_t>(out.size()),
                      text.data(), static_cast<int32_t>(text.size()), &err);
  ucnv_close(cnv);
  EXPECT_TRUE(U_SUCCESS(err)) << encoding;
  out.resize(static_cast<size_t>(n));
  return out;
}

}  // namespace editmove_test
