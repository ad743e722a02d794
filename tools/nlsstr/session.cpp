#include "session.hpp"

#include <nlssm/host.h>
#include <nlssm/nlssm.hpp>

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <iostream>

namespace nlsstr {
namespace {

template <typename Fn>
Fn slot_of(void *object, int n) {
  return reinterpret_cast<Fn>(NLSSM_HOST_SLOT(object, n));
}

int hex_digit(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  return -1;
}

std::vector<uint8_t> parse_hex(const std::string &text) {
  std::vector<uint8_t> bytes;
  int high = -1;
  for (char c : text) {
    if (c == ' ' || c == ':' || c == ',') continue;
    const int digit = hex_digit(c);
    if (digit < 0) throw Failure("not a hex digit in --hex: '" + std::string(1, c) + "'");
    if (high < 0) {
      high = digit;
    } else {
      bytes.push_back(static_cast<uint8_t>(high * 16 + digit));
      high = -1;
    }
  }
  if (high >= 0) throw Failure("--hex needs an even number of digits");
  return bytes;
}

}  // namespace

std::string status_name(int64_t status) {
  if (status == 0 || status < 0 || status > UINT32_MAX) return {};
  return nlssm::Status(static_cast<uint32_t>(status)).name();
}

void check(int64_t status, const std::string &what) {
  if (status != 0) throw Failure(what + " failed", status);
}

std::string hex(const uint8_t *bytes, size_t length) {
  std::string out;
  char buffer[4];
  for (size_t i = 0; i < length; ++i) {
    std::snprintf(buffer, sizeof buffer, i ? " %02X" : "%02X", bytes[i]);
    out += buffer;
  }
  return out;
}

std::string Arguments::option(const std::string &name, const std::string &fallback) const {
  const auto found = options.find(name);
  return found == options.end() ? fallback : found->second;
}

int64_t Arguments::number(const std::string &name, int64_t fallback) const {
  if (!has(name)) return fallback;
  try {
    return std::stoll(option(name), nullptr, 0);
  } catch (const std::exception &) {
    throw Failure("--" + name + " takes a number");
  }
}

NLSString descriptor(const NLSSMHandle *handle, std::vector<uint8_t> &bytes, int64_t start) {
  NLSString s{};
  s.buffer = bytes.data();
  s.length = s.capacity = bytes.size();
  s.curOffset = bytes.empty() ? NLSSM_POS_NONE : 0;
  s.nextOffset = NLSSM_POS_NONE;
  s.prevOffset = NLSSM_POS_NO_PREVIOUS;
  using SetPos = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, int64_t);
  if (!bytes.empty()) call<SetPos>(handle, handle->stringSetPos, &s, start, int64_t{0});
  return s;
}

Session::Session() : host_(nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module())) {
  if (host_->module() == nullptr) throw Failure("the module could not be started");
}

Session::~Session() {
  for (const auto &[pair, converter] : converters_)
    slot_of<NLSHostConverterDestroyFn>(converter, NLSHOST_SLOT_CONVERTER_DESTROY)(converter);
}

void Session::begin(const Arguments &args, Pieces pieces) {
  if (args.has("records") && args.has("lines"))
    throw Failure("give --records or --lines, not both");
  split_ = pieces == Pieces::kWhole ? Split::kWhole : Split::kPieces;
  if (args.has("lines")) split_ = Split::kLines;
  if (args.has("records")) {
    split_ = Split::kRecords;
    try {
      record_bytes_ = std::stoull(args.option("records"));
    } catch (const std::exception &) {
      record_bytes_ = 0;
    }
    if (record_bytes_ == 0) throw Failure("--records takes a record length in bytes");
  }
  file_ = args.option("file");
  // Raw records of a mapping verb follow each other in its output as they
  // do in the input: a batch of them gives the same bytes at a fraction of
  // the cost of one call per record.
  batch_ =
      pieces == Pieces::kMaps && split_ == Split::kRecords && output_form(args) == OutputForm::kRaw;
}

bool Session::more() {
  const bool again = took_ && stream_ != nullptr && stream_->more();
  took_ = false;
  return again;
}

bool Session::more_pieces() {
  return stream_ != nullptr && stream_->more_pieces();
}

int64_t Session::record() const {
  return stream_ != nullptr ? stream_->record() : 0;
}

int64_t Session::records() const {
  return stream_ != nullptr ? stream_->records() : 0;
}

void Session::finish() {
  if (stream_ != nullptr) stream_->finish();
}

int Session::encoding_number(const std::string &encoding) const {
  if (!encoding.empty() && encoding.find_first_not_of("0123456789") == std::string::npos)
    return std::stoi(encoding);
  const int number = nlssm::refhost::ReferenceHost::registry().lookup(encoding);
  if (number < 0) throw Failure("unknown encoding '" + encoding + "'");
  return number;
}

const NLSSMHandle *Session::handle(const std::string &encoding) {
  const auto known = handles_.find(encoding);
  if (known != handles_.end()) return known->second;
  NLSSMHandle *handle = nullptr;
  check(host_->create_handle(encoding_number(encoding), &handle),
        "creating a handle for encoding " + encoding);
  if (handle == nullptr) throw Failure("no handle for encoding " + encoding);
  handles_.emplace(encoding, handle);
  return handle;
}

std::vector<uint8_t> Session::convert(int64_t from, int64_t to,
                                      const std::vector<uint8_t> &text) const {
  void *&converter = converters_[{from, to}];
  if (converter == nullptr) {
    void *nls = host_->nls();
    converter = slot_of<NLSHostConverterBetweenFn>(nls, NLSHOST_SLOT_NLS_CONVERTER_BETWEEN)(
        nls, from, to, nullptr, nullptr);
  }
  if (converter == nullptr) {
    converters_.erase({from, to});
    throw Failure("no converter between the encodings", NLSSM_E_ENCODING);
  }
  std::vector<uint8_t> out(text.size() * 4 + 16);
  uint64_t produced = 0;
  const int64_t status =
      slot_of<NLSHostConverterConvertFn>(converter, NLSHOST_SLOT_CONVERTER_CONVERT)(
          converter, text.data(), text.size(), out.data(), out.size(), &produced, nullptr);
  check(status, "converting the text");
  out.resize(produced);
  return out;
}

std::vector<uint8_t> Session::encoded(const NLSSMHandle *handle, const std::string &utf8) {
  // Verbs convert their words again for every record: keep the last few.
  const auto key = std::make_pair(static_cast<int64_t>(handle->encodingNumber), utf8);
  const auto known = texts_.find(key);
  if (known != texts_.end()) return known->second;
  std::vector<uint8_t> text = convert(NLSSM_ENC_UTF8, handle->encodingNumber,
                                      std::vector<uint8_t>(utf8.begin(), utf8.end()));
  if (texts_.size() < 64 && utf8.size() < 4096) texts_.emplace(key, text);
  return text;
}

std::vector<uint8_t> Session::input(const NLSSMHandle *handle, const Arguments &args) {
  if (args.has("text")) return encoded(handle, args.options.at("text"));
  if (args.has("hex")) return parse_hex(args.options.at("hex"));
  if (stream_ == nullptr) {
    int fd = STDIN_FILENO;
    if (!file_.empty() && (fd = open(file_.c_str(), O_RDONLY | O_CLOEXEC)) < 0)
      throw Failure("cannot read " + file_ + ": " + std::strerror(errno), 0, kExitInput);
    stream_ = std::make_unique<Stream>(split_, record_bytes_, batch_, fd, !file_.empty(),
                                       file_.empty() ? "standard input" : file_);
  }
  took_ = true;
  std::vector<uint8_t> text = stream_->next(handle);
  if (text.capacity() == 0) text.reserve(1);  // an empty line still has a buffer to point at
  return text;
}

OutputForm Session::output_form(const Arguments &args) {
  const std::string form = args.option("out", "utf8");
  if (form == "utf8") return OutputForm::kUtf8;
  if (form == "hex") return OutputForm::kHex;
  if (form == "raw") return OutputForm::kRaw;
  if (form == "both") return OutputForm::kBoth;
  throw Failure("--out takes utf8, hex, raw or both");
}

// What follows a text printed from the input: records and whole texts
// print one per line, a line printed raw keeps its own newline, and the
// pieces of a long text follow each other with one newline at the end.
void Session::print_line_end(OutputForm form) const {
  const Split split = took_ && stream_ != nullptr ? stream_->split() : Split::kWhole;
  if (split == Split::kPieces && stream_->more_pieces()) {
    if (form == OutputForm::kHex) std::cout << ' ';
    if (form != OutputForm::kBoth) return;
  }
  if (form != OutputForm::kRaw) {
    std::cout << '\n';
  } else if (split == Split::kLines) {
    const std::vector<uint8_t> &end = stream_->line_end();
    std::cout.write(reinterpret_cast<const char *>(end.data()), std::ssize(end));
  }
}

void Session::print_text(const NLSSMHandle *handle, const std::vector<uint8_t> &text,
                         OutputForm form) const {
  if (form == OutputForm::kHex || form == OutputForm::kBoth)
    std::cout << hex(text.data(), text.size()) << (form == OutputForm::kBoth ? "  " : "");
  if (form == OutputForm::kRaw)
    std::cout.write(reinterpret_cast<const char *>(text.data()), std::ssize(text));
  if (form == OutputForm::kUtf8 || form == OutputForm::kBoth) {
    const std::vector<uint8_t> utf8 = convert(handle->encodingNumber, NLSSM_ENC_UTF8, text);
    std::cout.write(reinterpret_cast<const char *>(utf8.data()), std::ssize(utf8));
  }
  print_line_end(form);
}

}  // namespace nlsstr
