// Real handles from the reference host, text in their encodings from ICU's
// converters, and descriptors positioned as callers position them.
#pragma once

#include <nlssm/nlssm.h>
#include "reference_handles.hpp"

#include <cstdint>
#include <string>
#include <vector>

namespace search_test {

using Bytes = std::vector<uint8_t>;

using test_support::handle;

// `text` (code points) in `encoding`, as ICU converts it; modal text shifts
// around each run of double-byte characters.
Bytes encode(int encoding, const std::u32string &text);

// A descriptor over `bytes`, positioned on character `index` through the
// handle's stringSetPos (no current character when the text is empty).
NLSString at(const NLSSMHandle *h, Bytes &bytes, int64_t index = 0);

// Calls the function in a slot with the given arguments.
template <class... A>
int64_t call(NLSSlot slot, A... args) {
  return reinterpret_cast<int64_t (*)(A...)>(slot)(args...);
}

}  // namespace search_test
