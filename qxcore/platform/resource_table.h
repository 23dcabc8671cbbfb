// Resources that a program registers in memory with its module, in the published binary layouts, so that menus,
// accelerators and dialogs need no resource compiler and are the same on both targets.
#pragma once

#include <cstddef>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

namespace platform {

// The content of a resource; null data for none.
struct ResourceBytes {
  const void* data = nullptr;  // stays the owner's
  std::size_t size = 0;        // in bytes
};

// Registers a resource of `module` (null: the program) under a type and a name; each is a text or a number
// (MAKEINTRESOURCEW), texts are compared without regard to case. The bytes are not copied and must stay. A later
// registration of the same name replaces the earlier one. Returns false when memory is out. Safe from every thread.
QXCORE_API bool RegisterResource(HINSTANCE module, LPCWSTR type, LPCWSTR name, const void* data, std::size_t size);

// What was registered; null data otherwise. Safe from every thread.
QXCORE_API ResourceBytes FindRegisteredResource(HINSTANCE module, LPCWSTR type, LPCWSTR name) noexcept;

// The size in bytes of what was registered with this address; 0 for an unknown one. Safe from every thread.
QXCORE_API std::size_t RegisteredResourceSize(const void* data) noexcept;

}  // namespace platform
