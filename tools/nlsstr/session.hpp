// What every nlsstr verb needs: a started host, handles by encoding name or
// number, text read and converted into an encoding, results printed.
#pragma once

#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <cstdint>
#include <map>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

namespace nlsstr {

// A failure the tool reports and exits on: a message, and a module status
// when one caused it.
struct Failure : std::runtime_error {
  Failure(const std::string &message, int64_t status = 0)
      : std::runtime_error(message), status(status) {}
  int64_t status;
};

// The name of a module or host status ("NLSSM_E_DEST_TOO_SMALL"), or "".
std::string status_name(int64_t status);
// Throws Failure when an operation returned a non-zero status.
void check(int64_t status, const std::string &what);

enum class OutputForm { kUtf8, kHex, kRaw };

// Command-line options shared by the verbs: positional words and --name value.
struct Arguments {
  std::vector<std::string> words;
  std::map<std::string, std::string> options;
  bool has(const std::string &name) const { return options.count(name) != 0; }
  std::string option(const std::string &name, const std::string &fallback = "") const;
};

class Session {
 public:
  Session();
  ~Session();

  // The handle for an encoding given by number or by name.
  const NLSSMHandle *handle(const std::string &encoding);
  int encoding_number(const std::string &encoding) const;

  // The input text in the handle's encoding: --text (UTF-8, converted),
  // --hex, --file, or standard input (bytes as they are).
  std::vector<uint8_t> input(const NLSSMHandle *handle, const Arguments &args);
  // Writes text of the handle's encoding in the form --out asks for.
  void print_text(const NLSSMHandle *handle, const std::vector<uint8_t> &text,
                  OutputForm form) const;
  static OutputForm output_form(const Arguments &args);

  nlssm::refhost::ReferenceHost &host() { return *host_; }

 private:
  std::vector<uint8_t> convert(int64_t from, int64_t to, const std::vector<uint8_t> &text) const;
  std::unique_ptr<nlssm::refhost::ReferenceHost> host_;
};

// Calls the operation stored in a handle slot with the given prototype.
template <typename Fn, typename... Args>
auto call(const NLSSMHandle *handle, NLSSlot slot, Args... args) {
  if (slot == nullptr) throw Failure("this encoding has no such operation", NLSSM_E_UNSUPPORTED);
  return reinterpret_cast<Fn>(slot)(handle, args...);
}

std::string hex(const uint8_t *bytes, size_t length);

}  // namespace nlsstr
