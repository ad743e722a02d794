// What every nlsstr verb needs: a started host, handles by encoding name or
// number, text read and converted into an encoding, results printed.
#pragma once

#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include "stream.hpp"

#include <cstdint>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace nlsstr {

// Exit codes of nlsstr.
inline constexpr int kExitOk = 0;
inline constexpr int kExitStatus = 1;  // a failing status, or the answer "no"
inline constexpr int kExitUsage = 2;   // the command line is wrong
inline constexpr int kExitInput = 3;   // the input cannot be read or is too long

// A failure the tool reports and exits on: a message, and a module status
// when one caused it. Without an explicit exit code, a failure with a status
// exits with kExitStatus, one without with kExitUsage.
struct Failure : std::runtime_error {
  Failure(const std::string &message, int64_t status = 0, int exit_code = 0)
      : std::runtime_error(message),
        status(status),
        exit_code(exit_code != 0 ? exit_code
                  : status != 0  ? kExitStatus
                                 : kExitUsage) {}
  int64_t status;
  int exit_code;
};

// The name of a module or host status ("NLSSM_E_DEST_TOO_SMALL"), or "".
std::string status_name(int64_t status);
// Throws Failure when an operation returned a non-zero status.
void check(int64_t status, const std::string &what);

// Text results: converted to UTF-8, as hex bytes, as they are, or hex bytes
// with the UTF-8 beside them.
enum class OutputForm { kUtf8, kHex, kRaw, kBoth };

// Command-line options shared by the verbs: positional words and --name value.
struct Arguments {
  std::vector<std::string> words;
  std::map<std::string, std::string> options;
  bool has(const std::string &name) const { return options.count(name) != 0; }
  std::string option(const std::string &name, const std::string &fallback = "") const;
  // A numeric option (decimal, 0x hexadecimal or 0 octal), else `fallback`.
  int64_t number(const std::string &name, int64_t fallback = 0) const;
};

// How a verb can take a long text.
enum class Pieces {
  kWhole,  // only whole: the input is read whole, up to kWholeLimit bytes
  // In pieces, adding up its results while Session::more_pieces().
  kSums,
  // In pieces, printing only the text it makes from each: its output for a
  // text is its outputs for the text's pieces one after another. Such a
  // verb also takes raw fixed-length records in batches of whole records.
  kMaps,
};

class Session {
 public:
  Session();
  ~Session();

  // Sets how --file or standard input is taken apart for a verb: --records
  // N, --lines, or the whole text (in pieces when the verb can take them).
  void begin(const Arguments &args, Pieces pieces);
  // Whether the verb took a text from the input and another one follows:
  // the verb then runs again on it.
  bool more();
  // Whether the last text was a piece of a longer one and more follows.
  bool more_pieces();
  // The number of the record or line just taken, from 1; 0 for a whole
  // text. For a batch of records, the first one's number.
  int64_t record() const;
  // Records in the text just taken: more than one in a batch.
  int64_t records() const;
  void finish();

  // The handle for an encoding given by number or by name.
  const NLSSMHandle *handle(const std::string &encoding);
  int encoding_number(const std::string &encoding) const;

  // The input text in the handle's encoding: --text (UTF-8, converted),
  // --hex, or the next text of --file or standard input (bytes as they are).
  std::vector<uint8_t> input(const NLSSMHandle *handle, const Arguments &args);
  // A UTF-8 text of the command line in the handle's encoding.
  std::vector<uint8_t> encoded(const NLSSMHandle *handle, const std::string &utf8);
  // Writes text of the handle's encoding in the form --out asks for.
  void print_text(const NLSSMHandle *handle, const std::vector<uint8_t> &text,
                  OutputForm form) const;
  static OutputForm output_form(const Arguments &args);

  nlssm::refhost::ReferenceHost &host() { return *host_; }

 private:
  std::vector<uint8_t> convert(int64_t from, int64_t to, const std::vector<uint8_t> &text) const;
  void print_line_end(OutputForm form) const;

  std::unique_ptr<nlssm::refhost::ReferenceHost> host_;
  std::map<std::string, const NLSSMHandle *> handles_;
  mutable std::map<std::pair<int64_t, int64_t>, void *> converters_;
  std::map<std::pair<int64_t, std::string>, std::vector<uint8_t>> texts_;
  Split split_ = Split::kWhole;
  size_t record_bytes_ = 0;
  bool batch_ = false;
  std::string file_;
  std::unique_ptr<Stream> stream_;
  bool took_ = false;  // the verb took a text from the stream in this run
};

// Calls the operation stored in a handle slot with the given prototype.
template <typename Fn, typename... Args>
auto call(const NLSSMHandle *handle, NLSSlot slot, Args... args) {
  if (slot == nullptr) throw Failure("this encoding has no such operation", NLSSM_E_UNSUPPORTED);
  return reinterpret_cast<Fn>(slot)(handle, args...);
}

// A descriptor over `bytes`, on character `start` (unset when empty).
NLSString descriptor(const NLSSMHandle *handle, std::vector<uint8_t> &bytes, int64_t start = 0);

std::string hex(const uint8_t *bytes, size_t length);

}  // namespace nlsstr
