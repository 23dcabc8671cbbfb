#include "qxcore/ui/frame/internal/dialog_template.h"

#include <cstring>

namespace {

// Walks over the 16-bit words of a template.
class TemplateReader {
 public:
  explicit TemplateReader(const void* dialogTemplate) : m_place(static_cast<const unsigned char*>(dialogTemplate)) {}

  WORD Word() {
    WORD word;
    std::memcpy(&word, m_place, sizeof(word));
    m_place += sizeof(word);
    return word;
  }
  void Skip(int words) { m_place += words * 2; }

  // A menu or class: none, a number behind 0xFFFF, or a text.
  void SkipName() {
    const WORD first = Word();
    if (first == 0xFFFF) {
      Skip(1);
    } else if (first != 0) {
      while (Word() != 0) {
      }
    }
  }
  SString Text() {
    SString text;
    while (const WORD c = Word()) text += static_cast<WCHAR>(c);
    return text;
  }

 private:
  const unsigned char* m_place;
};

// Words before the menu: the extended layout begins with 1 and 0xFFFF.
constexpr int kHeaderWords = 9;
constexpr int kExtendedHeaderWords = 13;

}  // namespace

SString SDialogTemplateCaption(const void* dialogTemplate) {
  TemplateReader start(dialogTemplate);
  const bool isExtended = start.Word() == 1 && start.Word() == 0xFFFF;
  TemplateReader reader(dialogTemplate);
  reader.Skip(isExtended ? kExtendedHeaderWords : kHeaderWords);
  reader.SkipName();
  reader.SkipName();
  return reader.Text();
}
