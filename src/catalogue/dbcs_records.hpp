// Layout of the double-byte case tables (<set>_dbtab) and of their
// hexadecimal-digit range records (<set>_xdttab).
#ifndef NLSSM_CATALOGUE_DBCS_RECORDS_HPP
#define NLSSM_CATALOGUE_DBCS_RECORDS_HPP

#include <cstdint>

namespace nlssm::catalogue {

// One double-byte character with a case partner in its code page. `code` is
// the character's two bytes with the lead byte in the high half (for modal
// EBCDIC pages the two bytes between shift-out and shift-in). `lower` and
// `upper` are the codes of its lower- and upper-case forms; one of them is
// `code` itself. Tables are sorted ascending by `code`, without duplicates.
// A value of 0 means "leave the character as it is" (only zero_dbtab has it).
struct DbcsRecord {
  uint16_t code;
  uint16_t lower;
  uint16_t upper;
};
static_assert(sizeof(DbcsRecord) == 6, "three unsigned 16-bit values");

// An inclusive range of double-byte codes that are hexadecimal digits. Each
// <set>_xdttab holds two: the full-width digits 0-9, then the full-width
// letters A-F (8 bytes in all).
struct DbcsRange {
  uint16_t low;
  uint16_t high;
};
static_assert(sizeof(DbcsRange) == 4, "two unsigned 16-bit values");

inline constexpr uint64_t kDbcsRangeCount = 2;

// The record for `code`, or null. Codes outside the table's first-to-last
// range are not searched.
inline const DbcsRecord *dbcs_find(const DbcsRecord *table, uint64_t count, uint16_t code) {
  if (table == nullptr || count == 0 || code < table[0].code || code > table[count - 1].code) {
    return nullptr;
  }
  uint64_t low = 0;
  uint64_t high = count;
  while (low < high) {
    const uint64_t mid = low + (high - low) / 2;
    if (table[mid].code < code) {
      low = mid + 1;
    } else {
      high = mid;
    }
  }
  return low < count && table[low].code == code ? &table[low] : nullptr;
}

// True when `code` lies in one of the `count` ranges.
inline bool dbcs_in_ranges(const DbcsRange *ranges, uint64_t count, uint16_t code) {
  for (uint64_t i = 0; ranges != nullptr && i < count; ++i) {
    if (code >= ranges[i].low && code <= ranges[i].high) return true;
  }
  return false;
}

}  // namespace nlssm::catalogue

#endif  // NLSSM_CATALOGUE_DBCS_RECORDS_HPP
