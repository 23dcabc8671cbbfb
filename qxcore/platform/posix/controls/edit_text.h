// The text of an edit control: its lines, its selection, one step of undoing. No window, no pixels.
#pragma once

#include <algorithm>

#include "qxcore/platform/posix/window/memory.h"

namespace platform::controls {

class EditText {
 public:
  const model::Text& All() const { return m_text; }
  int Length() const { return static_cast<int>(m_text.size()); }

  // The selection; the caret is at its moving end. Positions are clamped.
  int First() const { return std::min(m_anchor, m_caret); }
  int Last() const { return std::max(m_anchor, m_caret); }
  int Caret() const { return m_caret; }
  bool HasSelection() const { return m_anchor != m_caret; }
  model::Text Selection() const {
    return m_text.substr(static_cast<std::size_t>(First()), static_cast<std::size_t>(Last() - First()));
  }
  void Select(int anchor, int caret);
  void MoveTo(int caret, bool keepsAnchor) { Select(keepsAnchor ? m_anchor : caret, caret); }

  // WM_GETTEXT: as much as the buffer holds, with a NUL. Returns the number of characters.
  LRESULT CopyAll(std::size_t capacity, WCHAR* buffer) const;
  // EM_GETLINE: without a NUL; the buffer begins with its capacity.
  LRESULT CopyLine(int line, WCHAR* buffer) const;

  // All throw std::bad_alloc and then change nothing.
  void Set(model::Text text);
  void Replace(const model::Text& text, bool canUndo);  // the selection
  bool CanUndo() const { return m_canUndo; }
  void Undo();
  void EmptyUndo() { m_canUndo = false; }

  // Lines end with CR LF. Positions outside are the nearest inside.
  int LineCount() const;
  int LineOf(int position) const;
  int LineStart(int line) const;  // -1 behind the last line
  int LineLength(int line) const;
  // The neighbour of a position; a surrogate pair and a CR LF are one step.
  int Next(int position) const;
  int Before(int position) const;
  int NextWord(int position) const;
  int WordBefore(int position) const;

 private:
  model::Text m_text, m_undoText;
  int m_anchor = 0, m_caret = 0;
  int m_undoFirst = 0, m_undoLength = 0;  // what undoing replaces with m_undoText
  bool m_canUndo = false;
};

}  // namespace platform::controls
