// Word-array objects: the host's objects start with an array of 64-bit words
// whose word N holds the function for slot N (or, for a few words, a data
// pointer). The C++ state follows the words.
#pragma once

#include <nlssm/host.h>

#include <cstddef>
#include <cstdint>

namespace nlssm::refhost {

template <std::size_t Words>
struct SlotWords {
  void *words[Words] = {};

  template <typename Fn>
  void set(int slot, Fn *function) {
    words[slot] = reinterpret_cast<void *>(function);
  }
};

// The object that owns a word array placed first in it.
template <typename T>
T *self(void *object) {
  return reinterpret_cast<T *>(object);
}

}  // namespace nlssm::refhost
