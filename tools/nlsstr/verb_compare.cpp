// nlsstr equals / compare ENCODING FIRST SECOND: equality and order of two
// texts (given in UTF-8 and converted into the encoding) through the
// handle's EqualsS and CompareS slots.
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using EqualsSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                              int64_t, int32_t);
using CompareSFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                               int64_t, uint32_t);
using CountFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

struct Pair {
  const NLSSMHandle *handle;
  std::vector<uint8_t> first, second;
  int64_t options;
};

Pair operands(Session &session, const Arguments &args, const std::string &verb) {
  if (args.words.size() != 3) throw Failure(verb + " takes an encoding and two texts");
  Pair pair{
      session.handle(args.words[0]), {}, {}, std::stoll(args.option("options", "0"), nullptr, 0)};
  pair.first = session.encoded(pair.handle, args.words[1]);
  pair.second = session.encoded(pair.handle, args.words[2]);
  return pair;
}

int equals(Session &session, const Arguments &args) {
  const Pair p = operands(session, args, "equals");
  const int64_t result = call<EqualsSFn>(
      p.handle,
      p.handle->NLSStringEqualsS ? p.handle->NLSStringEqualsS : p.handle->NLSStringEqualsC,
      p.first.data(), static_cast<int64_t>(p.first.size()), p.second.data(),
      static_cast<int64_t>(p.second.size()), static_cast<int32_t>(p.options));
  std::cout << "result " << result << '\n' << (result == 1 ? "equal" : "not equal") << '\n';
  return 0;
}

int compare(Session &session, const Arguments &args) {
  const Pair p = operands(session, args, "compare");
  const int64_t result = call<CompareSFn>(
      p.handle, p.handle->NLSStringCompareS, p.first.data(), static_cast<int64_t>(p.first.size()),
      p.second.data(), static_cast<int64_t>(p.second.size()), static_cast<uint32_t>(p.options));
  std::cout << "result " << result << '\n';
  if (result == 0) {
    std::cout << "equal\n";
    return 0;
  }
  // The magnitude is the byte offset of the decision plus one; say which
  // character of the first text that byte belongs to.
  const int64_t byte = (result < 0 ? -result : result) - 1;
  int64_t character = byte;
  if (byte <= static_cast<int64_t>(p.first.size()))
    call<CountFn>(p.handle, p.handle->NLSNumCharsS, p.first.data(), byte, int64_t{0}, &character);
  std::cout << (result < 0 ? "first is smaller" : "first is greater")
            << ", first differs at character " << character << " (byte " << byte << ")\n";
  return 0;
}

const RegisterVerb kEquals{{"equals", "ENCODING FIRST SECOND [--options N]",
                            "case-insensitive equality (options: 1 pad, 2 upper-case table)",
                            equals}};
const RegisterVerb kCompare{{"compare", "ENCODING FIRST SECOND [--options N]",
                             "order of two texts (options: 1 pad, 2 fold lower, 4 fold upper)",
                             compare}};

}  // namespace
}  // namespace nlsstr
