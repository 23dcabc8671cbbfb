// Views of file mappings beyond the published calls: how long they are, and copying that survives a file that
// was cut while it is mapped.
//
// On Linux another program can cut a mapped file, and who then touches a page behind its new end is sent
// SIGBUS. These copies are made by the system, which stops there instead. Windows lets nobody cut a
// mapped file; there they protect against media that fail.
#pragma once

#include <cstddef>

namespace platform {

// Bytes that can be addressed from `view`, the start of a view, on: its size, up to the end of a page.
// 0 when no view begins there.
std::size_t ViewLength(const void* view);

// Copy from and to addresses within a view; return how many bytes were copied, all but where pages are missing or,
// for the second, cannot be written (the last error is set then).
std::size_t CopyFromView(void* target, const void* source, std::size_t count);
std::size_t CopyToView(void* target, const void* source, std::size_t count);

}  // namespace platform
