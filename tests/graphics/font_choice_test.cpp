// The fonts that the user chose: what is saved comes back, at any resolution, and what is no choice gives the usual
// one.

#include <gtest/gtest.h>

#include <string>

#include "qxcore/graphics/font.h"
#include "qxcore/system/settings/registry.h"
#include "tests/support/registry_root.h"
#include "tests/support/text.h"

namespace {

using Load = int (SFont::*)(unsigned int);
using Save = HRESULT (SFont::*)() const;

struct Kind {
  Load load;
  Save save;
  unsigned int styles;  // that are kept
};
constexpr unsigned int kAllStyles = SFont::kBold | SFont::kItalic | SFont::kUnderline | SFont::kStrikeOut;
constexpr Kind kUI = {&SFont::LoadDefaultUIFont, &SFont::SaveDefaultUIFont, kAllStyles};
constexpr Kind kRtf = {&SFont::LoadRtfFont, &SFont::SaveRtfFont, kAllStyles};
constexpr Kind kFixed = {&SFont::LoadFixedUIFont, &SFont::SaveFixedUIFont, SFont::kBold | SFont::kItalic};

SString Controls(const WCHAR* below = WTEXT("")) {
  return SRegistry::GetApplicationPath(SString(WTEXT("Controls")) + below);
}

class FontChoices : public testing::Test {
 protected:
  static void Forget() { test::DeleteTree(HKEY_CURRENT_USER, Controls()); }
  static LOGFONTW Loaded(const Kind& kind, unsigned int dpi = 96) {
    SFont font;
    LOGFONTW description = {};
    EXPECT_EQ((font.*kind.load)(dpi), 1);
    EXPECT_TRUE(font.GetLogFont(&description));
    return description;
  }
  // Face, height and style in a form to compare.
  static std::string Shown(const LOGFONTW& font) {
    return test::Narrow(font.lfFaceName) + " " + std::to_string(font.lfHeight) + (font.lfWeight > 500 ? " bold" : "") +
           (font.lfItalic ? " italic" : "") + (font.lfUnderline ? " underlined" : "") +
           (font.lfStrikeOut ? " struck out" : "");
  }
  static std::string ShownAs(const Kind& kind, unsigned int dpi = 96) { return Shown(Loaded(kind, dpi)); }
  static void Choose(const Kind& kind, const WCHAR* face, int points, unsigned int style) {
    SFont font;
    ASSERT_TRUE(font.Create(face, points, style));
    EXPECT_EQ((font.*kind.save)(), S_OK);
  }

  test::OwnUser m_user;
};

TEST_F(FontChoices, WhatIsChosenComesBackAtEveryResolution) {
  for (const Kind& kind : {kUI, kRtf, kFixed}) {
    for (unsigned int style = 0; style <= kAllStyles; ++style) {
      const int points = 4 + static_cast<int>(style) * 11;
      Choose(kind, WTEXT("Liberation Serif"), points, style);
      for (const unsigned int dpi : {96u, 144u, 240u}) {
        SFont wanted;
        LOGFONTW description = {};
        ASSERT_TRUE(wanted.Create(WTEXT("Liberation Serif"), points, style & kind.styles, dpi));
        ASSERT_TRUE(wanted.GetLogFont(&description));
        ASSERT_EQ(ShownAs(kind, dpi), Shown(description)) << style;
      }
    }
    Forget();
  }
}

TEST_F(FontChoices, EachKindHasItsOwn) {
  LOGFONTW stock = {};
  ::GetObjectW(::GetStockObject(DEFAULT_GUI_FONT), sizeof stock, &stock);
  EXPECT_EQ(ShownAs(kUI, 0), Shown(stock));
  EXPECT_EQ(ShownAs(kRtf), ShownAs(kUI)) << "not chosen, it is the user interface's";
  const std::string fixed = ShownAs(kFixed);
  ::GetObjectW(::GetStockObject(ANSI_FIXED_FONT), sizeof stock, &stock);
  stock.lfHeight = -13;  // ten points
  EXPECT_EQ(fixed, Shown(stock));

  Choose(kUI, WTEXT("Liberation Sans"), 12, SFont::kBold);
  EXPECT_EQ(ShownAs(kUI), "Liberation Sans -16 bold");
  EXPECT_EQ(ShownAs(kRtf), ShownAs(kUI));
  EXPECT_EQ(ShownAs(kFixed), fixed);
  Choose(kRtf, WTEXT("Liberation Serif"), 9, SFont::kItalic);
  Choose(kFixed, WTEXT("Liberation Mono"), 15, 0);
  EXPECT_EQ(ShownAs(kUI), "Liberation Sans -16 bold");
  EXPECT_EQ(ShownAs(kRtf), "Liberation Serif -12 italic");
  EXPECT_EQ(ShownAs(kFixed), "Liberation Mono -20");

  SString header;
  SRegistry(HKEY_CURRENT_USER, Controls(WTEXT("\\Grid")), 0).GetProfile(WTEXT("Header Font Name"), &header, SString());
  EXPECT_EQ(header, WTEXT("Liberation Sans"));
}

TEST_F(FontChoices, WhatIsMissingOrOutOfRangeIsNoChoice) {
  const std::string usual = ShownAs(kUI), usualFixed = ShownAs(kFixed);
  Choose(kUI, WTEXT("Liberation Sans"), 12, 0);
  SRegistry key(HKEY_CURRENT_USER, Controls(), 1);
  for (const long points : {0L, 3L, 289L, -12L}) {
    key.WriteProfile(WTEXT("UI Font Size"), points, 1);
    EXPECT_EQ(ShownAs(kUI), usual) << points;
  }
  key.WriteProfile(WTEXT("UI Font Size"), 12L, 1);
  EXPECT_EQ(ShownAs(kUI), "Liberation Sans -16");
  key.WriteProfile(WTEXT("UI Font Name"), SString(WTEXT("")));
  EXPECT_EQ(ShownAs(kUI), usual);

  // Of the two keys for the fixed font the first one that names a font counts.
  Choose(kFixed, WTEXT("Liberation Mono"), 15, 0);
  SRegistry own(HKEY_CURRENT_USER, Controls(WTEXT("\\Editor\\Font")), 1);
  own.WriteProfile(WTEXT("Facename"), SString(WTEXT("Courier New")));
  EXPECT_EQ(ShownAs(kFixed), "Courier New -20");
  own.WriteProfile(WTEXT("Size"), 1000L, 1);
  EXPECT_EQ(ShownAs(kFixed), "Liberation Mono -20");
  SRegistry(HKEY_CURRENT_USER, Controls(WTEXT("\\Editor\\Default\\Font")), 1).DeleteProfile(WTEXT("Facename"), 0);
  EXPECT_EQ(ShownAs(kFixed), usualFixed);
}

TEST_F(FontChoices, ARegistryThatCannotBeWrittenIsAnError) {
  if (IsWindows()) GTEST_SKIP() << "the registry there can always be written";
  test::SetVariable("QXCORE_REGISTRY", "/proc/nowhere/registry.db");
  SFont font;
  ASSERT_TRUE(font.Create(WTEXT("Liberation Sans"), 12, 0));
  for (const Kind& kind : {kUI, kRtf, kFixed}) EXPECT_NE((font.*kind.save)(), S_OK);
  test::SetVariable("QXCORE_REGISTRY", m_user.Root().File());
  EXPECT_EQ(font.SaveDefaultUIFont(), S_OK);
}

}  // namespace
