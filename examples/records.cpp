// Fixed-length EBCDIC records with the C++ layer: each 36-byte record of
// code page 037 holds a name (16 bytes), a city (12) and an amount (8), as a
// mainframe data set would. The program builds the records, then reads them
// back field by field: orders them by name, finds the records of one city
// whatever the case, shows their names in upper case, sums their amounts,
// and prints the total formatted in the same code page.
#include <nlssm/nlssm.hpp>

#include <algorithm>
#include <cstdio>
#include <vector>

namespace {

constexpr int kName = 16, kCity = 12, kAmount = 8;

// One field of a record, padded with blanks to its width.
nlssm::Result<nlssm::Text> field(nlssm::Encoding ebcdic, const char *utf8, int width) {
  auto text = nlssm::Text::from_utf8(ebcdic, utf8);
  if (!text) return text.status();
  auto fitted = text->move_to(width);
  if (!fitted) return fitted.status();
  if (!fitted->complete) return nlssm::Status(NLSSM_E_DEST_TOO_SMALL);
  return fitted->text;
}

}  // namespace

int main() {
  nlssm::Host host = nlssm::Host::start();
  auto ebcdic = host.encoding("IBM-037");
  if (!ebcdic) {
    std::fprintf(stderr, "no handle: %s\n", ebcdic.status().name());
    return 1;
  }
  const char *rows[][3] = {{"Jürgen Weiß", "ZÜRICH", "1250"},
                           {"Ana Peña", "Madrid", "-75"},
                           {"Søren Ørsted", "zürich", "310"}};
  std::vector<nlssm::Text> records;
  for (const auto &row : rows) {
    auto name = field(*ebcdic, row[0], kName);
    auto city = field(*ebcdic, row[1], kCity);
    auto amount = field(*ebcdic, row[2], kAmount);
    if (!name || !city || !amount) return 1;
    auto record = name->concat(*city, *amount);
    if (!record) return 1;
    records.push_back(*record);
  }

  // In order of the names (the first field), as the code page orders bytes.
  std::sort(records.begin(), records.end(), [](const nlssm::Text &a, const nlssm::Text &b) {
    return a.compare(b).value_or(nlssm::Order{}).sign < 0;
  });

  auto wanted = nlssm::Text::from_utf8(*ebcdic, "Zürich");
  if (!wanted) return 1;
  std::int64_t total = 0;
  for (const nlssm::Text &record : records) {
    auto name = record.substr(0, kName);
    auto city = record.substr(kName, kCity);
    auto amount = record.substr(kName + kCity, kAmount);
    if (!name || !city || !amount) return 1;
    // Caseless, the field's trailing blanks allowed.
    if (!city->equals(*wanted, true).value_or(false)) continue;
    const auto value = amount->to_integer(true);
    if (!value) {
      std::fprintf(stderr, "bad amount: %s\n", value.status().name());
      return 1;
    }
    total += *value;
    name->strip();
    if (!name->upper()) return 1;
    const auto blank = name->find_literal(' ');
    std::printf("%s: surname from character %lld, amount %lld\n",
                name->to_utf8().value_or("?").c_str(),
                static_cast<long long>(blank.value_or(-1) + 1), static_cast<long long>(*value));
  }
  auto shown = nlssm::Text::from_integer(*ebcdic, total, 10, NLSHOST_NUMBER_GROUPING);
  if (!shown) return 1;
  std::printf("total for %s: [%s] (", wanted->to_utf8().value_or("?").c_str(),
              shown->to_utf8().value_or("?").c_str());
  for (std::uint8_t b : shown->bytes()) std::printf("%02X", b);
  std::printf(" in code page 037)\n");
  return 0;
}
