// Makes writing files fail at a size, as on a full disk; on Linux only.
#pragma once

#ifndef _WIN32

#include <signal.h>
#include <sys/resource.h>

namespace test {

class FileSizeLimit {
 public:
  explicit FileSizeLimit(rlim_t bytes) {
    m_handler = signal(SIGXFSZ, SIG_IGN);
    getrlimit(RLIMIT_FSIZE, &m_former);
    const rlimit limit = {bytes, m_former.rlim_max};
    setrlimit(RLIMIT_FSIZE, &limit);
  }
  FileSizeLimit(const FileSizeLimit&) = delete;
  FileSizeLimit& operator=(const FileSizeLimit&) = delete;
  ~FileSizeLimit() {
    setrlimit(RLIMIT_FSIZE, &m_former);
    signal(SIGXFSZ, m_handler);
  }

 private:
  rlimit m_former;
  void (*m_handler)(int);
};

}  // namespace test

#endif
