// Calling the reference host's objects through their slots, as the module does.
#pragma once

#include <nlssm/host.h>
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

#include <memory>
#include <string>

namespace hosttest {

template <typename Fn, typename... Args>
auto call(void *object, int slot, Args... args) {
  return reinterpret_cast<Fn>(NLSSM_HOST_SLOT(object, slot))(object, args...);
}

inline std::unique_ptr<nlssm::refhost::ReferenceHost> standalone() {
  return nlssm::refhost::ReferenceHost::standalone(nullptr);
}

// Code points in the host's character form (encoding 27) as bytes.
inline std::string host_chars(const std::u32string &text) {
  return {reinterpret_cast<const char *>(text.data()), text.size() * 4};
}

}  // namespace hosttest
