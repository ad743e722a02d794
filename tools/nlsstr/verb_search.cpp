// nlsstr index, verify, like and is: searching and classification on the
// text, with the pattern, set or class given on the command line.
#include <iostream>
#include <map>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using Next = int64_t (*)(const NLSSMHandle *, NLSString *);

struct Operands {
  const NLSSMHandle *h;
  std::vector<uint8_t> text, other;
};

Operands operands(Session &session, const Arguments &args, const char *verb) {
  if (args.words.size() != 2) throw Failure(std::string(verb) + " takes an encoding and a word");
  Operands o;
  o.h = session.handle(args.words[0]);
  o.text = session.input(o.h, args);
  o.other = session.encoded(o.h, args.words[1]);
  return o;
}

void print_position(int64_t r) {
  if (r < 0)
    std::cout << "not found\n";
  else
    std::cout << "character " << r << '\n';
}

int index(Session &session, const Arguments &args) {
  Operands o = operands(session, args, "index");
  NLSString s = descriptor(o.h, o.text), p = descriptor(o.h, o.other);
  using Fn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t);
  print_position(call<Fn>(o.h, o.h->NLSStringIndex, &s, &p, int64_t{0}));
  return 0;
}

int verify(Session &session, const Arguments &args) {
  Operands o = operands(session, args, "verify");
  NLSString s = descriptor(o.h, o.text), set = descriptor(o.h, o.other);
  using Fn =
      int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, const NLSString *, int64_t);
  print_position(call<Fn>(o.h, o.h->NLSStringVerify, &s, int64_t{0}, &set, int64_t{0}));
  return 0;
}

int like(Session &session, const Arguments &args) {
  Operands o = operands(session, args, "like");
  NLSString s = descriptor(o.h, o.text), p = descriptor(o.h, o.other);
  using Fn = int64_t (*)(const NLSSMHandle *, const NLSString *, const NLSString *, int64_t);
  const int64_t r =
      call<Fn>(o.h, o.h->NLSStringLike, &s, &p, int64_t{args.option("escape", "0") != "0"});
  if (r != 0 && r != 1) check(r, "like");
  std::cout << (r == 1 ? "match" : "no match") << '\n';
  return r == 1 ? 0 : 1;
}

// Class names and the slot and mask that answer them.
struct ClassQuery {
  NLSSlot NLSSMHandle::*slot;
  int32_t mask;
};

const std::map<std::string, ClassQuery> kClasses = {
    {"upper", {&NLSSMHandle::NLSStringIs, 0x01}},
    {"lower", {&NLSSMHandle::NLSStringIsLower, 0x02}},
    {"alpha", {&NLSSMHandle::NLSStringIs, 0x03}},
    {"digit", {&NLSSMHandle::NLSStringIsDigit, 0x04}},
    {"space", {&NLSSMHandle::NLSStringIsSpace, 0x08}},
    {"punct", {&NLSSMHandle::NLSStringIs, 0x10}},
    {"blank", {&NLSSMHandle::NLSStringIs, 0x20}},
    {"control", {&NLSSMHandle::NLSStringIs, 0x40}},
    {"xdigit", {&NLSSMHandle::NLSStringIsXDigit, 0x80}},
    {"graph", {&NLSSMHandle::NLSStringIsGraph, 0x17}},
};

int is(Session &session, const Arguments &args) {
  if (args.words.size() != 2) throw Failure("is takes an encoding and a class");
  const auto found = kClasses.find(args.words[1]);
  if (found == kClasses.end())
    throw Failure("classes: upper lower alpha digit space punct blank control xdigit graph");
  const NLSSMHandle *h = session.handle(args.words[0]);
  std::vector<uint8_t> text = session.input(h, args);
  NLSString s = descriptor(h, text);
  const ClassQuery q = found->second;
  // Unicode space tests take a strict flag instead of a mask.
  const bool strict_form =
      q.slot == &NLSSMHandle::NLSStringIsSpace &&
      (h->encodingClass >= NLSSM_CLASS_UTF8 && h->encodingClass <= NLSSM_CLASS_WCS4);
  int64_t all = 1;
  for (int64_t i = 0; s.curOffset >= 0 && static_cast<uint64_t>(s.curOffset) < s.length; ++i) {
    using Is = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t, int32_t);
    using IsStrict = int64_t (*)(const NLSSMHandle *, const NLSString *, int64_t);
    const int64_t r =
        strict_form ? call<IsStrict>(h, h->*q.slot, &s, int64_t{args.option("strict", "0") != "0"})
                    : call<Is>(h, h->*q.slot, &s, int64_t{0}, q.mask);
    std::cout << "character " << i << " at byte " << s.curOffset << ": " << r << '\n';
    all &= r;
    if (call<Next>(h, h->stringNextChar, &s) < 0) break;
  }
  std::cout << (all ? "all in class" : "not all in class") << '\n';
  return all ? 0 : 1;
}

const RegisterVerb kIndex{{"index", "ENCODING PATTERN",
                           "first occurrence of PATTERN (UTF-8, converted) in the text, in "
                           "characters (NLSStringIndex)",
                           index}};
const RegisterVerb kVerify{{"verify", "ENCODING SET",
                            "first character of the text not among the characters of SET "
                            "(NLSStringVerify)",
                            verify}};
const RegisterVerb kLike{{"like", "ENCODING PATTERN [--escape 1]",
                          "whether the whole text matches the LIKE pattern (% any run, _ one "
                          "character; --escape 1: backslash escapes); exit status 1 when not",
                          like}};
const RegisterVerb kIs{{"is", "ENCODING CLASS [--strict 1]",
                        "each character's membership in CLASS (upper lower alpha digit space "
                        "punct blank control xdigit graph; --strict 1: Unicode space without "
                        "controls); exit status 1 unless all are",
                        is}};

}  // namespace
}  // namespace nlsstr
