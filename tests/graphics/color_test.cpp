// SColor: texts, blends, hue, saturation and lightness.
#include "qxcore/graphics/color.h"

#include <gtest/gtest.h>

#include <cmath>
#include <random>

#include "tests/support/text.h"

namespace {

// The blend once more, from its description: whole numbers of the way, cut; a falling channel one less.
unsigned long Blend(unsigned long from, unsigned long to, int step, int steps) {
  if (steps == 0 || step == 0 || from == to) return from;
  if (step == steps) return to;
  unsigned long result = 0;
  for (unsigned long unit = 1; unit <= 0x10000; unit *= 256) {
    long first = static_cast<long>(from / unit % 256), last = static_cast<long>(to / unit % 256);
    long distance = std::labs(last - first) * step / steps;
    if (last < first) distance = distance == 0 ? 0 : -(distance - 1);
    result += static_cast<unsigned long>((first + distance + 256) % 256) * unit;
  }
  return result;
}

TEST(Colors, BlendsFollowTheDescription) {
  EXPECT_EQ(SColor::GetMediumColor(0x000000, 0xFFFFFF, 1, 3), 0x555555u);
  EXPECT_EQ(SColor::GetMediumColor(0xFFFFFF, 0x000000, 1, 3), 0xABABABu);
  EXPECT_EQ(SColor::GetDarkColor1(0xFFFFFF), 0xE7E7E7u);
  EXPECT_EQ(SColor::GetLightColor9(0x000000), 0xE5E5E5u);
  std::mt19937 random(1);
  for (int i = 0; i < 200000; ++i) {
    unsigned long from = random() & 0xFFFFFF, to = random() & 0xFFFFFF;
    int steps = static_cast<int>(random() % 400), step = steps ? static_cast<int>(random() % (steps + 1u)) : 3;
    ASSERT_EQ(SColor::GetMediumColor(from, to, step, steps), Blend(from, to, step, steps))
        << std::hex << from << ' ' << to << std::dec << ' ' << step << '/' << steps;
  }
}

TEST(Colors, EarlyReturnsKeepTheTopByte) {
  EXPECT_EQ(SColor::GetMediumColor(SColor::Default, 5, 0, 9), SColor::Default);
  EXPECT_EQ(SColor::GetMediumColor(5, SColor::None, 9, 9), SColor::None);
  EXPECT_EQ(SColor::GetMediumColor(SColor::None, 5, 4, 0), SColor::None);
  EXPECT_EQ(SColor::GetMediumColor(SColor::Default, 0xFF0000FF, 1, 2) >> 24, 0u);
}

TEST(Colors, NamesGoBothWays) {
  const SColor::Colors named[] = {SColor::Black,       SColor::DarkRed,     SColor::Red,          SColor::DarkGreen,
                                  SColor::DarkYellow,  SColor::Green,       SColor::Yellow,       SColor::DarkBlue,
                                  SColor::DarkMagenta, SColor::DarkCyan,    SColor::DarkGray,     SColor::Gray,
                                  SColor::LightGray,   SColor::LightGreen,  SColor::LightBlue,    SColor::Cream,
                                  SColor::LightRed,    SColor::LightYellow, SColor::LightMagenta, SColor::Blue,
                                  SColor::Magenta,     SColor::Cyan,        SColor::LightCyan,    SColor::White,
                                  SColor::Default,     SColor::None};
  for (SColor color : named) {
    SString name = color.GetAsString(), small = name;
    small.ToLower();
    EXPECT_GT(name[0], '9') << "a name, no number";
    EXPECT_EQ(SColor(name), color);
    EXPECT_EQ(SColor(SString(WTEXT(" \t")) + small + WTEXT(" ")), color);
  }
  EXPECT_EQ(SColor(0xF0FBFF).Format(), WTEXT("Cream"));
  EXPECT_EQ(SColor(0xA4A0A0).Format(), WTEXT("Gray"));
  EXPECT_EQ(SColor(0xF0FBFF).Format(0), WTEXT("255 251 240"));
  EXPECT_EQ(SColor(0x030201).Format(), WTEXT("1 2 3"));
  EXPECT_EQ(SColor(0x030201).Format(1, WTEXT("#%02X%02X%02X")), WTEXT("#010203"));
}

TEST(Colors, TextsOfNumbersAndOfTheSystem) {
  struct Case {
    const WCHAR* text;
    std::uint32_t value;
  } good[] = {{WTEXT("1 2 3"), 0x030201},       {WTEXT("1, 2 ; 3"), 0x030201},     {WTEXT("RGB(255,0,10)"), 0x0A00FF},
              {WTEXT("rgb (1 2 3)"), 0x030201}, {WTEXT("#0a0B0c"), 0x0C0B0A},      {WTEXT("#f80"), 0x0088FF},
              {WTEXT("0x30201"), 0x030201},     {WTEXT("0XFF000000"), 0xFF000000}, {WTEXT("0xffffffff"), 0xFFFFFFFF}};
  for (const Case& item : good) EXPECT_EQ(SColor(SString(item.text)), item.value) << item.value;
  for (const WCHAR* bad :
       {WTEXT(""), WTEXT("256 0 0"), WTEXT("1 2"), WTEXT("1 2 3 4"), WTEXT("#12345"), WTEXT("0x"), WTEXT("0x1000000"),
        WTEXT("-1 2 3"), WTEXT("1 2 3x"), WTEXT("(1 2 3"), WTEXT("Greenish"), WTEXT("99999999999 1 1")}) {
    SColor color(0x123456);
    EXPECT_EQ(color.SetAsString(SString(bad)), 0);
    EXPECT_EQ(color, 0x123456u) << "kept";
  }
  EXPECT_EQ(SColor(SString(WTEXT("gradientactivecaption"))), GetSysColor(COLOR_GRADIENTACTIVECAPTION));
  EXPECT_EQ(SColor(SString(WTEXT("ButtonFace"))), GetSysColor(COLOR_BTNFACE));
  std::mt19937 random(2);
  for (int i = 0; i < 2000; ++i) {
    SColor color(random() & 0xFFFFFF), again;
    again = color.GetAsString();
    ASSERT_EQ(again, color);
  }
}

TEST(Colors, HueSaturationLightnessGoBothWays) {
  std::mt19937 random(3);
  for (int i = 0; i < 300000; ++i) {
    SColor color(i < 4096 ? static_cast<std::uint32_t>((i & 15) * 0x11 + (i >> 4 & 15) * 0x1100 + (i >> 8) * 0x110000)
                          : random() & 0xFFFFFF);
    double hue, saturation, lightness;
    color.GetHSLColor(&hue, &saturation, &lightness);
    ASSERT_TRUE(hue >= 0 && hue < 360 && saturation >= 0 && saturation <= 1 + 1e-12 && lightness >= 0 &&
                lightness <= 1);
    SColor again;
    again.SetHSLColor(hue + (i % 5 - 2) * 360, saturation, lightness);  // whole turns in either direction
    ASSERT_EQ(again, color) << std::hex << static_cast<COLORREF>(color);
  }
  struct Case {
    double hue, saturation, lightness;
    std::uint32_t value;
  } cases[] = {{0, 1, 0.5, 0x0000FF}, {120, 1, 0.5, 0x00FF00}, {240, 1, 0.5, 0xFF0000}, {-60, 1, 0.5, 0xFF00FF},
               {0, 0, 0.5, 0x808080}, {77, 2, 1.5, 0xFFFFFF},  {200, -1, -3, 0x000000}, {60, 1, 0.25, 0x008080}};
  for (const Case& item : cases) {
    SColor color;
    color.SetHSLColor(item.hue, item.saturation, item.lightness);
    EXPECT_EQ(color, item.value) << item.hue;
  }
}

}  // namespace
