// Sequential input from a file.
//
// Reads take blocks from the runtime's buffer; for many single bytes put an SInputBufferStream in front.
// The end-of-file flag is set once a read met the end; IsEOF is that flag. What a failing read delivered
// counts; the error itself is asked for with GetError. Threads: a stream belongs to one thread at a time.
#pragma once

#include "qxcore/stream/file_progress_helper.h"
#include "qxcore/stream/input_stream.h"

class QXCORE_API SInputFile : public SInputStream, public SFileProgressHelper {
  QXCORE_DECLARE_CLASS(SInputFile)

  // Opens the file. The indicator, where given, must outlive the stream. Throws SEIOCantOpenForReading; a
  // folder cannot be opened.
  explicit SInputFile(const SString& path, SProgressIndicatorEx* progress = nullptr);
  ~SInputFile() override;

  int Read() override { return ReadByte(); }
  unsigned long Read(void* buffer, unsigned long count) override { return ReadBlock(buffer, count); }
  unsigned long Skip(unsigned long count) override { return SkipBytes(count); }
  // Bytes up to the end as it was when the file was opened, at least 1 while more follows.
  unsigned long Available() override { return CountAvailable(); }
  int IsEOF() override { return IsAtEnd(); }
  void Close() override { CloseFile(); }
  int GetError() const override { return m_error; }
  bool GetPlace(std::uint64_t* place) override { return GetFilePlace(place); }
  bool GoToPlace(std::uint64_t place) override { return GoToFilePlace(place); }
};
