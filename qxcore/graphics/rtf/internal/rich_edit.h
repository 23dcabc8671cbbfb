// SRichEditCtrl: a hidden rich-edit control, as far as conversions need one.
#pragma once

#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class SRichEditCtrl {
 public:
  SRichEditCtrl() = default;
  SRichEditCtrl(const SRichEditCtrl&) = delete;
  SRichEditCtrl& operator=(const SRichEditCtrl&) = delete;
  ~SRichEditCtrl();

  // Makes the window, without limit of text and for formatted text. Returns 1; 0 on failure.
  int Create();
  // Replaces the content, up to the text's first NUL. Return 1; 0 on failure.
  int SetPlainText(const SString& text);
  int SetRtf(const SString& rtf);
  // The content; lines end with CR LF. Throw SEOutOfMemory.
  SString GetPlainText() const;
  SString GetRtf() const;

 private:
  HWND m_hWnd = nullptr;
};
