// The memory of the window model: from the library's own allocator, so that tests can make every single
// allocation fail. A failure is std::bad_alloc inside the model and ERROR_NOT_ENOUGH_MEMORY outside.
#pragma once

#include <new>
#include <string>
#include <vector>

#include "qxcore/platform/win32.h"

namespace platform::model {

void* Allocate(std::size_t size);  // throws std::bad_alloc
void Release(void* block) noexcept;

template <class T>
struct Allocator {
  using value_type = T;
  Allocator() = default;
  template <class U>
  Allocator(const Allocator<U>&) {}
  T* allocate(std::size_t count) { return static_cast<T*>(Allocate(count * sizeof(T))); }
  void deallocate(T* block, std::size_t) { Release(block); }
  bool operator==(const Allocator&) const { return true; }
};

using Text = std::basic_string<WCHAR, std::char_traits<WCHAR>, Allocator<WCHAR>>;
template <class T>
using List = std::vector<T, Allocator<T>>;

// A base for objects that live on the model's heap.
struct OnModelHeap {
  static void* operator new(std::size_t size) { return Allocate(size); }
  static void operator delete(void* block) noexcept { Release(block); }
};

// Runs `work`; its result, or `failed` with the last error set when memory is out.
template <class Result, class Work>
Result OrNoMemory(Result failed, Work work) {
  try {
    return work();
  } catch (const std::bad_alloc&) {
    SetLastError(ERROR_NOT_ENOUGH_MEMORY);
    return failed;
  }
}

// Sets the last error; the result of a failed call.
template <class Result = BOOL>
Result Fail(DWORD error, Result result = {}) {
  SetLastError(error);
  return result;
}

}  // namespace platform::model
