// The conversions of SRtfDocument, through its hidden control.

#include <memory>

#include "qxcore/core/internal/quietly.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/control/rich_edit.h"
#include "qxcore/ui/rtf/document.h"

namespace {

constexpr long kNoLimit = 0x7FFFFFFE;

// The window that the hidden control is a child of: the owner window, or in a program without one the dummy window.
HWND ParentOfHidden() {
  const HWND owner = SGetOwnerWnd()->GetSafeHwnd();
  return owner != nullptr ? owner : SDummyWindow()->GetSafeHwnd();
}

// The parent learns nothing of a control that belongs to no one but the document.
int CreateHidden(SRichEditCtrl& edit) {
  if (!edit.CreateEx(WS_EX_NOPARENTNOTIFY, nullptr, nullptr, WS_CHILD | ES_MULTILINE, 0, 0, 0, 0, ParentOfHidden(),
                     nullptr)) {
    return 0;
  }
  edit.SetTextMode(TM_RICHTEXT);
  edit.SetTextLimit(kNoLimit);
  return 1;
}

// Puts the text into the control and hands out what `read` gets back.
int Convert(SRtfDocument& document, SRichEditCtrl*& edit, SString* result, const SString& text,
            SString (SRichEditCtrl::*read)() const) {
  if (result == nullptr) return 0;
  if (text.IsEmpty()) {
    *result = SString::null;
    return 1;
  }
  try {
    if (document.CreateEditCtrl() == 0) return 0;
    if ((text.IsRtf() != 0 ? edit->SetRtf(text) : edit->SetPlainText(text)) == 0) return 0;
    *result = (edit->*read)();
    return !result->IsEmpty();
  } catch (...) {
    return 0;
  }
}

}  // namespace

// A control whose parent was destroyed has no window any more and is replaced.
int SRtfDocument::CreateEditCtrl() {
  if (m_edit->GetSafeHwnd() != nullptr) return 1;
  DeleteEditCtrl();
  SQuietly([this] {
    auto edit = std::make_unique<SRichEditCtrl>();
    if (CreateHidden(*edit) != 0) m_edit = edit.release();
  });
  return m_edit != nullptr;
}

void SRtfDocument::DeleteEditCtrl() {
  delete m_edit;
  m_edit = nullptr;
}

int SRtfDocument::RtfToText(SString* text, const SString& rtf) {
  return Convert(*this, m_edit, text, rtf, &SRichEditCtrl::GetPlainText);
}

int SRtfDocument::TextToRtf(SString* rtf, const SString& text) {
  return Convert(*this, m_edit, rtf, text, &SRichEditCtrl::GetRtf);
}
