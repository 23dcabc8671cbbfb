// Builds dialog templates in the published binary layout.
#pragma once

#include <cstddef>
#include <cstdint>
#include <vector>

#include "qxcore/platform/win32.h"

namespace test {

class DialogTemplate {
 public:
  explicit DialogTemplate(SStringView caption, DWORD style = WS_POPUP | WS_CAPTION | WS_SYSMENU | DS_MODALFRAME) {
    Put32(style), Put32(0);
    Put16(0);  // the number of items, counted by Item
    for (int number : {10, 10, 120, 80}) Put16(number);
    Put16(0), Put16(0);  // no menu, the usual class
    Text(caption);
  }
  DialogTemplate& Item(WORD classNumber, SStringView text, DWORD style, WORD id, int y = 5) {
    while (m_words.size() % 2 != 0) Put16(0);
    Put32(style | WS_CHILD | WS_VISIBLE), Put32(0);
    for (int number : {5, y, 50, 12}) Put16(number);
    Put16(id);
    Put16(0xFFFF), Put16(classNumber);
    Text(text);
    Put16(0);
    ++m_words[4];
    return *this;
  }
  DialogTemplate& Button(SStringView text, DWORD style, WORD id, int y = 5) {
    return Item(0x0080, text, style | WS_TABSTOP, id, y);
  }
  DialogTemplate& Edit(WORD id, int y = 20) { return Item(0x0081, SStringView(), WS_TABSTOP | WS_BORDER, id, y); }
  const void* Data() const { return m_words.data(); }
  std::size_t Size() const { return m_words.size() * sizeof(m_words[0]); }  // in bytes

 private:
  void Put16(int number) { m_words.push_back(static_cast<std::uint16_t>(number)); }
  void Put32(DWORD number) { Put16(static_cast<int>(number & 0xFFFF)), Put16(static_cast<int>(number >> 16)); }
  void Text(SStringView text) {
    for (WCHAR c : text) Put16(c);
    Put16(0);
  }
  std::vector<std::uint16_t> m_words;
};

}  // namespace test
