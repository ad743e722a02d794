// Which member fills each operation slot of a handle, by encoding class.
#pragma once

#include <nlssm/nlssm.h>

namespace nlssm::module {

// Fills the handle's operation slots from its encoding class, encoding
// number, ASCII/EBCDIC flag and number form. Slots without a member stay
// as they are (handle creation clears them first).
void fill_operation_slots(NLSSMHandle &handle);

}  // namespace nlssm::module
