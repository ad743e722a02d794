// The UTF-8 toolkit's Unicode case tables (generated into case_tables.cpp by
// tools/u8gen) and their lookup.
//
// Every code point maps to one record through two stages: the block index
// (code point >> kCaseBlockShift) picks a block of record numbers, and the
// low bits pick the record. A record holds the simple mappings as
// differences from the code point and, where a full mapping is not the
// simple one (U+00DF to "SS"), the offset of its UTF-8 text in
// kCaseFullText: a length byte followed by the bytes. Offset 0 means none.
#pragma once

#include <cstdint>

namespace kernel::u8 {

struct CaseRecord {
  int32_t upper;
  int32_t lower;
  int32_t fold;
  uint16_t fullUpper;
  uint16_t fullLower;
  uint16_t fullFold;
};

inline constexpr uint32_t kCaseBlockShift = 7;
inline constexpr uint32_t kCaseBlockSize = 1u << kCaseBlockShift;
// No code point at or above this one has a case mapping.
inline constexpr uint32_t kCaseLimit = 0x20000;
// The longest full mapping, in UTF-8 bytes.
inline constexpr int kCaseFullMax = 15;

extern const uint16_t kCaseBlockIndex[kCaseLimit >> kCaseBlockShift];
extern const uint16_t kCaseRecordIndex[];
extern const CaseRecord kCaseRecords[];
extern const uint8_t kCaseFullText[];

inline const CaseRecord &case_record(uint32_t cp) {
  if (cp >= kCaseLimit) return kCaseRecords[0];
  const uint32_t block = kCaseBlockIndex[cp >> kCaseBlockShift];
  return kCaseRecords[kCaseRecordIndex[block * kCaseBlockSize + (cp & (kCaseBlockSize - 1))]];
}

}  // namespace kernel::u8
