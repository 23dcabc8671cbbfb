// The conversions of SRtfDocument, through its hidden control.

#include "qxcore/graphics/rtf/document.h"
#include "qxcore/platform/internal/rich_text.h"

class SRichEditCtrl {
 public:
  explicit SRichEditCtrl(std::unique_ptr<platform::RichText> control) : m_control(std::move(control)) {}
  platform::RichText* operator->() { return m_control.get(); }

 private:
  std::unique_ptr<platform::RichText> m_control;
};

namespace {

// Up to the first NUL, where a control's text ends.
SStringView TerminatedView(const SString& text) { return SStringView(text.GetSafePointer()); }

SString TextOf(SRichEditCtrl& edit) {
  SString text;
  const std::size_t length = edit->TextLength();
  if (length == 0) return text;
  if (length > 0x7FFFFFFF) throw std::bad_alloc();
  edit->GetText(text.GetBufferSetLength(static_cast<int>(length)));
  return text;
}

SString RtfOf(SRichEditCtrl& edit) {
  const std::string rtf = edit->GetRtf();
  if (rtf.size() > 0x7FFFFFFF) throw std::bad_alloc();
  SString text;
  WCHAR* to = rtf.empty() ? nullptr : text.GetBufferSetLength(static_cast<int>(rtf.size()));
  for (const char byte : rtf) *to++ = static_cast<unsigned char>(byte);
  return text;
}

// Loads the text into the control and hands out what `read` makes of it.
int Convert(SRtfDocument& document, SRichEditCtrl*& edit, SString* result, const SString& text,
            SString (*read)(SRichEditCtrl&)) {
  if (result == nullptr) return 0;
  if (text.IsEmpty()) {
    *result = SString::null;
    return 1;
  }
  try {
    if (document.CreateEditCtrl() == 0) return 0;
    if (!(*edit)->Load(TerminatedView(text), text.IsRtf() != 0)) return 0;
    *result = read(*edit);
    return !result->IsEmpty();
  } catch (...) {
    return 0;
  }
}

}  // namespace

int SRtfDocument::CreateEditCtrl() {
  if (m_edit != nullptr) return 1;
  try {
    std::unique_ptr<platform::RichText> control = platform::RichText::Make();
    if (control != nullptr) m_edit = new SRichEditCtrl(std::move(control));
  } catch (...) {
  }
  return m_edit != nullptr;
}

void SRtfDocument::DeleteEditCtrl() {
  delete m_edit;
  m_edit = nullptr;
}

int SRtfDocument::RtfToText(SString* text, const SString& rtf) { return Convert(*this, m_edit, text, rtf, TextOf); }
int SRtfDocument::TextToRtf(SString* rtf, const SString& text) { return Convert(*this, m_edit, rtf, text, RtfOf); }
