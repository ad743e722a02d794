// Work buffers of the operations: a fixed area on the stack for small needs,
// the handle's pool beyond it, always given back when the buffer goes out of
// scope. Operations differ in what they do when the pool refuses (a status,
// the sign-bit count, or falling back to the stack area with less room), so
// the buffer only reports the refusal and leaves that choice to the caller.
#pragma once

#include <nlssm/nlssm.h>

#include <cstddef>
#include <cstdint>

#include "module/host_access.hpp"

namespace nlssm::module {

template <std::size_t StackBytes>
class WorkBuffer {
 public:
  WorkBuffer() = default;
  WorkBuffer(const WorkBuffer &) = delete;
  WorkBuffer &operator=(const WorkBuffer &) = delete;
  ~WorkBuffer() { release(); }

  // Room for `bytes`: the stack area when it is large enough, else the
  // handle's pool. False (and no room) when the pool refuses or is absent.
  bool reserve(const NLSSMHandle *handle, std::uint64_t bytes) {
    release();
    if (bytes <= StackBytes) {
      data_ = stack_;
      size_ = bytes;
      return true;
    }
    if (handle == nullptr || handle->pool == nullptr) return false;
    void *memory = host::Pool{handle->pool}.allocate(bytes);
    if (memory == nullptr) return false;
    pool_ = handle->pool;
    data_ = static_cast<std::uint8_t *>(memory);
    size_ = bytes;
    return true;
  }

  // The stack area alone, whatever was asked (the fallback of operations
  // that cut their room to the stack size when the pool refuses).
  void use_stack() {
    release();
    data_ = stack_;
    size_ = StackBytes;
  }

  std::uint8_t *data() { return data_; }
  std::uint64_t size() const { return size_; }
  bool from_pool() const { return pool_ != nullptr; }

 private:
  void release() {
    if (pool_ != nullptr) host::Pool{pool_}.free(data_);
    pool_ = nullptr;
    data_ = nullptr;
    size_ = 0;
  }

  alignas(16) std::uint8_t stack_[StackBytes];
  std::uint8_t *data_ = nullptr;
  std::uint64_t size_ = 0;
  void *pool_ = nullptr;
};

}  // namespace nlssm::module
