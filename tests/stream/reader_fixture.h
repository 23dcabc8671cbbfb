// Vocabulary of the reader tests: streams over bytes that are handed out in pieces of any size, and
// what a reader makes of them.
#pragma once

#include <algorithm>
#include <cstring>
#include <string>
#include <utility>

#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_stream.h"
#include "qxcore/stream/output_stream.h"
#include "tests/support/steps.h"
#include "tests/support/text.h"

using Support = SAbstractIO::SMultiFormatSupport;
using Encoding = Support::Encoding;

// Hands out at most `piece` bytes a read, and can fail in the middle.
class PiecewiseInput : public SInputStream {
 public:
  explicit PiecewiseInput(std::string bytes, unsigned long piece = ~0ul) : m_bytes(std::move(bytes)), m_piece(piece) {}
  int Read() override { return m_at < m_bytes.size() ? static_cast<unsigned char>(m_bytes[m_at++]) : -1; }
  unsigned long Read(void* buffer, unsigned long count) override {
    ++m_reads;
    unsigned long got = std::min({count, m_piece, static_cast<unsigned long>(m_bytes.size() - m_at)});
    std::memcpy(buffer, m_bytes.data() + m_at, got);
    m_at += got;
    return got;
  }
  int IsEOF() override { return m_at == m_bytes.size(); }
  int Reads() const { return m_reads; }

 private:
  std::string m_bytes;
  unsigned long m_piece;
  std::size_t m_at = 0;
  int m_reads = 0;
};

class CollectingOutput : public SOutputStream {
 public:
  void Write(int byte) override { bytes += static_cast<char>(byte); }
  unsigned long Write(const void* buffer, unsigned long count) override {
    bytes.append(static_cast<const char*>(buffer), count);
    return count;
  }
  std::string bytes;
};

struct ReadResult {
  Encoding selected = 0;
  SString text;
  SString detection;
  SString report;
  SString loss;
  std::string failure;  // name and code of what was thrown
  bool operator==(const ReadResult& other) const = default;
};

inline void PrintTo(const ReadResult& result, std::ostream* out) {
  *out << std::hex << result.selected << std::dec << ' ' << testing::PrintToString(result.text.Left(60)) << " ("
       << result.text.Length() << ") " << testing::PrintToString(result.report) << testing::PrintToString(result.loss)
       << result.failure;
}

inline ReadResult ReadFrom(SInputStream& in, Encoding requested, int way = 0) {
  ReadResult result;
  SMultiFormatReaderUnicode reader(in, requested);
  try {
    test::Steps steps;
    switch (way) {
      case 0:
        for (; !reader.IsEOF(); steps.Take()) result.text += reader.ReadAll();
        break;
      case 1:
        for (int c; (c = reader.Read()) >= 0; steps.Take()) result.text += static_cast<WCHAR>(c);
        break;
      default: {
        WCHAR block[3000];
        for (; unsigned long bytes = reader.Read(block, sizeof block); steps.Take())
          result.text += SStringView(block, bytes / 2);
      }
    }
  } catch (const SException& thrown) {
    result.text = SString();  // what was delivered before depends on the way of reading
    result.failure = std::to_string(static_cast<std::uint32_t>(thrown.GetCode()));
    for (const WCHAR* c = thrown.GetExceptionName(); *c != 0; ++c) result.failure += static_cast<char>(*c);
  }
  result.selected = reader.GetFormat();
  result.detection = reader.GetDetectionWarning();
  result.report = reader.GetDetectionReport();
  result.loss = reader.GetEncodingWarning();
  return result;
}

inline ReadResult ReadBytes(const std::string& bytes, Encoding requested, unsigned long piece = ~0ul, int way = 0) {
  PiecewiseInput in(bytes, piece);
  return ReadFrom(in, requested, way);
}

inline std::string Utf16Bytes(SStringView text, bool isBigEndian = false) {
  std::string bytes;
  for (WCHAR c : text) {
    char low = static_cast<char>(c & 0xFF);
    char high = static_cast<char>(c >> 8);
    bytes += isBigEndian ? high : low;
    bytes += isBigEndian ? low : high;
  }
  return bytes;
}
