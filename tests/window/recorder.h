// The vocabulary of the window tests: a window class whose procedure writes down what it hears, a hook that does
// the same, and the comparison with an expected file that was made under Wine.
#pragma once

#include <string>

#include "qxcore/platform/win32.h"

namespace recorder {

// Registers the class "Recorder" (double clicks, a background, the arrow) once.
void RegisterRecorder();

// A window of the class; its name is what the record calls it.
HWND Make(LPCWSTR name, DWORD style, HWND parent = nullptr, RECT rect = {10, 20, 310, 220}, DWORD exStyle = 0);

// Writes down what windows of the class and the thread's WH_CBT hook hear until it ends, indented by depth.
class Record {
 public:
  Record();
  ~Record();
  void Title(const char* title);
  // Names a window that is not of the class.
  static void Name(HWND window, const std::string& name);
  const std::string& Text() const;

 private:
  HHOOK m_hook;
};

// Lets a dialog's procedure be recorded, too.
void NoteDialog(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam);

// Handles messages until the queue is empty.
void Pump();

// Compares with tests/window/expected/<name>.txt. With QXCORE_EXPECTED in the environment, on Windows, the
// file is written instead.
void ExpectRecord(const std::string& name, const std::string& text);

}  // namespace recorder
