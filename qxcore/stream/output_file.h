// Output to a file.
//
// Failures throw SEIODiskFullException when the device is full, else SEIOWriteFailed. The runtime buffers:
// that everything arrived is known only when Flush or Close came back. The destructor closes, too, but cannot
// report a failure. Threads: a stream belongs to one thread at a time.
#pragma once

#include <cstdio>

#include "qxcore/stream/output_stream.h"
#include "qxcore/string/string.h"

class QXCORE_API SOutputFile : public SOutputStream {
  QXCORE_DECLARE_CREATABLE_CLASS(SOutputFile)

  // Flags of the constructor and Init.
  enum Flags : int { kCreate = 0, kAppend = 2 };

  // Opens nothing; Init does.
  SOutputFile();
  // Creates the file, or cuts it to nothing; with kAppend writes behind what is there. Throws
  // SEIOCantOpenForWriting.
  explicit SOutputFile(const SString& path, int flags = kCreate);
  SOutputFile(const SOutputFile&) = delete;
  SOutputFile& operator=(const SOutputFile&) = delete;
  ~SOutputFile() override;

  // Closes what is open, then opens as the constructor does.
  void Init(const SString& path, int flags);
  void Write(int byte) override;
  unsigned long Write(const void* buffer, unsigned long count) override;
  void Flush() override;
  // Flushes, closes and throws if anything did not arrive; a closed file is left alone.
  void Close() override;
  // The position from the start, or -1 when nothing is open or the position does not fit.
  long GetPosition() const;

 private:
  [[noreturn]] void ThrowFailure() const;
  int CloseFile() noexcept;

  std::FILE* m_file = nullptr;
  char* m_buffer = nullptr;  // the file's
};
