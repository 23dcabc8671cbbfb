// The class "Edit": one line or several, without wrapping.

#include <utility>

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/controls/edit_text.h"
#include "qxcore/platform/posix/controls/painting.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {
namespace {

using model::OrNoMemory;
using model::Send;
using model::Text;

constexpr int kUsualLimit = 30000, kHighestLimit = 0x7FFFFFFE;

struct Edit : model::OnModelHeap {
  EditText text;
  HFONT font = nullptr;
  int limit = kUsualLimit;
  int firstLine = 0, scrolled = 0;  // what is at the top left, in lines and pixels
  int leftMargin = 0, rightMargin = 0;
  WCHAR password = 0;
  bool isModified = false, hasFocus = false;
};

DWORD StyleOf(HWND window) { return static_cast<DWORD>(GetWindowLongW(window, GWL_STYLE)); }
bool IsMultiline(HWND window) { return StyleOf(window) & ES_MULTILINE; }
bool IsReadOnly(HWND window) { return StyleOf(window) & ES_READONLY; }

// --- measuring ---

// A context with the control's font, for as long as it is needed.
class Measure {
 public:
  explicit Measure(const Edit* edit)
      : m_dc(GetDC(nullptr)), m_old(SelectObject(m_dc, edit->font != nullptr ? edit->font : InterfaceFont())) {
    GetTextMetricsW(m_dc, &m_metrics);
  }
  ~Measure() {
    SelectObject(m_dc, m_old);
    ReleaseDC(nullptr, m_dc);
  }
  int LineHeight() const { return m_metrics.tmHeight; }
  int Width(const WCHAR* text, int count) const {
    SIZE size{};
    GetTextExtentPoint32W(m_dc, text, count, &size);
    return size.cx;
  }

 private:
  HDC m_dc;
  HGDIOBJ m_old;
  TEXTMETRICW m_metrics{};
};

// What is seen of a line.
Text Shown(const Edit* edit, int line) {
  const Text part = edit->text.All().substr(static_cast<std::size_t>(std::max(edit->text.LineStart(line), 0)),
                                            static_cast<std::size_t>(edit->text.LineLength(line)));
  return edit->password != 0 ? Text(part.size(), edit->password) : part;
}

RECT TextRect(HWND window, const Edit* edit) {
  RECT rect;
  GetClientRect(window, &rect);
  rect.left += edit->leftMargin + 1;
  rect.right -= edit->rightMargin + 1;
  rect.top += 1;
  return rect;
}

POINT PointOf(HWND window, const Edit* edit, int position) {
  const Measure measure(edit);
  const RECT rect = TextRect(window, edit);
  const int line = edit->text.LineOf(position);
  const Text shown = Shown(edit, line);
  const int column = std::min(position - edit->text.LineStart(line), static_cast<int>(shown.size()));
  return {rect.left - edit->scrolled + measure.Width(shown.data(), column),
          rect.top + (line - edit->firstLine) * measure.LineHeight()};
}

// The position whose left edge is nearest.
int PositionAt(HWND window, const Edit* edit, POINT point) {
  const Measure measure(edit);
  const RECT rect = TextRect(window, edit);
  const int height = std::max(measure.LineHeight(), 1);
  const int offset = point.y - rect.top;
  const int line = std::clamp(edit->firstLine + (offset >= 0 ? offset / height : -1), 0, edit->text.LineCount() - 1);
  const Text shown = Shown(edit, IsMultiline(window) ? line : 0);
  const int x = point.x - rect.left + edit->scrolled;
  int before = 0;
  for (int column = 0; column < static_cast<int>(shown.size()); ++column) {
    const int after = measure.Width(shown.data(), column + 1);
    if (x < (before + after) / 2) return edit->text.LineStart(line) + column;
    before = after;
  }
  return edit->text.LineStart(line) + static_cast<int>(shown.size());
}

void PlaceCaret(HWND window, const Edit* edit) {
  if (!edit->hasFocus) return;
  const POINT point = PointOf(window, edit, edit->text.Caret());
  SetCaretPos(point.x, point.y);
}

void ShowCaretLine(HWND window, Edit* edit) {
  const Measure measure(edit);
  const RECT rect = TextRect(window, edit);
  const POINT point = PointOf(window, edit, edit->text.Caret());
  if (point.x < rect.left) edit->scrolled -= rect.left - point.x;
  if (point.x >= rect.right) edit->scrolled += point.x - rect.right + 1;
  edit->scrolled = std::max(edit->scrolled, 0);
  const int lines = std::max(model::Height(rect) / std::max(measure.LineHeight(), 1), 1);
  const int line = edit->text.LineOf(edit->text.Caret());
  edit->firstLine = std::clamp(edit->firstLine, line - lines + 1, line);
  edit->firstLine = std::max(edit->firstLine, 0);
  InvalidateRect(window, nullptr, TRUE);
  PlaceCaret(window, edit);
}

// --- changing ---

void Changed(HWND window, Edit* edit) {
  edit->isModified = true;
  NotifyCommand(window, EN_UPDATE);
  if (StateOf<Edit>(window) != edit) return;
  ShowCaretLine(window, edit);
  NotifyCommand(window, EN_CHANGE);
}

// What the styles let in of a text.
Text Admitted(HWND window, Text text) {
  const DWORD style = StyleOf(window);
  if (!(style & ES_MULTILINE)) text.resize(std::min(text.find_first_of(WTEXT("\r\n")), text.size()));
  for (WCHAR& c : text) {
    if (style & ES_UPPERCASE) c = ToUpperBmp(c);
    if ((style & ES_LOWERCASE) && c < 0x80 && c >= 'A' && c <= 'Z') c = static_cast<WCHAR>(c + 32);
  }
  return text;
}

void Insert(HWND window, Edit* edit, Text text, bool canUndo) {
  text = Admitted(window, std::move(text));
  const int room = edit->limit - (edit->text.Length() - (edit->text.Last() - edit->text.First()));
  if (static_cast<int>(text.size()) > room) {
    text.resize(static_cast<std::size_t>(std::max(room, 0)));
    NotifyCommand(window, EN_MAXTEXT);
    if (StateOf<Edit>(window) != edit) return;
    if (text.empty() && !edit->text.HasSelection()) return;
  }
  edit->text.Replace(text, canUndo);
  Changed(window, edit);
}

void Erase(HWND window, Edit* edit, int to) {
  if (IsReadOnly(window)) return;
  if (!edit->text.HasSelection()) edit->text.MoveTo(to, true);
  if (!edit->text.HasSelection()) return;
  edit->text.Replace(Text(), true);
  Changed(window, edit);
}

void Type(HWND window, Edit* edit, WCHAR c) {
  if (c == 8) {
    Erase(window, edit, edit->text.Before(edit->text.Caret()));
    return;
  }
  if (IsReadOnly(window) || (GetKeyState(VK_CONTROL) < 0 && c < ' ' && c != '\t')) return;
  if (c == '\r' || c == '\n') {
    if (IsMultiline(window)) Insert(window, edit, WTEXT("\r\n"), true);
    return;
  }
  if (c < ' ' && c != '\t') return;
  if ((StyleOf(window) & ES_NUMBER) && (c < '0' || c > '9')) {
    MessageBeep(0);
    return;
  }
  Insert(window, edit, Text(1, c), true);
}

int LineStep(const Edit* edit, int step) {
  const int line = edit->text.LineOf(edit->text.Caret());
  const int wanted = line + step;
  if (wanted < 0 || wanted >= edit->text.LineCount()) return edit->text.Caret();
  const int column = edit->text.Caret() - edit->text.LineStart(line);
  return edit->text.LineStart(wanted) + std::min(column, edit->text.LineLength(wanted));
}

int LineEnd(const Edit* edit, int position) {
  const int line = edit->text.LineOf(position);
  return edit->text.LineStart(line) + edit->text.LineLength(line);
}

void Key(HWND window, Edit* edit, WPARAM key) {
  const bool shift = GetKeyState(VK_SHIFT) < 0, control = GetKeyState(VK_CONTROL) < 0;
  const EditText& text = edit->text;
  int to = text.Caret();
  switch (key) {
    case VK_LEFT:
      to = control ? text.WordBefore(to) : text.Before(to);
      break;
    case VK_RIGHT:
      to = control ? text.NextWord(to) : text.Next(to);
      break;
    case VK_UP:
      to = IsMultiline(window) ? LineStep(edit, -1) : text.Before(to);
      break;
    case VK_DOWN:
      to = IsMultiline(window) ? LineStep(edit, 1) : text.Next(to);
      break;
    case VK_HOME:
      to = control ? 0 : text.LineStart(text.LineOf(to));
      break;
    case VK_END:
      to = control ? text.Length() : LineEnd(edit, to);
      break;
    case VK_DELETE:
      Erase(window, edit, text.Next(to));
      return;
    case 'A':
      if (control) Send(window, EM_SETSEL, 0, -1);
      return;
    case 'Z':
      if (control) Send(window, EM_UNDO);
      return;
    default:
      return;
  }
  edit->text.MoveTo(to, shift);
  ShowCaretLine(window, edit);
}

void SelectByMouse(HWND window, Edit* edit, LPARAM lParam, bool keepsAnchor) {
  edit->text.MoveTo(PositionAt(window, edit, model::PointOf(lParam)), keepsAnchor);
  ShowCaretLine(window, edit);
}

void SelectWord(HWND window, Edit* edit) {
  const int caret = edit->text.Caret();
  edit->text.Select(edit->text.WordBefore(edit->text.Next(caret)), edit->text.NextWord(caret));
  ShowCaretLine(window, edit);
}

// --- painting ---

void PaintLine(HDC dc, const Edit* edit, const Measure& measure, int line, int x, int y) {
  const Text shown = Shown(edit, line);
  const int start = edit->text.LineStart(line), length = static_cast<int>(shown.size());
  TextOutW(dc, x, y, shown.data(), length);
  if (!edit->hasFocus || !edit->text.HasSelection()) return;
  const int first = std::clamp(edit->text.First() - start, 0, length);
  const int last = std::clamp(edit->text.Last() - start, 0, length);
  if (first >= last) return;
  const COLORREF oldText = SetTextColor(dc, GetSysColor(COLOR_HIGHLIGHTTEXT));
  const COLORREF oldBack = SetBkColor(dc, GetSysColor(COLOR_HIGHLIGHT));
  const int oldMode = SetBkMode(dc, OPAQUE);
  TextOutW(dc, x + measure.Width(shown.data(), first), y, shown.data() + first, last - first);
  SetBkMode(dc, oldMode);
  SetBkColor(dc, oldBack);
  SetTextColor(dc, oldText);
}

void Paint(HWND window, const Edit* edit, HDC dc) {
  OrNoMemory<int>(0, [&] {
    const bool isField = IsWindowEnabled(window) && !IsReadOnly(window);
    const auto brush = reinterpret_cast<HBRUSH>(Send(GetParent(window), isField ? WM_CTLCOLOREDIT : WM_CTLCOLORSTATIC,
                                                     reinterpret_cast<WPARAM>(dc), reinterpret_cast<LPARAM>(window)));
    RECT client;
    GetClientRect(window, &client);
    if (brush != nullptr) FillRect(dc, &client, brush);
    const RECT rect = TextRect(window, edit);
    const HGDIOBJ old = SelectObject(dc, edit->font != nullptr ? edit->font : InterfaceFont());
    if (!IsWindowEnabled(window)) SetTextColor(dc, GetSysColor(COLOR_GRAYTEXT));
    const int oldMode = SetBkMode(dc, TRANSPARENT);
    const Measure measure(edit);
    int y = rect.top;
    for (int line = edit->firstLine; line < edit->text.LineCount() && y < rect.bottom; ++line) {
      PaintLine(dc, edit, measure, line, rect.left - edit->scrolled, y);
      y += measure.LineHeight();
    }
    SetBkMode(dc, oldMode);
    SelectObject(dc, old);
    return 0;
  });
}

// --- messages ---

void SetAll(HWND window, Edit* edit, LPCWSTR text) {
  edit->text.Set(Admitted(window, text != nullptr ? Text(text) : Text()));
  edit->scrolled = edit->firstLine = 0;
  edit->isModified = false;
  InvalidateRect(window, nullptr, TRUE);
  PlaceCaret(window, edit);
  if (!IsMultiline(window)) return;
  NotifyCommand(window, EN_UPDATE);
  NotifyCommand(window, EN_CHANGE);
}

LRESULT CopyAll(const Edit* edit, WPARAM capacity, LPWSTR buffer) {
  if (capacity == 0 || buffer == nullptr) return 0;
  const Text& text = edit->text.All();
  const std::size_t count = std::min<std::size_t>(text.size(), capacity - 1);
  std::copy_n(text.data(), count, buffer);
  buffer[count] = 0;
  return static_cast<LRESULT>(count);
}

LRESULT CopyLine(const Edit* edit, int line, WCHAR* buffer) {
  const std::size_t capacity = static_cast<WORD>(buffer[0]);
  if (line >= edit->text.LineCount()) return 0;
  const std::size_t count = std::min<std::size_t>(capacity, static_cast<std::size_t>(edit->text.LineLength(line)));
  std::copy_n(edit->text.All().data() + edit->text.LineStart(line), count, buffer);
  return static_cast<LRESULT>(count);
}

void Focus(HWND window, Edit* edit, bool gained) {
  edit->hasFocus = gained;
  if (gained) {
    CreateCaret(window, nullptr, 1, Measure(edit).LineHeight());
    PlaceCaret(window, edit);
    ShowCaret(window);
  } else {
    DestroyCaret();
  }
  InvalidateRect(window, nullptr, TRUE);
  NotifyCommand(window, gained ? EN_SETFOCUS : EN_KILLFOCUS);
}

LRESULT DialogCode(HWND window) {
  const LRESULT code = DLGC_HASSETSEL | DLGC_WANTCHARS | DLGC_WANTARROWS;
  return IsMultiline(window) && (StyleOf(window) & ES_WANTRETURN) ? code | DLGC_WANTALLKEYS : code;
}

void SetMargins(HWND window, Edit* edit, WPARAM which, LPARAM lParam) {
  if (which & EC_LEFTMARGIN) edit->leftMargin = LOWORD(lParam);
  if (which & EC_RIGHTMARGIN) edit->rightMargin = HIWORD(lParam);
  InvalidateRect(window, nullptr, TRUE);
}

LRESULT EditMessage(HWND window, Edit* edit, UINT message, WPARAM wParam, LPARAM lParam) {
  const EditText& text = edit->text;
  switch (message) {
    case EM_GETSEL:
      if (wParam) *reinterpret_cast<DWORD*>(wParam) = static_cast<DWORD>(text.First());
      if (lParam) *reinterpret_cast<DWORD*>(lParam) = static_cast<DWORD>(text.Last());
      return text.Last() > 0xFFFF ? -1 : static_cast<LRESULT>(MAKELONG(text.First(), text.Last()));
    case EM_SETSEL: {
      const int first = static_cast<int>(wParam), last = static_cast<int>(lParam);
      // -1 as the first leaves nothing selected, as the last means the end.
      edit->text.Select(first < 0 ? text.Caret() : first, first < 0 ? text.Caret() : last < 0 ? text.Length() : last);
      InvalidateRect(window, nullptr, TRUE);
      PlaceCaret(window, edit);
      return 0;
    }
    case EM_REPLACESEL:
      Insert(window, edit, lParam != 0 ? Text(reinterpret_cast<LPCWSTR>(lParam)) : Text(), wParam != 0);
      return 0;
    case EM_GETMODIFY:
      return edit->isModified;
    case EM_SETMODIFY:
      edit->isModified = wParam != 0;
      return 0;
    case EM_GETLINECOUNT:
      return text.LineCount();
    case EM_LINEINDEX:
      return text.LineStart(static_cast<int>(wParam) < 0 ? text.LineOf(text.Caret()) : static_cast<int>(wParam));
    case EM_LINEFROMCHAR:
      return text.LineOf(static_cast<int>(wParam) < 0 ? text.First() : static_cast<int>(wParam));
    case EM_LINELENGTH:
      return text.LineLength(text.LineOf(static_cast<int>(wParam) < 0 ? text.Caret() : static_cast<int>(wParam)));
    case EM_GETLINE:
      return CopyLine(edit, IsMultiline(window) ? static_cast<int>(wParam) : 0, reinterpret_cast<WCHAR*>(lParam));
    case EM_SETLIMITTEXT:
      edit->limit = wParam == 0 || wParam > kHighestLimit ? kHighestLimit : static_cast<int>(wParam);
      return 0;
    case EM_GETLIMITTEXT:
      return edit->limit;
    case EM_CANUNDO:
      return text.CanUndo();
    case EM_UNDO:
    case WM_UNDO:
      if (!text.CanUndo()) return FALSE;
      edit->text.Undo();
      Changed(window, edit);
      return TRUE;
    case EM_EMPTYUNDOBUFFER:
      edit->text.EmptyUndo();
      return 0;
    case EM_SETREADONLY: {
      const DWORD style = StyleOf(window);
      SetWindowLongW(window, GWL_STYLE, static_cast<LONG>(wParam ? style | ES_READONLY : style & ~ES_READONLY));
      InvalidateRect(window, nullptr, TRUE);
      return TRUE;
    }
    case EM_SETPASSWORDCHAR:
      edit->password = static_cast<WCHAR>(wParam);
      InvalidateRect(window, nullptr, TRUE);
      return 0;
    case EM_GETPASSWORDCHAR:
      return edit->password;
    case EM_SETMARGINS:
      SetMargins(window, edit, wParam, lParam);
      return 0;
    case EM_GETMARGINS:
      return MAKELRESULT(edit->leftMargin, edit->rightMargin);
    case EM_GETFIRSTVISIBLELINE:
      return edit->firstLine;
    case EM_SCROLLCARET:
      ShowCaretLine(window, edit);
      return TRUE;
    case EM_LINESCROLL:
      edit->firstLine = std::clamp(edit->firstLine + static_cast<int>(lParam), 0, text.LineCount() - 1);
      InvalidateRect(window, nullptr, TRUE);
      return TRUE;
    case EM_GETRECT:
      *reinterpret_cast<RECT*>(lParam) = TextRect(window, edit);
      return 0;
    case EM_POSFROMCHAR: {
      const POINT point = PointOf(window, edit, static_cast<int>(wParam));
      return static_cast<LRESULT>(MAKELONG(point.x, point.y));
    }
    case EM_CHARFROMPOS: {
      const int position = PositionAt(window, edit, model::PointOf(lParam));
      return MAKELRESULT(position, text.LineOf(position));
    }
    case WM_CLEAR:
      if (text.HasSelection()) Erase(window, edit, text.Caret());
      return 0;
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

LRESULT Handle(HWND window, Edit* edit, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_CREATE: {
      const auto* create = reinterpret_cast<const CREATESTRUCTW*>(lParam);
      if (StyleOf(window) & ES_PASSWORD) edit->password = '*';
      if (create->lpszName != nullptr && !IS_INTRESOURCE(create->lpszName))
        edit->text.Set(Admitted(window, create->lpszName));
      return 0;
    }
    case WM_GETDLGCODE:
      return DialogCode(window);
    case WM_SETTEXT:
      SetAll(window, edit, reinterpret_cast<LPCWSTR>(lParam));
      return TRUE;
    case WM_GETTEXT:
      return CopyAll(edit, wParam, reinterpret_cast<LPWSTR>(lParam));
    case WM_GETTEXTLENGTH:
      return edit->text.Length();
    case WM_CHAR:
      Type(window, edit, static_cast<WCHAR>(wParam));
      return 0;
    case WM_KEYDOWN:
      Key(window, edit, wParam);
      return 0;
    case WM_LBUTTONDOWN:
      SetFocus(window);
      SetCapture(window);
      SelectByMouse(window, edit, lParam, wParam & MK_SHIFT);
      return 0;
    case WM_MOUSEMOVE:
      if (GetCapture() == window) SelectByMouse(window, edit, lParam, true);
      return 0;
    case WM_LBUTTONUP:
      if (GetCapture() == window) ReleaseCapture();
      return 0;
    case WM_LBUTTONDBLCLK:
      SelectWord(window, edit);
      return 0;
    case WM_SETFOCUS:
    case WM_KILLFOCUS:
      Focus(window, edit, message == WM_SETFOCUS);
      return 0;
    case WM_ENABLE:
      InvalidateRect(window, nullptr, TRUE);
      return 0;
    case WM_ERASEBKGND:
      return TRUE;
    case WM_PAINT: {
      PAINTSTRUCT paint;
      const HDC dc = BeginPaint(window, &paint);
      if (dc != nullptr) Paint(window, edit, dc);
      EndPaint(window, &paint);
      return 0;
    }
    case WM_PRINTCLIENT:
      Paint(window, edit, reinterpret_cast<HDC>(wParam));
      return 0;
    case WM_SETFONT:
      edit->font = reinterpret_cast<HFONT>(wParam);
      if (LOWORD(lParam)) InvalidateRect(window, nullptr, TRUE);
      return 0;
    case WM_GETFONT:
      return reinterpret_cast<LRESULT>(edit->font);
    default:
      return EditMessage(window, edit, message, wParam, lParam);
  }
}

}  // namespace

LRESULT CALLBACK EditProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  Edit* edit = StateOf<Edit>(window);
  if (message == WM_NCCREATE) {
    return MakeState<Edit>(window) ? DefWindowProcW(window, message, wParam, lParam) : FALSE;
  }
  if (message == WM_NCDESTROY) FreeState<Edit>(window);
  if (edit == nullptr || message == WM_NCDESTROY) return DefWindowProcW(window, message, wParam, lParam);
  return OrNoMemory<LRESULT>(0, [&] { return Handle(window, edit, message, wParam, lParam); });
}

}  // namespace platform::controls
