// nlsstr count ENCODING: characters and bytes of a text, of a long input
// added up piece by piece, or of each record.
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using CountFn = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);

int count(Session &session, const Arguments &args) {
  if (args.words.size() != 1) throw Failure("count takes one encoding");
  const NLSSMHandle *handle = session.handle(args.words[0]);
  int64_t characters = 0, bytes = 0, status = 0;
  do {
    const std::vector<uint8_t> text = session.input(handle, args);
    int64_t counted = 0;
    const int64_t piece = call<CountFn>(handle, handle->NLSNumCharsS, text.data(),
                                        static_cast<int64_t>(text.size()), int64_t{0}, &counted);
    characters += counted;
    bytes += static_cast<int64_t>(text.size());
    if (status == 0) status = piece;
  } while (session.more_pieces());
  if (session.record() > 0)
    std::cout << "record " << session.record() << ": " << characters << " characters, " << bytes
              << " bytes\n";
  else
    std::cout << "characters " << characters << "\nbytes      " << bytes << '\n';
  check(status, "counting");
  return 0;
}

const RegisterVerb kCount{{"count", "ENCODING",
                           "characters (through the handle's NLSNumCharsS) and bytes of the text",
                           count, Pieces::kSums}};

}  // namespace
}  // namespace nlsstr
