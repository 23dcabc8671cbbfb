// The dialog window class, the end of dialogs, and the calls that reach a dialog's controls by their number.

#include "qxcore/platform/posix/window/dialog.h"

#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

struct State {
  bool exists = false, isEnded = false;
  HWND savedFocus = nullptr;
  UINT defaultId = 0;
  HFONT font = nullptr;
};

State StateOf(HWND handle) {
  const Guard guard;
  const Dialog* dialog = FindDialog(handle);
  if (dialog == nullptr) return {};
  return {true, dialog->isEnded, dialog->savedFocus, dialog->defaultId, dialog->font};
}

void SaveFocus(HWND handle) {
  const HWND focus = GetFocus();
  if (focus == nullptr || !IsChild(handle, focus)) return;
  const Guard guard;
  if (Dialog* dialog = FindDialog(handle)) dialog->savedFocus = focus;
}

void RestoreFocus(HWND handle, bool isActivation) {
  const State state = StateOf(handle);
  if (!state.exists || state.isEnded || IsIconic(handle)) return;
  HWND wanted = IsWindow(state.savedFocus) ? state.savedFocus : nullptr;
  if (wanted == nullptr) {
    if (isActivation) return;
    wanted = GetNextDlgTabItem(handle, nullptr, FALSE);
    if (wanted == nullptr) return;
  }
  SetFocus(wanted);
  const Guard guard;
  if (Dialog* dialog = FindDialog(handle)) dialog->savedFocus = nullptr;
}

LRESULT SetDefault(HWND handle, UINT id) {
  HWND old = nullptr;
  {
    const Guard guard;
    Dialog* dialog = FindDialog(handle);
    if (dialog == nullptr) return FALSE;
    old = FindItemById(handle, dialog->defaultId);
    dialog->defaultId = id;
  }
  const HWND now = GetDlgItem(handle, static_cast<int>(id));
  if (old != nullptr && (Send(old, WM_GETDLGCODE) & DLGC_DEFPUSHBUTTON)) Send(old, BM_SETSTYLE, BS_PUSHBUTTON, TRUE);
  if (now != nullptr && (Send(now, WM_GETDLGCODE) & DLGC_UNDEFPUSHBUTTON))
    Send(now, BM_SETSTYLE, BS_DEFPUSHBUTTON, TRUE);
  return TRUE;
}

LRESULT NextControl(HWND handle, WPARAM wParam, bool isHandle) {
  const HWND target = isHandle ? reinterpret_cast<HWND>(wParam) : GetNextDlgTabItem(handle, GetFocus(), wParam != 0);
  if (target == nullptr) return 0;
  FocusControl(target);
  ShowDefaultButton(handle, target);
  return 0;
}

LRESULT EraseDialog(HWND handle, HDC context) {
  const auto brush = reinterpret_cast<HBRUSH>(
      Send(handle, WM_CTLCOLORDLG, reinterpret_cast<WPARAM>(context), reinterpret_cast<LPARAM>(handle)));
  if (g_painter.eraseBackground != nullptr && context != nullptr && brush != nullptr)
    g_painter.eraseBackground(handle, context, brush);
  return 1;
}

LRESULT Close(HWND handle) {
  const HWND cancel = GetDlgItem(handle, IDCANCEL);
  if (cancel != nullptr && !IsWindowEnabled(cancel)) {
    MessageBeep(0);
  } else {
    PostMessageW(handle, WM_COMMAND, MAKEWPARAM(IDCANCEL, BN_CLICKED), reinterpret_cast<LPARAM>(cancel));
  }
  return 0;
}

LRESULT DefaultDialog(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case WM_INITDIALOG:
      return 0;
    case WM_ERASEBKGND:
      return EraseDialog(handle, reinterpret_cast<HDC>(wParam));
    case WM_SHOWWINDOW:
      if (!wParam) SaveFocus(handle);
      break;
    case WM_ACTIVATE:
      if (LOWORD(wParam) != WA_INACTIVE) {
        RestoreFocus(handle, true);
      } else {
        SaveFocus(handle);
      }
      return 0;
    case WM_SETFOCUS:
      RestoreFocus(handle, false);
      return 0;
    case WM_CLOSE:
      return Close(handle);
    case DM_SETDEFID:
      return SetDefault(handle, static_cast<UINT>(wParam));
    case DM_GETDEFID: {
      const State state = StateOf(handle);
      return state.exists ? MAKELRESULT(state.defaultId, DC_HASDEFID) : 0;
    }
    case WM_NEXTDLGCTL:
      return NextControl(handle, wParam, LOWORD(lParam) != 0);
    case WM_GETFONT:
      return reinterpret_cast<LRESULT>(StateOf(handle).font);
    case WM_SETFONT: {
      const Guard guard;
      if (Dialog* dialog = FindDialog(handle)) dialog->font = reinterpret_cast<HFONT>(wParam);
      return 0;
    }
    default:
      break;
  }
  return DefWindowProcW(handle, message, wParam, lParam);
}

// Messages whose answer is the procedure's own result.
bool AnswersItself(UINT message) {
  return (message >= WM_CTLCOLORMSGBOX && message <= WM_CTLCOLORSTATIC) || message == WM_COMPAREITEM ||
         message == WM_VKEYTOITEM || message == WM_CHARTOITEM || message == WM_QUERYDRAGICON ||
         message == WM_INITDIALOG;
}

}  // namespace

Dialog* FindDialog(HWND handle) {
  const Window* window = FindWindowObject(handle);
  return window != nullptr ? window->dialog : nullptr;
}

void FreeDialog(Window* window) {
  delete window->dialog;
  window->dialog = nullptr;
}

bool MakeDialog(HWND handle) {
  return OrNoMemory<bool>(false, [&] {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return false;
    if (window->dialog == nullptr) window->dialog = new Dialog;
    return true;
  });
}

HWND FindItemById(HWND handle, UINT id) {
  const Window* window = FindWindowObject(handle);
  if (window == nullptr) return nullptr;
  for (const Window* child = window->firstChild; child != nullptr; child = child->next)
    if (static_cast<int>(child->idOrMenu) == static_cast<int>(id)) return child->handle;
  return nullptr;
}

}  // namespace platform::model

using namespace platform::model;

LRESULT DefDlgProcW(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  if (!MakeDialog(handle)) return message == WM_NCCREATE ? FALSE : 0;
  const auto procedure = reinterpret_cast<DLGPROC>(GetWindowLongPtrW(handle, DWLP_DLGPROC));
  SetWindowLongPtrW(handle, DWLP_MSGRESULT, 0);
  INT_PTR handled = 0;
  if (procedure != nullptr) handled = [&]() noexcept { return procedure(handle, message, wParam, lParam); }();
  if (!handled && IsWindow(handle)) return DefaultDialog(handle, message, wParam, lParam);
  if (AnswersItself(message)) return handled;
  return GetWindowLongPtrW(handle, DWLP_MSGRESULT);
}

BOOL EndDialog(HWND handle, INT_PTR result) {
  HWND owner = nullptr;
  {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return FALSE;
    Dialog* dialog = FindDialog(handle);
    if (dialog == nullptr) return Fail(ERROR_WINDOW_NOT_DIALOG);
    dialog->isEnded = true;
    dialog->result = result;
    owner = HandleOf(window->owner);
  }
  const bool wasActive = handle == GetActiveWindow();
  if (owner != nullptr) EnableWindow(owner, TRUE);
  if (const HWND focus = GetFocus(); focus != nullptr && IsChild(handle, focus)) SetFocus(handle);
  SetWindowPos(handle, nullptr, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_HIDEWINDOW);
  if (wasActive && handle == GetActiveWindow()) {
    if (owner != nullptr) {
      SetForegroundWindow(owner);
    } else {
      ActivateAnother(handle);
    }
  }
  PostMessageW(handle, WM_NULL, 0, 0);  // lets a waiting loop look
  return TRUE;
}

HWND GetDlgItem(HWND handle, int id) {
  const Guard guard;
  if (Expect(handle) == nullptr) return nullptr;
  const HWND item = FindItemById(handle, static_cast<UINT>(id));
  return item != nullptr ? item : Fail<HWND>(ERROR_CONTROL_ID_NOT_FOUND);
}

int GetDlgCtrlID(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr ? static_cast<int>(window->idOrMenu) : 0;
}

LRESULT SendDlgItemMessageW(HWND dialog, int id, UINT message, WPARAM wParam, LPARAM lParam) {
  const HWND control = GetDlgItem(dialog, id);
  return control != nullptr ? Send(control, message, wParam, lParam) : 0;
}

BOOL SetDlgItemTextW(HWND dialog, int id, LPCWSTR text) {
  const HWND control = GetDlgItem(dialog, id);
  return control != nullptr && SetWindowTextW(control, text);
}

UINT GetDlgItemTextW(HWND dialog, int id, LPWSTR text, int capacity) {
  if (text != nullptr && capacity > 0) text[0] = 0;
  const HWND control = GetDlgItem(dialog, id);
  return control != nullptr ? static_cast<UINT>(GetWindowTextW(control, text, capacity)) : 0;
}

BOOL SetDlgItemInt(HWND dialog, int id, UINT value, BOOL isSigned) {
  WCHAR text[16];
  WCHAR* at = std::end(text) - 1;
  *at = 0;
  const bool isNegative = isSigned && static_cast<int>(value) < 0;
  UINT rest = isNegative ? 0u - value : value;
  do {
    *--at = static_cast<WCHAR>('0' + rest % 10);
    rest /= 10;
  } while (rest != 0);
  if (isNegative) *--at = '-';
  return SetDlgItemTextW(dialog, id, at);
}

UINT GetDlgItemInt(HWND dialog, int id, BOOL* translated, BOOL isSigned) {
  if (translated != nullptr) *translated = FALSE;
  WCHAR text[32];
  if (GetDlgItemTextW(dialog, id, text, static_cast<int>(std::size(text))) == 0) return 0;
  const WCHAR* at = text;
  while (*at == ' ') ++at;
  const bool isNegative = isSigned && *at == '-';
  if (isNegative) ++at;
  std::uint64_t value = 0;
  const WCHAR* first = at;
  for (; *at >= '0' && *at <= '9'; ++at) {
    value = value * 10 + (*at - '0');
    if (value > 0xFFFFFFFFu) return 0;
  }
  const std::uint64_t highest = !isSigned ? 0xFFFFFFFFu : isNegative ? 0x80000000u : 0x7FFFFFFFu;
  if (at == first || *at != 0 || value > highest) return 0;
  if (translated != nullptr) *translated = TRUE;
  return isNegative ? 0u - static_cast<UINT>(value) : static_cast<UINT>(value);
}

BOOL CheckDlgButton(HWND dialog, int id, UINT check) {
  return GetDlgItem(dialog, id) != nullptr && (SendDlgItemMessageW(dialog, id, BM_SETCHECK, check, 0), TRUE);
}

UINT IsDlgButtonChecked(HWND dialog, int id) {
  return static_cast<UINT>(SendDlgItemMessageW(dialog, id, BM_GETCHECK, 0, 0));
}

BOOL CheckRadioButton(HWND dialog, int first, int last, int chosen) {
  if (!IsWindow(dialog)) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  for (HWND child = GetWindow(dialog, GW_CHILD); child != nullptr; child = GetWindow(child, GW_HWNDNEXT)) {
    const int id = GetDlgCtrlID(child);
    if (id >= first && id <= last) Send(child, BM_SETCHECK, id == chosen ? BST_CHECKED : BST_UNCHECKED);
  }
  return TRUE;
}

BOOL MapDialogRect(HWND handle, LPRECT rect) {
  const Guard guard;
  const Dialog* dialog = FindDialog(handle);
  if (dialog == nullptr) return Fail(ERROR_WINDOW_NOT_DIALOG);
  *rect = {MulDiv(rect->left, dialog->baseX, 4), MulDiv(rect->top, dialog->baseY, 8),
           MulDiv(rect->right, dialog->baseX, 4), MulDiv(rect->bottom, dialog->baseY, 8)};
  return TRUE;
}

LONG GetDialogBaseUnits() {
  const int dpi = static_cast<int>(GetDpiForSystem());
  return MAKELONG(MulDiv(7, dpi, 96), MulDiv(16, dpi, 96));
}
