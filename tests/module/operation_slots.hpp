// The operation table as data: for each slot, the member each encoding
// class expects, with the rule that picks among several.
#pragma once

#include <nlssm/nlssm.h>

#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace nlssm::testing {

struct SlotRow {
  int slot = 0;
  std::string operation;
  std::string cells[6];
};

inline std::vector<SlotRow> load_operation_slots(const std::string &path) {
  std::vector<SlotRow> rows;
  std::ifstream in(path);
  std::string line;
  while (std::getline(in, line)) {
    if (line.empty() || line[0] == '#') continue;
    std::istringstream fields(line);
    SlotRow row;
    std::string slot;
    std::getline(fields, slot, '\t');
    row.slot = std::stoi(slot);
    std::getline(fields, row.operation, '\t');
    for (std::string &cell : row.cells) std::getline(fields, cell, '\t');
    rows.push_back(row);
  }
  return rows;
}

inline std::vector<std::string> split(const std::string &text, const std::string &separator) {
  std::vector<std::string> parts;
  size_t start = 0;
  for (size_t at; (at = text.find(separator, start)) != std::string::npos;
       start = at + separator.size())
    parts.push_back(text.substr(start, at - start));
  parts.push_back(text.substr(start));
  return parts;
}

inline std::string after(const std::string &text, const std::string &prefix) {
  return text.substr(text.find(prefix) + prefix.size());
}

// The member name a cell gives for the handle; empty for "not set".
inline std::string expected_member(const std::string &cell, const NLSSMHandle &handle) {
  const uint32_t number = handle.encodingNumber;
  const uint32_t cls = handle.encodingClass;
  if (cell.rfind("A: ", 0) == 0) {
    auto parts = split(cell, ", E: ");
    return (handle.encodingFlags & 1u) ? after(parts[0], "A: ") : parts[1];
  }
  if (cell.rfind("for 27 ", 0) == 0) {
    auto parts = split(cell, "; ");
    if (number == NLSSM_ENC_HOST_CHARS) return after(parts[0], "for 27 ");
    if (handle.numberForm == 4) return after(parts[1], "swap form ");
    return after(parts[2], "others ");
  }
  auto names = split(cell, " / ");
  std::string name = names[0];
  if (names.size() == 2 && cls == NLSSM_CLASS_UTF8) {
    name = number == NLSSM_ENC_UTF8 ? names[0] : names[1];
  } else if (names.size() == 2) {
    const bool big = number == (cls == NLSSM_CLASS_WCS2 ? NLSSM_ENC_WCS2_BE : NLSSM_ENC_WCS4_BE);
    name = big ? names[1] : names[0];
  } else if (names.size() == 4) {
    if (number == NLSSM_ENC_EUC_JP)
      name = names[1];
    else if (number == 119 || number == 120 || number == 159)
      name = names[2];
    else if (number == NLSSM_ENC_GB18030)
      name = names[3];
  }
  return name == "not set" ? std::string() : name;
}

}  // namespace nlssm::testing
