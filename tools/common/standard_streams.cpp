#include "tools/common/standard_streams.h"

#include <cerrno>

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"

int StandardInput::Read() {
  unsigned char byte;
  return Read(&byte, 1) == 1 ? byte : -1;
}

unsigned long StandardInput::Read(void* buffer, unsigned long count) {
  unsigned long done = 0;
  while (done < count && !m_isAtEnd) {
    std::size_t got = std::fread(static_cast<char*>(buffer) + done, 1, count - done, stdin);
    int error = errno;
    done += static_cast<unsigned long>(got);
    // Whoever fed us may have been interrupted, too: such an end is not the end of the text.
    if (console::Interrupted()) throw SEIOAbortedException();
    if (std::ferror(stdin) && error == EINTR) {
      std::clearerr(stdin);
    } else if (got == 0) {
      m_isAtEnd = true;
      if (std::ferror(stdin)) m_error = error;
    }
  }
  return done;
}

void FileOutput::Write(int byte) {
  unsigned char one = static_cast<unsigned char>(byte);
  Write(&one, 1);
}

unsigned long FileOutput::Write(const void* bytes, unsigned long count) {
  errno = 0;
  if (std::fwrite(bytes, 1, count, m_file) != count) Fail();
  return count;
}

void FileOutput::Flush() {
  errno = 0;
  if (std::fflush(m_file) != 0) Fail();
}

void FileOutput::Fail() {
  int error = errno;
  if (console::Interrupted()) throw SEIOAbortedException();
  if (m_file == stdout && console::IsBrokenPipe(error)) throw BrokenPipe();
  if (error == ENOSPC) throw SEIODiskFullException();
  throw SEIOWriteFailed();
}

void Print(std::string_view text) { FileOutput(stdout).Write(text.data(), static_cast<unsigned long>(text.size())); }

void FlushPrinted() { FileOutput(stdout).Flush(); }
