// Message boxes: a dialog whose template is put together for the text and the buttons.

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/dialog.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

struct Button {
  int id;
  LPCWSTR label;
};
constexpr Button kOk{IDOK, WTEXT("OK")}, kCancel{IDCANCEL, WTEXT("Cancel")}, kAbort{IDABORT, WTEXT("&Abort")},
    kRetry{IDRETRY, WTEXT("&Retry")}, kIgnore{IDIGNORE, WTEXT("&Ignore")}, kYes{IDYES, WTEXT("&Yes")},
    kNo{IDNO, WTEXT("&No")}, kTryAgain{IDTRYAGAIN, WTEXT("&Try Again")}, kContinue{IDCONTINUE, WTEXT("&Continue")};

List<Button> ButtonsOf(UINT style) {
  switch (style & MB_TYPEMASK) {
    case MB_OKCANCEL:
      return {kOk, kCancel};
    case MB_ABORTRETRYIGNORE:
      return {kAbort, kRetry, kIgnore};
    case MB_YESNOCANCEL:
      return {kYes, kNo, kCancel};
    case MB_YESNO:
      return {kYes, kNo};
    case MB_RETRYCANCEL:
      return {kRetry, kCancel};
    case MB_CANCELTRYCONTINUE:
      return {kCancel, kTryAgain, kContinue};
    default:
      return {kOk};
  }
}

// Writes a template, in dialog units.
class Writer {
 public:
  void Word(int value) { m_words.push_back(static_cast<WORD>(value)); }
  void Long(DWORD value) {
    Word(LOWORD(value));
    Word(HIWORD(value));
  }
  void String(LPCWSTR text) {
    do m_words.push_back(*text);
    while (*text++ != 0);
  }
  void Item(DWORD style, int x, int y, int width, int height, int id, WORD windowClass, LPCWSTR text) {
    if (m_words.size() & 1) Word(0);
    Long(style | WS_CHILD | WS_VISIBLE);
    Long(0);
    for (const int value : {x, y, width, height, id, 0xFFFF, static_cast<int>(windowClass)}) Word(value);
    String(text);
    Word(0);
  }
  LPCDLGTEMPLATEW Template() const { return reinterpret_cast<LPCDLGTEMPLATEW>(m_words.data()); }

 private:
  List<WORD> m_words;
};

constexpr int kButtonWidth = 50, kButtonHeight = 14, kMargin = 7, kGap = 4;
constexpr int kButtonClass = 0x80, kStaticClass = 0x82;
constexpr int kTextId = 0xFFFF, kCharacterWidth = 4, kLineHeight = 8;

// Where no text can be measured.
SIZE EstimatedSize(LPCWSTR text) {
  int lines = 1, width = 0, widest = 0;
  for (; *text != 0; ++text) {
    if (*text == '\n') {
      ++lines;
      width = 0;
    } else {
      widest = std::max(widest, ++width);
    }
  }
  return {std::min(widest, 80) * kCharacterWidth, (lines + widest / 80) * kLineHeight};
}

// Enough dialog units for a number of pixels.
int DialogUnits(LONG pixels, int perBase, int base) { return static_cast<int>((pixels * perBase + base - 1) / base); }

// In dialog units, with lines of at most five eighths of the screen.
SIZE TextSize(LPCWSTR text) {
  if (g_painter.brokenTextSize == nullptr) return EstimatedSize(text);
  const SIZE size = g_painter.brokenTextSize(text, GetSystemMetrics(SM_CXSCREEN) * 5 / 8);
  const LONG base = GetDialogBaseUnits();
  return {DialogUnits(size.cx, 4, LOWORD(base)), DialogUnits(size.cy, 8, HIWORD(base))};
}

INT_PTR CALLBACK Procedure(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_INITDIALOG) {
    const HWND button = reinterpret_cast<HWND>(GetDlgItem(dialog, static_cast<int>(lParam)));
    if (button != nullptr) Send(dialog, WM_NEXTDLGCTL, reinterpret_cast<WPARAM>(button), TRUE);
    return FALSE;
  }
  if (message == WM_COMMAND && HIWORD(wParam) == BN_CLICKED) {
    const int id = LOWORD(wParam);
    if (id != IDCANCEL || GetDlgItem(dialog, IDCANCEL) != nullptr) {
      EndDialog(dialog, id);
    } else if (GetDlgItem(dialog, IDNO) == nullptr && GetDlgItem(dialog, IDABORT) == nullptr) {
      EndDialog(dialog, IDOK);  // a box with OK alone can be closed
    }
    return TRUE;
  }
  return FALSE;
}

int Show(HWND owner, LPCWSTR text, LPCWSTR caption, UINT style) {
  const List<Button> buttons = ButtonsOf(style);
  const int count = static_cast<int>(buttons.size());
  const SIZE textSize = TextSize(text);
  const int buttonsWidth = count * kButtonWidth + (count - 1) * kGap;
  const int width = std::max<int>(textSize.cx, buttonsWidth) + 2 * kMargin;
  const int height = textSize.cy + kButtonHeight + 3 * kMargin;
  const int chosen = std::min(static_cast<int>((style & MB_DEFMASK) >> 8), count - 1);

  Writer writer;
  writer.Long(WS_POPUP | WS_CAPTION | WS_SYSMENU | WS_VISIBLE | DS_MODALFRAME | DS_CENTER | DS_NOIDLEMSG);
  writer.Long(0);
  for (const int value : {count + 1, 0, 0, width, height, 0, 0}) writer.Word(value);
  writer.String(caption != nullptr ? caption : WTEXT("Error"));
  writer.Item(SS_NOPREFIX, kMargin, kMargin, width - 2 * kMargin, textSize.cy, kTextId, kStaticClass, text);
  int x = (width - buttonsWidth) / 2;
  for (int i = 0; i < count; ++i, x += kButtonWidth + kGap) {
    const Button& button = buttons[static_cast<std::size_t>(i)];
    writer.Item(WS_TABSTOP | (i == 0 ? WS_GROUP : 0u) | (i == chosen ? BS_DEFPUSHBUTTON : BS_PUSHBUTTON), x,
                textSize.cy + 2 * kMargin, kButtonWidth, kButtonHeight, button.id, kButtonClass, button.label);
  }
  return static_cast<int>(DialogBoxIndirectParamW(nullptr, writer.Template(), owner, &Procedure,
                                                  buttons[static_cast<std::size_t>(chosen)].id));
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

int MessageBoxW(HWND owner, LPCWSTR text, LPCWSTR caption, UINT style) {
  if (owner != nullptr && !IsWindow(owner)) return Fail<int>(ERROR_INVALID_WINDOW_HANDLE);
  return OrNoMemory<int>(0, [&] {
    const int answer = Show(owner, text != nullptr ? text : WTEXT(""), caption, style);
    return std::max(answer, 0);
  });
}

// There is nothing to sound with.
BOOL MessageBeep(UINT) { return TRUE; }
