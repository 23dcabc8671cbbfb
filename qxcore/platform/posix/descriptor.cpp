#include "qxcore/platform/posix/descriptor.h"

#include <memory>

namespace platform {
namespace {

// Reads once, however often a signal interrupts it.
ssize_t ReadSome(int file, char* buffer, std::size_t count) {
  for (;;) {
    const ssize_t got = read(file, buffer, count);
    if (got >= 0 || errno != EINTR) return got;
  }
}

}  // namespace

bool ReadToEnd(int file, std::string& bytes) {
  char buffer[16384];
  for (;;) {
    const ssize_t count = ReadSome(file, buffer, sizeof buffer);
    if (count <= 0) return count == 0;
    bytes.append(buffer, static_cast<std::size_t>(count));
  }
}

bool WriteWhole(int file, const char* bytes, std::size_t count) {
  for (std::size_t done = 0; done < count;) {
    const ssize_t put = write(file, bytes + done, count - done);
    if (put < 0 && errno != EINTR) return false;
    if (put > 0) done += static_cast<std::size_t>(put);
  }
  return true;
}

bool CopyToEnd(int from, int to) {
  constexpr std::size_t kBlock = 1 << 18;
  const auto buffer = std::make_unique<char[]>(kBlock);
  for (;;) {
    const ssize_t count = ReadSome(from, buffer.get(), kBlock);
    if (count <= 0) return count == 0;
    if (!WriteWhole(to, buffer.get(), static_cast<std::size_t>(count))) return false;
  }
}

}  // namespace platform
