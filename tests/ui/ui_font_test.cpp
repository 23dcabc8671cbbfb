// The font of the user interface, which is read once and kept until it is to be read anew.

#include "qxcore/ui/app/ui_font.h"
#include "tests/support/registry_root.h"
#include "tests/ui/ui_fixture.h"

namespace {

class UIFont : public testing::Test {
 protected:
  void SetUp() override { SUpdateDefaultUIFont(); }
  void TearDown() override { SUpdateDefaultUIFont(); }
  static void Choose(const WCHAR* face, int points) {
    SFont font;
    ASSERT_TRUE(font.Create(face, points, 0, 96));
    ASSERT_EQ(font.SaveDefaultUIFont(), S_OK);
  }
  static LOGFONTW DescriptionOf(HFONT font) {
    LOGFONTW description = {};
    EXPECT_NE(::GetObjectW(font, sizeof description, &description), 0) << "the handle is no longer valid";
    return description;
  }

  test::OwnUser m_user;
};

TEST_F(UIFont, AChoiceCountsFromWhenItIsReadAnew) {
  const HFONT usual = SGetDefaultUIFont(96);
  const LOGFONTW before = DescriptionOf(usual);
  Choose(WTEXT("Liberation Serif"), 20);
  EXPECT_EQ(SGetDefaultUIFont(96), usual);
  SUpdateDefaultUIFont();
  const HFONT chosen = SGetDefaultUIFont(96), larger = SGetDefaultUIFont(192);
  EXPECT_EQ(SString(DescriptionOf(chosen).lfFaceName), WTEXT("Liberation Serif"));
  EXPECT_NEAR(DescriptionOf(larger).lfHeight, 2 * DescriptionOf(chosen).lfHeight, 1) << "each is rounded";
  EXPECT_EQ(SGetDefaultUIFont(96), chosen);
  EXPECT_EQ(DescriptionOf(usual).lfHeight, before.lfHeight);

  // What is as before has the handle of before, so that going to and fro takes no more fonts.
  Choose(WTEXT("Liberation Sans"), 9);
  SUpdateDefaultUIFont();
  EXPECT_NE(SGetDefaultUIFont(96), chosen);
  Choose(WTEXT("Liberation Serif"), 20);
  SUpdateDefaultUIFont();
  EXPECT_EQ(SGetDefaultUIFont(96), chosen);
  EXPECT_EQ(SGetDefaultUIFont(192), larger);
}

}  // namespace
