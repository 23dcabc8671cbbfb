// The text of a file, decoded a piece at a time into lines. Of a long file one part is held at a time: 8 million
// characters; the others are decoded when they are asked for.
#pragma once

#include <memory>
#include <string>
#include <vector>

#include "tools/common/text_source.h"
#include "tools/qxworkbench/time_slice.h"

class PreviewText {
 public:
  // Begins with the first part of a file, in an encoding without detection.
  void Open(const std::string& native, Encoding encoding);
  // Decodes on for a while. True while another step has something to do at once.
  bool Step();

  // The lines that have been decoded; one of more than 4096 characters counts as several.
  int LineCount() const { return m_lineCount; }
  // Without its end. Valid until the next call that is not const.
  SStringView Line(int line) const;
  const std::string& Error() const { return m_error; }  // why the text ends; empty when it does not end early
  bool IsComplete() const { return m_source == nullptr || m_isPartFull; }

  int Part() const { return m_part; }                // from 0
  bool HasNextPart() const { return m_isPartFull; }  // known when this one is complete
  void GoToPart(int part);                           // does nothing when there is no such part
  Encoding GetEncoding() const { return m_encoding; }
  // What could not be decoded so far, in words; empty for nothing.
  SString Warning() const { return m_warning; }

 private:
  struct Chunk {
    int firstLine;
    std::vector<WCHAR> text;
    std::vector<unsigned> ends;  // of lines, without their ends
    std::vector<unsigned> starts;
  };

  void Restart();
  void ReadPiece();
  void AddPiece(SStringView piece);
  void AddLine(Chunk& chunk, SStringView line);
  void EndText();

  std::string m_native;
  Encoding m_encoding = 0;
  std::unique_ptr<TextSource> m_source;  // null when all has been read
  std::vector<Chunk> m_chunks;
  int m_lineCount = 0;
  std::vector<WCHAR> m_open;  // of the line that has not ended
  bool m_endedWithReturn = false;
  std::size_t m_characters = 0;  // of the part
  int m_part = 0;
  int m_skipped = 0;  // parts that were passed over on the way to this one
  bool m_isPartFull = false;
  std::string m_error;
  SString m_warning;
};
