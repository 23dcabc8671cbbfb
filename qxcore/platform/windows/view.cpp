#include "qxcore/platform/internal/view.h"

#include "qxcore/platform/win32.h"

namespace platform {

std::size_t ViewLength(const void* view) {
  MEMORY_BASIC_INFORMATION info;
  if (VirtualQuery(view, &info, sizeof info) == 0 || info.AllocationBase != view) return 0;
  return info.RegionSize;
}

std::size_t CopyFromView(void* target, const void* source, std::size_t count) {
  SIZE_T done = 0;
  ReadProcessMemory(GetCurrentProcess(), source, target, count, &done);
  return done;
}

std::size_t CopyToView(void* target, const void* source, std::size_t count) {
  // The system would make pages writable that are not.
  MEMORY_BASIC_INFORMATION info;
  if (VirtualQuery(target, &info, sizeof info) == 0) return 0;
  if ((info.Protect & (PAGE_READWRITE | PAGE_WRITECOPY)) == 0) {
    SetLastError(ERROR_NOACCESS);
    return 0;
  }
  SIZE_T done = 0;
  WriteProcessMemory(GetCurrentProcess(), target, source, count, &done);
  return done;
}

}  // namespace platform
