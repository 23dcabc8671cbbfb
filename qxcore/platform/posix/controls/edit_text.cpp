#include "qxcore/platform/posix/controls/edit_text.h"

#include <algorithm>

namespace platform::controls {
namespace {

bool IsLow(WCHAR c) { return c >= 0xDC00 && c <= 0xDFFF; }
bool IsHigh(WCHAR c) { return c >= 0xD800 && c <= 0xDBFF; }
bool IsBlank(WCHAR c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }

}  // namespace

void EditText::Select(int anchor, int caret) {
  m_anchor = std::clamp(anchor, 0, Length());
  m_caret = std::clamp(caret, 0, Length());
}

void EditText::Set(model::Text text) {
  m_text.swap(text);
  m_anchor = m_caret = 0;
  m_canUndo = false;
}

void EditText::Replace(const model::Text& text, bool canUndo) {
  const auto first = static_cast<std::size_t>(First()), count = static_cast<std::size_t>(Last() - First());
  model::Text gone = m_text.substr(first, count);
  m_text.replace(first, count, text);
  const int length = static_cast<int>(text.size());
  // Typing goes on in the same step.
  const bool continues = canUndo && m_canUndo && gone.empty() && m_undoFirst + m_undoLength == static_cast<int>(first);
  if (continues) {
    m_undoLength += length;
  } else {
    m_undoText.swap(gone);
    m_undoFirst = static_cast<int>(first);
    m_undoLength = length;
  }
  m_canUndo = canUndo;
  m_anchor = m_caret = static_cast<int>(first) + length;
}

void EditText::Undo() {
  if (!m_canUndo) return;
  const model::Text back = m_undoText;
  const int first = m_undoFirst;
  Select(first, first + m_undoLength);
  m_canUndo = false;
  Replace(back, true);
  Select(first, first + static_cast<int>(back.size()));
}

int EditText::LineCount() const { return 1 + static_cast<int>(std::count(m_text.begin(), m_text.end(), u'\n')); }

int EditText::LineOf(int position) const {
  const auto end = m_text.begin() + std::clamp(position, 0, Length());
  return static_cast<int>(std::count(m_text.begin(), end, u'\n'));
}

int EditText::LineStart(int line) const {
  std::size_t at = 0;
  for (; line > 0; --line) {
    at = m_text.find(u'\n', at);
    if (at == model::Text::npos) return -1;
    ++at;
  }
  return static_cast<int>(at);
}

int EditText::LineLength(int line) const {
  const int start = LineStart(line);
  if (start < 0) return 0;
  std::size_t end = m_text.find(u'\n', static_cast<std::size_t>(start));
  if (end == model::Text::npos) end = m_text.size();
  if (end > static_cast<std::size_t>(start) && end < m_text.size() && m_text[end - 1] == '\r') --end;
  return static_cast<int>(end) - start;
}

int EditText::Next(int position) const {
  if (position >= Length()) return Length();
  const auto at = static_cast<std::size_t>(position);
  const bool isPair = at + 1 < m_text.size() &&
                      ((IsHigh(m_text[at]) && IsLow(m_text[at + 1])) || (m_text[at] == '\r' && m_text[at + 1] == '\n'));
  return position + (isPair ? 2 : 1);
}

int EditText::Before(int position) const {
  if (position <= 0) return 0;
  const auto at = static_cast<std::size_t>(position);
  const bool isPair = at >= 2 && ((IsLow(m_text[at - 1]) && IsHigh(m_text[at - 2])) ||
                                  (m_text[at - 1] == '\n' && m_text[at - 2] == '\r'));
  return position - (isPair ? 2 : 1);
}

int EditText::NextWord(int position) const {
  while (position < Length() && !IsBlank(m_text[static_cast<std::size_t>(position)])) ++position;
  while (position < Length() && IsBlank(m_text[static_cast<std::size_t>(position)])) ++position;
  return position;
}

int EditText::WordBefore(int position) const {
  while (position > 0 && IsBlank(m_text[static_cast<std::size_t>(position) - 1])) --position;
  while (position > 0 && !IsBlank(m_text[static_cast<std::size_t>(position) - 1])) --position;
  return position;
}

LRESULT EditText::CopyAll(std::size_t capacity, WCHAR* buffer) const {
  if (capacity == 0 || buffer == nullptr) return 0;
  const std::size_t count = std::min(m_text.size(), capacity - 1);
  std::copy_n(m_text.data(), count, buffer);
  buffer[count] = 0;
  return static_cast<LRESULT>(count);
}

LRESULT EditText::CopyLine(int line, WCHAR* buffer) const {
  const std::size_t capacity = static_cast<WORD>(buffer[0]);
  if (line >= LineCount()) return 0;
  const std::size_t count = std::min(capacity, static_cast<std::size_t>(LineLength(line)));
  std::copy_n(m_text.data() + LineStart(line), count, buffer);
  return static_cast<LRESULT>(count);
}

}  // namespace platform::controls
