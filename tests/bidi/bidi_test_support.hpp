// Handles of the reference host and the calls through their bidirectional
// slots, shared by the bidi tests.
#pragma once

#include <nlssm/nlssm.h>
#include <unicode/uchar.h>
#include <nlssm/reference_host.hpp>
#include "reference_handles.hpp"

#include <cstdint>
#include <string>
#include <vector>

#include "bidi/uba.hpp"

namespace bidi_test {

using Bytes = std::vector<uint8_t>;

using test_support::handle;

using Reorder = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                            int64_t *, uint8_t *);

struct Reordered {
  int64_t status;
  Bytes text;
  int direction;
};

// Calls slot 80 (visual) or 81 (logical) with room for twice the text.
inline Reordered reorder(const NLSSMHandle *h, const Bytes &text, int direction,
                         bool visual = true) {
  Bytes out(text.size() * 2 + 8);
  int64_t written = -1;
  uint8_t dir = static_cast<uint8_t>(direction);
  const auto fn =
      reinterpret_cast<Reorder>(visual ? h->NLSVisualOrderFormat : h->NLSLogicalOrderFormat);
  const int64_t status = fn(h, text.data(), static_cast<int64_t>(text.size()), out.data(),
                            static_cast<int64_t>(out.size()), &written, &dir);
  out.resize(written < 0 ? 0 : static_cast<size_t>(written));
  return {status, out, dir};
}

// ICU's class of a code point in the module's numbering.
inline uint8_t icu_class(UChar32 c) {
  using namespace nlssm::bidi;
  static const uint8_t kByIcu[] = {L,   R,  EN,  ES,  ET,  AN,  CS, B,   S,   WS,  ON, LRE,
                                   LRO, AL, RLE, RLO, PDF, NSM, BN, FSI, LRI, RLI, PDI};
  return kByIcu[u_charDirection(c)];
}

// UTF-32 in the machine's (little-endian) order, for encoding 27.
inline Bytes utf32(const std::vector<UChar32> &chars) {
  Bytes out;
  for (UChar32 c : chars)
    for (int k = 0; k < 4; ++k) out.push_back(static_cast<uint8_t>(c >> (8 * k)));
  return out;
}
inline std::vector<UChar32> from_utf32(const Bytes &bytes) {
  std::vector<UChar32> out;
  for (size_t i = 0; i + 4 <= bytes.size(); i += 4)
    out.push_back(static_cast<UChar32>(bytes[i] | bytes[i + 1] << 8 | bytes[i + 2] << 16 |
                                       bytes[i + 3] << 24));
  return out;
}

}  // namespace bidi_test
