#include "tools/qxworkbench/text_dialog.h"

#include "qxcore/ui/frame/data_exchange.h"

namespace {

constexpr int kEditId = 100;
constexpr WORD kButtonClass = 0x80, kEditClass = 0x81, kStaticClass = 0x82;

// Writes a template in the published layout; places are in dialog units.
class TemplateWriter {
 public:
  explicit TemplateWriter(std::vector<WORD>& words) : m_words(words) {}
  void Dialog(const SString& caption, int items, int width, int height) {
    Long(WS_POPUP | WS_CAPTION | WS_SYSMENU | DS_MODALFRAME | DS_CENTER | DS_SETFONT);
    Long(0);
    for (const int value : {items, 0, 0, width, height, 0, 0}) Word(value);
    Text(caption);
    Word(8);
    Text(WTEXT("MS Shell Dlg"));
  }
  void Item(WORD windowClass, int id, DWORD style, const SRect& place, const SString& text) {
    if (m_words.size() % 2 != 0) Word(0);
    Long(style | WS_CHILD | WS_VISIBLE);
    Long(0);
    for (const LONG value : {place.left, place.top, place.right - place.left, place.bottom - place.top})
      Word(static_cast<int>(value));
    for (const int value : {id, 0xFFFF, static_cast<int>(windowClass)}) Word(value);
    Text(text);
    Word(0);
  }

 private:
  void Word(int value) { m_words.push_back(static_cast<WORD>(value)); }
  void Long(DWORD value) {
    Word(LOWORD(value));
    Word(HIWORD(value));
  }
  void Text(const SString& text) {
    for (const WCHAR c : text.View()) Word(c);
    Word(0);
  }

  std::vector<WORD>& m_words;
};

}  // namespace

TextDialog::TextDialog(const SString& caption, const SString& prompt, const SString& text) : m_text(text) {
  TemplateWriter writer(m_template);
  writer.Dialog(caption, 4, 240, 64);
  writer.Item(kStaticClass, -1, SS_LEFT, SRect(7, 7, 233, 17), prompt);
  writer.Item(kEditClass, kEditId, WS_TABSTOP | WS_BORDER | ES_AUTOHSCROLL, SRect(7, 20, 233, 33), SString());
  writer.Item(kButtonClass, IDOK, WS_TABSTOP | BS_DEFPUSHBUTTON, SRect(129, 43, 179, 57), WTEXT("OK"));
  writer.Item(kButtonClass, IDCANCEL, WS_TABSTOP | BS_PUSHBUTTON, SRect(183, 43, 233, 57), WTEXT("Cancel"));
  SetTemplate(m_template.data());
}

void TextDialog::DoDataExchange(SDataExchange* exchange) { exchange->Text(kEditId, &m_text); }
