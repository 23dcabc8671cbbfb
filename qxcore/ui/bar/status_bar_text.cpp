#include "qxcore/ui/bar/status_bar_text.h"

#include <exception>

#include "qxcore/core/module_state.h"
#include "qxcore/string/string.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/bar/size_parent.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

// A text, or null for the former one, for a user.
static void SendStatusText(LPCWSTR text, const SSetStatusBarText* user) {
  SWnd* owner = SGetOwnerWnd();
  if (owner == nullptr) return;
  owner->SendMessageW(kSMsgStatusText, reinterpret_cast<WPARAM>(text), reinterpret_cast<LPARAM>(user));
}

SSetStatusBarText::SSetStatusBarText() { Begin(); }

SSetStatusBarText::SSetStatusBarText(LPCWSTR text) {
  Begin();
  Show(text);
}

SSetStatusBarText::SSetStatusBarText(UINT stringId, SModuleState* module) {
  Begin();
  SModuleState* const owner = module != nullptr ? module : SCoreGetModuleState();
  const SString text = owner->LoadStringW(stringId);
  Show(text.IsEmpty() ? nullptr : text.GetSafePointer());
}

// A constructor that fails must take the cursor back itself.
void SSetStatusBarText::Begin() {
  SWinApp* app = SGetApp();
  if (app == nullptr) return;
  app->BeginWaitCursor();
  m_flags |= kWaits;
}

void SSetStatusBarText::Show(LPCWSTR text) {
  if (text == nullptr) return;
  try {
    SendStatusText(text, this);
  } catch (...) {
    TakeBack();
    throw;
  }
}

void SSetStatusBarText::Set(LPCWSTR text) { SendStatusText(text, nullptr); }

void SSetStatusBarText::StartModal() {
  m_modal.Start(1);
  m_flags |= kModal;
}

void SSetStatusBarText::DisableOwner() {
  SWnd* owner = SGetOwnerWnd();
  if ((m_flags & kWaits) == 0 || owner == nullptr || !owner->IsWindowEnabled()) return;
  owner->EnableWindow(0);
  m_flags |= kDisabledOwner;
}

// The flags go first: what is called may throw, and is not to be done twice.
void SSetStatusBarText::TakeBack() {
  const unsigned flags = m_flags;
  m_flags &= kIsReset;
  SWinApp* app = SGetApp();
  if ((flags & kWaits) && app != nullptr) app->EndWaitCursor();
  if (flags & kModal) m_modal.Stop();
  if (SWnd* owner = SGetOwnerWnd(); (flags & kDisabledOwner) && owner != nullptr) owner->EnableWindow(1);
}

void SSetStatusBarText::Reset() {
  m_flags |= kIsReset;
  TakeBack();
  SendStatusText(nullptr, this);
}

SSetStatusBarText::~SSetStatusBarText() {
  if (m_flags & kIsReset) return;
  try {
    Reset();
  } catch (...) {
    SWndThreadState::Get().KeepException(std::current_exception());
  }
}
