// Merging: the tables of two texts, and references that are renumbered as a second reading of them says.

#include "fuzz/fuzz_input.h"
#include "qxcore/graphics/rtf/color_table.h"
#include "qxcore/graphics/rtf/font_table.h"
#include "qxcore/ui/rtf/document.h"
#include "tests/rtf/reference_walk.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 8000) return 0;
  FuzzInput input(data, size);
  SString first(ToText(input.Part("\1")).c_str()), second(ToText(input.Rest()).c_str());
  SString firstFonts, firstColors, fonts, colors;
  SRtfDocument::ExtractFontTable(first, firstFonts, 0);
  SRtfDocument::ExtractColorTable(first, firstColors, 0);
  SRtfDocument::ExtractFontTable(second, fonts, 0);
  SRtfDocument::ExtractColorTable(second, colors, 0);

  SRtfFontTable fontTable;
  SRtfColorTable colorTable;
  fontTable.AddFontTable(firstFonts);
  colorTable.AddColorTable(firstColors);
  const int kept = fontTable.GetCount();
  const SString before = fontTable.GetFontTable();
  const SMap<int, int> fontMap = fontTable.AddFontTable(fonts), colorMap = colorTable.AddColorTable(colors);
  SRtfFontTable alone;
  alone.AddFontTable(firstFonts);
  FUZZ_CHECK(alone.GetFontTable() == before && fontTable.GetCount() >= kept);

  SString result;
  FUZZ_CHECK(SRtfDocument::ChangeFontAndColor(second, result, fontMap, colorMap) == 1);
  FUZZ_CHECK(walk::Renumber(walk::Text(second.View()), fontMap, colorMap) == result);
  return 0;
}
