// Exchange of data between a dialog's controls and its variables, with checks.
// ```cpp
// void SSizeDlg::DoDataExchange(SDataExchange* exchange) {
//   exchange->Text(IDC_NAME, &m_name);
//   exchange->MaxLength(m_name, 40);
//   exchange->Number(IDC_COUNT, &m_count);
//   exchange->Range(m_count, 1, 99);
//   exchange->Check(IDC_FRAME, &m_hasFrame);
// }
// ```
// One function serves both ways: SaveAndValidate() says which. A check stands behind the exchange of its variable and
// looks only when data is taken; when it fails, the user is told with SMessageBox, the control gets the focus, and
// UpdateData returns 0. In an unattended mode that message box is answered or aborted like any other.
// For the user-interface thread.
#pragma once

#include "qxcore/string/string.h"
#include "qxcore/ui/window/window.h"

class QXCORE_API SDataExchange {
 public:
  // For the controls of `window`; `save` is nonzero to take data from them.
  SDataExchange(SWnd* window, int save) : m_window(window), m_save(save != 0) {}
  SDataExchange(const SDataExchange&) = delete;
  SDataExchange& operator=(const SDataExchange&) = delete;

  bool SaveAndValidate() const { return m_save; }  // true when data is taken from the controls
  SWnd* GetWindow() const { return m_window; }     // whose controls they are

  // The text of a control.
  void Text(int id, SString* value);
  // A whole number, or one with a fraction, as the text of a control. A text that is no number fails; so does a whole
  // number that does not fit 32 bits.
  void Number(int id, std::int32_t* value);
  void Number(int id, double* value);
  // A check box: 0, 1, or 2 for undecided.
  void Check(int id, int* value);
  // A group of radio buttons, the first of which has this identifier and WS_GROUP: which one is on, from 0; -1 for
  // none. The group ends before the next control with WS_GROUP.
  void Radio(int firstId, int* index);

  // Checks of the variable that was exchanged last.
  void MaxLength(const SString& value, int count);  // at most `count` characters; also limits what can be typed
  void Range(std::int32_t value, std::int32_t low, std::int32_t high);
  void Range(double value, double low, double high);

  // Ends the exchange: shows the message, gives the focus to the control of the last exchange.
  [[noreturn]] void Fail(const SString& message);

 private:
  HWND Control(int id);
  SString TextOf(HWND control);

  SWnd* m_window;
  bool m_save;
  HWND m_last = nullptr;  // the control of the last exchange
};

// Thrown by Fail and caught by UpdateData.
struct SDataExchangeFailed {};
