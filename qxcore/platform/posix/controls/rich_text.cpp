#include "qxcore/platform/internal/rich_text.h"

#include <new>

#include "qxcore/platform/posix/controls/rtf_reader.h"
#include "qxcore/platform/posix/controls/rtf_writer.h"

namespace platform {
namespace {

class PortableRichText : public RichText {
 public:
  bool Load(SStringView text, bool isRtf) override {
    isRtf ? rich::ReadRtf(text, m_document) : rich::ReadText(text, m_document);
    return true;
  }
  std::size_t TextLength() override { return m_document.text.Length(); }
  void GetText(WCHAR* text) override {
    const SStringView content = m_document.text.View();
    content.copy(text, content.size());
    text[content.size()] = 0;
  }
  std::string GetRtf() override {
    std::string rtf;
    rich::WriteRtf(m_document, rtf);
    return rtf;
  }

 private:
  rich::Document m_document;
};

}  // namespace

std::unique_ptr<RichText> RichText::Make() { return std::make_unique<PortableRichText>(); }

}  // namespace platform
