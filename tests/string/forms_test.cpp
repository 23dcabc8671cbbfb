// Forms of one operation beside each other: narrow and wide, with and without a start or a count, near the edges; and
// active code pages other than 1252.

#include <climits>
#include <cstdarg>
#include <cstdio>
#include <regex>
#include <string>

#include "qxcore/core/exception.h"
#include "qxcore/string/ansi_string.h"
#include "qxcore/string/natural_compare.h"
#include "qxcore/string/string.h"
#include "qxcore/string/string_buffer.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

namespace {

std::string Narrow(const WideString& text) { return std::string(text.begin(), text.end()); }

// --- narrow texts ---

TEST(NarrowForms, AreTheWideOnes) {
  RandomText random(31);
  for (int round = 0; round < 300; ++round) {
    const WideString left = random.Make(40, WTEXT("abc ")), right = random.Make(40, WTEXT("xyz!"));
    const SString a = SStringView(left), b = SStringView(right);
    const std::string narrowA = Narrow(left), narrowB = Narrow(right);
    const SString joined = SStringView(left + right);
    ASSERT_EQ(a + narrowB.c_str(), joined);
    ASSERT_EQ(narrowA.c_str() + b, joined);
    SString text;
    text = narrowA.c_str();
    ASSERT_EQ(text, a);
    text += narrowB.c_str();
    ASSERT_EQ(text, joined);
    ASSERT_EQ(a + 'q', a + WTEXT("q"));
    ASSERT_EQ('q' + a, WTEXT("q") + a);
    ASSERT_EQ(a + WTEXT('q'), a + WTEXT("q"));
    ASSERT_EQ(WTEXT('q') + a, WTEXT("q") + a);
    text = 'q';
    text += 'r';
    text += WTEXT('s');
    ASSERT_EQ(text, WTEXT("qrs"));
  }
  SString text = WTEXT("kept");
  text += static_cast<const char*>(nullptr);
  EXPECT_EQ(text, WTEXT("kept"));
  text += static_cast<char>(0);
  EXPECT_EQ(text.Left(4), WTEXT("kept"));
  text = '\0';
  EXPECT_TRUE(text.IsEmpty()) << "a NUL ends a narrow text";
  text = WTEXT("x");
  text = static_cast<const char*>(nullptr);
  EXPECT_TRUE(text.IsEmpty());
}

TEST(NarrowForms, BuffersTakeThemToo) {
  SStringBuffer buffer(10);
  buffer += 'a';
  buffer += static_cast<char>(0);
  buffer.Concat(nullptr, 5);
  buffer.Concat(WTEXT("none"), 0);
  buffer.Concat(WTEXT("none"), -3);
  buffer.Concat(WTEXT("b\0c"), 3);
  buffer += WTEXT('c');
  SString text = buffer;
  EXPECT_EQ(text, WTEXT("abc"));
  text += buffer;
  EXPECT_EQ(text, WTEXT("abcabc"));
  SStringBuffer full(text, 100);
  text = full;
  EXPECT_EQ(text, WTEXT("abcabc"));
  full = full.View().data() + 2;  // of its own content
  EXPECT_TRUE(full.View() == WTEXT("cabc"));
  full = static_cast<const WCHAR*>(nullptr);
  EXPECT_TRUE(full.IsEmpty());
}

// A ratio that rounds to nothing still makes room, for one character at least.
TEST(NarrowForms, BuffersGrowWhateverTheirRatio) {
  SStringBuffer slow(3000, 3001, 3000);
  WideString expected;
  for (int i = 0; i < 5000; ++i) {
    slow += static_cast<WCHAR>('a' + i % 26);
    expected += static_cast<WCHAR>('a' + i % 26);
  }
  EXPECT_TRUE(slow.View() == expected);
  SStringBuffer large(0x7FFFFFF0u, 0, 0);
  EXPECT_THROW(large += WTEXT("too much"), SEOutOfMemory);
  EXPECT_TRUE(large.IsEmpty());
}

// --- formats ---

SString Formatted(const WCHAR* format, ...) {
  SString text(WTEXT("before"));
  std::va_list arguments;
  va_start(arguments, format);
  text.FormatV(format, arguments);
  va_end(arguments);
  return text;
}

template <class... Values>
std::string Printed(const std::string& format, Values... values) {
  char text[2000];
  std::snprintf(text, sizeof text, format.c_str(), values...);
  return text;
}

TEST(FormatForms, WidthsAndSizesFromTheArguments) {
  RandomText random(41);
  const std::string kTypes = "diuxXo";
  for (int round = 0; round < 2000; ++round) {
    const std::string type(1, kTypes[static_cast<std::size_t>(random.Number(6))]);
    const int width = random.Number(61) - 30;
    const int value = random.Number(1 << 30) - (1 << 29);
    const long longValue = static_cast<long>(value) * (round % 7 + 1);
    const long long longLong = static_cast<long long>(value) * 0x10001;
    ASSERT_EQ(Formatted(SString(("%*" + type).c_str()), width, value),
              SString(Printed("%*" + type, width, value).c_str()));
    ASSERT_EQ(Formatted(SString(("<%h" + type + ">").c_str()), value),
              SString(Printed("<%h" + type + ">", value).c_str()));
    ASSERT_EQ(Formatted(SString(("%#l" + type + "|").c_str()), longValue),
              SString(Printed("%#l" + type + "|", longValue).c_str()));
    for (const char* size : {"I64", "ll"}) {
      const std::string format = std::string("%") + size + type + ";%s";
      ASSERT_EQ(Formatted(SString(format.c_str()), longLong, WTEXT("behind")),
                SString((Printed("%ll" + type, longLong) + ";behind").c_str()))
          << format;
    }
    ASSERT_EQ(Formatted(SString(("%I32" + type + ";%s").c_str()), value, WTEXT("behind")),
              SString((Printed("%" + type, value) + ";behind").c_str()));
    ASSERT_EQ(Formatted(SString(("%I" + type + ";%s").c_str()), static_cast<std::ptrdiff_t>(value), WTEXT("behind")),
              SString((Printed("%t" + type, static_cast<std::ptrdiff_t>(value)) + ";behind").c_str()));
#ifndef _WIN32  // sizes that its runtime does not know
    for (const char* size : {"j", "z", "t"}) {
      const std::string format = std::string("%") + size + type;
      ASSERT_EQ(Formatted(SString((format + ";%s").c_str()), longLong, WTEXT("behind")),
                SString((Printed(format, longLong) + ";behind").c_str()));
    }
#endif
    const double number = value / 997.0;  // never in the middle between two results
    const std::string floating(1, "eEfgG"[round % 5]);
    const int precision = random.Number(9) + 1;
    std::string expected = Printed("%.*" + floating, precision, number);
    const std::size_t exponent = expected.find_first_of("eE");
    // Windows writes three digits of an exponent, and so does the portable layer.
    if (exponent != std::string::npos && expected.size() == exponent + 4) expected.insert(exponent + 2, 1, '0');
    ASSERT_EQ(Formatted(SString(("%.*" + floating).c_str()), precision, number), SString(expected.c_str()));
  }
}

TEST(FormatForms, TextsThatAreMissingOrHopeless) {
  EXPECT_EQ(Formatted(WTEXT("%s"), static_cast<const WCHAR*>(nullptr)), WTEXT("(null)"));
  EXPECT_EQ(Formatted(WTEXT("%hs|%c%C"), "narrow", 'c', 'd'), WTEXT("narrow|cd"));
  EXPECT_TRUE(Formatted(nullptr).IsEmpty());
  EXPECT_TRUE(Formatted(WTEXT("%*d"), INT_MAX, 1).IsEmpty()) << "more than a string can hold";
  EXPECT_TRUE(Formatted(WTEXT("%*d"), INT_MIN, 1).IsEmpty());
  EXPECT_TRUE(Formatted(WTEXT("%99999999999999d"), 1).IsEmpty());
  EXPECT_LE(Formatted(WTEXT("100%")).Length(), 4);
  EXPECT_EQ(Formatted(WTEXT("%-600d|"), 5).Length(), 601) << "beyond the room on the stack";
  EXPECT_NE(Formatted(WTEXT("%p"), static_cast<void*>(nullptr)).Length(), 0);
  // Into a buffer that is lent out: what fits is put there, at the same place.
  SString lent;
  WCHAR* const buffer = lent.LockBuffer(700);
  lent.Format(WTEXT("%650d"), 7);
  EXPECT_EQ(lent.GetSafePointer(), buffer);
  lent.UnlockBuffer();
  EXPECT_EQ(lent.Length(), 650);
  EXPECT_EQ(lent.Right(2), WTEXT(" 7"));
}

// --- numbers, classes ---

TEST(Classes, NumbersAreWhatAPatternSays) {
  const std::regex integer("[+-]?[0-9]+"), number("[+-]?([0-9]+\\.?[0-9]*|\\.[0-9]+)([eE][+-]?[0-9]+)?");
  RandomText random(51);
  int numbers = 0;
  for (int round = 0; round < 40000; ++round) {
    const WideString text = random.Make(7, WTEXT("+-.eE019 "));
    const SString tested = SStringView(text);
    ASSERT_EQ(tested.IsInteger() != 0, std::regex_match(Narrow(text), integer)) << Narrow(text);
    ASSERT_EQ(tested.IsNumber() != 0, std::regex_match(Narrow(text), number)) << Narrow(text);
    numbers += tested.IsNumber();
  }
  EXPECT_GT(numbers, 1000);
}

TEST(Classes, AreOneRuleForEveryCharacter) {
  for (unsigned code = 1; code < 0x10000; ++code) {
    const WCHAR c = static_cast<WCHAR>(code);
    const SString text(SStringView(&c, 1));
    ASSERT_EQ(text.IsAlphaNum(0), text.IsAlpha(0) | text.IsDigit(0)) << code;
    ASSERT_EQ(text.IsASCII(0) != 0, code < 0x80);
    ASSERT_FALSE(text.IsAlpha(0) && text.IsWhitespace(0)) << code;
    ASSERT_FALSE(text.IsLower(0) && text.IsUpper(0)) << code;
    if (text.IsXDigit(0)) {
      ASSERT_TRUE(text.IsAlphaNum(0)) << code;
    }
    if (code >= 0x80) continue;
    ASSERT_EQ(text.IsAlpha(0) != 0, (code | 32) >= 'a' && (code | 32) <= 'z');
    ASSERT_EQ(text.IsDigit(0) != 0, code >= '0' && code <= '9');
    ASSERT_EQ(text.IsLower(0) != 0, code >= 'a' && code <= 'z');
    ASSERT_EQ(text.IsUpper(0) != 0, code >= 'A' && code <= 'Z');
    ASSERT_EQ(text.IsWhitespace(0) != 0, code == ' ' || (code >= 9 && code <= 13));
  }
}

// --- comparing and searching ---

int Sign(int value) { return (value > 0) - (value < 0); }

// A count and a start are those of the texts that they leave.
TEST(Orders, StartsAndCountsCutTheTexts) {
  using One = int (SString::*)(const WCHAR*) const;
  using Counted = int (SString::*)(const WCHAR*, int) const;
  using Started = int (SString::*)(int, const WCHAR*) const;
  using Both = int (SString::*)(int, const WCHAR*, int) const;
  const struct {
    One one;
    Counted counted;
    Started started;
    Both both;
  } kOrders[] = {
      {&SString::Compare, &SString::Compare, &SString::Compare, &SString::Compare},
      {&SString::CompareNoCase, &SString::CompareNoCase, &SString::CompareNoCase, &SString::CompareNoCase},
      {&SString::Collate, &SString::Collate, &SString::Collate, &SString::Collate},
      {&SString::CollateNoCase, &SString::CollateNoCase, &SString::CollateNoCase, &SString::CollateNoCase},
      {&SString::CompareNb, &SString::CompareNb, &SString::CompareNb, &SString::CompareNb},
      {&SString::CompareNbNoCase, &SString::CompareNbNoCase, &SString::CompareNbNoCase, &SString::CompareNbNoCase}};
  RandomText random(61);
  for (int round = 0; round < 3000; ++round) {
    const SString a = SStringView(random.Make(6, WTEXT("aAbB12"))), b = SStringView(random.Make(6, WTEXT("aAbB12")));
    const int count = random.Number(8) - 1, start = random.Number(a.Length() + 1);
    for (const auto& order : kOrders) {
      const int expected = Sign((a.Left(count).*order.one)(b.Left(count)));
      ASSERT_EQ(Sign((a.*order.counted)(b, count)), expected) << round;
      ASSERT_EQ(Sign((a.*order.started)(start, b)), Sign((a.Mid(start).*order.one)(b)));
      ASSERT_EQ(Sign((a.*order.both)(start, b, count)), Sign((a.Mid(start).Left(count).*order.one)(b.Left(count))));
      ASSERT_EQ((a.*order.one)(a), 0);
    }
  }
  for (const auto& order : kOrders) {
    EXPECT_EQ((SString().*order.one)(nullptr), 0);
    EXPECT_GT((SString(WTEXT("x")).*order.one)(nullptr), 0);
  }
  EXPECT_EQ(_tcscmpi(nullptr, nullptr), 0);
  EXPECT_LT(_tcscmpi(nullptr, WTEXT("1")), 0);
  EXPECT_GT(_tcsicmpi(WTEXT("1"), nullptr), 0);
  EXPECT_EQ(_tcsncmpi(nullptr, WTEXT("1"), 0), 0);
  const WCHAR* const same = WTEXT("same");
  EXPECT_EQ(_tcsncmpi(same, same, 3), 0);
  EXPECT_EQ(_tcsnicmpi(same, same, 3), 0);
}

// Numbers of any length: by their digits, and then by their leading zeros.
TEST(Orders, NaturalOrderOfLongNumbers) {
  RandomText random(71);
  const auto sign = [](const WideString& a, const WideString& b) {
    const std::size_t zerosA = std::min(a.find_first_not_of(WTEXT('0')), a.size());
    const std::size_t zerosB = std::min(b.find_first_not_of(WTEXT('0')), b.size());
    const WideString digitsA = a.substr(zerosA), digitsB = b.substr(zerosB);
    if (digitsA.size() != digitsB.size()) return digitsA.size() < digitsB.size() ? -1 : 1;
    if (digitsA != digitsB) return digitsA < digitsB ? -1 : 1;
    return zerosA == zerosB ? 0 : zerosA < zerosB ? -1 : 1;
  };
  for (int round = 0; round < 20000; ++round) {
    WideString a = WTEXT("1") + random.Make(40, WTEXT("0019")), b = a;
    for (int changes = random.Number(4); changes > 0; --changes) {
      const auto at = static_cast<std::size_t>(random.Number(static_cast<int>(b.size()) + 1));
      if (at == b.size()) {
        b += WTEXT('7');
      } else if (random.Number(3) == 0 && b.size() > 1) {
        b.erase(at, 1);
      } else {
        b[at] = static_cast<WCHAR>('0' + random.Number(10));
      }
    }
    if (random.Number(4) == 0) a.insert(0, 2, WTEXT('0'));
    ASSERT_EQ(Sign(_tcscmpi(a.c_str(), b.c_str())), sign(a, b)) << Narrow(a) << ' ' << Narrow(b);
    ASSERT_EQ(Sign(_tcsicmpi((a + WTEXT("X")).c_str(), (b + WTEXT("x")).c_str())), sign(a, b));
  }
}

// --- other active code pages; the environment chooses them before the first question, on Linux ---

TEST(OtherPages, DoubleByteTextsAreCountedByCharacters) {
  if (GetACP() != 932) GTEST_SKIP() << "the active page is " << GetACP();
  const SString text = WTEXT("a\u30C6\u30B9\u30C8\uFF71z");  // the last but one is a single byte
  const SAnsiString bytes(text);
  EXPECT_STREQ(bytes, "a\x83\x65\x83\x58\x83\x67\xB1z");
  EXPECT_EQ(bytes.LengthByte(), 9);
  EXPECT_EQ(bytes.Length(), 6);
  EXPECT_EQ(SAnsiString(text, 3).LengthByte(), 5);
  SAnsiString cut(text);
  static_cast<char*>(cut)[2] = 0;  // within a character
  EXPECT_EQ(cut.Length(), 2) << "nothing behind the end counts";
  EXPECT_EQ(SString(static_cast<const char*>(bytes)), text);
  EXPECT_EQ(SUnicodeString(bytes).Length(), 6);
  EXPECT_EQ(SUnicodeString(bytes, 3).Length(), 2);
  EXPECT_TRUE(text.CanConvertToMBCS());
  EXPECT_FALSE(SString(WTEXT("\u0E01")).CanConvertToMBCS());
  EXPECT_EQ(SString(WTEXT("")).CanConvertToMBCS(), 1);
  EXPECT_EQ(SString(WTEXT("x")) + "\x83\x65", WTEXT("x\u30C6"));
}

TEST(OtherPages, Utf8TextsAreCountedByCharacters) {
  if (GetACP() != CP_UTF8) GTEST_SKIP() << "the active page is " << GetACP();
  const SString text = WTEXT("a\u00E9\u20ACz");
  const SAnsiString bytes(text);
  EXPECT_STREQ(bytes, "a\xC3\xA9\xE2\x82\xACz");
  EXPECT_EQ(bytes.LengthByte(), 7);
  EXPECT_EQ(bytes.Length(), 4);
  EXPECT_EQ(SString(static_cast<const char*>(bytes)), text);
  EXPECT_TRUE(text.CanConvertToMBCS());
  const WCHAR half[] = {0xD800, 0};
  EXPECT_FALSE(SString(half).CanConvertToMBCS()) << "half a pair has no bytes";
}

TEST(OtherPages, MissingTextsHaveNoLength) {
  EXPECT_EQ(SAnsiString(static_cast<const WCHAR*>(nullptr)).Length(), 0);
  EXPECT_EQ(SAnsiString(static_cast<const WCHAR*>(nullptr)).LengthByte(), 0);
  EXPECT_EQ(SAnsiString(static_cast<const WCHAR*>(nullptr), 4).LengthByte(), 0);
  EXPECT_EQ(SUnicodeString(static_cast<const char*>(nullptr)).Length(), 0);
  EXPECT_EQ(SUnicodeString(static_cast<const char*>(nullptr), 4).Length(), 0);
}

}  // namespace
