// A file or standard input as text: the byte stream, the reader on it, and the progress bar.
#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_file.h"
#include "tools/common/encoding_option.h"
#include "tools/common/progress_bar.h"
#include "tools/common/standard_streams.h"

// Passes bytes on, counts them and remembers the first ones.
class CountingInput : public SInputStream {
 public:
  explicit CountingInput(SInputStream& inner) : m_inner(inner) {}
  using SInputStream::Read;
  int Read() override;
  unsigned long Read(void* buffer, unsigned long count) override;
  int IsEOF() override { return m_inner.IsEOF(); }
  unsigned long Available() override { return m_inner.Available(); }
  int GetError() const override { return m_inner.GetError(); }
  // A detection that looks at all of a file goes back; what it looked at counts once.
  bool GetPlace(std::uint64_t* place) override;
  bool GoToPlace(std::uint64_t place) override;

  unsigned long long Count() const { return m_count; }
  // Whether the input starts with these bytes, at most three.
  bool StartsWith(std::string_view bytes) const;

 private:
  SInputStream& m_inner;
  unsigned long long m_count = 0;
  unsigned char m_first[3] = {};
};

// Opens a file for reading. Throws Failure that says what the system has against it.
std::unique_ptr<SInputFile> OpenInput(const std::string& name, SProgressIndicatorEx& progress);

class TextSource {
 public:
  // Opens the file, or standard input for "-". `progress` is told how far the file has been read, and outlives the
  // source; null for a bar on the terminal. Throws Failure when the file cannot be opened.
  TextSource(const std::string& name, Encoding request, SProgressIndicatorEx* progress = nullptr);

  SMultiFormatReaderUnicode& Reader() { return *m_reader; }

  // Decides on the encoding without reading text.
  void Select();

  // Whether the input starts with the mark of the encoding that was selected.
  bool HasMark();

  // The size of the whole input; reads what is left of it where the system does not know it.
  unsigned long long CountBytes();

  // Throws when the end that the reader saw was a failed read.
  void CheckRead();

 private:
  std::unique_ptr<ProgressBar> m_bar;  // null when somebody else is told
  std::unique_ptr<SInputFile> m_file;  // null for standard input
  std::unique_ptr<StandardInput> m_standardInput;
  std::unique_ptr<CountingInput> m_bytes;
  std::unique_ptr<SMultiFormatReaderUnicode> m_reader;
  unsigned long long m_size = 0;
};
