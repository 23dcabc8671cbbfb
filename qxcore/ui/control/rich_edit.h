// SRichEditCtrl: a rich-edit control of the system. It holds formatted text, and takes and returns it as plain text and
// as RTF 1.9.1, as Microsoft has published it.
//
// Positions count characters, the end of a paragraph as one, and begin with 0. Texts that are returned end their
// lines with CR LF. On Linux the control holds, formats and converts a document but shows nothing and takes no
// keys; docs/portable-layer.md lists its messages. For the user-interface thread.
#pragma once

#include "qxcore/platform/win32/rich_edit.h"
#include "qxcore/ui/window/window.h"

class QXCORE_API SRichEditCtrl : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SRichEditCtrl)

 public:
  SRichEditCtrl() = default;
  ~SRichEditCtrl() override;

  using SWnd::Create;
  // Creates the control as a child; `style` has the system's ES_ bits. Returns nonzero on success.
  int Create(DWORD style, const SRect& rect, SWnd* parent, UINT id);
  // Sets the window class when none is given; refuses the creation where the system has no such control.
  int PreCreateWindow(CREATESTRUCTW* create) override;

  // --- the whole content ---

  // Replace the content, up to the first NUL of the text. A plain text that begins with "{\rtf" is read as RTF.
  // Return 1; 0 when the control takes nothing, as without memory or when SetRtf is given no RTF.
  int SetPlainText(const SString& text);
  int SetRtf(const SString& rtf);
  // Return the content. Throw SEOutOfMemory.
  SString GetPlainText() const;
  SString GetRtf() const;
  // Read and write the content, or with SFF_SELECTION the selection, through a callback that the system calls with
  // a piece at a time. `format`: SF_RTF or SF_TEXT, with SF_UNICODE for UTF-16. Return what the message does, which
  // the systems count differently; stream.dwError is not 0 after a failure.
  long StreamIn(UINT format, EDITSTREAM& stream);
  long StreamOut(UINT format, EDITSTREAM& stream) const;

  // TM_RICHTEXT or TM_PLAINTEXT; possible only while the control is empty. Returns nonzero on success.
  int SetTextMode(UINT mode);
  // The longest text that a user may type and that may be streamed in as plain text, in characters: 32767 at the
  // start.
  void SetTextLimit(long count);
  long GetTextLength() const;    // in positions, so without the line feeds of GetPlainText
  int GetModify() const;         // nonzero after a change that did not replace the whole content
  void SetModify(int modified);  // sets or clears that

  // --- the selection ---

  void GetSel(long* start, long* end) const;       // `end` lies behind it
  void SetSel(long start, long end);               // (0, -1) selects all
  SString GetSelText() const;                      // the selected text; throws SEOutOfMemory
  void ReplaceSel(LPCWSTR text, int canUndo = 0);  // puts plain text in its place, in its first format

  // --- formats ---

  // The format of the selected characters. format.cbSize says which structure it is. Returns the CFM_ bits of what
  // is the same in all of them; format.dwMask gets them, too.
  DWORD GetSelectionCharFormat(CHARFORMAT2W& format) const;
  // Sets what format.dwMask names for the selected characters, or for all. With an empty selection the format is
  // that of the text that is put in next. Sets format.cbSize. Returns nonzero on success.
  int SetSelectionCharFormat(CHARFORMAT2W& format);
  int SetAllCharFormat(CHARFORMAT2W& format);
};
