// Shared helpers of the catalogue tests: the generator's input data and the
// code pages behind it.
#ifndef NLSSM_TESTS_CATALOGUE_SUPPORT_HPP
#define NLSSM_TESTS_CATALOGUE_SUPPORT_HPP

#include <map>
#include <memory>
#include <string>

#include "codepage.hpp"

namespace catalogue_test {

struct PageInfo {
  std::string converter;
  std::string family;  // "ASCII", "EBCDIC", or a double-byte form
};

// data/catalogue_sets.tsv (`doubleByte` false) or data/catalogue/dbcs_sets.tsv.
inline std::map<std::string, PageInfo> load_sets(bool doubleByte) {
  const std::string path = std::string(NLSSM_DATA_DIR) +
                           (doubleByte ? "/catalogue/dbcs_sets.tsv" : "/catalogue_sets.tsv");
  std::map<std::string, PageInfo> sets;
  for (const auto &row : catgen::read_tsv(path, 3)) sets[row[0]] = {row[1], row[2]};
  return sets;
}

inline std::unique_ptr<catgen::CodePage> open_page(const std::string &converter) {
  return std::make_unique<catgen::CodePage>(converter, NLSSM_CATALOGUE_CNV_DIR);
}

}  // namespace catalogue_test

#endif
