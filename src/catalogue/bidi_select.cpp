// Selection of the single-byte bidirectional table by encoding number.
#include "catalogue/tables.hpp"
#include "nlssm/nlssm.h"

extern "C" const uint8_t *NLSGetBIDICategorySBCSTab(int32_t encodingNumber) {
  for (const auto &entry : nlssm::catalogue::bidi_selection) {
    if (entry.encodingNumber == encodingNumber) {
      return reinterpret_cast<const uint8_t *>(entry.table);
    }
  }
  return nullptr;
}
