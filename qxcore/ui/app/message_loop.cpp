// The application's message loop and its idle work.

#include <utility>

#include "qxcore/core/exception.h"
#include "qxcore/system/notification_manager.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/error_report.h"
#include "qxcore/ui/app/modal_state.h"
#include "qxcore/ui/app/temp_maps.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

namespace {

constexpr UINT kSystemTimer = 0x0118;
// The mark in the queue behind what idle work posted: an idle kick with this wParam.
constexpr WPARAM kPostedMark = 0x51C0;

// The three names that the library asks for when it is loaded, so that a program's first kind is 4.
[[maybe_unused]] const int g_kinds[] = {
    SNotificationManager::NotificationKind(WTEXT("idle step")),
    SNotificationManager::NotificationKind(WTEXT("idle started")),
    SNotificationManager::NotificationKind(WTEXT("idle ended")),
};

void Notify(int kind) { SNotificationManager::Notify(kind, nullptr, 0); }

bool IsMessageWaiting() {
  MSG message;
  return ::PeekMessageW(&message, nullptr, 0, 0, PM_NOREMOVE) != 0;
}

bool IsMouseMove(const MSG& message) { return message.message == WM_MOUSEMOVE || message.message == WM_NCMOUSEMOVE; }

// What comes from the user's devices.
bool IsInput(UINT message) {
  return (message >= WM_MOUSEFIRST && message <= WM_MOUSELAST) || (message >= WM_KEYFIRST && message <= WM_KEYLAST) ||
         (message >= WM_NCMOUSEMOVE && message <= WM_NCMBUTTONDBLCLK);
}

}  // namespace

int SWinApp::Run() {
  if (m_isIdle) m_idleCount = 0;
  m_isIdle = 0;
  for (bool goesOn = true; goesOn;) {
    try {
      goesOn = RunRound();
    } catch (...) {
      SReportException(std::current_exception());
    }
  }
  SetExiting(1);
  return ExitInstance();
}

// Idle work, then all messages that wait; false when the program ends.
bool SWinApp::RunRound() {
  DoIdle();
  do {
    if (!PumpMessage()) return false;
  } while (IsMessageWaiting());
  return true;
}

long SWinApp::DoIdle() {
  while (m_isIdle && !IsMessageWaiting()) {
    int wantsMore = 0;
    try {
      wantsMore = OnIdle(IdleStep(1));
    } catch (...) {
      EndIdlePeriod();
      throw;
    }
    MarkPosted();
    if (wantsMore) {
      ::Sleep(0);
    } else {
      EndIdlePeriod();
    }
  }
  SWndThreadState::Get().ThrowException();
  return m_idleCount;
}

void SWinApp::EndIdlePeriod() {
  if (m_isIdle) m_idleCount = 0;
  m_isIdle = 0;
  Notify(kSIdleEnded);
}

long SWinApp::IdleStep(int advance) { return advance ? m_idleCount++ : m_idleCount; }

// The queue was empty before the idle work, so what waits now came from it, or meanwhile.
void SWinApp::MarkPosted() {
  if (!m_hasPosted && IsMessageWaiting()) m_hasPosted = ::PostMessageW(nullptr, kSMsgIdleKick, kPostedMark, 0) != 0;
}

// The mark itself is one of them, and ends them.
bool SWinApp::IsOfIdleWork(const MSG& message) {
  if (!m_hasPosted || IsInput(message.message)) return false;
  if (message.hwnd == nullptr && message.message == kSMsgIdleKick && message.wParam == kPostedMark) m_hasPosted = false;
  return true;
}

int SWinApp::OnIdle(long count) {
  if (count == 0) {
    Notify(kSIdleStep);
    if (!std::exchange(m_idleStarted, 1)) Notify(kSIdleStarted);
  } else if (count == 1) {
    SLockTempMaps();
    SUnlockTempMaps();
  }
  return count == 0;
}

int SWinApp::IsIdleMessage(MSG* message) {
  if (IsMouseMove(*message)) {
    const bool isRepeated = m_lastMousePoint == message->pt && m_lastMouseMessage == message->message;
    m_lastMousePoint = message->pt;
    m_lastMouseMessage = message->message;
    return !isRepeated;
  }
  if (message->message == WM_PAINT || message->message == kSystemTimer) return 0;
  if (!m_idleStarted) return 1;
  switch (message->message) {
    case WM_TIMER:
    case WM_MOUSEWHEEL:
    case WM_MOUSEHOVER:
    case WM_MOUSELEAVE:
      return 1;
    default:
      m_idleStarted = 0;
      m_idleCount = 0;
      return 1;
  }
}

// While the application is disabled, its owner window still paints, moves and takes system commands.
int SWinApp::DropsInput(const MSG& message) {
  if (SModalState::State() != 0) return 0;
  const HWND owner = GetOwnerWnd()->GetSafeHwnd();
  if (owner == nullptr || message.hwnd != owner) return 0;
  switch (message.message) {
    case WM_TIMER:
    case WM_PAINT:
    case WM_SIZE:
    case WM_MOVE:
    case WM_SHOWWINDOW:
    case WM_SYSCOMMAND:
      return 0;
    default:
      return 1;
  }
}

// The message is handled as a copy: a nested loop takes others into the field.
int SWinApp::PumpMessage() {
  const BOOL taken = ::GetMessageW(&m_message, nullptr, 0, 0);
  if (taken == 0) return 0;
  if (taken < 0) throw SEOutOfMemory();  // without a window to name wrongly, it cannot fail for another reason
  MSG message = m_message;
  if (DropsInput(message)) return 1;
  if (!IsOfIdleWork(message) && IsIdleMessage(&message)) {
    if (!m_isIdle) m_idleCount = 0;
    m_isIdle = 1;
  }
  if (message.message == kSMsgIdleKick) return 1;
  if (message.message != WM_NULL && PreTranslateMessage(&message)) return SSent(1);
  ::TranslateMessage(&message);
  ::DispatchMessageW(&message);
  return SSent(1);
}

// Without a main window, a modal loop's window stands in for it: a dialog of a small program takes its keys, too.
int SWinApp::PreTranslateMessage(MSG* message) {
  if (message->hwnd == nullptr) return 0;
  const SWnd* stop = m_mainWnd;
  if (const auto* loop = SWndThreadState::Get().m_modalLoops; stop == nullptr && loop != nullptr) stop = loop->m_window;
  return stop != nullptr && SWnd::WalkPreTranslateTree(stop->GetSafeHwnd(), message);
}
