// The keyboard of dialogs: tab, arrows, the default button, mnemonics.

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/window/dialog.h"
#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

// The controls of a dialog in the order of the tab key; those of a WS_EX_CONTROLPARENT child count as its own.
void Collect(const Window* parent, List<const Window*>& controls) {
  for (const Window* child = parent->firstChild; child != nullptr; child = child->next) {
    if (child->exStyle & WS_EX_CONTROLPARENT) {
      if (child->IsVisible() && !(child->style & WS_DISABLED)) Collect(child, controls);
    } else {
      controls.push_back(child);
    }
  }
}

bool IsUsable(const Window* control) { return control->IsVisible() && !(control->style & WS_DISABLED); }

UINT CodeOf(HWND control) { return static_cast<UINT>(Send(control, WM_GETDLGCODE)); }

bool IsStatic(HWND control) { return CodeOf(control) & DLGC_STATIC; }

HWND CommandTarget(HWND dialog) {
  const HWND focus = GetFocus();
  if (focus != nullptr && IsChild(dialog, focus) && (CodeOf(focus) & DLGC_DEFPUSHBUTTON)) return focus;
  return nullptr;
}

void PressDefault(HWND dialog) {
  if (const HWND focus = CommandTarget(dialog)) {
    Send(dialog, WM_COMMAND, MAKEWPARAM(GetDlgCtrlID(focus), BN_CLICKED), reinterpret_cast<LPARAM>(focus));
    return;
  }
  const LRESULT answer = Send(dialog, DM_GETDEFID);
  const UINT id = HIWORD(answer) == DC_HASDEFID ? LOWORD(answer) : static_cast<UINT>(IDOK);
  const HWND button = GetDlgItem(dialog, static_cast<int>(id));
  if (button != nullptr && !IsWindowEnabled(button)) return;
  Send(dialog, WM_COMMAND, MAKEWPARAM(id, BN_CLICKED), reinterpret_cast<LPARAM>(button));
}

void PressCancel(HWND dialog) {
  const HWND button = GetDlgItem(dialog, IDCANCEL);
  if (button != nullptr && !IsWindowEnabled(button)) return;
  Send(dialog, WM_COMMAND, MAKEWPARAM(IDCANCEL, BN_CLICKED), reinterpret_cast<LPARAM>(button));
}

// Arrows walk within the group and choose a radio button as they come to it.
void WalkGroup(HWND dialog, HWND control, bool back) {
  const HWND next = GetNextDlgGroupItem(dialog, control, back);
  if (next == nullptr) return;
  Send(dialog, WM_NEXTDLGCTL, reinterpret_cast<WPARAM>(next), TRUE);
  if ((CodeOf(next) & DLGC_RADIOBUTTON) && !Send(next, BM_GETCHECK)) Send(next, BM_CLICK);
}

// A mnemonic in a static text belongs to the control behind it.
bool PressMnemonic(HWND dialog, WCHAR key) {
  List<HWND> handles;
  {
    const Guard guard;
    const Window* window = FindWindowObject(dialog);
    if (window == nullptr) return false;
    List<const Window*> controls;
    Collect(window, controls);
    for (const Window* control : controls)
      if (IsUsable(control)) handles.push_back(control->handle);
  }
  const HWND focus = GetFocus();
  // The search begins behind the control that has the focus.
  const auto at = std::find(handles.begin(), handles.end(), focus);
  if (at != handles.end()) std::rotate(handles.begin(), at + 1, handles.end());
  for (const HWND control : handles) {
    const UINT code = CodeOf(control);
    if (code & DLGC_WANTCHARS || GetWindowLongW(control, GWL_STYLE) & SS_NOPREFIX & (code & DLGC_STATIC ? ~0 : 0))
      continue;
    WCHAR buffer[256];
    GetWindowTextW(control, buffer, static_cast<int>(std::size(buffer)));
    if (MnemonicOf(buffer) != ToUpperBmp(key) || key == 0) continue;
    if (code & DLGC_STATIC || !(code & (DLGC_BUTTON | DLGC_DEFPUSHBUTTON | DLGC_UNDEFPUSHBUTTON | DLGC_RADIOBUTTON))) {
      const HWND target = GetNextDlgTabItem(dialog, control, FALSE);
      if (target != nullptr) Send(dialog, WM_NEXTDLGCTL, reinterpret_cast<WPARAM>(target), TRUE);
    } else if (code & (DLGC_DEFPUSHBUTTON | DLGC_UNDEFPUSHBUTTON)) {
      Send(dialog, WM_NEXTDLGCTL, reinterpret_cast<WPARAM>(control), TRUE);
      Send(control, BM_CLICK);
    } else {
      Send(dialog, WM_NEXTDLGCTL, reinterpret_cast<WPARAM>(control), TRUE);
      Send(control, BM_CLICK);
    }
    return true;
  }
  return false;
}

// True when the key is the dialog's own.
bool TakeKey(HWND dialog, const MSG& message) {
  const UINT code =
      static_cast<UINT>(Send(message.hwnd, WM_GETDLGCODE, message.wParam, reinterpret_cast<LPARAM>(&message)));
  if (code & DLGC_WANTMESSAGE) return false;
  switch (message.wParam) {
    case VK_TAB:
      if (code & DLGC_WANTTAB) return false;
      Send(dialog, WM_NEXTDLGCTL, GetKeyState(VK_SHIFT) < 0, 0);
      return true;
    case VK_RIGHT:
    case VK_DOWN:
    case VK_LEFT:
    case VK_UP:
      if (code & DLGC_WANTARROWS) return false;
      WalkGroup(dialog, message.hwnd, message.wParam == VK_LEFT || message.wParam == VK_UP);
      return true;
    case VK_CANCEL:
    case VK_ESCAPE:
      PressCancel(dialog);
      return true;
    case VK_EXECUTE:
    case VK_RETURN:
      PressDefault(dialog);
      return true;
    default:
      return false;
  }
}

bool TakeCharacter(HWND dialog, const MSG& message) {
  const UINT code =
      static_cast<UINT>(Send(message.hwnd, WM_GETDLGCODE, message.wParam, reinterpret_cast<LPARAM>(&message)));
  if (code & (DLGC_WANTCHARS | DLGC_WANTMESSAGE)) return false;
  if (message.wParam == '\t' && code & DLGC_WANTTAB) return false;
  return message.wParam > ' ' && PressMnemonic(dialog, static_cast<WCHAR>(message.wParam));
}

}  // namespace

void FocusControl(HWND control) {
  if (CodeOf(control) & DLGC_HASSETSEL) Send(control, EM_SETSEL, 0, -1);
  SetFocus(control);
}

void ShowDefaultButton(HWND dialog, HWND control) {
  UINT ownId = 0;
  {
    const Guard guard;
    const Dialog* made = FindDialog(dialog);
    if (made == nullptr) return;
    ownId = made->defaultId;
  }
  const HWND own = GetDlgItem(dialog, static_cast<int>(ownId));
  const bool isButton = control != nullptr && (CodeOf(control) & (DLGC_UNDEFPUSHBUTTON | DLGC_DEFPUSHBUTTON));
  const HWND wanted = isButton ? control : own;
  for (HWND child = GetWindow(dialog, GW_CHILD); child != nullptr; child = GetWindow(child, GW_HWNDNEXT))
    if (child != wanted && (CodeOf(child) & DLGC_DEFPUSHBUTTON)) Send(child, BM_SETSTYLE, BS_PUSHBUTTON, TRUE);
  if (wanted != nullptr && (CodeOf(wanted) & DLGC_UNDEFPUSHBUTTON)) Send(wanted, BM_SETSTYLE, BS_DEFPUSHBUTTON, TRUE);
}

}  // namespace platform::model

using namespace platform::model;

HWND GetNextDlgTabItem(HWND dialog, HWND control, BOOL previous) {
  return OrNoMemory<HWND>(nullptr, [&]() -> HWND {
    const Guard guard;
    const Window* window = Expect(dialog);
    if (window == nullptr) return nullptr;
    List<const Window*> controls;
    Collect(window, controls);
    const int count = static_cast<int>(controls.size());
    int at = previous ? 0 : -1;
    for (int i = 0; i < count; ++i) {
      if (controls[static_cast<std::size_t>(i)]->handle == control ||
          (control != nullptr && IsBelow(FindWindowObject(control), controls[static_cast<std::size_t>(i)])))
        at = i;
    }
    for (int i = 1; i <= count; ++i) {
      const int next = ((at + (previous ? -i : i)) % count + count) % count;
      const Window* candidate = controls[static_cast<std::size_t>(next)];
      if (candidate->style & WS_TABSTOP && IsUsable(candidate)) return candidate->handle;
    }
    return nullptr;
  });
}

// A group begins with WS_GROUP and ends before the next one; the walk goes around in it.
HWND GetNextDlgGroupItem(HWND dialog, HWND control, BOOL previous) {
  return OrNoMemory<HWND>(nullptr, [&]() -> HWND {
    List<HWND> group;
    {
      const Guard guard;
      const Window* window = Expect(dialog);
      if (window == nullptr) return nullptr;
      List<const Window*> controls;
      Collect(window, controls);
      bool isOwn = control == nullptr;
      for (const Window* each : controls) {
        if (each->style & WS_GROUP) {
          if (isOwn && !group.empty()) break;
          group.clear();
        }
        if (each->handle == control) isOwn = true;
        if (IsUsable(each) || each->handle == control) group.push_back(each->handle);
      }
      if (!isOwn) return nullptr;
    }
    std::erase_if(group, [&](HWND each) { return each != control && IsStatic(each); });
    if (group.empty()) return nullptr;
    const auto at = std::find(group.begin(), group.end(), control);
    if (at == group.end()) return previous ? group.back() : group.front();
    const std::size_t index = static_cast<std::size_t>(at - group.begin());
    return group[(index + (previous ? group.size() - 1 : 1)) % group.size()];
  });
}

BOOL IsDialogMessageW(HWND dialog, MSG* message) {
  if (message == nullptr || !IsWindow(dialog)) return FALSE;
  if (message->hwnd != dialog && !IsChild(dialog, message->hwnd)) return FALSE;
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    bool isTaken = false;
    if (message->message == WM_KEYDOWN) {
      isTaken = TakeKey(dialog, *message);
    } else if (message->message == WM_CHAR) {
      isTaken = TakeCharacter(dialog, *message);
    } else if (message->message == WM_SYSCHAR) {
      isTaken = PressMnemonic(dialog, static_cast<WCHAR>(message->wParam));
    }
    if (!isTaken) {
      TranslateMessage(message);
      DispatchMessageW(message);
    }
    return TRUE;
  });
}
