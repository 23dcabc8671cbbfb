// DrawTextW: lines broken, shortened, aligned and marked, then drawn one by one.
#include <algorithm>
#include <string>
#include <vector>

#include "qxcore/platform/posix/draw/object.h"

namespace {

using Text = std::basic_string<WCHAR>;
constexpr WCHAR kEllipsis[] = {'.', '.', '.', 0}, kBlanks[] = {' ', '\t', 0};

bool IsBlank(WCHAR character) { return character == ' ' || character == '\t'; }

// Blanks at the end of a broken line have no width where it is centred or stands at the right.
SStringView WithoutBlanksAtEnd(SStringView text) {
  while (!text.empty() && IsBlank(text.back())) text.remove_suffix(1);
  return text;
}

// A text without its prefix signs: "&" marks the character behind it, "&&" is one "&".
struct Plain {
  Text text;
  std::vector<bool> marked;  // one a unit of the text
};

Plain WithoutPrefixes(SStringView text) {
  Plain plain;
  bool mark = false;
  for (WCHAR unit : text) {
    if (unit == '&' && !mark) {
      mark = true;
      continue;
    }
    plain.text.push_back(unit);
    plain.marked.push_back(mark && unit != '&');
    mark = false;
  }
  // Only the last mark is shown.
  for (std::size_t i = plain.marked.size(), seen = 0; i-- > 0;) {
    if (plain.marked[i] && seen++) plain.marked[i] = false;
  }
  return plain;
}

Plain AsItIs(SStringView text) { return {Text(text), std::vector<bool>(text.size(), false)}; }

// A call below for which memory is short is a failure of the whole; without a font there is just nothing to draw.
void Check(BOOL done) {
  if (!done && GetLastError() == ERROR_NOT_ENOUGH_MEMORY) throw std::bad_alloc();
}

class Drawer {
 public:
  Drawer(HDC dc, UINT format) : m_dc(dc), m_format(format) {
    Check(GetTextMetricsW(dc, &m_metrics));
    m_lineHeight = m_metrics.tmHeight + (format & DT_EXTERNALLEADING ? m_metrics.tmExternalLeading : 0);
    int stops = format & DT_TABSTOP ? static_cast<int>(format >> 8 & 0xFF) : 8;
    m_tab = std::max(1, stops * m_metrics.tmAveCharWidth);
  }

  int LineHeight() const { return m_lineHeight; }
  int TextHeight() const { return m_metrics.tmHeight; }

  int Width(SStringView text) const {
    if (!(m_format & DT_EXPANDTABS)) return PlainWidth(text);
    int x = 0;
    for (std::size_t start = 0;;) {
      std::size_t tab = text.find(WCHAR{'\t'}, start);
      x += PlainWidth(text.substr(start, tab == SStringView::npos ? tab : tab - start));
      if (tab == SStringView::npos) return x;
      x = (x / m_tab + 1) * m_tab;
      start = tab + 1;
    }
  }

  // Draws a line whose box begins at (x, y).
  void Draw(SStringView text, int x, int y, const RECT* clip) const {
    UINT options = (clip ? ETO_CLIPPED : 0) | (m_format & DT_RTLREADING ? ETO_RTLREADING : 0);
    int at = 0;
    for (std::size_t start = 0; start <= text.size();) {
      std::size_t tab = m_format & DT_EXPANDTABS ? text.find(WCHAR{'\t'}, start) : SStringView::npos;
      SStringView part = text.substr(start, tab == SStringView::npos ? tab : tab - start);
      Check(ExtTextOutW(m_dc, x + at, y, options, clip, part.data(), static_cast<UINT>(part.size()), nullptr));
      if (tab == SStringView::npos) return;
      at = ((at + PlainWidth(part)) / m_tab + 1) * m_tab;
      start = tab + 1;
    }
  }

  // Underlines the marked characters of a line.
  void Underline(SStringView text, const std::vector<bool>& marked, std::size_t first, int x, int y) const {
    for (std::size_t i = 0; i < text.size(); ++i) {
      if (!marked[first + i]) continue;
      int left = x + Width(text.substr(0, i)), right = x + Width(text.substr(0, i + 1));
      RECT rule{left, y + m_metrics.tmAscent + 1, right, y + m_metrics.tmAscent + 2};
      COLORREF former = SetBkColor(m_dc, GetTextColor(m_dc));
      ExtTextOutW(m_dc, 0, 0, ETO_OPAQUE, &rule, nullptr, 0, nullptr);
      SetBkColor(m_dc, former);
    }
  }

 private:
  int PlainWidth(SStringView text) const {
    SIZE size{};
    Check(GetTextExtentPoint32W(m_dc, text.data(), static_cast<int>(text.size()), &size));
    return size.cx;
  }

  HDC m_dc;
  UINT m_format;
  TEXTMETRICW m_metrics{};
  int m_lineHeight, m_tab;
};

// --- breaking ---

struct Line {
  std::size_t start, length;
};

// How many units of a line fit into a width, at least one. A surrogate pair stays whole.
std::size_t Fitting(const Drawer& drawer, SStringView text, int width) {
  std::size_t low = 0, high = text.size();
  while (low < high) {
    std::size_t middle = (low + high + 1) / 2;
    if (drawer.Width(text.substr(0, middle)) <= width)
      low = middle;
    else
      high = middle - 1;
  }
  if (low > 0 && low < text.size() && (text[low] & 0xFC00) == 0xDC00) --low;
  return std::max<std::size_t>(low, 1);
}

// The end of the first line of a paragraph that is too wide: behind the last blank that fits, or, where an edit control
// would break, within a word that is wider than the line. The blank belongs to the line before, unless nothing fits.
std::size_t BreakAt(const Drawer& drawer, SStringView text, int width, UINT format) {
  std::size_t fit = Fitting(drawer, text, width);
  if (fit >= text.size()) return text.size();
  std::size_t blank = text.substr(0, fit).find_last_of(kBlanks);
  if (blank != SStringView::npos) return blank + 1;
  if (format & DT_EDITCONTROL) return fit;
  blank = text.find_first_of(kBlanks);
  return blank == SStringView::npos ? text.size() : blank;
}

void AddParagraph(const Drawer& drawer, SStringView all, Line paragraph, int width, UINT format,
                  std::vector<Line>& lines) {
  if (!(format & DT_WORDBREAK)) {
    lines.push_back(paragraph);
    return;
  }
  std::size_t end = paragraph.start + paragraph.length, start = paragraph.start;
  do {
    SStringView rest = all.substr(start, end - start);
    std::size_t length = BreakAt(drawer, rest, width, format);
    lines.push_back({start, length});
    start += length;
    // The blank behind a word that is too wide belongs to no line.
    if (start < end && IsBlank(all[start]) && !IsBlank(all[start - 1])) ++start;
  } while (start < end);
}

std::vector<Line> Break(const Drawer& drawer, SStringView text, int width, UINT format) {
  std::vector<Line> lines;
  if (format & DT_SINGLELINE) return {{0, text.size()}};
  for (std::size_t start = 0; start <= text.size();) {
    std::size_t end = std::min(text.find_first_of(WTEXT("\r\n"), start), text.size());
    AddParagraph(drawer, text, {start, end - start}, width, format, lines);
    if (end == text.size()) break;
    bool pair = text[end] == '\r' && end + 1 < text.size() && text[end + 1] == '\n';
    start = end + (pair ? 2 : 1);
    if (start == text.size()) break;  // a line end at the very end adds no line
  }
  return lines;
}

// --- shortening ---

Text ShortenedAtEnd(const Drawer& drawer, SStringView text, int width) {
  int room = width - drawer.Width(kEllipsis);
  std::size_t fit = room > 0 ? Fitting(drawer, text, room) : 1;
  return Text(text.substr(0, fit)) + kEllipsis;
}

// A path keeps its last part: what stands before it is cut.
Text ShortenedPath(const Drawer& drawer, SStringView text, int width) {
  std::size_t slash = text.find_last_of(WTEXT("\\/"));
  if (slash == SStringView::npos) return ShortenedAtEnd(drawer, text, width);
  SStringView last = text.substr(slash);
  int room = width - drawer.Width(kEllipsis) - drawer.Width(last);
  if (room <= 0) return Text(kEllipsis) + Text(last);
  return Text(text.substr(0, Fitting(drawer, text.substr(0, slash), room))) + kEllipsis + Text(last);
}

Text Shortened(const Drawer& drawer, SStringView text, int width, UINT format) {
  if (drawer.Width(text) <= width) return Text(text);
  if (format & DT_PATH_ELLIPSIS) return ShortenedPath(drawer, text, width);
  if (format & (DT_END_ELLIPSIS | DT_WORD_ELLIPSIS)) return ShortenedAtEnd(drawer, text, width);
  return Text(text);
}

int LeftOf(const RECT& rect, int width, UINT format) {
  if (format & DT_CENTER) return rect.left + (rect.right - rect.left - width) / 2;
  return format & DT_RIGHT ? rect.right - width : rect.left;
}

int TopOf(const RECT& rect, int height, UINT format) {
  if (!(format & DT_SINGLELINE)) return rect.top;
  if (format & DT_VCENTER) return rect.top + (rect.bottom - rect.top) / 2 - height / 2;
  return format & DT_BOTTOM ? rect.bottom - height : rect.top;
}

}  // namespace

int DrawTextW(HDC dc, LPCWSTR text, int count, RECT* rect, UINT format) try {
  if (!rect || !GetObjectType(dc)) return 0;
  if (!text) return 0;
  SStringView given = count < 0 ? SStringView(text) : SStringView(text, static_cast<std::size_t>(count));
  Drawer drawer(dc, format);
  if (given.empty()) {
    if (format & DT_CALCRECT) rect->right = rect->left, rect->bottom = rect->top + drawer.LineHeight();
    return drawer.LineHeight();
  }
  Plain plain = format & DT_NOPREFIX ? AsItIs(given) : WithoutPrefixes(given);
  SStringView whole = plain.text;
  std::vector<Line> lines = Break(drawer, whole, rect->right - rect->left, format);
  int height = drawer.LineHeight() * static_cast<int>(lines.size());
  if (format & DT_SINGLELINE) height = drawer.LineHeight();
  int top = TopOf(*rect, height, format), y = top, widest = 0;
  const RECT* clip = format & DT_NOCLIP ? nullptr : rect;
  for (std::size_t i = 0; i < lines.size(); ++i, y += drawer.LineHeight()) {
    // What begins below the rectangle is not drawn and does not count.
    if (clip && !(format & (DT_CALCRECT | DT_SINGLELINE)) && y > rect->bottom) {
      height = y - top;
      break;
    }
    SStringView line = whole.substr(lines[i].start, lines[i].length);
    bool shorten = i + 1 == lines.size() || !(format & DT_END_ELLIPSIS);
    Text shown = shorten ? Shortened(drawer, line, rect->right - rect->left, format) : Text(line);
    bool trims = format & DT_WORDBREAK && format & (DT_CENTER | DT_RIGHT);
    int width = drawer.Width(trims ? WithoutBlanksAtEnd(shown) : shown);
    widest = std::max(widest, width);
    if (format & DT_CALCRECT) continue;
    if (format & DT_EDITCONTROL && y + drawer.LineHeight() > rect->bottom) break;
    int x = LeftOf(*rect, width, format);
    if (!(format & DT_PREFIXONLY)) drawer.Draw(shown, x, y, clip);
    if (!(format & DT_HIDEPREFIX))
      drawer.Underline(line.substr(0, std::min(line.size(), shown.size())), plain.marked, lines[i].start, x, y);
    if (format & DT_MODIFYSTRING && shown != line)
      std::copy_n(shown.c_str(), shown.size() + 1, const_cast<LPWSTR>(text));
  }
  if (format & DT_CALCRECT) {
    rect->right = rect->left + widest;
    rect->bottom = top + height;
  }
  return top - rect->top + height;
} catch (const std::bad_alloc&) {
  return draw::NoMemory(0);
}
