#include "tools/qxworkbench/app.h"

#include <atomic>
#include <cstdio>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/ui/app/interaction_mode.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxworkbench/commands.h"
#include "tools/qxworkbench/picture.h"

namespace {

constexpr SIZE kSize{1000, 640};  // of the window at 96 dots an inch

std::atomic<HWND> g_interrupted = nullptr;  // the window that hears of an interruption

void TellWindow() { ::PostMessageW(g_interrupted, kMsgInterrupted, 0, 0); }

}  // namespace

int WorkbenchApp::InitInstance() {
  m_mode = std::make_unique<SetInteractiveMode>(ModeOf(m_options.mode));
  if (!m_options.script.empty()) m_script = std::make_unique<Script>(m_options.script);
  m_frame = new WorkbenchFrame;
  const int dpi = static_cast<int>(::GetDpiForSystem());
  const SRect place(SPoint(20, 20), SSize(::MulDiv(kSize.cx, dpi, 96), ::MulDiv(kSize.cy, dpi, 96)));
  if (!m_frame->Create(nullptr, WTEXT("qxcore workbench"), WS_OVERLAPPEDWINDOW, place)) {
    throw Failure{"the window cannot be made: " + SystemText(::GetLastError())};
  }
  m_mainWnd = m_frame;
  g_interrupted = m_frame->m_hWnd;
  console::WakeWhenInterrupted(&TellWindow);
  const bool isUnattended = m_script != nullptr || !m_options.picture.empty();
  if (!isUnattended && ::GetSystemMetrics(SM_CMONITORS) == 0) {
    throw Failure{"nobody would see the window; --script and --picture need no screen"};
  }
  if (isUnattended) {
    m_frame->SetReporter([this](const SString& text) {
      if (m_script != nullptr) return m_script->Fail(text);
      Complain(ToUtf8(text));
      m_exitCode = kFailed;
    });
  }
  m_frame->ShowWindow(GetShowCommand());
  m_frame->UpdateWindow();
  if (!m_options.folder.empty()) {
    try {
      m_frame->OpenFolder(console::NameOf(m_options.folder));
    } catch (const Failure& failure) {
      m_frame->Report(FromUtf8(failure.place.empty() ? failure.text : failure.place + ": " + failure.text));
      if (isUnattended) m_exitCode = kFailed;
    }
  }
  m_frame->PostMessageW(WM_NULL);  // idle work follows each message
  return 1;
}

// --- idle time ---

int WorkbenchApp::OnIdle(long count) {
  const Clock::time_point begin = Clock::now();
  bool goesOn = SWinApp::OnIdle(count) != 0;
  if (console::Interrupted() && m_mainWnd != nullptr) m_frame->DestroyWindow();
  if (m_mainWnd != nullptr && !m_hasEnded) {
    goesOn |= StepFrame();
    Measure(begin, "idle");
    // What the script does is the user's part, and is measured by the messages that it sends.
    if (m_script != nullptr) goesOn |= RunScript();
    if (m_script == nullptr && !m_options.picture.empty() && !m_frame->IsBusy()) {
      goesOn = true;
      if (count > 2) TakePicture();
    }
  }
  return goesOn && !m_hasEnded;
}

// An interruption ends what reads and writes at once; the next idle work ends the program.
bool WorkbenchApp::StepFrame() {
  try {
    return m_frame->Step();
  } catch (const SEIOAbortedException&) {
    return true;
  }
}

// One command at a time; true while there are more to run at once.
bool WorkbenchApp::RunScript() {
  if (m_hasEnded) return false;
  try {
    if (m_script->Step(*m_frame, *this)) return true;
    if (m_script->IsWaiting()) return false;
  } catch (const ScriptFailure& failure) {
    Complain(failure.text);
    m_exitCode = kFailed;
  }
  if (!m_options.picture.empty()) TakePicture();
  End(m_exitCode);
  return false;
}

void WorkbenchApp::TakePicture() {
  try {
    SavePicture(*m_frame, console::NameOf(m_options.picture));
  } catch (const Failure& failure) {
    Complain(failure.place + ": " + failure.text);
    m_exitCode = kFailed;
  }
  End(m_exitCode);
}

void WorkbenchApp::End(int code) {
  m_hasEnded = true;
  m_exitCode = code;
  if (m_options.timing) {
    char line[96];
    std::snprintf(line, sizeof line, "longest step: %.1f ms (%s)\n", m_longest, m_longestName.c_str());
    Print(line);
  }
  m_frame->DestroyWindow();
  ::PostQuitMessage(code);
}

// --- how long a step takes ---

int WorkbenchApp::PreTranslateMessage(MSG* message) {
  m_messageBegan = Clock::now();
  m_isInMessage = true;
  return SWinApp::PreTranslateMessage(message);
}

int WorkbenchApp::PumpMessage() {
  m_isInMessage = false;
  const int goesOn = SWinApp::PumpMessage();
  if (m_isInMessage) {
    char name[32];
    std::snprintf(name, sizeof name, "message 0x%04X", static_cast<unsigned>(CurrentMessage().message));
    Measure(m_messageBegan, name);
  }
  return goesOn;
}

void WorkbenchApp::Measure(Clock::time_point begin, const std::string& name) {
  const double taken = std::chrono::duration<double, std::milli>(Clock::now() - begin).count();
  if (taken <= m_longest) return;
  m_longest = taken;
  m_longestName = name;
}
