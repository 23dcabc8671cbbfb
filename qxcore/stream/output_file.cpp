#include "qxcore/stream/output_file.h"

#include <cerrno>
#include <limits>

#include "qxcore/core/error_cause.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/wide.h"
#include "qxcore/stream/internal/file_buffer.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SOutputFile, SOutputStream, 0)

SOutputFile::SOutputFile() = default;
SOutputFile::SOutputFile(const SString& path, int flags) { Init(path, flags); }

SOutputFile::~SOutputFile() { CloseFile(); }

// What fclose returns.
int SOutputFile::CloseFile() noexcept {
  const int result = m_file != nullptr ? std::fclose(m_file) : 0;
  m_file = nullptr;
  SMemFree(m_buffer);
  m_buffer = nullptr;
  return result;
}

void SOutputFile::Init(const SString& path, int flags) {
  Close();
  m_file = platform::WideFileOpen(path, (flags & kAppend) != 0 ? WTEXT("ab") : WTEXT("wb"));
  if (m_file == nullptr) throw SEWithError<SEIOCantOpenForWriting>(errno);
  m_buffer = SGiveBuffer(m_file);
  // Some runtimes go to the end with the first write only; what cannot seek has no position anyway.
  if ((flags & kAppend) != 0) platform::FileSeek(m_file, 0, SEEK_END);
}

void SOutputFile::ThrowFailure() const {
  if (errno == ENOSPC) throw SEWithError<SEIODiskFullException>(errno);
  throw SEWithError<SEIOWriteFailed>(errno);
}

void SOutputFile::Write(int byte) {
  errno = 0;
  if (m_file == nullptr || std::putc(byte & 0xFF, m_file) == EOF) ThrowFailure();
}

unsigned long SOutputFile::Write(const void* buffer, unsigned long count) {
  if (count == 0) return 0;
  errno = 0;
  if (m_file == nullptr || std::fwrite(buffer, 1, count, m_file) != count) ThrowFailure();
  return count;
}

void SOutputFile::Flush() {
  errno = 0;
  if (m_file != nullptr && std::fflush(m_file) != 0) ThrowFailure();
}

void SOutputFile::Close() {
  if (m_file == nullptr) return;
  errno = 0;
  // Flushed by itself first: closing alone hides the failure on some runtimes.
  bool failed = std::fflush(m_file) != 0 || std::ferror(m_file) != 0;
  int reason = errno;
  failed = CloseFile() != 0 || failed;
  if (reason != 0) errno = reason;
  if (failed) ThrowFailure();
}

long SOutputFile::GetPosition() const {
  std::int64_t position = m_file != nullptr ? platform::FileTell(m_file) : -1;
  return position <= std::numeric_limits<long>::max() ? static_cast<long>(position) : -1;
}
