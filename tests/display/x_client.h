// Another client of the X server: a person's hands and eyes, and a second program.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qxcore/platform/win32.h"

namespace test {

class XClient {
 public:
  XClient();
  ~XClient();
  XClient(const XClient&) = delete;
  XClient& operator=(const XClient&) = delete;

  // Whether the server takes input from clients (XTEST).
  bool CanType() const;

  // --- hands; points are on the screen ---
  void Move(POINT point);
  void Button(int button, bool isDown);  // 1 left, 3 right, 4 and 5 the wheel
  void Click(POINT point);
  void Key(const char* name, bool isDown);  // by the name of its symbol: "a", "F6", "Shift_L"
  void Type(const char* name) { Key(name, true), Key(name, false); }

  // --- eyes ---
  // The pixels of a part of the screen, row by row, 0x00RRGGBB.
  std::vector<std::uint32_t> Pixels(const RECT& rect);

  // --- what window managers and other programs do to the window with this title ---
  bool HasWindow(const std::string& title);
  // The titles of the windows that are shown.
  std::vector<std::string> Titles();
  void Place(const std::string& title, const RECT& rect);
  void AskToClose(const std::string& title);
  // Takes the keyboard for a window of its own, and gives it back.
  void TakeKeyboard();
  void GiveKeyboard(const std::string& title);
  // Whether some window has it: while one closes, there may be none for a moment, and keys are lost.
  bool HasKeyboardOwner();

  // --- drag and drop ---
  // Drags files to a point of the screen and drops them there; `uris` has a line for each. Returns true once the window
  // at that point has taken them, false when none there takes drops, when it refuses and after five seconds. The
  // window's thread must not wait.
  bool Drop(POINT point, const std::string& uris);
  // Begins a drag there with a window that goes at once, as that of a program that ends meanwhile.
  void BeginDragAndGo(POINT point);

  // --- the clipboard ---
  // Asks the owner of the clipboard for its text; Answer() returns true once it is there.
  void AskForText();
  bool Answer(std::string* text);
  // Owns the clipboard and serves one request after the other until the object ends.
  void OfferText(const std::string& text);

 private:
  struct State;
  std::unique_ptr<State> m_state;
};

}  // namespace test
