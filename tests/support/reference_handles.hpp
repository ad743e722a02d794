// Handles from the reference host for the operation tests: one host per test
// program, started on first use (the module keeps the host's service object
// in one global, so a program runs one host at a time).
#pragma once

#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

namespace test_support {

inline nlssm::refhost::ReferenceHost &host() {
  static auto started = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
  return *started;
}

// The shared handle of an encoding, or null when it has none.
inline const NLSSMHandle *handle(int encoding) {
  NLSSMHandle *h = nullptr;
  return host().create_handle(encoding, &h) == 0 ? h : nullptr;
}

}  // namespace test_support
