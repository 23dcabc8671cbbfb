// Texts, code pages, resources and numbers with arguments that are missing or contradict themselves. Linux only,
// because the other system does not look at all of them.

#ifndef _WIN32

#include <gtest/gtest.h>

#include <cmath>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>

#include "qxcore/platform/module.h"
#include "qxcore/platform/wide.h"
#include "tests/support/last_error.h"
#include "tests/support/temp_folder.h"

namespace {

using test::Text;

constexpr DWORD kBadParameter = ERROR_INVALID_PARAMETER;

TEST(TextArguments, AreLookedAt) {
  WCHAR text[40] = u"former";
  const WCHAR letter[] = u"\u00E9";
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, nullptr, 1, text, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 0, text, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 1, text, -1); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 1, nullptr, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, text, 1, text, 40); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(0, letter, 1, text, 40); }), DWORD(ERROR_INVALID_FLAGS));
  EXPECT_EQ(FoldStringW(MAP_COMPOSITE, letter, -1, nullptr, 0), 3) << "the terminator counts";
  EXPECT_EQ(ErrorOf([&] { return FoldStringW(MAP_COMPOSITE, letter, 1, text, 1); }), DWORD(ERROR_INSUFFICIENT_BUFFER));

  CPINFO info;
  CPINFOEXW more;
  EXPECT_EQ(ErrorOf([] { return GetCPInfo(1252, nullptr); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetCPInfo(12345, &info); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetCPInfoExW(12345, 0, &more); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return GetCPInfoExW(1252, 1, &more); }), kBadParameter);
  EXPECT_EQ(ErrorOf([] { return GetCPInfoExW(1252, 0, nullptr); }), kBadParameter);
  EXPECT_FALSE(IsDBCSLeadByteEx(12345, 0x81));
  EXPECT_EQ(ErrorOf([] { return EnumSystemCodePagesW(nullptr, CP_INSTALLED); }), kBadParameter);
  static int pages = 0;
  const auto stop = [](LPWSTR) -> BOOL { return ++pages < 3; };
  EXPECT_EQ(ErrorOf([&] { return EnumSystemCodePagesW(stop, 7); }), kBadParameter);
  EXPECT_TRUE(EnumSystemCodePagesW(stop, CP_SUPPORTED));
  EXPECT_EQ(pages, 3) << "the caller had enough";

  EXPECT_EQ(ErrorOf([] { return FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM, nullptr, 2, 0, nullptr, 10, nullptr); }),
            kBadParameter);
  EXPECT_EQ(ErrorOf([] { return LoadStringW(nullptr, 1, nullptr, 10); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return LoadStringW(nullptr, 1, text, -1); }), kBadParameter);
  EXPECT_EQ(ErrorOf([&] { return LoadStringW(platform::ModuleHandle(), 65000, text, 0); }),
            DWORD(ERROR_RESOURCE_NAME_NOT_FOUND));
  EXPECT_EQ(Text(text), u"former") << "there was no room to say so";
  EXPECT_EQ(ErrorOf([&] { return LoadStringW(platform::ModuleHandle(), 65000, text, 40); }),
            DWORD(ERROR_RESOURCE_NAME_NOT_FOUND));
  EXPECT_EQ(Text(text), u"");
  EXPECT_EQ(ErrorOf([] { return GetModuleHandleW(u"other") != nullptr; }), DWORD(ERROR_MOD_NOT_FOUND));
  const auto number = [](std::uintptr_t n) { return reinterpret_cast<LPCWSTR>(n); };
  constexpr std::uintptr_t kTexts = 6;
  for (const std::uintptr_t block : {std::uintptr_t{0}, std::uintptr_t{4000}}) {
    EXPECT_EQ(
        ErrorOf([&] { return FindResourceW(platform::ModuleHandle(), number(block), number(kTexts)) != nullptr; }),
        DWORD(ERROR_RESOURCE_NAME_NOT_FOUND));
  }
  EXPECT_EQ(ErrorOf([&] { return FindResourceW(nullptr, number(1), number(999)) != nullptr; }),
            DWORD(ERROR_RESOURCE_TYPE_NOT_FOUND));
}

TEST(TextArguments, NothingIsWrittenBehindTheRoom) {
  const std::string bytes("ab\0cd\0", 6);
  const Text wide(bytes.begin(), bytes.end());
  for (const UINT page : {1252u, 932u, 50220u, 54936u, 57002u, 65000u, 65001u}) {
    if (!IsValidCodePage(page)) continue;
    for (int room = 1; room <= 7; ++room) {
      WCHAR text[8];
      char back[8];
      std::fill_n(text, 8, u'#');
      std::fill_n(back, 8, '#');
      const int length = MultiByteToWideChar(page, 0, bytes.data(), 6, text, room);
      EXPECT_EQ(length, room >= 6 ? 6 : 0) << page;
      EXPECT_EQ(Text(text + room, text + 8), Text(static_cast<std::size_t>(8 - room), u'#')) << page << ' ' << room;
      const int size = WideCharToMultiByte(page, 0, wide.data(), 6, back, room, nullptr, nullptr);
      EXPECT_EQ(size, room >= 6 ? 6 : 0) << page;
      EXPECT_EQ(std::string(back + room, back + 8), std::string(static_cast<std::size_t>(8 - room), '#')) << page;
    }
  }
}

TEST(TextArguments, DefaultsOfTwoBytesAndLonelyHalves) {
  const WCHAR missing[] = {u'a', 0x0E01, u'b'}, half[] = {0xD800, u'x'};
  char bytes[20] = {};
  BOOL used = FALSE;
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "\x81\x48", &used), 4);
  EXPECT_EQ(std::string(bytes, 4),
            "a\x81\x48"
            "b");
  EXPECT_TRUE(used);
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "\x81", &used), 3) << "a lead byte alone stays one byte";
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "#", nullptr), 3);
  EXPECT_EQ(std::string(bytes, 3), "a#b");
  EXPECT_EQ(WideCharToMultiByte(932, 0, missing, 3, bytes, 20, "", nullptr), 3);
  EXPECT_EQ(bytes[1], '?');
  EXPECT_EQ(
      ErrorOf([&] { return WideCharToMultiByte(54936, WC_ERR_INVALID_CHARS, half, 2, bytes, 20, nullptr, nullptr); }),
      DWORD(ERROR_NO_UNICODE_TRANSLATION));
  EXPECT_GT(WideCharToMultiByte(54936, 0, half, 2, bytes, 20, nullptr, &used), 0);
  EXPECT_TRUE(used);
}

TEST(TextArguments, NumbersThatAreNoneAndLongPrecisions) {
  const auto format = [](const WCHAR* pattern, auto value) {
    WCHAR text[300];
    const int length = platform::WideFormat(text, 300, pattern, value);
    return length < 0 ? Text(u"refused") : Text(text, static_cast<std::size_t>(length));
  };
  const double infinite = HUGE_VAL, none = std::nan("");
  EXPECT_EQ(format(u"%E", -infinite), u"-1.#INF00E+000");
  EXPECT_EQ(format(u"%+g", infinite), u"+1.#INF");
  EXPECT_EQ(format(u"% G", none), u" 1.#QNAN");
  EXPECT_EQ(format(u"%.10f", none), u"1.#QNAN00000");
  EXPECT_EQ(format(u"%g", -none), u"-1.#IND");
  EXPECT_EQ(format(u"%.0g", 2.5), u"3");
  EXPECT_EQ(format(u"%+.1f", 2.0), u"+2.0");
  EXPECT_EQ(format(u"% .1f", 2.0), u" 2.0");
  EXPECT_EQ(format(u"%Lf", 1.0), u"1.000000");
  EXPECT_EQ(format(u"%#X", 255), u"0XFF");
  EXPECT_EQ(format(u"%#o", 8), u"010");
  EXPECT_EQ(format(u"%.0S", "narrow"), u"");
  EXPECT_EQ(format(u"%9999999999d", 1), u"refused");
  char narrow[200];
  const int length = std::snprintf(narrow, sizeof narrow, "%.70f", 0.1);
  EXPECT_EQ(format(u"%.70f", 0.1), Text(narrow, narrow + length));
}

// Numbers of every form, as another reader of numbers has them.
TEST(TextArguments, NumbersAreThoseOfTheRuntime) {
  std::mt19937 random(77);
  const auto digits = [&](int most) {
    std::string made;
    for (int i = static_cast<int>(random() % static_cast<unsigned>(most)); i > 0; --i)
      made += random() % 3 == 0 ? '0' : static_cast<char>('0' + random() % 10);
    return made;
  };
  for (int round = 0; round < 20000; ++round) {
    std::string text(random() % 3, ' ');
    text += std::string("+-").substr(random() % 3, 1);
    text += digits(12);
    if (random() % 2 == 0) text += "." + digits(random() % 9 == 0 ? 400 : 12);
    if (random() % 3 == 0)
      text += std::string("eE").substr(random() % 2, 1) + std::string("+-").substr(random() % 3, 1) + digits(4);
    text += std::string("x e").substr(random() % 3, 1);
    char* stop = nullptr;
    errno = 0;
    const double expected = std::strtod(text.c_str(), &stop);
    const bool isOut = errno == ERANGE && (expected == 0 || expected == HUGE_VAL || expected == -HUGE_VAL);
    const Text wide(text.begin(), text.end());
    const WCHAR* end = nullptr;
    errno = 0;
    ASSERT_EQ(platform::WideToDouble(wide.c_str(), &end), expected) << text;
    ASSERT_EQ(end - wide.c_str(), stop - text.c_str()) << text;
    if (isOut) {
      ASSERT_EQ(errno, ERANGE) << text;
    }
    const int base = static_cast<int>(random() % 36) + 1;
    std::string letters;
    for (int i = static_cast<int>(random() % 6); i > 0; --i) letters += static_cast<char>('/' + random() % 80);
    const std::string whole = std::string(random() % 2, ' ') + std::string("+-").substr(random() % 3, 1) +
                              (random() % 4 == 0 ? "0x" : "") + letters;
    const int asked = base == 1 ? 0 : base;
    const long long value = std::strtoll(whole.c_str(), &stop, asked);
    const Text wideWhole(whole.begin(), whole.end());
    if (value >= -0x80000000LL && value <= 0x7FFFFFFF) {
      ASSERT_EQ(platform::WideToLong(wideWhole.c_str(), &end, asked), value) << whole << " to base " << asked;
      ASSERT_EQ(end - wideWhole.c_str(), stop - whole.c_str()) << whole << " to base " << asked;
    }
  }
}

}  // namespace

#endif
