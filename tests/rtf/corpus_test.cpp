// Real documents through everything but the control: tags, parts, tables, merging. The documents lie in the
// folder that QXCORE_CORPUS names, under rtf/; without it the tests are left out.

#include <gtest/gtest.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <map>
#include <vector>

#include "qxcore/graphics/rtf/color_table.h"
#include "qxcore/graphics/rtf/font_table.h"
#include "qxcore/ui/rtf/document.h"
#include "tests/rtf/reference_walk.h"
#include "tests/rtf/rtf_file.h"
#include "tests/support/text.h"

namespace {

namespace fs = std::filesystem;
using walk::Text;

struct RealDocument {
  std::string name;
  SString text;
};

const std::vector<RealDocument>& Documents() {
  static const std::vector<RealDocument> documents = [] {
    std::vector<RealDocument> read;
    const char* corpus = std::getenv("QXCORE_CORPUS");
    if (corpus == nullptr) {
      std::printf("left out: real RTF documents, because QXCORE_CORPUS is not set\n");
      return read;
    }
    std::map<std::string, fs::path> paths;
    for (const auto& entry : fs::directory_iterator(fs::path(corpus) / "rtf" / "files"))
      paths[entry.path().filename().string()] = entry.path();
    for (const auto& [name, path] : paths) read.push_back({name, ReadRtfFile(path)});
    EXPECT_GT(read.size(), 100u);
    return read;
  }();
  return documents;
}

// --- a second reading of the tables ---

Text Lower(Text text) {
  for (WCHAR& c : text) c = platform::ToLowerBmp(c);
  return text;
}

// The name that each number of a font table has, where a reader takes the last text before a ";" or the
// entry's end, and skips groups inside an entry.
std::map<long, Text> FontNames(const Text& table) {
  std::map<long, Text> names;
  long number = -1, depth = 0;
  Text name;
  const auto end = [&] {
    while (!name.empty() && (name.back() == ' ' || name.back() == '\r' || name.back() == '\n')) name.pop_back();
    if (number >= 0 && !name.empty()) names[number] = Lower(name);
    number = -1;
    name.clear();
  };
  for (std::size_t at = 0; at < table.size(); ++at) {
    const WCHAR c = table[at];
    if (c == '{') {
      ++depth;
      if (number >= 0) {
        for (long inner = 1; inner > 0;) {
          ++at;
          inner += table[at] == '{' ? 1 : table[at] == '}' ? -1 : 0;
        }
        --depth;
      }
    } else if (c == '}' || c == ';') {
      end();
      if (c == '}' && --depth == 0) break;
    } else if (c == '\\' && table[at + 1] == 'f' && walk::IsDigit(table[at + 2]) && name.empty()) {
      std::string digits;
      for (at += 2; walk::IsDigit(table[at]); ++at) digits += static_cast<char>(table[at]);
      number = std::atol(digits.c_str());
      at -= table[at] == ' ' ? 0 : 1;
    } else if (c == '\\' && walk::IsLetter(table[at + 1]) && name.empty() && table[at + 1] != 'u') {
      while (walk::IsLetter(table[at + 1])) ++at;
      while (walk::IsDigit(table[at + 1]) || table[at + 1] == '-') ++at;
      if (table[at + 1] == ' ') ++at;
    } else if (c != '\r' && c != '\n' && (c != ' ' || !name.empty())) {
      name += c;
    }
  }
  return names;
}

std::vector<Text> Colors(const Text& table) {
  std::vector<Text> colors;
  Text definition;
  const std::size_t start = table.find(WTEXT("colortbl"));
  for (std::size_t at = start == Text::npos ? table.size() : start + 8; at < table.size(); ++at) {
    const bool isBlank = table[at] == ' ' || table[at] == '\r' || table[at] == '\n';
    if (table[at] == ';') {
      while (!definition.empty() && definition.back() <= ' ') definition.pop_back();
      colors.push_back(definition);
      definition.clear();
    } else if (table[at] != '}' && !(isBlank && definition.empty())) {
      definition += table[at];
    }
  }
  return colors;
}

struct Tables {
  SString fonts, colors;
  explicit Tables(const SString& document) {
    SString text(document);
    SRtfDocument::ExtractFontTable(text, fonts, 0);
    SRtfDocument::ExtractColorTable(text, colors, 0);
  }
};

// --- tests ---

TEST(Corpus, TagsMakeUpTheWholeText) {
  for (const RealDocument& document : Documents()) {
    for (const int wholeGroup : {0, 1}) {
      const WCHAR* at = document.text;
      const WCHAR* start;
      long length;
      for (; SRtfDocument::GetNextTag(&start, &length, at, wholeGroup) != 0; at = start + length)
        for (; at < start; ++at) ASSERT_LE(*at, ' ') << document.name;
      EXPECT_EQ(*start, 0) << document.name;
    }
  }
}

TEST(Corpus, TablesComeOutAsASecondReadingSays) {
  int fonts = 0, colors = 0;
  for (const RealDocument& document : Documents()) {
    const Tables tables(document.text);
    SRtfFontTable fontTable;
    SRtfColorTable colorTable;
    const SMap<int, int> fontNumbers = fontTable.AddFontTable(tables.fonts);
    const SMap<int, int> colorNumbers = colorTable.AddColorTable(tables.colors);

    const std::map<long, Text> names = FontNames(Text(tables.fonts.View()));
    EXPECT_EQ(fontNumbers.size(), names.size()) << document.name;
    for (const auto& [number, name] : names) {
      const int* place = fontNumbers.Retrieve(static_cast<int>(number));
      ASSERT_NE(place, nullptr) << document.name << " font " << number;
      EXPECT_EQ(Lower(Text(fontTable[*place].m_name)), name) << document.name;
    }
    const std::vector<Text> definitions = Colors(Text(tables.colors.View()));
    ASSERT_EQ(colorNumbers.size(), definitions.size()) << document.name;
    for (const auto& [from, to] : colorNumbers)
      EXPECT_EQ(colorTable[to].m_text, SStringView(definitions[static_cast<std::size_t>(from)])) << document.name;
    fonts += fontTable.GetCount();
    colors += colorTable.GetCount();

    SRtfFontTable fontsAgain;
    SRtfColorTable colorsAgain;
    EXPECT_EQ(static_cast<int>(fontsAgain.AddFontTable(fontTable.GetFontTable()).size()), fontTable.GetCount());
    EXPECT_EQ(fontsAgain.GetFontTable(), fontTable.GetFontTable()) << document.name;
    colorsAgain.AddColorTable(colorTable.GetColorTable());
    EXPECT_EQ(colorsAgain.GetColorTable(), colorTable.GetColorTable()) << document.name;
  }
  if (!Documents().empty()) std::printf("%d fonts and %d colours\n", fonts, colors);
}

// The name or definition behind each reference of a body.
std::vector<Text> Resolve(const Text& body, const Text& fonts, const Text& colors) {
  const std::map<long, Text> names = FontNames(fonts);
  const std::vector<Text> definitions = Colors(colors);
  std::vector<Text> resolved;
  for (const walk::Reference& reference : walk::References(body)) {
    const auto number = static_cast<std::size_t>(reference.number);
    if (!reference.isFont) {
      resolved.push_back(number < definitions.size() ? definitions[number] : WTEXT("missing"));
    } else {
      const auto name = names.find(static_cast<long>(reference.number));
      resolved.push_back(name != names.end() ? name->second : WTEXT("missing"));
    }
  }
  return resolved;
}

TEST(Corpus, MergedReferencesLeadWhereTheyLedBefore) {
  std::size_t references = 0, missing = 0;
  const std::vector<RealDocument>& documents = Documents();
  for (std::size_t i = 0; i < documents.size(); ++i) {
    const RealDocument& first = documents[i];
    const RealDocument& second = documents[(i + 1) % documents.size()];
    SRtfFontTable fonts;
    SRtfColorTable colors;
    std::vector<Text> before[2], after[2];
    const SString* const texts[] = {&first.text, &second.text};
    SString bodies[2], changed[2];
    for (int n = 0; n < 2; ++n) {
      const Tables tables(*texts[n]);
      SString header;
      bodies[n] = *texts[n];
      SRtfDocument::ExtractHeader(bodies[n], header, 1);
      before[n] = Resolve(Text(bodies[n].View()), Text(tables.fonts.View()), Text(tables.colors.View()));
      const SMap<int, int> fontMap = fonts.AddFontTable(tables.fonts), colorMap = colors.AddColorTable(tables.colors);
      ASSERT_EQ(SRtfDocument::ChangeFontAndColor(bodies[n], changed[n], fontMap, colorMap), 1);
      EXPECT_EQ(changed[n], SStringView(walk::Renumber(Text(bodies[n].View()), fontMap, colorMap)));
    }
    for (int n = 0; n < 2; ++n) {
      after[n] =
          Resolve(Text(changed[n].View()), Text(fonts.GetFontTable().View()), Text(colors.GetColorTable().View()));
      ASSERT_EQ(before[n].size(), after[n].size());
      for (std::size_t k = 0; k < before[n].size(); ++k) {
        ++references;
        if (before[n][k] == WTEXT("missing")) {
          ++missing;  // led nowhere before
        } else {
          EXPECT_EQ(SString(SStringView(after[n][k])), SStringView(before[n][k])) << first.name << " + " << second.name;
        }
      }
    }
  }
  if (!documents.empty()) std::printf("%zu references, %zu of them to nothing\n", references, missing);
}

// Whatever is cut off, nothing hangs or reads beyond the end.
TEST(Corpus, CutsAreRead) {
  for (const RealDocument& document : Documents()) {
    for (int length = 0; length < document.text.Length(); length += 64) {
      SString cut(document.text.Left(length));
      const Tables tables(cut);
      SRtfFontTable fonts;
      SRtfColorTable colors;
      SString part, result;
      const SMap<int, int> fontMap = fonts.AddFontTable(tables.fonts), colorMap = colors.AddColorTable(tables.colors);
      SRtfDocument::ExtractStyleTable(cut, part, 0);
      SRtfDocument::ExtractHeader(cut, part, 1);
      ASSERT_EQ(SRtfDocument::ChangeFontAndColor(cut, result, fontMap, colorMap), 1);
    }
  }
}

}  // namespace
