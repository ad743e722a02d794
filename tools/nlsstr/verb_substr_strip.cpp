// nlsstr substr, delete, reverse and strip: the editing operations that cut,
// turn round and measure a text, called through the handle's slots.
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using SubStrFn = int64_t (*)(const NLSSMHandle *, const NLSString *, NLSString *, int64_t,
                             int64_t *, int64_t);
using DeleteFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t, const NLSString *, int64_t,
                             int64_t);
using ReverseFn = int64_t (*)(const NLSSMHandle *, NLSString *, int64_t);
using StripFn = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int64_t);
using StripSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t);

std::vector<uint8_t> head(const std::vector<uint8_t> &text, uint64_t length) {
  return {text.begin(), text.begin() + static_cast<ptrdiff_t>(length)};
}

int substr(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("substr takes one encoding");
  const NLSSMHandle *h = session.handle(args.words[0]);
  std::vector<uint8_t> text = session.input(h, args);
  const NLSString source = descriptor(h, text, args.number("start"));
  std::vector<uint8_t> out(
      static_cast<size_t>(args.number("room", static_cast<int64_t>(text.size()))));
  NLSString destination{out.data(), 0, out.size(), 0, -9, -9, -1, 0, 0, 0};
  int64_t copied = 0;
  const int64_t status = call<SubStrFn>(h, h->NLSStringSubStr, &source, &destination,
                                        args.number("count"), &copied, args.number("flags"));
  session.print_text(h, head(out, destination.length), Session::output_form(args));
  std::cerr << "copied " << copied << " bytes\n";
  check(status, "taking the substring");
  return 0;
}

int delete_chars(Session &session, const Arguments &args) {
  if (args.words.size() != 2) throw Failure("delete takes an encoding and a character list");
  const NLSSMHandle *h = session.handle(args.words[0]);
  std::vector<uint8_t> text = session.input(h, args);
  std::vector<uint8_t> list = session.encoded(h, args.words[1]);
  NLSString target = descriptor(h, text, args.number("start"));
  const NLSString chars = descriptor(h, list, 0);
  const int64_t kept = call<DeleteFn>(h, h->NLSStringDelete, &target, args.number("count"), &chars,
                                      int64_t{0}, int64_t{0});
  if (kept == NLSSM_COUNT_NO_MEMORY) throw Failure("deleting", NLSSM_E_NO_MEMORY);
  session.print_text(h, text, Session::output_form(args));
  std::cerr << "kept " << kept << " characters\n";
  return 0;
}

int reverse(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("reverse takes one encoding");
  const NLSSMHandle *h = session.handle(args.words[0]);
  std::vector<uint8_t> text = session.input(h, args);
  NLSString s = descriptor(h, text, args.number("start"));
  check(call<ReverseFn>(h, h->NLSStringReverse, &s, args.number("count")), "reversing");
  session.print_text(h, text, Session::output_form(args));
  return 0;
}

int strip(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("strip takes one encoding");
  const NLSSMHandle *h = session.handle(args.words[0]);
  std::vector<uint8_t> text = session.input(h, args);
  const int64_t flags = args.number("flags");
  const NLSString s = descriptor(h, text, args.number("start"));
  const int64_t chars = call<StripFn>(h, h->NLSStringStrip, &s, args.number("count"), flags);
  const int64_t bytes =
      call<StripSFn>(h, h->NLSStringStripS, text.data(), static_cast<int64_t>(text.size()), flags);
  std::cout << "characters " << chars << "\nbytes      " << bytes << '\n';
  return 0;
}

const RegisterVerb kSubstr{{"substr", "ENCODING [--start N] [--count N] [--room BYTES] [--flags 1]",
                            "COUNT characters (0: all) from character START into a destination "
                            "of ROOM bytes; flag 1 blank-pads it",
                            substr}};
const RegisterVerb kDelete{{"delete", "ENCODING LIST [--start N] [--count N]",
                            "takes every character of LIST (UTF-8) out of the text, "
                            "blank-filling the end",
                            delete_chars}};
const RegisterVerb kReverse{{"reverse", "ENCODING [--start N] [--count N]",
                             "turns round the order of COUNT characters (0: all) from START",
                             reverse}};
const RegisterVerb kStrip{{"strip", "ENCODING [--start N] [--count N] [--flags 1]",
                           "characters and bytes up to the last non-blank; flag 1 strips every "
                           "white space",
                           strip}};

}  // namespace
}  // namespace nlsstr
