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
  // Whether the verb can take a long text in pieces (see Pieces).
  Pieces pieces = Pieces::kWhole;
};

std::vector<Verb> &verbs();

struct RegisterVerb {
  explicit RegisterVerb(Verb verb) { verbs().push_back(std::move(verb)); }
};

}  // namespace nlsstr
