// Describing encodings: every number against the registry file, and the rows
// whose meaning the module relies on.
#include <gtest/gtest.h>
#include <unicode/ucnv.h>

#include <fstream>
#include <map>
#include <set>
#include <sstream>
#include <vector>

#include "host_test_support.hpp"

using namespace hosttest;

namespace {

std::vector<std::string> fields_of(const std::string &line) {
  std::vector<std::string> fields;
  std::string field;
  std::istringstream in(line);
  while (std::getline(in, field, '\t')) fields.push_back(field);
  return fields;
}

std::map<int, std::vector<std::string>> registry_file() {
  std::map<int, std::vector<std::string>> rows;
  std::ifstream in(NLSSM_REGISTRY_PATH);
  std::string line;
  while (std::getline(in, line))
    if (!line.empty() && line[0] != '#') rows[std::stoi(line)] = fields_of(line);
  return rows;
}

const NLSHostEncodingRecord *describe(void *nls, std::int64_t number, std::int64_t *status) {
  const NLSHostEncodingRecord *record = nullptr;
  *status = call<NLSHostDescribeEncodingFn>(nls, NLSHOST_SLOT_NLS_DESCRIBE, number, &record);
  return record;
}

std::string name_of(const NLSHostEncodingRecord *record) {
  std::string name;
  for (std::uint64_t i = 0; i < record->nameLength; ++i)
    name.push_back(static_cast<char>(record->name[i]));
  return name;
}

std::string canonical(const char *converter) {
  UErrorCode error = U_ZERO_ERROR;
  UConverter *c = ucnv_open(converter, &error);
  std::string name = U_SUCCESS(error) ? ucnv_getName(c, &error) : "";
  if (c != nullptr) ucnv_close(c);
  return name;
}

}  // namespace

TEST(Registry, EveryNumberDescribesAsTheRegistryFileSays) {
  auto host = standalone();
  auto rows = registry_file();
  ASSERT_EQ(rows.size(), 265u);
  std::set<std::string> names;
  int described = 0, listed = 0;
  for (int n = -1; n <= 265; ++n) {
    SCOPED_TRACE(n);
    std::int64_t status = 0;
    const NLSHostEncodingRecord *record = describe(host->nls(), n, &status);
    if (n < 0 || n > 264 || rows[n][4] == "-") {
      EXPECT_EQ(status, NLSHOST_E_NO_ENCODING);
      EXPECT_EQ(record, nullptr);
      continue;
    }
    const auto &f = rows[n];
    ++listed;
    ASSERT_EQ(status, 0);
    ASSERT_NE(record, nullptr);
    ++described;
    EXPECT_EQ(record->number, static_cast<std::uint32_t>(n));
    EXPECT_EQ(name_of(record), f[1]);
    EXPECT_EQ(record->encodingClass, std::stoul(f[4]));
    EXPECT_EQ(record->encodingFlags & 1u, f[5] == "A" ? 1u : 0u);
    EXPECT_EQ(record->blankValue, std::stoul(f[6], nullptr, 16));
    EXPECT_EQ(record->numberForm, std::stoi(f[7]));
    EXPECT_STREQ(record->converterName, f[8].c_str());
    EXPECT_EQ(record->charRanges.shiftLength, std::stoul(f[9]));
    // The name is the module's cache key: at most 13 bytes, one per encoding.
    EXPECT_LE(record->nameLength, 13u);
    if (n != 19) {
      EXPECT_TRUE(names.insert(f[1]).second) << f[1];
    }
  }
  EXPECT_EQ(described, listed);
  EXPECT_GT(described, 160);
}

struct TellingRow {
  int number;
  std::uint32_t encodingClass;
  bool ascii;
  std::uint32_t blank;
  int numberForm;
  const char *icuName;  // ICU's canonical name of the converter, "" for the built-in one
};

class TellingRows : public ::testing::TestWithParam<TellingRow> {};

TEST_P(TellingRows, DescribeAsTheModuleExpects) {
  const TellingRow &row = GetParam();
  auto host = standalone();
  std::int64_t status = 0;
  const NLSHostEncodingRecord *record = describe(host->nls(), row.number, &status);
  ASSERT_EQ(status, 0);
  EXPECT_EQ(record->encodingClass, row.encodingClass);
  EXPECT_EQ((record->encodingFlags & NLSHOST_ENCODING_ASCII) != 0, row.ascii);
  EXPECT_EQ(record->blankValue, row.blank);
  EXPECT_EQ(record->numberForm, row.numberForm);
  if (*row.icuName != '\0') {
    EXPECT_EQ(canonical(record->converterName), row.icuName);
  }
}

INSTANTIATE_TEST_SUITE_P(
    Host, TellingRows,
    ::testing::Values(TellingRow{20, 1, true, 0x20, 0, "UTF-8"},
                      TellingRow{161, 1, false, 0x40, 0, ""},
                      TellingRow{24, 2, true, 0x2000, 4, "UTF-16BE"},
                      TellingRow{25, 2, true, 0x20, 4, "UTF-16LE"},
                      TellingRow{19, 2, true, 0x20, 4, "UTF-16LE"},
                      TellingRow{26, 3, true, 0x20000000, 4, "UTF-32BE"},
                      TellingRow{27, 3, true, 0x20, 0, "UTF-32LE"},
                      TellingRow{62, 0, true, 0x20, 0, "ibm-5348_P100-1997"},
                      TellingRow{29, 0, true, 0x20, 0, "ISO-8859-1"},
                      TellingRow{78, 0, false, 0x40, 0, "ibm-37_P100-1995"},
                      TellingRow{134, 5, true, 0x20, 0, "ibm-33722_P12A_P12A-2009_U2"},
                      TellingRow{119, 5, true, 0x20, 0, "ibm-964_P110-1999"},
                      TellingRow{120, 5, true, 0x20, 0, "ibm-964_P110-1999"},
                      TellingRow{159, 5, true, 0x20, 0, "euc-tw-2014"},
                      TellingRow{205, 5, true, 0x20, 0, "gb18030"},
                      TellingRow{117, 4, false, 0x40, 0, "ibm-937_P110-1999"},
                      TellingRow{135, 5, true, 0x20, 0, "ibm-943_P15A-2003"}),
    [](const auto &info) { return "Encoding" + std::to_string(info.param.number); });

TEST(Registry, ModalSetsShiftWithSoAndSi) {
  auto host = standalone();
  for (int n : {117, 124, 129, 130, 139, 234, 235, 236, 237, 238}) {
    std::int64_t status = 0;
    const NLSHostEncodingRecord *record = describe(host->nls(), n, &status);
    ASSERT_EQ(status, 0) << n;
    EXPECT_EQ(record->charRanges.shiftLength, 1) << n;
    EXPECT_EQ(record->charRanges.shiftOut[0], 0x0E) << n;
    EXPECT_EQ(record->charRanges.shiftIn[0], 0x0F) << n;
    EXPECT_EQ(record->charRanges.dbcsSpace[0], 0x40) << n;
  }
}

TEST(Registry, LookupByNameOrAlias) {
  const auto &registry = nlssm::refhost::Registry::instance();
  EXPECT_EQ(registry.lookup("utf-8"), 20);
  EXPECT_EQ(registry.lookup("cp1252"), 62);
  EXPECT_EQ(registry.lookup("IBM-037"), 78);
  EXPECT_EQ(registry.lookup("UTF-16LE"), 25);
  EXPECT_EQ(registry.lookup("no-such-encoding"), -1);
}
