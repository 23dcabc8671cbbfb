// The buffer of a runtime file: of our own, because not every runtime heeds the size that setvbuf gets without a
// buffer.
#pragma once

#include <cstdio>

#include "qxcore/core/memory.h"

constexpr std::size_t kSFileBuffer = 65536;  // bytes

// Sets a buffer for the file, of which nothing was read or written yet; returns null where memory is out, and the file
// then keeps the runtime's own. Freed with SMemFree once the file is closed.
inline char* SGiveBuffer(std::FILE* file) {
  char* buffer = static_cast<char*>(SMemTryAlloc(kSFileBuffer));
  if (buffer != nullptr && std::setvbuf(file, buffer, _IOFBF, kSFileBuffer) != 0) {
    SMemFree(buffer);
    buffer = nullptr;
  }
  return buffer;
}
