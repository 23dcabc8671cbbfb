// Text on its way from a source to a stream of bytes in another encoding: a piece at a time, so that a program with
// windows can take messages in between.
#pragma once

#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "tools/common/text_source.h"
#include "tools/common/text_target.h"

// One source that is read, by its name in messages, and what reads it.
struct PipeSource {
  std::string name;
  TextSource& text;
};

// What is to be said of one source when all of it has been passed on.
struct TextOutcome {
  SString detection, reading, writing;  // warnings; empty when there is nothing to warn of
  SString encoding;                     // the source's
  bool IsLossy() const { return !reading.IsEmpty() || !writing.IsEmpty(); }
};

// What `read` (into a buffer of some bytes) returns, 0 at the end of the source. Failures, a cut source and the
// user's wish to end are thrown, as those of the source.
unsigned ReadPiece(PipeSource& source, void* buffer, unsigned size,
                   const std::function<unsigned long(void*, unsigned long)>& read);

class TextPass {
 public:
  // From a source that has selected its encoding into `out`, in the encoding and with the policy of `format`;
  // `replacement` stands for characters that cannot be mapped, 0 drops them, and without one the library's own does.
  // Source and stream must outlive the pass.
  TextPass(const std::string& name, TextSource& source, SOutputStream& out, Encoding format,
           std::optional<WCHAR> replacement);

  PipeSource& Source() { return m_source; }
  TextTarget& Target() { return m_target; }

  // Passes the next piece on; false at the end of the source. Throws what ReadPiece and TextTarget::Write throw.
  bool CopyPiece();

  // Ends the text and says what came of it. Throws what the stream throws.
  TextOutcome Finish();

 private:
  PipeSource m_source;
  SOutputStringStream m_stream;
  TextTarget m_target;
  std::vector<WCHAR> m_piece;
};
