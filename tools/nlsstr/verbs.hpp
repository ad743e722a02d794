// The verb registry: each verb file adds its verbs at start-up.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "session.hpp"

namespace nlsstr {

// A verb: its name, its arguments and options as its help shows them
// ("ENCODING PATTERN [--escape 1]"; every --name in it is an option taking a
// value), a one-line summary, and what it does. `run` takes its text through
// Session::input; with --records or --lines it runs once per record.
struct Verb {
  std::string name;
  std::string usage;    // arguments after the verb
  std::string summary;  // one line
  std::function<int(Session &, const Arguments &)> run;
  // Whether the verb's results on the pieces of a text, one after another,
  // are its result on the whole text (a character-by-character mapping, or
  // a verb that adds up its pieces while Session::more_pieces()): then a
  // whole input is handed to it in pieces instead of being read whole.
  bool piecewise = false;
};

std::vector<Verb> &verbs();

struct RegisterVerb {
  explicit RegisterVerb(Verb verb) { verbs().push_back(std::move(verb)); }
};

}  // namespace nlsstr
