// A stream that hands out its bytes in pieces, and what a reader makes of it.
#pragma once

#include <cstdio>
#include <cstring>
#include <string>
#include <string_view>

#include "qxcore/core/exception.h"
#include "qxcore/platform/win32.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"

// Gives at most `piece` bytes at a time; 0 gives all that is asked for.
class PieceInput : public SInputStream {
 public:
  PieceInput(std::string_view bytes, unsigned long piece) : m_rest(bytes), m_piece(piece) {}
  int Read() override {
    unsigned char byte;
    return Read(&byte, 1) == 1 ? byte : -1;
  }
  unsigned long Read(void* buffer, unsigned long count) override {
    if (m_piece != 0 && count > m_piece) count = m_piece;
    if (count > m_rest.size()) count = static_cast<unsigned long>(m_rest.size());
    if (count != 0) std::memcpy(buffer, m_rest.data(), count);
    m_rest.remove_prefix(count);
    return count;
  }
  unsigned long Available() override { return static_cast<unsigned long>(m_rest.size()); }
  int IsEOF() override { return m_rest.empty(); }

 private:
  std::string_view m_rest;
  unsigned long m_piece;
};

// All that can be seen of one pass: the text up to the end or the failure, and how it went.
struct Outcome {
  std::basic_string<WCHAR> text;
  SAbstractIO::SMultiFormatSupport::Encoding selected = 0;
  HRESULT failure = 0;
  std::basic_string<WCHAR> warnings;

  friend bool operator==(const Outcome&, const Outcome&) = default;
  void Print() const {
    std::fprintf(stderr, "selected %x, failure %x, text", static_cast<unsigned>(selected),
                 static_cast<unsigned>(failure));
    for (WCHAR c : text) std::fprintf(stderr, " %x", static_cast<unsigned>(c));
    std::fprintf(stderr, "\nwarnings: %s\n", std::string(warnings.begin(), warnings.end()).c_str());
  }
};

// Reads all; with `characters` other than 0 as many at a time, else one by one.
inline Outcome ReadAll(std::string_view bytes, unsigned long piece, unsigned requested, unsigned characters, int quick,
                       int replacement) {
  Outcome outcome;
  PieceInput in(bytes, piece);
  SMultiFormatReaderUnicode reader(in, requested);
  reader.SetQuickUTF8ToUTF16(quick);
  if (replacement >= 0) reader.SetReplacement(static_cast<WCHAR>(replacement));
  try {
    if (characters == 0) {
      for (int c; (c = reader.Read()) >= 0;) outcome.text += static_cast<WCHAR>(c);
    } else {
      std::basic_string<WCHAR> buffer(characters, 0);
      while (unsigned long got = reader.Read(buffer.data(), characters * static_cast<unsigned>(sizeof(WCHAR)))) {
        outcome.text.append(buffer, 0, got / sizeof(WCHAR));
      }
    }
  } catch (const SException& failure) {
    outcome.failure = failure.GetCode();
  }
  outcome.selected = reader.GetFormat();
  outcome.warnings = reader.GetDetectionWarning();
  outcome.warnings += reader.GetEncodingWarning();
  return outcome;
}

// Ends the run, with both outcomes, when they differ.
inline void CheckSame(const Outcome& expected, const Outcome& other, const char* where) {
  if (other == expected) return;
  std::fprintf(stderr, "%s differs\n", where);
  expected.Print();
  other.Print();
  std::abort();
}
