// Font and colour tables of any text: what was read is written and read back without change.

#include "fuzz/fuzz_input.h"
#include "qxcore/graphics/rtf/color_table.h"
#include "qxcore/graphics/rtf/font_table.h"

namespace {

void CheckFonts(const SString& text) {
  SRtfFontTable table, again;
  const SMap<int, int> numbers = table.AddFontTable(text);
  for (const auto& [from, to] : numbers) FUZZ_CHECK(to >= 0 && to < table.GetCount());
  for (int i = 0; i < table.GetCount(); ++i) {
    FUZZ_CHECK(table[i].m_number == i && !table[i].m_name.IsEmpty());
    for (int j = 0; j < i && i < 50; ++j) FUZZ_CHECK(!(table[i] == table[j]));
    SRtfFontEntry entry;
    FUZZ_CHECK(entry.SetFontEntry(table[i].GetFontEntry()) == 1);
    FUZZ_CHECK(entry.m_number == i && entry.m_name == table[i].m_name);
  }
  const SString written = table.GetFontTable();
  FUZZ_CHECK(again.AddFontTable(written).GetCount() == table.GetCount());
  FUZZ_CHECK(again.GetFontTable() == written);
  FUZZ_CHECK(table.AddFontTable(text).GetCount() == numbers.GetCount() && table.GetFontTable() == written);
}

void CheckColors(const SString& text) {
  SRtfColorTable table, again;
  const SMap<int, int> numbers = table.AddColorTable(text);
  int expected = 0;
  for (const auto& [from, to] : numbers) FUZZ_CHECK(from == expected++ && to >= 0 && to < table.GetCount());
  const SString written = table.GetColorTable();
  FUZZ_CHECK(again.AddColorTable(written).GetCount() == table.GetCount());
  FUZZ_CHECK(again.GetColorTable() == written);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 8000) return 0;
  FuzzInput input(data, size);
  const std::basic_string<WCHAR> text = ToText(input.Rest());
  CheckFonts(text.c_str());
  CheckColors(text.c_str());
  SRtfFontEntry entry;
  const int isEntry = entry.SetFontEntry(text.c_str());
  FUZZ_CHECK(isEntry == !entry.m_name.IsEmpty());
  return 0;
}
