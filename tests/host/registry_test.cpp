// Describing encodings: every number against the registry file, and the rows
// whose meaning the module relies on.
#include <gtest/gtest.h>

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

TEST(Registry, LookupByNameOrAlias) {
  const auto &registry = nlssm::refhost::Registry::instance();
  EXPECT_EQ(registry.lookup("utf-8"), 20);
  EXPECT_EQ(registry.lookup("cp1252"), 62);
  EXPECT_EQ(registry.lookup("IBM-037"), 78);
  EXPECT_EQ(registry.lookup("UTF-16LE"), 25);
  EXPECT_EQ(registry.lookup("no-such-encoding"), -1);
}
