// catgen: generates the encoding catalogue (src/catalogue/tables.hpp and the
// *_tables.cpp / trantab.cpp sources) from the code pages named in
// data/catalogue_sets.tsv and data/catalogue/, reading them through ICU.
//
//   catgen --data <project>/data --cnv <dir of built .cnv files> --out <dir>
#include <unicode/uchar.h>
#include <unicode/uclean.h>
#include <unicode/utf8.h>

#include <algorithm>
#include <array>
#include <cstdio>
#include <fstream>
#include <iostream>
#include <map>
#include <memory>
#include <sstream>
#include <stdexcept>
#include <string>
#include <vector>

#include "codepage.hpp"
#include "rules.hpp"

namespace catgen {
namespace {

using Bytes256 = std::array<uint8_t, 256>;

struct SbcsSet {
  std::string name;
  std::string converter;
  bool ebcdic = false;
  Bytes256 lower{}, upper{}, classes{};
};

struct Record {
  uint16_t code, lower, upper;
};

struct DbcsSet {
  std::string name;
  std::vector<Record> records;
  std::array<std::pair<uint16_t, uint16_t>, 2> ranges{};
};

struct Bidi {
  std::string name;
  std::vector<int> numbers;
  std::array<uint32_t, 256> categories{}, reorder{};
  std::array<uint8_t, 8> brackets{}, mirrors{};
};

struct Row {
  int number = 0;
  std::string caseSet, classSet, dbcs;
};

struct Numeric {
  std::vector<uint8_t> noBreakSpace;
  uint8_t apostrophe = 0;
};

struct Catalogue {
  std::vector<SbcsSet> sets;
  std::vector<DbcsSet> dbcs;
  std::vector<Bidi> bidi;
  std::vector<Row> rows;
  std::vector<Numeric> numeric;
  std::array<uint8_t, 20> asciiNumChars{}, ebcdicNumChars{};
  std::array<uint8_t, 4> asciiLikeChars{}, ebcdicLikeChars{};
};

[[noreturn]] void fail(const std::string &message) {
  throw std::runtime_error(message);
}

// ---- Computing the tables ------------------------------------------------

SbcsSet build_sbcs(const TsvRow &row, const std::string &cnvDir) {
  SbcsSet set;
  set.name = row[0];
  set.converter = row[1];
  if (row[2] != "ASCII" && row[2] != "EBCDIC") fail(set.name + ": family must be ASCII or EBCDIC");
  set.ebcdic = row[2] == "EBCDIC";
  const CodePage page(set.converter, cnvDir);
  for (int b = 0; b < 256; ++b) {
    set.lower[b] = set.upper[b] = uint8_t(b);
    const UChar32 c = page.decode_byte(uint8_t(b));
    if (c < 0) continue;
    set.classes[b] = class_bits(c);
    // A case partner is used only when the page has it as a single byte.
    if (u_tolower(c) != c) {
      const int lower = page.encode_byte(u_tolower(c));
      if (lower >= 0) set.lower[b] = uint8_t(lower);
    }
    if (u_toupper(c) != c) {
      const int upper = page.encode_byte(u_toupper(c));
      if (upper >= 0) set.upper[b] = uint8_t(upper);
    }
  }
  // The family is data, but it must agree with where the page keeps 'A'.
  if (page.encode_byte('A') != (set.ebcdic ? 0xC1 : 0x41)) fail(set.name + ": wrong family");
  return set;
}

enum class DbcsForm { kMixed, kModal };

// Only a round-trip mapping counts: a code the page merely falls back to
// for the character reads back as another character in text.
int dbcs_code(const CodePage &page, DbcsForm form, UChar32 c) {
  const std::string s = page.encode(c);
  if (s.empty() || page.decode(s) != c) return -1;
  auto byte = [&](size_t i) { return int(uint8_t(s[i])); };
  switch (form) {
    case DbcsForm::kMixed:
      return s.size() == 2 ? byte(0) << 8 | byte(1) : -1;
    case DbcsForm::kModal:
      return s.size() == 4 && byte(0) == 0x0E && byte(3) == 0x0F ? byte(1) << 8 | byte(2) : -1;
  }
  return -1;
}

// The codes of `count` consecutive characters from `first`, which must be
// consecutive codes in the page.
std::pair<uint16_t, uint16_t> dbcs_run(const CodePage &page, DbcsForm form, UChar32 first,
                                       int count, const std::string &name) {
  const int low = dbcs_code(page, form, first);
  for (int i = 0; i < count; ++i) {
    if (low < 0 || dbcs_code(page, form, first + i) != low + i) {
      fail(name + ": full-width hexadecimal digits are not consecutive double-byte codes");
    }
  }
  return {uint16_t(low), uint16_t(low + count - 1)};
}

// The character that a double-byte code reads as in a page, or -1.
UChar32 dbcs_char(const CodePage &page, DbcsForm form, int code) {
  std::string bytes{char(code >> 8), char(code & 0xFF)};
  if (form == DbcsForm::kModal) bytes = "\x0E" + bytes + "\x0F";
  return page.decode(bytes);
}

// `users`: the code pages of the encodings whose rows carry the table. A
// record is kept only when its code and both cases read as the same
// characters in every one of them, since it is applied to their text.
DbcsSet build_dbcs(const TsvRow &row, const std::string &cnvDir,
                   const std::vector<std::unique_ptr<CodePage>> &users) {
  DbcsSet set;
  set.name = row[0];
  DbcsForm form;
  if (row[2] == "mixed") {
    form = DbcsForm::kMixed;
  } else if (row[2] == "modal") {
    form = DbcsForm::kModal;
  } else {
    fail(set.name + ": unknown form " + row[2]);
  }
  const CodePage page(row[1], cnvDir);
  for (UChar32 c = 0; c <= 0x10FFFF; ++c) {
    const UChar32 lowerChar = u_tolower(c), upperChar = u_toupper(c);
    if (lowerChar == c && upperChar == c) continue;
    const int code = dbcs_code(page, form, c);
    if (code < 0) continue;
    int lower = lowerChar == c ? code : dbcs_code(page, form, lowerChar);
    int upper = upperChar == c ? code : dbcs_code(page, form, upperChar);
    if (lower < 0) lower = code;
    if (upper < 0) upper = code;
    if (lower == code && upper == code) continue;
    const bool sameInUsers = std::all_of(users.begin(), users.end(), [&](const auto &user) {
      return dbcs_char(*user, form, code) == c &&
             dbcs_char(*user, form, lower) == (lower == code ? c : lowerChar) &&
             dbcs_char(*user, form, upper) == (upper == code ? c : upperChar);
    });
    if (!sameInUsers) continue;
    set.records.push_back({uint16_t(code), uint16_t(lower), uint16_t(upper)});
  }
  std::sort(set.records.begin(), set.records.end(),
            [](const Record &a, const Record &b) { return a.code < b.code; });
  for (size_t i = 1; i < set.records.size(); ++i) {
    if (set.records[i].code == set.records[i - 1].code) fail(set.name + ": duplicate code");
  }
  if (set.records.empty()) fail(set.name + ": no cased double-byte characters");
  set.ranges[0] = dbcs_run(page, form, 0xFF10, 10, set.name);  // full-width 0-9
  set.ranges[1] = dbcs_run(page, form, 0xFF21, 6, set.name);   // full-width A-F
  return set;
}

Bidi build_bidi(const TsvRow &row, const std::map<std::string, const SbcsSet *> &sets,
                const std::string &cnvDir) {
  Bidi bidi;
  bidi.name = row[0];
  const auto set = sets.find(row[1]);
  if (set == sets.end()) fail("bidi_" + bidi.name + ": unknown set " + row[1]);
  std::stringstream numbers(row[2]);
  for (int n; numbers >> n;) bidi.numbers.push_back(n);
  const CodePage page(set->second->converter, cnvDir);
  for (int b = 0; b < 256; ++b) {
    const UChar32 c = page.decode_byte(uint8_t(b));
    const uint32_t category = c < 0 ? 0xFFFFFFFFu : bidi_category(c);
    bidi.categories[b] = category;
    bidi.reorder[b] = c >= 0 && bidi_reorder_keeps(c, category) ? category : 0xFFFFFFFFu;
  }
  // The classes the tables are defined to carry win over what the code
  // page's current mapping derives (EBCDIC 424 keeps 0x78 a Hebrew letter).
  std::vector<BidiByteClass> stated = family_bidi_classes(set->second->ebcdic);
  if (row.size() > 3) {
    const std::vector<BidiByteClass> own = parse_bidi_classes(row[3]);
    stated.insert(stated.end(), own.begin(), own.end());
  }
  // The reduced table takes the fixed class where it keeps the byte at all,
  // and always for the right-to-left letters.
  for (const BidiByteClass &run : stated) {
    for (int b = run.first; b <= run.last; ++b) {
      bidi.categories[b] = run.category;
      if (bidi.reorder[b] != 0xFFFFFFFFu || run.category == 3 || run.category == 4)
        bidi.reorder[b] = run.category;
    }
  }
  const char brackets[] = "()[]{}<>";
  for (int i = 0; i < 8; ++i) {
    const int bracket = page.encode_byte(UChar32(brackets[i]));
    const int mirror = page.encode_byte(u_charMirror(UChar32(brackets[i])));
    bidi.brackets[i] = uint8_t(bracket < 0 ? 0 : bracket);
    bidi.mirrors[i] = uint8_t(mirror < 0 ? 0 : mirror);
  }
  return bidi;
}

template <size_t N>
std::array<uint8_t, N> page_chars(const CodePage &page, const char (&chars)[N]) {
  std::array<uint8_t, N> out{};
  for (size_t i = 0; i < N; ++i) {
    const int byte = page.encode_byte(UChar32(uint8_t(chars[i])));
    if (byte < 0) fail(page.name() + " lacks a number or pattern character");
    out[i] = uint8_t(byte);
  }
  return out;
}

Numeric build_numeric(const CodePage &page, bool alwaysBlank) {
  Numeric numeric;
  const std::string blank = page.encode(0x20);
  const std::string noBreak = alwaysBlank ? "" : page.encode(0xA0);
  const std::string &chosen = noBreak.empty() || noBreak.size() > 4 ? blank : noBreak;
  numeric.noBreakSpace.assign(chosen.begin(), chosen.end());
  const int apostrophe = page.encode_byte('\'');
  numeric.apostrophe = uint8_t(apostrophe >= 0 ? apostrophe : uint8_t(blank[0]));
  return numeric;
}

Catalogue build(const std::string &dataDir, const std::string &cnvDir) {
  Catalogue cat;
  std::map<std::string, const SbcsSet *> setByName;
  for (const TsvRow &row : read_tsv(dataDir + "/catalogue_sets.tsv", 3)) {
    cat.sets.push_back(build_sbcs(row, cnvDir));
  }
  for (const SbcsSet &set : cat.sets) {
    if (!setByName.emplace(set.name, &set).second) fail("duplicate set " + set.name);
  }
  std::map<std::string, const DbcsSet *> dbcsByName;
  // The converters of the encodings that use each double-byte table: the
  // table set column of encodings.tsv names it after a '+'.
  std::map<std::string, std::vector<std::unique_ptr<CodePage>>> dbcsUsers;
  for (const TsvRow &row : read_tsv(dataDir + "/encodings.tsv", 9)) {
    const size_t plus = row[3].find('+');
    const std::string &converter = row[8];
    if (plus == std::string::npos || converter == "-" || converter.find(':') != std::string::npos)
      continue;
    dbcsUsers[row[3].substr(plus + 1)].push_back(std::make_unique<CodePage>(converter, cnvDir));
  }
  for (const TsvRow &row : read_tsv(dataDir + "/catalogue/dbcs_sets.tsv", 3)) {
    cat.dbcs.push_back(build_dbcs(row, cnvDir, dbcsUsers[row[0]]));
  }
  for (const DbcsSet &set : cat.dbcs) dbcsByName.emplace(set.name, &set);
  for (const TsvRow &row : read_tsv(dataDir + "/catalogue/bidi_tables.tsv", 3)) {
    cat.bidi.push_back(build_bidi(row, setByName, cnvDir));
  }

  for (const TsvRow &fields : read_tsv(dataDir + "/catalogue/trantab.tsv", 4)) {
    Row row{std::stoi(fields[0]), fields[1], fields[2], fields[3]};
    if (row.number != int(cat.rows.size())) fail("trantab rows must run 0, 1, 2, ...");
    auto known = [&](const std::string &name, const char *extra) {
      return name == "-" || name == extra || setByName.count(name);
    };
    if (!known(row.caseSet, "idty") || !known(row.classSet, "zero") ||
        (row.dbcs != "-" && row.dbcs != "zero" && !dbcsByName.count(row.dbcs))) {
      fail("trantab row " + fields[0] + " names an unknown table");
    }
    cat.rows.push_back(row);
  }
  if (cat.rows.size() != 266) fail("trantab needs rows 0 to 265");

  std::map<int, TsvRow> overrides;
  for (const TsvRow &row : read_tsv(dataDir + "/catalogue/numeric.tsv", 3)) {
    overrides[std::stoi(row[0])] = row;
  }
  std::map<std::string, std::unique_ptr<CodePage>> pages;
  auto page = [&](const std::string &name) -> const CodePage & {
    auto &slot = pages[name];
    if (!slot) slot = std::make_unique<CodePage>(name, cnvDir);
    return *slot;
  };
  for (const Row &row : cat.rows) {
    const auto override = overrides.find(row.number);
    if (override != overrides.end()) {
      cat.numeric.push_back(
          build_numeric(page(override->second[1]), override->second[2] == "blank"));
    } else if (setByName.count(row.caseSet)) {
      cat.numeric.push_back(build_numeric(page(setByName[row.caseSet]->converter), false));
    } else {
      cat.numeric.push_back(build_numeric(page("US-ASCII"), false));
    }
  }
  static const char kNumChars[20] = {'0', '1', '2', '3', '4', '5',  '6', '7', '8',  '9',
                                     ' ', '-', '+', '.', ',', '\0', 'E', 'e', '\'', '*'};
  static const char kLikeChars[4] = {'%', '_', '\\', '\0'};
  cat.asciiNumChars = page_chars(page("US-ASCII"), kNumChars);
  cat.ebcdicNumChars = page_chars(page("ibm-37"), kNumChars);
  cat.asciiLikeChars = page_chars(page("US-ASCII"), kLikeChars);
  cat.ebcdicLikeChars = page_chars(page("ibm-37"), kLikeChars);
  return cat;
}

// ---- Writing the sources ---------------------------------------------------------

const char kBanner[] =
    "// Generated by tools/catgen from data/catalogue_sets.tsv and data/catalogue/.\n"
    "// Do not edit: change the data or the generator and build the\n"
    "// regenerate_catalogue target.\n"
    "// clang-format off\n";

std::string hex(unsigned value, int digits) {
  char buffer[16];
  std::snprintf(buffer, sizeof buffer, "0x%0*X", digits, value);
  return buffer;
}

template <typename T, typename Format>
void write_values(std::ostream &out, const T *values, size_t count, size_t perLine, Format format) {
  for (size_t i = 0; i < count; ++i) {
    out << (i % perLine == 0 ? "    " : " ") << format(values[i]) << ',';
    if (i % perLine == perLine - 1 || i == count - 1) out << '\n';
  }
}

void write_bytes(std::ostream &out, const uint8_t *values, size_t count) {
  write_values(out, values, count, 16, [](uint8_t v) { return hex(v, 2); });
}

void write_categories(std::ostream &out, const uint32_t *values) {
  write_values(out, values, 256, 16, [](uint32_t v) {
    return v == 0xFFFFFFFFu ? std::string("  X")
                            : (v < 10    ? "  "
                               : v < 100 ? " "
                                         : "") +
                                  std::to_string(v);
  });
}

std::string header(const Catalogue &cat) {
  std::ostringstream out;
  out << kBanner << "#ifndef NLSSM_CATALOGUE_TABLES_HPP\n#define NLSSM_CATALOGUE_TABLES_HPP\n\n"
      << "#include \"catalogue/catalogue.hpp\"\n\nnamespace nlssm::catalogue {\n\n"
      << "// Single-byte sets: <set>_lcs, <set>_ucs, <set>_ccl.\n";
  for (const SbcsSet &s : cat.sets) {
    out << "extern const uint8_t " << s.name << "_lcs[256], " << s.name << "_ucs[256], " << s.name
        << "_ccl[256];\n";
  }
  out << "\n// Double-byte case tables and their hexadecimal-digit ranges.\n";
  for (const DbcsSet &s : cat.dbcs) {
    out << "extern const DbcsRecord " << s.name << "_dbtab[" << s.records.size() << "];\n"
        << "extern const DbcsRange " << s.name << "_xdttab[2];\n";
  }
  out << "\n// Single-byte bidirectional tables.\n";
  for (const Bidi &b : cat.bidi) out << "extern const BidiTable bidi_" << b.name << ";\n";

  out << "\ninline constexpr SbcsSet sbcs_sets[] = {\n";
  for (const SbcsSet &s : cat.sets) {
    out << "    {\"" << s.name << "\", " << s.name << "_lcs, " << s.name << "_ucs, " << s.name
        << "_ccl},\n";
  }
  out << "};\n\ninline constexpr DbcsSet dbcs_sets[] = {\n";
  for (const DbcsSet &s : cat.dbcs) {
    out << "    {\"" << s.name << "\", " << s.name << "_dbtab, " << s.records.size() << ", "
        << s.name << "_xdttab},\n";
  }
  out << "};\n\n// Encoding numbers that select a bidirectional table.\n"
      << "inline constexpr BidiSelection bidi_selection[] = {\n";
  for (const Bidi &b : cat.bidi) {
    for (int n : b.numbers) {
      out << "    {" << n << ", \"" << b.name << "\", &bidi_" << b.name << "},\n";
    }
  }
  out << "};\n\n}  // namespace nlssm::catalogue\n\n#endif  // NLSSM_CATALOGUE_TABLES_HPP\n";
  return out.str();
}

std::string source_prologue() {
  return std::string(kBanner) +
         "#include \"catalogue/tables.hpp\"\n\nnamespace nlssm::catalogue {\n";
}

const char kEpilogue[] = "\n}  // namespace nlssm::catalogue\n";

std::string sbcs_source(const Catalogue &cat, bool ebcdic) {
  std::ostringstream out;
  out << source_prologue();
  for (const SbcsSet &s : cat.sets) {
    if (s.ebcdic != ebcdic) continue;
    out << "\n// " << s.name << ": " << s.converter << "\n";
    const std::pair<const char *, const Bytes256 *> tables[] = {
        {"_lcs", &s.lower}, {"_ucs", &s.upper}, {"_ccl", &s.classes}};
    for (const auto &[suffix, bytes] : tables) {
      out << "const uint8_t " << s.name << suffix << "[256] = {\n";
      write_bytes(out, bytes->data(), 256);
      out << "};\n";
    }
  }
  out << kEpilogue;
  return out.str();
}

std::string dbcs_source(const Catalogue &cat) {
  std::ostringstream out;
  out << source_prologue();
  for (const DbcsSet &s : cat.dbcs) {
    out << "\n// " << s.name << ": {code, lower, upper}\n"
        << "const DbcsRecord " << s.name << "_dbtab[" << s.records.size() << "] = {\n";
    write_values(out, s.records.data(), s.records.size(), 3, [](const Record &r) {
      return "{" + hex(r.code, 4) + ", " + hex(r.lower, 4) + ", " + hex(r.upper, 4) + "}";
    });
    out << "};\nconst DbcsRange " << s.name << "_xdttab[2] = {{" << hex(s.ranges[0].first, 4)
        << ", " << hex(s.ranges[0].second, 4) << "}, {" << hex(s.ranges[1].first, 4) << ", "
        << hex(s.ranges[1].second, 4) << "}};\n";
  }
  out << kEpilogue;
  return out.str();
}

std::string bidi_source(const Catalogue &cat) {
  std::ostringstream out;
  out << source_prologue() << "\nnamespace {\nconstexpr uint32_t X = kBidiNone;\n}  // namespace\n";
  for (const Bidi &b : cat.bidi) {
    out << "\nconst BidiTable bidi_" << b.name << " = {\n  {\n";
    write_categories(out, b.categories.data());
    out << "  },\n  {\n";
    write_bytes(out, b.brackets.data(), 8);
    out << "  },\n  {\n";
    write_bytes(out, b.mirrors.data(), 8);
    out << "  },\n  {\n";
    write_categories(out, b.reorder.data());
    out << "  },\n};\n";
  }
  out << kEpilogue;
  return out.str();
}

std::string trantab_source(const Catalogue &cat) {
  std::ostringstream out;
  out << source_prologue();
  Bytes256 identity{}, utf8Length{};
  for (int b = 0; b < 256; ++b) {
    identity[b] = uint8_t(b);
    utf8Length[b] = b == 0            ? 0
                    : U8_IS_SINGLE(b) ? 1
                    : U8_IS_LEAD(b)   ? uint8_t(1 + U8_COUNT_TRAIL_BYTES(b))
                                      : 0;
  }
  out << "\nconst uint8_t idty_tbl[256] = {\n";
  write_bytes(out, identity.data(), 256);
  out << "};\n\nconst uint8_t zero_ccl[256] = {};\n\nconst DbcsRecord zero_dbtab[1] = {{0, 0, "
         "0}};\n"
      << "\nconst uint8_t euc_db1st[6] = {0x8E, 0x8E, 0xA1, 0xFE, 0x00, 0x00};\n"
      << "const uint8_t euc_db2nd[4] = {0xA1, 0xFE, 0x00, 0x00};\n"
      << "\nconst uint8_t lead_utf8_len[256] = {\n";
  write_bytes(out, utf8Length.data(), 256);
  out << "};\n\n// The digits, blank, - + . , NUL E e ' *\n";
  out << "const uint8_t SM_ASCII_chars[20] = {\n";
  write_bytes(out, cat.asciiNumChars.data(), 20);
  out << "};\nconst uint8_t SM_EBCDIC_chars[20] = {\n";
  write_bytes(out, cat.ebcdicNumChars.data(), 20);
  out << "};\n\n// % _ \\ NUL\nconst uint8_t LIKE_ASCII_chars[4] = {\n";
  write_bytes(out, cat.asciiLikeChars.data(), 4);
  out << "};\nconst uint8_t LIKE_EBCDIC_chars[4] = {\n";
  write_bytes(out, cat.ebcdicLikeChars.data(), 4);
  out << "};\n\n// {no-break space bytes, their count, apostrophe}\n"
      << "const NumSpecialChars NLSNumSpecialChars[kTrantabRows] = {\n";
  for (size_t n = 0; n < cat.numeric.size(); ++n) {
    const Numeric &num = cat.numeric[n];
    out << "    {{";
    for (size_t i = 0; i < 4; ++i) {
      out << (i ? ", " : "") << hex(i < num.noBreakSpace.size() ? num.noBreakSpace[i] : 0, 2);
    }
    out << "}, " << num.noBreakSpace.size() << ", " << hex(num.apostrophe, 2) << ", {}},  // " << n
        << "\n";
  }
  out << "};\n\n// {lower, upper, fold, class, double-byte table, its count, ranges, their count}\n"
      << "const TrantabRow sm_trantab[kTrantabRows] = {\n";
  for (const Row &row : cat.rows) {
    std::string lower = "nullptr", upper = "nullptr", classes = "nullptr", dbcs = "nullptr",
                count = "0", ext = "nullptr", extCount = "0";
    if (row.caseSet == "idty") {
      lower = upper = "idty_tbl";
    } else if (row.caseSet != "-") {
      lower = row.caseSet + "_lcs";
      upper = row.caseSet + "_ucs";
    }
    if (row.classSet == "zero") {
      classes = "zero_ccl";
    } else if (row.classSet != "-") {
      classes = row.classSet + "_ccl";
    }
    if (row.dbcs == "zero") {
      dbcs = "zero_dbtab";
      count = "1";
    } else if (row.dbcs != "-") {
      dbcs = row.dbcs + "_dbtab";
      for (const DbcsSet &s : cat.dbcs) {
        if (s.name == row.dbcs) count = std::to_string(s.records.size());
      }
      ext = row.dbcs + "_xdttab";
      extCount = "2";
    }
    out << "    {" << lower << ", " << upper << ", " << lower << ", " << classes << ", " << dbcs
        << ", " << count << ", " << ext << ", " << extCount << "},  // " << row.number << "\n";
  }
  out << "};\n" << kEpilogue;
  return out.str();
}

void write_file(const std::string &dir, const std::string &name, const std::string &text) {
  std::ofstream out(dir + "/" + name, std::ios::binary);
  out << text;
  if (!out) fail("cannot write " + dir + "/" + name);
}

int run(int argc, char **argv) {
  std::string dataDir, cnvDir, outDir;
  for (int i = 1; i + 1 < argc; i += 2) {
    const std::string option = argv[i];
    if (option == "--data") {
      dataDir = argv[i + 1];
    } else if (option == "--cnv") {
      cnvDir = argv[i + 1];
    } else if (option == "--out") {
      outDir = argv[i + 1];
    }
  }
  if (dataDir.empty() || outDir.empty()) {
    std::cerr << "usage: catgen --data DIR [--cnv DIR] --out DIR\n";
    return 2;
  }
  const Catalogue cat = build(dataDir, cnvDir);
  write_file(outDir, "tables.hpp", header(cat));
  write_file(outDir, "sbcs_ascii_tables.cpp", sbcs_source(cat, false));
  write_file(outDir, "sbcs_ebcdic_tables.cpp", sbcs_source(cat, true));
  write_file(outDir, "dbcs_tables.cpp", dbcs_source(cat));
  write_file(outDir, "bidi_tables.cpp", bidi_source(cat));
  write_file(outDir, "trantab.cpp", trantab_source(cat));
  return 0;
}

}  // namespace
}  // namespace catgen

int main(int argc, char **argv) {
  int status = 1;
  try {
    status = catgen::run(argc, argv);
  } catch (const std::exception &error) {
    std::cerr << "catgen: " << error.what() << '\n';
  }
  u_cleanup();
  return status;
}
