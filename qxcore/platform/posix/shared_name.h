// Named memory that processes share, alive as long as one of them holds it, as the named mappings of Windows.
//
// A name stands for a shared memory object of the user's, "/qxcore.UID.NAME". Everybody who holds it has a
// shared lock on it; who can lock it alone is the last one and removes it, or finds what a killed process left
// behind and makes it anew.
#pragma once

#include <cstdint>
#include <string>

#include "qxcore/platform/win32.h"

namespace platform {

struct SharedMemory {
  int descriptor = -1;  // -1 on failure
  std::uint64_t size = 0;
  bool existed = false;
  DWORD error = ERROR_SUCCESS;
};

// The object's name for a mapping's: "Global\" and "Local\" in front mean nothing more, other backslashes are
// ERROR_PATH_NOT_FOUND; too long is ERROR_FILENAME_EXCED_RANGE.
DWORD NameOfSharedMemory(LPCWSTR name, std::string& object);

// Takes hold of the memory of that name, which is made with this size where it is missing. ERROR_ACCESS_DENIED when
// somebody else made it, or could open it.
SharedMemory OpenSharedMemory(const std::string& object, std::uint64_t size);

// Lets go; closes the descriptor.
void CloseSharedMemory(const std::string& object, int descriptor);

}  // namespace platform
