// Character information and folding from ICU's character properties.
#include <unicode/uchar.h>

#include "internal.hpp"

namespace nlssm::refhost {

namespace {

// ICU general category -> bit number of the property word.
constexpr std::uint32_t kCategoryBit[U_CHAR_CATEGORY_COUNT] = {
    16,  // U_UNASSIGNED: Cn
    0,   // Lu
    1,   // Ll
    2,   // Lt
    17,  // Lm
    18,  // Lo
    3,   // Mn
    5,   // Me
    4,   // Mc
    6,   // Nd
    7,   // Nl
    8,   // No
    9,   // Zs
    10,  // Zl
    11,  // Zp
    12,  // Cc
    13,  // Cf
    15,  // Co
    14,  // Cs
    20,  // Pd
    21,  // Ps
    22,  // Pe
    19,  // Pc
    25,  // Po
    26,  // Sm
    27,  // Sc
    28,  // Sk
    29,  // So
    23,  // Pi
    24,  // Pf
};

// ICU bidi class -> the host's bidirectional category number.
constexpr std::uint32_t kBidi[] = {
    NLSHOST_BIDI_L,   NLSHOST_BIDI_R,   NLSHOST_BIDI_EN,  NLSHOST_BIDI_ES, NLSHOST_BIDI_ET,
    NLSHOST_BIDI_AN,  NLSHOST_BIDI_CS,  NLSHOST_BIDI_B,   NLSHOST_BIDI_S,  NLSHOST_BIDI_WS,
    NLSHOST_BIDI_ON,  NLSHOST_BIDI_LRE, NLSHOST_BIDI_LRO, NLSHOST_BIDI_AL, NLSHOST_BIDI_RLE,
    NLSHOST_BIDI_RLO, NLSHOST_BIDI_PDF, NLSHOST_BIDI_NSM, NLSHOST_BIDI_BN, NLSHOST_BIDI_FSI,
    NLSHOST_BIDI_LRI, NLSHOST_BIDI_RLI, NLSHOST_BIDI_PDI,
};
static_assert(std::size(kBidi) == U_POP_DIRECTIONAL_ISOLATE + 1);

std::uint32_t mapping(UChar32 from, UChar32 to) {
  return to == from ? 0 : static_cast<std::uint32_t>(to);
}

struct CharObject {
  SlotWords<33> slots;
};

std::uint32_t fold_slot(void *, std::uint32_t character, std::int64_t options) {
  return fold_char(character, options);
}

}  // namespace

std::int64_t char_info(std::uint32_t character, NLSHostCharInfo *info) {
  if (info == nullptr) return NLSHOST_E_NULL;
  if (character > 0x10FFFF) return NLSHOST_E_NOT_A_CHARACTER;
  const auto c = static_cast<UChar32>(character);
  const std::uint32_t bit = kCategoryBit[u_charType(c)];
  info->character = character;
  info->properties = 1u << bit;
  info->categoryIndex = bit;
  info->bidiCategory = kBidi[u_charDirection(c)];
  info->upper = mapping(c, u_toupper(c));
  info->lower = mapping(c, u_tolower(c));
  info->title = mapping(c, u_totitle(c));
  info->combiningClass = u_getCombiningClass(c);
  return 0;
}

std::uint32_t fold_char(std::uint32_t character, std::int64_t options) {
  if (character > 0x10FFFF) return character;
  const auto c = static_cast<UChar32>(character);
  if (options & NLSHOST_FOLD_TURKIC)
    return static_cast<std::uint32_t>(u_foldCase(c, U_FOLD_CASE_EXCLUDE_SPECIAL_I));
  if (options & NLSHOST_FOLD_DEFAULT)
    return static_cast<std::uint32_t>(u_foldCase(c, U_FOLD_CASE_DEFAULT));
  return character;
}

void *char_object() {
  static CharObject object = [] {
    CharObject o;
    o.slots.set(NLSHOST_SLOT_FOLD_CHAR, &fold_slot);
    return o;
  }();
  return &object;
}

}  // namespace nlssm::refhost
