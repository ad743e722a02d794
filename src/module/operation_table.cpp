// The operation table, written once, row by row, in slot order. Each row
// names the member for each encoding class (SBCS, UTF-8/UTF-EBCDIC, WCS2,
// WCS4, MBCS modal, MBCS non-modal); a cell with several members picks one
// by the rule its constructor names.
#include "module/operation_table.hpp"

#include <array>
#include <cstddef>

namespace nlssm::module {
namespace {

enum class Pick : unsigned char {
  kSame,           // one member
  kUtf8OrUtfe,     // encoding 20, else UTF-EBCDIC
  kLittleOrBig,    // big-endian is encoding 24 (WCS2) or 26 (WCS4)
  kAsciiOrEbcdic,  // bit 0 of encodingFlags
  kDbcsVariant,    // other double-byte sets, EUC-JP, EUC-TW, GB18030
  kNumberForm,     // encoding 27, number form 4, all others
};

struct Cell {
  Pick pick = Pick::kSame;
  NLSSlot member[4] = {};
};

struct Row {
  int slot;
  Cell cells[6];
};

template <typename Fn>
NLSSlot op(Fn *function) {
  return reinterpret_cast<NLSSlot>(function);
}

Cell same(NLSSlot f) {
  return {Pick::kSame, {f}};
}
[[maybe_unused]] Cell utf(NLSSlot utf8, NLSSlot utfe) {
  return {Pick::kUtf8OrUtfe, {utf8, utfe}};
}
[[maybe_unused]] Cell endian(NLSSlot little, NLSSlot big) {
  return {Pick::kLittleOrBig, {little, big}};
}
[[maybe_unused]] Cell ascii_ebcdic(NLSSlot ascii, NLSSlot ebcdic) {
  return {Pick::kAsciiOrEbcdic, {ascii, ebcdic}};
}
[[maybe_unused]] Cell dbcs(NLSSlot other, NLSSlot eucJp, NLSSlot eucTw, NLSSlot gb18030) {
  return {Pick::kDbcsVariant, {other, eucJp, eucTw, gb18030}};
}
[[maybe_unused]] Cell number_form(NLSSlot hostChars, NLSSlot swapped, NLSSlot other) {
  return {Pick::kNumberForm, {hostChars, swapped, other}};
}
Row every_class(int slot, NLSSlot f) {
  return {slot, {same(f), same(f), same(f), same(f), same(f), same(f)}};
}

// Slots 21 and 118 come last: they serve every class.
const std::array kRows = {
    // slot, SBCS, UTF-8 / UTF-EBCDIC, WCS2, WCS4, MBCS modal, MBCS non-modal
    every_class(14, op(&NLSStringInit)),
    Row{15,
        {same(op(&NLSCharInit_SBCS)), same(op(&NLSCharInit)), same(op(&NLSCharInit)),
         same(op(&NLSCharInit)), same(op(&NLSCharInit)), same(op(&NLSCharInit))}},
    every_class(16, op(&NLSStringClean)),
    every_class(17, op(&stringDupPos)),
    every_class(18, op(&stringGetPos)),
    every_class(21, op(&stringNextCharB)),
};

bool is_class_independent(const Row &row) {
  for (const Cell &cell : row.cells)
    if (cell.pick != Pick::kSame || cell.member[0] != row.cells[0].member[0]) return false;
  return true;
}

NLSSlot choose(const Cell &cell, const NLSSMHandle &handle) {
  const uint32_t number = handle.encodingNumber;
  switch (cell.pick) {
    case Pick::kSame:
      return cell.member[0];
    case Pick::kUtf8OrUtfe:
      return cell.member[number == NLSSM_ENC_UTF8 ? 0 : 1];
    case Pick::kLittleOrBig: {
      const bool big = number == (handle.encodingClass == NLSSM_CLASS_WCS2 ? NLSSM_ENC_WCS2_BE
                                                                           : NLSSM_ENC_WCS4_BE);
      return cell.member[big ? 1 : 0];
    }
    case Pick::kAsciiOrEbcdic:
      return cell.member[(handle.encodingFlags & 1u) ? 0 : 1];
    case Pick::kDbcsVariant:
      if (number == NLSSM_ENC_EUC_JP) return cell.member[1];
      if (number == 119 || number == 120 || number == 159) return cell.member[2];
      if (number == NLSSM_ENC_GB18030) return cell.member[3];
      return cell.member[0];
    case Pick::kNumberForm:
      if (number == NLSSM_ENC_HOST_CHARS) return cell.member[0];
      return cell.member[handle.numberForm == 4 ? 1 : 2];
  }
  return nullptr;
}

}  // namespace

void fill_operation_slots(NLSSMHandle &handle) {
  auto *words = reinterpret_cast<NLSSlot *>(&handle);
  for (const Row &row : kRows) {
    NLSSlot member = nullptr;
    if (handle.encodingClass <= NLSSM_CLASS_MBCS_NONMODAL)
      member = choose(row.cells[handle.encodingClass], handle);
    else if (is_class_independent(row))
      member = row.cells[0].member[0];
    if (member != nullptr) words[row.slot] = member;
  }
}

}  // namespace nlssm::module
