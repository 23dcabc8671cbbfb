// Input from a file of ANSI text that can seek and read lines. Threads: a stream belongs to one thread at a time.
#pragma once

#include "qxcore/stream/file_progress_helper.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/seekable_char_reader.h"

class QXCORE_API SSeekableInputANSIFile : public SInputStream,
                                          public SFileProgressHelper,
                                          public SAbstractIO::SIOSeekableCharReader {
  QXCORE_DECLARE_CLASS(SSeekableInputANSIFile)

  // As SInputFile.
  explicit SSeekableInputANSIFile(const SString& path, SProgressIndicatorEx* progress = nullptr);
  ~SSeekableInputANSIFile() override;

  int Read() override { return ReadByte(); }
  unsigned long Read(void* buffer, unsigned long count) override { return ReadBlock(buffer, count); }
  unsigned long Skip(unsigned long count) override { return SkipBytes(count); }
  unsigned long Available() override { return CountAvailable(); }
  int IsEOF() override { return IsAtEnd(); }
  void Close() override { CloseFile(); }
  int GetError() const override { return m_error; }
  bool GetPlace(std::uint64_t* place) override { return GetFilePlace(place); }
  bool GoToPlace(std::uint64_t place) override { return GoToFilePlace(place); }

  // Invalid bytes of the ANSI code page give its default character; -1 at the end.
  int ReadChar() override;
  // The next line, converted with the ANSI code page.
  SString ReadLn() override;
  // Byte positions.
  bool SeekPos(unsigned long position) override { return SFileProgressHelper::SeekPos(position); }
  unsigned long GetPos() const override { return SFileProgressHelper::GetPos(); }
  bool SeekSupported() const override { return true; }

  // The runtime's file handle, owned by the stream; null after Close.
  std::FILE* GetFile() const { return m_file; }
};
