#include "verbs.hpp"

namespace nlsstr {

std::vector<Verb> &verbs() {
  static std::vector<Verb> registry;
  return registry;
}

}  // namespace nlsstr
