// The class "Edit": one line or several, without wrapping.

#include <utility>

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/controls/clipboard_text.h"
#include "qxcore/platform/posix/controls/edit_view.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/win32/clipboard.h"

namespace platform::controls {
namespace {

using model::OrNoMemory;
using model::Send;
using model::Text;

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

// A password stays where it is.
bool Copy(HWND window, const Edit* edit) {
  if (edit->password != 0 || !edit->text.HasSelection()) return false;
  return CopyToClipboard(window, edit->text.Selection());
}

void Cut(HWND window, Edit* edit) {
  if (!IsReadOnly(window) && Copy(window, edit)) Erase(window, edit, edit->text.Caret());
}

void Paste(HWND window, Edit* edit) {
  if (IsReadOnly(window) || !IsClipboardFormatAvailable(CF_UNICODETEXT)) return;
  Insert(window, edit, TextOfClipboard(window), true);
}

void Type(HWND window, Edit* edit, WCHAR c) {
  constexpr WCHAR kCopy = 'C' - '@', kBackspace = 'H' - '@', kPaste = 'V' - '@', kCut = 'X' - '@';
  switch (c) {
    case kBackspace:
      Erase(window, edit, edit->text.Before(edit->text.Caret()));
      return;
    case kCopy:
      Copy(window, edit);
      return;
    case kCut:
      Cut(window, edit);
      return;
    case kPaste:
      Paste(window, edit);
      return;
    default:
      break;
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
      if (shift && text.HasSelection()) {
        Cut(window, edit);
      } else {
        Erase(window, edit, text.Next(to));
      }
      return;
    case VK_INSERT:
      if (shift) Paste(window, edit);
      if (control) Copy(window, edit);
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
      return text.CopyLine(IsMultiline(window) ? static_cast<int>(wParam) : 0, reinterpret_cast<WCHAR*>(lParam));
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
    case WM_COPY:
      return Copy(window, edit);
    case WM_CUT:
      Cut(window, edit);
      return 0;
    case WM_PASTE:
      Paste(window, edit);
      return 0;
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
      return edit->text.CopyAll(wParam, reinterpret_cast<LPWSTR>(lParam));
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
    default:
      return EditMessage(window, edit, message, wParam, lParam);
  }
}

}  // namespace

LRESULT CALLBACK EditProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return ControlMessage<Edit, &PaintEdit, &Handle>(window, message, wParam, lParam);
}

}  // namespace platform::controls
