#include "codepage.hpp"

#include <fstream>
#include <sstream>
#include <stdexcept>

namespace catgen {

std::vector<TsvRow> read_tsv(const std::string &path, size_t minFields) {
  std::ifstream in(path);
  if (!in) throw std::runtime_error("cannot read " + path);
  std::vector<TsvRow> rows;
  std::string line;
  int lineNumber = 0;
  while (std::getline(in, line)) {
    ++lineNumber;
    if (line.empty() || line[0] == '#') continue;
    TsvRow row;
    std::stringstream fields(line);
    std::string field;
    while (std::getline(fields, field, '\t')) row.push_back(field);
    if (row.size() < minFields) {
      throw std::runtime_error(path + ":" + std::to_string(lineNumber) + ": expected " +
                               std::to_string(minFields) + " fields");
    }
    rows.push_back(std::move(row));
  }
  return rows;
}

CodePage::CodePage(const std::string &name, const std::string &cnvDir) : name_(name) {
  UErrorCode status = U_ZERO_ERROR;
  const std::string file = cnvDir + "/" + name + ".cnv";
  if (!cnvDir.empty() && std::ifstream(file).good()) {
    cnv_ = ucnv_openPackage((cnvDir + "/").c_str(), name.c_str(), &status);
  } else {
    cnv_ = ucnv_open(name.c_str(), &status);
  }
  if (U_FAILURE(status) || cnv_ == nullptr) {
    throw std::runtime_error("cannot open code page " + name + ": " + u_errorName(status));
  }
  status = U_ZERO_ERROR;
  ucnv_setToUCallBack(cnv_, UCNV_TO_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &status);
  ucnv_setFromUCallBack(cnv_, UCNV_FROM_U_CALLBACK_STOP, nullptr, nullptr, nullptr, &status);
  ucnv_setFallback(cnv_, false);
  if (U_FAILURE(status)) throw std::runtime_error("cannot set up " + name);
}

CodePage::~CodePage() {
  ucnv_close(cnv_);
}

UChar32 CodePage::decode(const std::string &bytes) const {
  UChar units[8];
  UErrorCode status = U_ZERO_ERROR;
  const int32_t n = ucnv_toUChars(cnv_, units, 8, bytes.data(), int32_t(bytes.size()), &status);
  if (U_FAILURE(status) || n <= 0 || n > 2) return -1;
  UChar32 c;
  int32_t i = 0;
  U16_NEXT(units, i, n, c);
  return i == n && !U_IS_SURROGATE(c) ? c : -1;
}

std::string CodePage::encode(UChar32 c) const {
  UChar units[2];
  int32_t length = 0;
  U16_APPEND_UNSAFE(units, length, c);
  char bytes[32];
  UErrorCode status = U_ZERO_ERROR;
  const int32_t n = ucnv_fromUChars(cnv_, bytes, sizeof bytes, units, length, &status);
  if (U_FAILURE(status) || n <= 0) return "";
  std::string result(bytes, size_t(n));
  return decode(result) == c ? result : "";
}

int CodePage::encode_byte(UChar32 c) const {
  const std::string bytes = encode(c);
  return bytes.size() == 1 ? int(uint8_t(bytes[0])) : -1;
}

}  // namespace catgen
