// A dialog that asks for one line of text: a folder, or an encoding.
#pragma once

#include <vector>

#include "qxcore/ui/frame/dialog.h"

class TextDialog : public SDlg {
 public:
  // The text that stands there at first becomes what the user typed.
  TextDialog(const SString& caption, const SString& prompt, const SString& text);

  const SString& GetText() const { return m_text; }

 protected:
  void DoDataExchange(SDataExchange* exchange) override;

 private:
  SString m_text;
  std::vector<WORD> m_template;
};
