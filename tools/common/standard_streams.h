// The C library's files as streams of the library: standard input, standard output, and the file that
// a conversion writes.
#pragma once

#include <cstdio>
#include <string>
#include <string_view>

#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/output_stream.h"

// Reads standard input. A failed read ends the data and is reported by GetError; the user's wish to end
// throws SEIOAbortedException.
class StandardInput : public SInputStream {
 public:
  using SInputStream::Read;
  int Read() override;
  unsigned long Read(void* buffer, unsigned long count) override;
  int IsEOF() override { return m_isAtEnd; }
  int GetError() const override { return m_error; }

 private:
  bool m_isAtEnd = false;
  int m_error = 0;
};

// Writes an open file, which stays its owner's. A failed write throws SEIODiskFullException or
// SEIOWriteFailed; on standard output a reader that has gone throws BrokenPipe.
class FileOutput : public SOutputStream {
 public:
  explicit FileOutput(std::FILE* file) : m_file(file) {}
  using SOutputStream::Write;
  void Write(int byte) override;
  unsigned long Write(const void* bytes, unsigned long count) override;
  void Flush() override;

 private:
  [[noreturn]] void Fail();

  std::FILE* m_file;
};

// Writes text to standard output, with the same exceptions.
void Print(std::string_view text);

// Hands what was printed to the system; what a full disk refused shows here at the latest.
void FlushPrinted();
