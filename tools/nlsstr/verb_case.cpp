// nlsstr upper|lower|normalize ENCODING: case mapping of a text through the
// handle's S forms.
#include <iostream>
#include <string>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using CaseFn = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t);
using NormalizeFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                                int64_t *, uint32_t);

// --options N: the options word (bit 2 upper case for normalize, bit 4
// double-byte characters too).
uint32_t options_of(const Arguments &args) {
  return static_cast<uint32_t>(std::stoul(args.option("options", "0"), nullptr, 0));
}

int map_case(Session &session, const Arguments &args, bool toUpper) {
  if (args.words.size() != 1) throw Failure("upper and lower take one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  std::vector<uint8_t> text = session.input(handle, args);
  const int64_t status =
      call<CaseFn>(handle, toUpper ? handle->NLSStringUpperS : handle->NLSStringLowerS, text.data(),
                   static_cast<int64_t>(text.size()), options_of(args));
  check(status, toUpper ? "upper-casing" : "lower-casing");
  session.print_text(handle, text, Session::output_form(args));
  return 0;
}

// The destination holds --capacity bytes (default: the text's length). Some
// members do not report what they wrote; then the whole destination prints.
int normalize(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("normalize takes one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  const std::vector<uint8_t> text = session.input(handle, args);
  std::vector<uint8_t> out(std::stoul(args.option("capacity", std::to_string(text.size()))));
  int64_t written = -1;
  const int64_t status = call<NormalizeFn>(
      handle, handle->NLSStringNormalizeS, text.data(), static_cast<int64_t>(text.size()),
      out.data(), static_cast<int64_t>(out.size()), &written, options_of(args));
  if (written >= 0 && static_cast<size_t>(written) <= out.size()) out.resize(written);
  session.print_text(handle, out, Session::output_form(args));
  check(status, "normalizing");
  return 0;
}

const RegisterVerb kUpper{{"upper", "ENCODING [--options N]",
                           "the text in upper case (the handle's NLSStringUpperS)",
                           [](Session &s, const Arguments &a) { return map_case(s, a, true); }}};
const RegisterVerb kLower{{"lower", "ENCODING [--options N]",
                           "the text in lower case (the handle's NLSStringLowerS)",
                           [](Session &s, const Arguments &a) { return map_case(s, a, false); }}};
const RegisterVerb kNormalize{
    {"normalize", "ENCODING [--options N] [--capacity BYTES]",
     "the text copied in one case, upper with --options 2 (the handle's NLSStringNormalizeS)",
     normalize}};

}  // namespace
}  // namespace nlsstr
