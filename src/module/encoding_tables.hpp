// The catalogue as handle creation sees it.
#pragma once

#include <nlssm/nlssm.h>

namespace nlssm::module {

// Copies the catalogue row of the handle's encoding number into its table
// fields, and for single-byte handles the BIDI category table.
void attach_encoding_tables(NLSSMHandle &handle);

}  // namespace nlssm::module
