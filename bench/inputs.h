// Texts of 64 MB that the encoding benchmarks read, and a stream over them.
//
// "Mixed UTF-8" repeats sentences in English, German, French, Polish, Russian, Greek, Chinese and
// Japanese, with the shares that the sentences have by themselves: of its bytes about half are
// ASCII, of its characters two thirds; the others take two bytes (accents, Cyrillic, Greek) or three (Chinese and
// Japanese). "windows-1252" repeats the English, German and French ones, "Shift-JIS" the English and
// Japanese ones. Four-byte sequences do not occur.
#pragma once

#include <string>

#include "platform/win32.h"
#include "qxcore/stream/input_stream.h"

namespace bench {

inline constexpr std::size_t kInputBytes = 64 << 20;
inline constexpr std::size_t kPieceBytes = 64 << 10;  // what a reader is asked for at a time

// Each made on first use, and exactly kInputBytes long but for the last sentence.
const std::string& Ascii();
const std::string& MixedUtf8();
const std::string& Utf16();  // the characters of the mixed text, little-endian, without a mark
const std::string& Windows1252();
const std::string& ShiftJis();

// Bytes in memory as an input stream.
class MemoryInput : public SInputStream {
 public:
  explicit MemoryInput(std::string_view bytes) : m_rest(bytes) {}
  int Read() override;
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long Available() override { return static_cast<unsigned long>(m_rest.size()); }
  int IsEOF() override { return m_rest.empty(); }
  const void* TakeRest(unsigned long* size) override;

 private:
  std::string_view m_rest;
};

}  // namespace bench
