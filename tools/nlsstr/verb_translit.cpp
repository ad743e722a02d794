// nlsstr translit, tranword, squeeze, unquote: the copying edits on a text,
// through the handle's raw-buffer slots. Lists, words and the squeeze
// character are given in UTF-8 and converted into the encoding.
#include <algorithm>
#include <iostream>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using TranslitS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                              int64_t, const uint8_t *, int64_t, int64_t, uint8_t *, int64_t,
                              int64_t *, int64_t);
using TranwordS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                              int64_t, const uint8_t *, int64_t, uint8_t *, int64_t, int64_t *,
                              int64_t);
using SqueezeS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                             int64_t, uint8_t *, int64_t, int64_t *);
using SqueezeLitS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, const uint8_t *,
                                int64_t, uint8_t *, int64_t, int64_t *, int64_t *, int64_t);
using UnquoteS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                             int64_t *);

// One verb's inputs: the handle, the text, and a destination of --room bytes
// (by default enough for any result the verb can give).
struct Job {
  const NLSSMHandle *handle;
  std::vector<uint8_t> text;
  std::vector<uint8_t> out;

  Job(Session &session, const Arguments &args, const std::string &verb, int64_t growth) {
    if (args.words.size() != 1) throw Failure(verb + " takes one encoding");
    handle = session.handle(args.words[0]);
    text = session.input(handle, args);
    const int64_t room = args.has("room") ? std::stoll(args.option("room"))
                                          : (static_cast<int64_t>(text.size()) + 16) * growth;
    out.resize(static_cast<size_t>(std::max<int64_t>(room, 0)));
  }
  // An option's UTF-8 text in the handle's encoding.
  std::vector<uint8_t> word(Session &session, const Arguments &args, const std::string &name) {
    return session.encoded(handle, args.option(name));
  }
  int64_t room() const { return static_cast<int64_t>(out.size()); }
  int finish(Session &session, const Arguments &args, int64_t status, int64_t written,
             const std::string &what) {
    out.resize(static_cast<size_t>(written));
    session.print_text(handle, out, Session::output_form(args));
    check(status, what);
    return 0;
  }
};

int translit(Session &session, const Arguments &args) {
  Job job(session, args, "translit", 8);
  const auto from = job.word(session, args, "from"), to = job.word(session, args, "to");
  int64_t written = 0;
  const int64_t status = call<TranslitS>(
      job.handle, job.handle->NLSStringTransliterateS, job.text.data(),
      static_cast<int64_t>(job.text.size()), to.data(), static_cast<int64_t>(to.size()),
      from.data(), static_cast<int64_t>(from.size()), std::stoll(args.option("pairs", "0")),
      job.out.data(), job.room(), &written, int64_t{0});
  return job.finish(session, args, status, written, "transliterating");
}

int tranword(Session &session, const Arguments &args) {
  const int64_t growth = static_cast<int64_t>(args.option("replace").size()) * 4 + 4;
  Job job(session, args, "tranword", growth);
  const auto find = job.word(session, args, "find"), repl = job.word(session, args, "replace");
  int64_t written = 0;
  const int64_t status = call<TranwordS>(job.handle, job.handle->NLSStringTranwordS,
                                         job.text.data(), static_cast<int64_t>(job.text.size()),
                                         repl.data(), static_cast<int64_t>(repl.size()),
                                         find.data(), static_cast<int64_t>(find.size()),
                                         job.out.data(), job.room(), &written, int64_t{0});
  return job.finish(session, args, status, written, "replacing words");
}

int squeeze(Session &session, const Arguments &args) {
  Job job(session, args, "squeeze", 1);
  int64_t written = 0, status = 0;
  if (args.has("char")) {
    const auto ch = job.word(session, args, "char");
    status = call<SqueezeS>(job.handle, job.handle->NLSStringSqueezeS, job.text.data(),
                            static_cast<int64_t>(job.text.size()), ch.data(),
                            static_cast<int64_t>(ch.size()), job.out.data(), job.room(), &written);
  } else {  // an empty literal squeezes blanks
    int64_t characters = 0;
    status = call<SqueezeLitS>(job.handle, job.handle->NLSStringSqueezeLitS, job.text.data(),
                               static_cast<int64_t>(job.text.size()),
                               static_cast<const uint8_t *>(nullptr), int64_t{0}, job.out.data(),
                               job.room(), &written, &characters, int64_t{0});
  }
  return job.finish(session, args, status, written, "squeezing");
}

int unquote(Session &session, const Arguments &args) {
  Job job(session, args, "unquote", 1);
  int64_t written = 0;
  const int64_t status =
      call<UnquoteS>(job.handle, job.handle->NLSStringRemoveDelimitersS, job.text.data(),
                     static_cast<int64_t>(job.text.size()), job.out.data(), job.room(), &written);
  return job.finish(session, args, status, written, "removing delimiters");
}

const RegisterVerb kTranslit{
    {"translit", "ENCODING --from LIST --to LIST [--pairs N] [--room BYTES]",
     "replace each character of --from by the --to character at the same index", translit,
     Pieces::kMaps}};
const RegisterVerb kTranword{{"tranword", "ENCODING --find WORD --replace WORD [--room BYTES]",
                              "replace every occurrence of a word", tranword}};
const RegisterVerb kSqueeze{{"squeeze", "ENCODING [--char C] [--room BYTES]",
                             "reduce runs of a character (default: the blank) to one", squeeze}};
const RegisterVerb kUnquote{{"unquote", "ENCODING [--room BYTES]",
                             "remove the delimiters around a text, undoubling those inside",
                             unquote}};

}  // namespace
}  // namespace nlsstr
