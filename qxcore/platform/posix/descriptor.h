// An open descriptor of the file system, and whole reads and writes on it.
#pragma once

#include <unistd.h>

#include <cerrno>
#include <cstddef>
#include <string>
#include <utility>

namespace platform {

class Descriptor {
 public:
  explicit Descriptor(int descriptor = -1) : m_descriptor(descriptor) {}
  Descriptor(Descriptor&& other) noexcept : m_descriptor(std::exchange(other.m_descriptor, -1)) {}
  Descriptor& operator=(Descriptor&& other) noexcept {
    std::swap(m_descriptor, other.m_descriptor);
    return *this;
  }
  ~Descriptor() {
    if (m_descriptor >= 0) close(m_descriptor);
  }
  operator int() const { return m_descriptor; }
  // False, with errno, for an error that the system reports only now; the descriptor is closed all the same.
  bool Close() { return close(std::exchange(m_descriptor, -1)) == 0 || errno == EINTR; }

 private:
  int m_descriptor;
};

// From the present place to the end. False with errno.
bool ReadToEnd(int file, std::string& bytes);
// All of the bytes, whatever the number of steps. False with errno.
bool WriteWhole(int file, const char* bytes, std::size_t count);
// The rest of one file to the present place of the other. False with errno.
bool CopyToEnd(int from, int to);

}  // namespace platform
