// From the bytes of an RTF text to characters: which code page a font's character set stands for, and the
// page's table.
#pragma once

#include <cstdint>
#include <string>

#include "qxcore/platform/posix/code_page.h"
#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {

// One code page, ready to decode.
class Charset {
 public:
  // The page, or windows-1252 where the page is unknown. Throws std::bad_alloc.
  static const Charset* Of(UINT page);

  // A byte that stands for one character: the character. Else 0: it is a lead byte, or IsLong().
  WCHAR Single(unsigned char byte) const {
    return m_table != nullptr && (m_table->kind[byte] & DecodeTable::kLead) == 0 ? m_table->single[byte] : u'\0';
  }
  // The character of a lead byte and the byte behind it; 0 when the page has none.
  WCHAR Double(unsigned char lead, unsigned char trail) const {
    return m_table != nullptr && m_table->doubles != nullptr ? m_table->doubles[lead * 256 + trail] : u'\0';
  }
  // Whether a character may take more than two bytes; then whole sequences are decoded at a time.
  bool IsLong() const { return m_table == nullptr; }
  std::u16string Decode(const std::string& bytes) const;

 private:
  UINT m_page = 0;
  const DecodeTable* m_table = nullptr;
};

// The code page of a font's texts, by its character set (\fcharset) and code page (\cpg); `documentPage` is
// that of fonts that name none.
UINT CodePageOf(const Font& font, UINT documentPage);

}  // namespace platform::rich
