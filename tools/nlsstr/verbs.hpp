// The verb registry: each verb file adds its verbs at start-up.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "session.hpp"

namespace nlsstr {

struct Verb {
  std::string name;
  std::string usage;    // arguments after the verb
  std::string summary;  // one line
  std::function<int(Session &, const Arguments &)> run;
};

std::vector<Verb> &verbs();

struct RegisterVerb {
  explicit RegisterVerb(Verb verb) { verbs().push_back(std::move(verb)); }
};

}  // namespace nlsstr
