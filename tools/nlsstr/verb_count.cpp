// nlsstr count ENCODING: characters and bytes of a text.
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using CountFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

int count(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("count takes one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  const std::vector<uint8_t> text = session.input(handle, args);
  int64_t characters = 0;
  const int64_t status = call<CountFn>(handle, handle->NLSNumCharsS, text.data(),
                                       static_cast<int64_t>(text.size()), int64_t{0}, &characters);
  std::cout << "characters " << characters << "\nbytes      " << text.size() << '\n';
  check(status, "counting");
  return 0;
}

const RegisterVerb kCount{{"count", "ENCODING",
                           "characters (through the handle's NLSNumCharsS) and bytes of the text",
                           count}};

}  // namespace
}  // namespace nlsstr
