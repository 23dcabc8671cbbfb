#include "tools/qxworkbench/preview_text.h"

#include <algorithm>

#include "tools/common/failure.h"

namespace {

constexpr std::size_t kPiece = 32768;           // characters
constexpr std::size_t kPart = 8 * 1024 * 1024;  // characters, a multiple of the piece
constexpr std::size_t kLongestLine = 4096;      // characters

}  // namespace

void PreviewText::Open(const std::string& native, Encoding encoding) {
  m_native = native;
  m_encoding = encoding;
  m_part = 0;
  Restart();
}

void PreviewText::GoToPart(int part) {
  if (part < 0 || part == m_part || (part > m_part && !m_isPartFull)) return;
  const bool goesOn = part == m_part + 1;
  m_part = part;
  if (!goesOn) return Restart();
  m_skipped = part;
  m_chunks.clear();
  m_lineCount = 0;
  m_characters = 0;
  m_isPartFull = false;
}

void PreviewText::Restart() {
  m_chunks.clear();
  m_open.clear();
  m_lineCount = 0;
  m_characters = 0;
  m_skipped = 0;
  m_isPartFull = m_endedWithReturn = false;
  m_error.clear();
  m_warning = SString();
  m_source.reset();
  try {
    m_source = std::make_unique<TextSource>(m_native, m_encoding | Encodings::kFullUnicode);
    m_source->Select();
  } catch (...) {
    m_error = ReasonOfCurrentException();
    m_source.reset();
  }
}

bool PreviewText::Step() {
  const TimeSlice slice;
  while (m_source != nullptr && !m_isPartFull && !slice.IsOver()) {
    try {
      ReadPiece();
    } catch (...) {
      m_error = ReasonOfCurrentException();
      EndText();
    }
  }
  return !IsComplete();
}

void PreviewText::ReadPiece() {
  WCHAR piece[kPiece];
  const unsigned long count = m_source->Reader().ReadCharacters(piece, kPiece);
  if (count == 0) {
    m_source->CheckRead();
    return EndText();
  }
  m_characters += count;
  m_warning = m_source->Reader().GetEncodingWarning();
  if (m_skipped == m_part) AddPiece({piece, count});
  if (m_characters < kPart) return;
  if (m_skipped == m_part) {
    m_isPartFull = true;
  } else {
    ++m_skipped;
    m_characters = 0;
  }
}

// CR LF, LF and CR end a line.
void PreviewText::AddPiece(SStringView piece) {
  Chunk chunk;
  chunk.firstLine = m_lineCount;
  chunk.text.reserve(piece.size() + m_open.size());
  std::size_t begin = m_endedWithReturn && piece[0] == '\n' ? 1 : 0;
  m_endedWithReturn = false;
  for (std::size_t at = begin; at < piece.size(); ++at) {
    const bool ends = piece[at] == '\n' || piece[at] == '\r';
    if (!ends && m_open.size() + at - begin < kLongestLine) continue;
    AddLine(chunk, piece.substr(begin, at - begin));
    if (piece[at] == '\r') {
      if (at + 1 == piece.size()) m_endedWithReturn = true;
      if (at + 1 < piece.size() && piece[at + 1] == '\n') ++at;
    }
    begin = ends ? at + 1 : at;
  }
  if (begin < piece.size())
    m_open.insert(m_open.end(), piece.begin() + static_cast<std::ptrdiff_t>(begin), piece.end());
  if (!chunk.ends.empty()) m_chunks.push_back(std::move(chunk));
}

void PreviewText::AddLine(Chunk& chunk, SStringView line) {
  chunk.starts.push_back(static_cast<unsigned>(chunk.text.size()));
  chunk.text.insert(chunk.text.end(), m_open.begin(), m_open.end());
  chunk.text.insert(chunk.text.end(), line.begin(), line.end());
  chunk.ends.push_back(static_cast<unsigned>(chunk.text.size()));
  m_open.clear();
  ++m_lineCount;
}

void PreviewText::EndText() {
  if (!m_open.empty()) {
    Chunk chunk;
    chunk.firstLine = m_lineCount;
    AddLine(chunk, SStringView());
    m_chunks.push_back(std::move(chunk));
  }
  m_source.reset();
}

SStringView PreviewText::Line(int line) const {
  const auto behind = std::upper_bound(m_chunks.begin(), m_chunks.end(), line,
                                       [](int number, const Chunk& chunk) { return number < chunk.firstLine; });
  const Chunk& chunk = *(behind - 1);
  const auto at = static_cast<std::size_t>(line - chunk.firstLine);
  return {chunk.text.data() + chunk.starts[at], chunk.ends[at] - chunk.starts[at]};
}
