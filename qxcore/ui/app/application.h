// SWinApp: the application object, with its message loop and idle work.
//
// A program has one application object. Init gives it what the program was started with; InitInstance makes the
// windows; Run takes messages until the main window is destroyed. When the queue is empty, OnIdle is called in steps
// as long as it returns nonzero; then the loop sleeps until the next message.
//
// At idle time the notifications kSIdleStep (each time), kSIdleStarted (once until there is input again) and
// kSIdleEnded are sent through SNotificationManager. A derived class drives idle consumers from OnIdle.
// Messages that idle work posts do not start another idle period, so that it cannot keep the program busy for ever.
//
// What a handler throws, and nobody catches, is passed to the error reporter by Run, which goes on.
// For the user-interface thread.
#pragma once

#include "qxcore/graphics/rect.h"
#include "qxcore/ui/app/command_line.h"
#include "qxcore/ui/window/command_target.h"

class SDockSiteFrameWnd;
class SWnd;

// The kinds of notification that the loop sends, both further arguments 0.
inline constexpr int kSIdleStep = 1;     // a step with the count 0 begins
inline constexpr int kSIdleStarted = 2;  // it is the first one since there was input
inline constexpr int kSIdleEnded = 3;    // the loop goes to sleep

// The application object; see above. A program has one.
class QXCORE_API SWinApp : public SCmdTarget {
  QXCORE_DECLARE_CLASS(SWinApp)

 public:
  // Makes the application object. A null name stands for the name of the program's file.
  explicit SWinApp(LPCWSTR name = nullptr);
  SWinApp(const SWinApp&) = delete;
  SWinApp& operator=(const SWinApp&) = delete;
  ~SWinApp() override;

  // --- virtual functions; their order is part of the binary interface ---

  virtual int InitApplication();  // for the first instance; 0 ends the program. Here: 1
  virtual int InitInstance();     // makes the main window; 0 ends the program. Here: 1
  virtual int ExitInstance();     // the result of Run. Here: the number that WM_QUIT carries
  // Takes messages until WM_QUIT comes. Returns ExitInstance().
  virtual int Run();
  // Sees a message before it is dispatched; nonzero takes it. Here: the main window's tree is asked.
  virtual int PreTranslateMessage(MSG* message);
  // Takes one message, waiting for it, and dispatches it; 0 for WM_QUIT. Throws what a handler threw, and
  // SEOutOfMemory.
  virtual int PumpMessage();
  // One step of idle work. Nonzero asks for another one at once. Here: with 0 the notifications, with 1 the
  // temporary objects are destroyed; nonzero for 0 only.
  virtual int OnIdle(long count);
  // Whether a message starts idle work when it has been handled: a repeated mouse move, painting and the system's
  // timer do not.
  virtual int IsIdleMessage(MSG* message);
  virtual SDockSiteFrameWnd* GetFrameWnd();  // the main window, if it is such a frame; else null
  virtual SWnd* GetOwnerWnd();               // the owner of boxes and dialogs; here the main window; may be null
  // Shows the wait cursor (1), takes it back (-1) or shows it again (0). The calls nest.
  virtual void DoWaitCursor(int change);
  virtual int GetWaitCount() const;          // how often the wait cursor is asked for
  virtual int OnDDECommand(LPWSTR command);  // DDE is not supported: 0

  // --- the loop ---

  // Takes what the program was started with; a null command line is the process's own. Returns InitApplication().
  int Init(HINSTANCE instance, HINSTANCE previous, char* commandLine, int show);
  // Does the idle work that is due, until a message comes, for loops of the program's own. Returns the idle count.
  long DoIdle();
  // Returns the idle count, and adds one to it afterwards when `advance` is nonzero.
  long IdleStep(int advance);
  int NeedOnIdle() const { return m_isIdle; }              // nonzero while idle work is due
  void SetNeedOnIdle(int need) { m_isIdle = need != 0; }   // asks for it, or takes that back
  const MSG& CurrentMessage() const { return m_message; }  // the message that was taken last

  // --- what the program was started with ---

  const SCommandLine& GetCommmandLine() const { return m_commandLine; }
  const SString& GetCmdLineString() const { return m_commandLine.GetText(); }
  const SString& GetAppName() const { return m_appName; }                  // for captions
  const SString& GetExeName() const { return m_exeName; }                  // "tool" for "C:\bin\tool.exe"
  const SString& GetExeFileName() const { return m_exeFileName; }          // "tool.exe"
  const SString& GetExeFullFileName() const { return m_exeFullFileName; }  // the whole path
  int GetShowCommand() const { return m_show; }                            // for the main window's ShowWindow
  void SetCurrentHandles();                                                // reads the names above
  static int IsExiting() { return m_isExiting; }                           // nonzero once Run has seen WM_QUIT
  static void SetExiting(int exiting) { m_isExiting = exiting; }

  // --- not supported ---

  void EnableShellCommands() {}                      // documents are not opened by the shell
  int GetPrinterDeviceDefaults(void*) { return 0; }  // there is no printer
  int DoPrintDialog(void*) { return IDCANCEL; }      // as if the user had cancelled it
  void UpdatePrinterSelection(int) {}

 protected:
  MSG m_message = {};           // the message that was taken last
  SPoint m_lastMousePoint;      // of the last mouse move
  UINT m_lastMouseMessage = 0;  // and its kind
  int m_idleStarted = 0;        // kSIdleStarted was sent since there was input
  int m_isIdle = 0;             // idle work is due
  long m_idleCount = 0;         // what the next OnIdle is given

 public:
  SWnd* m_mainWnd = nullptr;  // whose destruction ends the program; not owned

 private:
  void EndIdlePeriod();
  void MarkPosted();
  bool IsOfIdleWork(const MSG& message);
  int DropsInput(const MSG& message);
  bool RunRound();
  void NamesFrom(const SString& path);

  SCommandLine m_commandLine;
  SString m_appName;
  SString m_exeName;
  SString m_exeFileName;
  SString m_exeFullFileName;
  HINSTANCE m_instance = nullptr;
  HCURSOR m_cursorBefore = nullptr;  // shown again when the last wait cursor goes
  int m_show = SW_SHOWNORMAL;
  int m_waitCount = 0;
  bool m_hasPosted = false;  // a mark in the queue ends the messages that idle work posted
  static int m_isExiting;

  friend QXCORE_API HINSTANCE SGetInstance();
};

// The one application object; null before it is made and after its end.
QXCORE_API SWinApp* SGetApp();
// The module instance that windows are created with: the program's, else the library's.
QXCORE_API HINSTANCE SGetInstance();
// The module where resources are looked up.
QXCORE_API HINSTANCE SGetResInstance();
// The application's owner window; null without an application or main window.
QXCORE_API SWnd* SGetOwnerWnd();
// A hidden window for code that needs one; made on the first call, null when that fails. It lives until the
// program ends or it is destroyed, and is then made anew.
QXCORE_API SWnd* SDummyWindow();
