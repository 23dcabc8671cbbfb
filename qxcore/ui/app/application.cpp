#include "qxcore/ui/app/application.h"

#include <algorithm>

#include "qxcore/core/module_state.h"
#include "qxcore/ui/frame/dock_site_frame.h"
#include "qxcore/ui/window/window.h"

QXCORE_IMPLEMENT_CLASS(SWinApp, SCmdTarget, 2)

namespace {
constinit SWinApp* g_app = nullptr;
}

int SWinApp::m_isExiting = 0;

SWinApp* SGetApp() { return g_app; }

HINSTANCE SGetInstance() {
  if (g_app != nullptr && g_app->m_instance != nullptr) return g_app->m_instance;
  return SCoreGetModuleState()->GetInstance();
}

HINSTANCE SGetResInstance() { return SCoreGetModuleState()->GetResInstance(); }

SWnd* SGetOwnerWnd() { return g_app != nullptr ? g_app->GetOwnerWnd() : nullptr; }

SWinApp::SWinApp(LPCWSTR name) : m_appName(name) {
  if (g_app != nullptr) return;
  g_app = this;
  SetExiting(0);
}

SWinApp::~SWinApp() {
  if (g_app == this) g_app = nullptr;
}

int SWinApp::InitApplication() { return 1; }
int SWinApp::InitInstance() { return 1; }
int SWinApp::ExitInstance() { return static_cast<int>(m_message.wParam); }
SDockSiteFrameWnd* SWinApp::GetFrameWnd() {
  return static_cast<SDockSiteFrameWnd*>(
      SObjectCast<SDockSiteFrameWnd>(m_mainWnd, &SDockSiteFrameWnd::classSDockSiteFrameWnd));
}
SWnd* SWinApp::GetOwnerWnd() { return m_mainWnd; }
int SWinApp::OnDDECommand(LPWSTR) { return 0; }

int SWinApp::Init(HINSTANCE instance, HINSTANCE, char* commandLine, int show) {
  m_instance = instance;
  m_show = show;
  SetCurrentHandles();
  SString line(::GetCommandLineW());
  if (commandLine != nullptr) line = WTEXT("\"") + m_exeFullFileName + WTEXT("\" ") + SString(commandLine);
  m_commandLine.Parse(line);
  return InitApplication();
}

void SWinApp::SetCurrentHandles() {
  SString path;
  for (int size = 260; size <= 32768; size *= 2) {
    const DWORD length = ::GetModuleFileNameW(nullptr, path.Lock(size), static_cast<DWORD>(size));
    path.Unlock(static_cast<int>(std::min(length, static_cast<DWORD>(size) - 1)));
    if (length < static_cast<DWORD>(size) - 1) break;
  }
  NamesFrom(path);
}

void SWinApp::NamesFrom(const SString& path) {
  const std::size_t slash = path.View().find_last_of(WTEXT("\\/:"));
  const SStringView file = slash == SStringView::npos ? path.View() : path.View().substr(slash + 1);
  m_exeFullFileName = path;
  m_exeFileName = SString(file);
  m_exeName = SString(file.substr(0, file.find_last_of(WCHAR('.'))));
  if (m_appName.IsEmpty()) m_appName = m_exeName;
}

// --- the wait cursor ---

int SWinApp::GetWaitCount() const { return m_waitCount; }

void SWinApp::DoWaitCursor(int change) {
  if (change < 0 && m_waitCount == 0) return;
  const HCURSOR wait = ::LoadCursorW(nullptr, IDC_WAIT);
  const bool begins = change > 0 && m_waitCount == 0;
  m_waitCount += change;
  if (m_waitCount > 0) {
    const HCURSOR before = ::SetCursor(wait);
    if (begins) m_cursorBefore = before;
  } else if (change < 0) {
    ::SetCursor(m_cursorBefore);
  }
}
