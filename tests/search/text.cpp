#include "text.hpp"

#include <gtest/gtest.h>
#include <unicode/ucnv.h>

#include <memory>
#include <nlssm/reference_host.hpp>

namespace search_test {

Bytes encode(int encoding, const std::u32string &text) {
  const auto *info = nlssm::refhost::ReferenceHost::registry().find(encoding);
  if (info->converter == "builtin:utf-ebcdic") {  // ICU has none: the module's encoder
    Bytes out;
    for (char32_t c : text) {
      uint8_t bytes[8];
      out.insert(out.end(), bytes, bytes + ToUTFE(handle(encoding), c, bytes));
    }
    return out;
  }
  const std::string name = info->converter.substr(0, info->converter.find(','));
  UErrorCode e = U_ZERO_ERROR;
  UConverter *cnv = ucnv_open(name.c_str(), &e);
  EXPECT_TRUE(U_SUCCESS(e)) << name;
  std::u16string units;
  for (char32_t c : text) {
    if (c > 0xFFFF) {
      units.push_back(static_cast<char16_t>(0xD7C0 + (c >> 10)));
      units.push_back(static_cast<char16_t>(0xDC00 | (c & 0x3FF)));
    } else {
      units.push_back(static_cast<char16_t>(c));
    }
  }
  Bytes out(units.size() * 4 + 16);
  e = U_ZERO_ERROR;
  const int32_t n =
      ucnv_fromUChars(cnv, reinterpret_cast<char *>(out.data()), static_cast<int32_t>(out.size()),
                      units.data(), static_cast<int32_t>(units.size()), &e);
  EXPECT_TRUE(U_SUCCESS(e)) << name << ' ' << u_errorName(e);
  ucnv_close(cnv);
  out.resize(static_cast<size_t>(n));
  // ICU's UTF-16 and UTF-32 converters write no byte-order mark for the
  // named byte orders; nothing to strip.
  return out;
}

NLSString at(const NLSSMHandle *h, Bytes &bytes, int64_t index) {
  NLSString s{};
  s.buffer = bytes.data();
  s.length = s.capacity = bytes.size();
  s.curOffset = bytes.empty() ? NLSSM_POS_NONE : 0;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  if (!bytes.empty()) call(h->stringSetPos, h, &s, int64_t{index}, int64_t{0});
  return s;
}

}  // namespace search_test
