// nlsstr direction, visual, logical: the base direction of a text, and a line
// put into display order or back into reading order.
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using BaseDirectionFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *);
using ReorderFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                              int64_t *, uint8_t *);

const char *direction_name(uint8_t direction) {
  return direction == 1 ? "right-to-left" : "left-to-right";
}

int direction(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("direction takes one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  const std::vector<uint8_t> text = session.input(handle, args);
  uint8_t result = 0;
  const int64_t status = call<BaseDirectionFn>(handle, handle->NLSGetBaseDirection, text.data(),
                                               static_cast<int64_t>(text.size()), &result);
  check(status, "reading the base direction");
  std::cout << direction_name(result) << '\n';
  return 0;
}

// --direction ltr, rtl or auto (the default: from the first strong character).
uint8_t requested_direction(const Arguments &args) {
  const std::string value = args.option("direction", "auto");
  if (value == "ltr") return 0;
  if (value == "rtl") return 1;
  if (value == "auto") return 2;
  throw Failure("--direction takes ltr, rtl or auto");
}

int reorder(Session &session, const Arguments &args, bool visual) {
  if (args.words.size() != 1) throw Failure("takes one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  const OutputForm form = Session::output_form(args);
  const std::vector<uint8_t> text = session.input(handle, args);
  // Mirror images and replaced input may change a character's length.
  std::vector<uint8_t> out(text.size() * 2 + 16);
  int64_t written = 0;
  uint8_t paragraph = requested_direction(args);
  const int64_t status =
      call<ReorderFn>(handle, visual ? handle->NLSVisualOrderFormat : handle->NLSLogicalOrderFormat,
                      text.data(), static_cast<int64_t>(text.size()), out.data(),
                      static_cast<int64_t>(out.size()), &written, &paragraph);
  out.resize(static_cast<size_t>(written));
  session.print_text(handle, out, form);
  std::cerr << "paragraph " << direction_name(paragraph) << '\n';
  check(status, visual ? "reordering for display" : "reordering for reading");
  return 0;
}

const RegisterVerb kDirection{
    {"direction", "ENCODING",
     "base direction of the text (through the handle's NLSGetBaseDirection)", direction}};
const RegisterVerb kVisual{
    {"visual", "ENCODING [--direction ltr|rtl|auto]",
     "one line in display order (NLSVisualOrderFormat); the paragraph direction goes to stderr",
     [](Session &s, const Arguments &a) { return reorder(s, a, true); }}};
const RegisterVerb kLogical{{"logical", "ENCODING [--direction ltr|rtl|auto]",
                             "a displayed line back in reading order (NLSLogicalOrderFormat)",
                             [](Session &s, const Arguments &a) { return reorder(s, a, false); }}};

}  // namespace
}  // namespace nlsstr
