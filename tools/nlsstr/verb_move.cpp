// nlsstr move, fill, concat, justify, quote: the writing edits on a text,
// through the handle's slots, into a destination of a given room.
#include <initializer_list>
#include <iostream>
#include <utility>

#include "verbs.hpp"

namespace nlsstr {
namespace {

using MoveC = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                          int64_t *, int64_t *, uint32_t);
using FillLitS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, const uint8_t *, int64_t,
                             int64_t *);
using ConcatS = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, int64_t *, const uint8_t *,
                            int64_t, uint32_t, int64_t, ...);
using JustifyC = int64_t (*)(const NLSSMHandle *, uint8_t *, int64_t, uint32_t, int64_t *,
                             int64_t *, int64_t *, int64_t *);
using NumCharsS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, int64_t, int64_t *);
using AddQuotesS = int64_t (*)(const NLSSMHandle *, const uint8_t *, int64_t, uint8_t *, int64_t,
                               int64_t *);

const NLSSMHandle *one_encoding(Session &session, const Arguments &args, const char *verb) {
  if (args.words.empty()) throw Failure(std::string(verb) + " takes an encoding");
  return session.handle(args.words[0]);
}

// A status is reported, not thrown: a short destination still has a
// result. Prints the status, the counts and the text; exit code 1 unless 0.
int finish(Session &session, const NLSSMHandle *h, const Arguments &args, int64_t status,
           std::initializer_list<std::pair<const char *, int64_t>> counts,
           const std::vector<uint8_t> &text) {
  const std::string name = status_name(status);
  std::cout << "status     "
            << (status == 0    ? "0"
                : name.empty() ? std::to_string(status)
                               : name)
            << '\n';
  for (const auto &[label, value] : counts) {
    const std::string l = label;
    std::cout << l << std::string(l.size() < 11 ? 11 - l.size() : 1, ' ') << value << '\n';
  }
  session.print_text(h, text, Session::output_form(args));
  return status == 0 ? 0 : 1;
}

int move(Session &session, const Arguments &args) {
  const NLSSMHandle *h = one_encoding(session, args, "move");
  const std::vector<uint8_t> text = session.input(h, args);
  const int64_t room = args.number("room", static_cast<int64_t>(text.size()));
  if (room < 0) throw Failure("--room must not be negative");
  std::vector<uint8_t> dst(static_cast<size_t>(room));
  int64_t bytes = 0, chars = 0;
  const int64_t status =
      call<MoveC>(h, h->NLSStringMoveC, text.data(), static_cast<int64_t>(text.size()), dst.data(),
                  room, &bytes, &chars, static_cast<uint32_t>(args.number("flags", 0)));
  return finish(session, h, args, status, {{"bytes", bytes}, {"characters", chars}}, dst);
}

int fill(Session &session, const Arguments &args) {
  const NLSSMHandle *h = one_encoding(session, args, "fill");
  const std::string ch = args.option("char", " ");
  const int64_t room = args.number("room", 8);
  if (room < 0) throw Failure("--room must not be negative");
  std::vector<uint8_t> dst(static_cast<size_t>(room));
  int64_t written = 0;
  const int64_t status = call<FillLitS>(h, h->NLSStringFillLitS, dst.data(), room,
                                        reinterpret_cast<const uint8_t *>(ch.data()),
                                        static_cast<int64_t>(ch.size()), &written);
  dst.resize(static_cast<size_t>(std::max<int64_t>(written, 0)));
  return finish(session, h, args, status, {{"bytes", written}}, dst);
}

// Pieces are the words after the encoding (UTF-8, converted); up to eight.
int concat(Session &session, const Arguments &args) {
  const NLSSMHandle *h = one_encoding(session, args, "concat");
  std::vector<std::vector<uint8_t>> pieces;
  for (size_t i = 1; i < args.words.size(); ++i)
    pieces.push_back(session.encoded(h, args.words[i]));
  if (pieces.size() > 8) throw Failure("concat takes at most eight pieces");
  pieces.resize(8);
  const int64_t length = args.number("room", 32);
  const int64_t room = length < 0 ? -length : length;
  std::vector<uint8_t> dst(static_cast<size_t>(room));
  const std::string sep = args.option("sep", "");
  int64_t written = 0;
  auto piece = [&](size_t i) { return pieces[i].data(); };
  auto size = [&](size_t i) { return static_cast<int64_t>(pieces[i].size()); };
  const int64_t status = call<ConcatS>(
      h, h->NLSStringConcatS, dst.data(), length, &written,
      reinterpret_cast<const uint8_t *>(sep.data()), static_cast<int64_t>(sep.size()),
      static_cast<uint32_t>(args.number("flags", 0)), static_cast<int64_t>(args.words.size() - 1),
      piece(0), size(0), piece(1), size(1), piece(2), size(2), piece(3), size(3), piece(4), size(4),
      piece(5), size(5), piece(6), size(6), piece(7), size(7));
  if (length < 0) dst.resize(static_cast<size_t>(written));  // the text before its zero byte
  return finish(session, h, args, status, {{"bytes", written}}, dst);
}

int justify(Session &session, const Arguments &args) {
  const NLSSMHandle *h = one_encoding(session, args, "justify");
  std::vector<uint8_t> field = session.input(h, args);
  const std::string align = args.option("align", "C");
  int64_t chars = 0;
  check(call<NumCharsS>(h, h->NLSNumCharsS, field.data(), static_cast<int64_t>(field.size()),
                        int64_t{0}, &chars),
        "counting the field");
  int64_t bytes = 0, textChars = 0, start = 0, startChars = 0;
  const int64_t status =
      call<JustifyC>(h, h->NLSStringJustifyC, field.data(), chars,
                     static_cast<uint32_t>(static_cast<uint8_t>(align.empty() ? 0 : align[0])),
                     &bytes, &textChars, &start, &startChars);
  return finish(session, h, args, status,
                {{"text bytes", bytes},
                 {"text chars", textChars},
                 {"start", start},
                 {"start char", startChars}},
                field);
}

int quote(Session &session, const Arguments &args) {
  const NLSSMHandle *h = one_encoding(session, args, "quote");
  const std::vector<uint8_t> text = session.input(h, args);
  const int64_t room =
      args.number("room", 2 * static_cast<int64_t>(text.size()) + 2 * h->quoteWidth);
  if (room < 0) throw Failure("--room must not be negative");
  std::vector<uint8_t> dst(static_cast<size_t>(room));
  int64_t result = 0;
  const int64_t status =
      call<AddQuotesS>(h, h->NLSStringAddQuotesS, text.data(), static_cast<int64_t>(text.size()),
                       dst.data(), room, &result);
  if (result >= 0) dst.resize(static_cast<size_t>(result));
  return finish(session, h, args, status, {{"length", result}}, dst);
}

const RegisterVerb kMove{{"move", "ENCODING [--room BYTES] [--flags 0x1|0x200]",
                          "moves the text into ROOM bytes (NLSStringMoveC): flag 0x1 blank-pads, "
                          "0x200 counts the text in characters",
                          move}};
const RegisterVerb kFill{{"fill", "ENCODING [--room BYTES] [--char C]",
                          "fills ROOM bytes with the first character of C (NLSStringFillLitS)",
                          fill}};
const RegisterVerb kConcat{{"concat", "ENCODING PIECE... [--room BYTES] [--sep C] [--flags 0x1]",
                            "joins up to eight pieces into ROOM bytes (NLSStringConcatS); a "
                            "negative ROOM is terminated mode",
                            concat}};
const RegisterVerb kJustify{{"justify", "ENCODING [--align C|L|R|N]",
                             "justifies the text as a field (NLSStringJustifyC)", justify}};
const RegisterVerb kQuote{{"quote", "ENCODING [--room BYTES]",
                           "puts the text between quotes, doubling quotes inside it "
                           "(NLSStringAddQuotesS)",
                           quote}};

}  // namespace
}  // namespace nlsstr
