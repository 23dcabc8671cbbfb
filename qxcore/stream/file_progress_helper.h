// What the two file input streams share: the runtime's file handle and an optional progress indicator.
//
// With an indicator, a read asks before it takes anything from the file: whenever the position has moved by
// a hundredth of the file's size since the last time, the indicator is moved and asked whether the user
// cancelled; then SEIOAbortedException is thrown, and no byte is lost. Seeking asks each time.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>
#include <cstdio>

#include "qxcore/platform/export.h"
#include "qxcore/stream/progress_indicator.h"
#include "qxcore/string/string.h"

class QXCORE_API SFileProgressHelper {
 public:
  SFileProgressHelper(const SFileProgressHelper&) = delete;
  SFileProgressHelper& operator=(const SFileProgressHelper&) = delete;

  // Moves to a position from the start; true on failure. May throw SEIOAbortedException.
  bool SeekPos(unsigned long position);
  // The position from the start; the largest value where it does not fit.
  unsigned long GetPos() const;
  // The size when the file was opened; 0 for what has none, such as pipes.
  std::uint64_t GetFileSize() const { return m_size; }

 protected:
  // Opens the file for reading. Throws SEIOCantOpenForReading.
  SFileProgressHelper(const SString& path, SProgressIndicatorEx* progress);
  ~SFileProgressHelper();

  // The two file streams forward to these; each does what SInputStream says of its like.
  int ReadByte();
  unsigned long ReadBlock(void* buffer, unsigned long count);
  unsigned long SkipBytes(unsigned long count);
  unsigned long CountAvailable();
  bool IsAtEnd() const;
  // The next byte of a block that began at `start`: a cancelled read goes back there.
  int ReadByteOf(std::uint64_t start);
  std::uint64_t Position() const { return m_position; }
  bool GoBackTo(std::uint64_t position);
  bool GetFilePlace(std::uint64_t* place);
  bool GoToFilePlace(std::uint64_t place);
  void CloseFile() noexcept;

  std::FILE* m_file;  // null when closed
  int m_error = 0;    // errno of a read that failed

 private:
  bool IsCancelled();
  bool LookAhead();

  SProgressIndicatorEx* m_progress;  // not owned
  std::uint64_t m_size = 0;
  std::uint64_t m_position = 0;
  std::uint64_t m_step = 0;
  std::uint64_t m_nextReport = 0;
  char* m_buffer = nullptr;  // the file's
};
