// The conversions of SRtfDocument, through its hidden control.

#include <memory>

#include "qxcore/core/internal/quietly.h"
#include "qxcore/graphics/rtf/document.h"
#include "qxcore/graphics/rtf/internal/rich_edit.h"

namespace {

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

int SRtfDocument::CreateEditCtrl() {
  if (m_edit != nullptr) return 1;
  SQuietly([this] {
    auto edit = std::make_unique<SRichEditCtrl>();
    if (edit->Create() != 0) m_edit = edit.release();
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
