// Where a virtual function stands in its class's table.
#pragma once

#include <cstddef>
#include <cstring>

// The number of a virtual function, as a pointer to it holds it.
template <class Function>
std::ptrdiff_t SlotOf(Function function) {
  std::ptrdiff_t parts[2];
  static_assert(sizeof(function) == sizeof(parts));
  std::memcpy(parts, &function, sizeof(parts));
  return (parts[0] - 1) / static_cast<std::ptrdiff_t>(sizeof(void*));
}
