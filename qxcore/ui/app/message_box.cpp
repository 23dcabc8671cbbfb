#include "qxcore/ui/app/message_box.h"

#include "qxcore/core/module_state.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/interaction_mode.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

namespace {

constexpr UINT kTypes = 6;  // with a label in the string table
constexpr unsigned int kFirstLabel = 270;

// By type: the answers without a default bit, with MB_DEFBUTTON2 and with MB_DEFBUTTON3.
constexpr int kAnswers[kTypes][3] = {
    {IDOK, IDOK, IDOK},      {IDOK, IDCANCEL, IDOK}, {IDABORT, IDRETRY, IDIGNORE},
    {IDYES, IDNO, IDCANCEL}, {IDYES, IDNO, IDYES},   {IDRETRY, IDCANCEL, IDRETRY},
};

constexpr UINT kCancelTryContinue = 6;

}  // namespace

int SDefaultButton(UINT type) {
  const UINT kind = type & 0xF;
  if (kind >= kTypes) return kind == kCancelTryContinue ? IDCANCEL : IDOK;
  const UINT button = type >> 8 & 0xF;
  return kAnswers[kind][button < 3 ? button : 0];
}

SString SButtonSetLabel(UINT type) {
  const UINT kind = type & 0xF;
  return kind < kTypes ? SCoreGetModuleState()->LoadStringW(kFirstLabel + kind) : SString();
}

// A box without a text has nothing to quote, its buttons included.
[[noreturn]] static void AbortOnBox(const SString& text, UINT type, const SString& caption) {
  SString quoted(text);
  const SString label = SButtonSetLabel(type);
  if (!quoted.IsEmpty() && !label.IsEmpty()) {
    quoted += WTEXT("\n");
    quoted += label;
  }
  g_ThrowAbortOnDlg(caption, quoted);
}

int SMessageBox(LPCWSTR text, UINT type, LPCWSTR caption, HWND owner) {
  SString title(caption);
  if (caption == nullptr && SGetApp() != nullptr) title = SGetApp()->GetAppName();
  switch (SInteractionModeInForce()) {
    case kInteractiveAnswer:
      return SDefaultButton(type);
    case kInteractiveAbort:
      AbortOnBox(text, type, title);
    default:
      break;
  }
  if (owner == nullptr) owner = SGetOwnerWnd()->GetSafeHwnd();
  return SSent(::MessageBoxW(owner, text, title, owner == nullptr ? type | MB_TASKMODAL : type));
}
