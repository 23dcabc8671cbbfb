// The wide functions, the character tables and the formatting agree between the targets.

#include "qxcore/platform/wide.h"

#include <gtest/gtest.h>

#include <cerrno>
#include <cmath>
#include <string>

namespace {

using namespace platform;
using Text = std::basic_string<WCHAR>;

template <class T>
std::uint32_t Checksum(const BmpTable<T>& table) {
  std::uint32_t hash = 2166136261u;
  for (const T& value : table.values) hash = (hash ^ static_cast<std::uint32_t>(value)) * 16777619u;
  return hash;
}

// A map written on one machine is in order on every other: these tables never change unnoticed.
TEST(Bmp, TablesArePinned) {
  EXPECT_EQ(Checksum(g_lowerBmp), 3405953198u);
  EXPECT_EQ(Checksum(g_upperBmp), 242026677u);
  EXPECT_EQ(Checksum(g_classBmp), 4171344946u);
}

TEST(Bmp, SimpleMappings) {
  EXPECT_EQ(ToLowerBmp(u'A'), u'a');
  EXPECT_EQ(ToLowerBmp(0x00C4), 0x00E4);
  EXPECT_EQ(ToLowerBmp(0x0130), 0x0069);
  EXPECT_EQ(ToUpperBmp(0x00DF), 0x00DF);  // sharp s has no single capital
  EXPECT_EQ(ToUpperBmp(0x00FF), 0x0178);
  EXPECT_EQ(ToLowerBmp(0x0416), 0x0436);
  EXPECT_EQ(ToLowerBmp(0xD800), 0xD800);
  int moved = 0;
  for (unsigned c = 0; c < 0x10000; ++c) {
    const WCHAR lower = ToLowerBmp(static_cast<WCHAR>(c));
    if (ToLowerBmp(lower) != lower) ++moved;
  }
  EXPECT_EQ(moved, 0);  // mapping twice is mapping once
}

TEST(Bmp, Classes) {
  EXPECT_TRUE(IsAlpha(0x00E9) && IsAlpha(0x4E00) && !IsAlpha(u'1'));
  EXPECT_TRUE(IsDigit(u'7') && IsDigit(0x0663) && !IsDigit(0x00B2));
  EXPECT_TRUE(IsSpace(u' ') && IsSpace(u'\t') && IsSpace(0x00A0) && IsSpace(0x3000) && !IsSpace(u'x'));
  EXPECT_TRUE(IsUpper(0x0416) && IsLower(0x0436) && !IsUpper(u'1'));
  EXPECT_TRUE(IsPunct(u'$') && IsPunct(u'!') && !IsPunct(u'a'));
  EXPECT_TRUE(IsControl(0x07) && IsPrint(u'~') && !IsPrint(0x07));
  EXPECT_TRUE(IsXDigit(u'F') && !IsXDigit(u'G') && !IsXDigit(0xFF21));
}

TEST(Wide, ComparisonAndSearch) {
  EXPECT_LT(WideCompare(WTEXT("abc"), WTEXT("abd")), 0);
  EXPECT_GT(WideCompare(WTEXT("\xFFFF"), WTEXT("a")), 0);  // code units are unsigned
  EXPECT_EQ(WideCompare(WTEXT("abc"), WTEXT("abX"), 2), 0);
  EXPECT_EQ(WideCompareNoCase(WTEXT("\x00C4rger_"), WTEXT("\x00E4RGER_")), 0);
  EXPECT_LT(WideCompareNoCase(WTEXT("_"), WTEXT("Z")), 0);  // lower case: the underscore comes before letters
  EXPECT_EQ(WideCompareNoCase(WTEXT("ABx"), WTEXT("aby"), 2), 0);
  const WCHAR* text = WTEXT("one two one");
  EXPECT_EQ(WideFind(text, u'o'), text);
  EXPECT_EQ(WideReverseFind(text, u'o'), text + 8);
  EXPECT_EQ(WideFind(text, u'\0'), text + 11);
  EXPECT_EQ(WideFind(text, WTEXT("two")), text + 4);
  EXPECT_EQ(WideFind(text, WTEXT("x")), nullptr);
  EXPECT_EQ(WideSpan(text, WTEXT("eno")), 3u);
  EXPECT_EQ(WideSpanNot(text, WTEXT(" ")), 3u);
  EXPECT_EQ(WideLength(text, 5), 5u);
  EXPECT_LT(WideCollate(WTEXT("Z"), WTEXT("a")), 0);  // the "C" locale: code units
  EXPECT_EQ(WideCollateNoCase(WTEXT("Abc"), WTEXT("aBC")), 0);
}

TEST(Wide, Numbers) {
  const WCHAR* end = nullptr;
  const WCHAR* text = WTEXT("  -12x");
  EXPECT_EQ(WideToLong(text, &end), -12);
  EXPECT_EQ(end, text + 5);
  EXPECT_EQ(WideToLong(WTEXT("0x1F"), nullptr, 0), 31);
  EXPECT_EQ(WideToLong(WTEXT("0x"), nullptr, 0), 0);
  EXPECT_EQ(WideToLong(WTEXT("017"), nullptr, 0), 15);
  EXPECT_EQ(WideToLong(WTEXT("zz"), nullptr, 36), 35 * 36 + 35);
  errno = 0;
  EXPECT_EQ(WideToLong(WTEXT("99999999999999999999999")), 2147483647);
  EXPECT_EQ(errno, ERANGE);
  EXPECT_EQ(WideToLong(WTEXT("-2147483648")), -2147483647 - 1);
  EXPECT_EQ(WideToULong(WTEXT("4294967295")), 4294967295ul);
  EXPECT_EQ(WideToULong(WTEXT("-1")), 4294967295ul);
  text = WTEXT("nothing");
  EXPECT_EQ(WideToLong(text, &end), 0);
  EXPECT_EQ(end, text);
  EXPECT_EQ(WideToDouble(WTEXT(" -1.5e3x")), -1500.0);
  EXPECT_EQ(WideToDouble(WTEXT(".5")), 0.5);
  text = WTEXT("1e");
  EXPECT_EQ(WideToDouble(text, &end), 1.0);
  EXPECT_EQ(end, text + 1);
  EXPECT_EQ(WideToDouble(WTEXT("1e400")), HUGE_VAL);
  EXPECT_EQ(WideToDouble(WTEXT("00001e-400")), 0.0);
  EXPECT_EQ(WideToDouble((Text(500, u'0') + WTEXT("1") + Text(400, u'0')).c_str()), HUGE_VAL);
  EXPECT_EQ(WideToDouble(WTEXT("0.1")), 0.1);
}

Text Format(const WCHAR* format, ...) {
  WCHAR buffer[600];
  std::va_list arguments;
  va_start(arguments, format);
  std::va_list again;
  va_copy(again, arguments);
  const int length = WideFormatV(buffer, 600, format, arguments);
  EXPECT_EQ(WideFormatLengthV(format, again), length);
  va_end(again);
  va_end(arguments);
  return length < 0 ? Text(WTEXT("refused")) : Text(buffer, static_cast<std::size_t>(length));
}

TEST(Format, Integers) {
  // Flags, widths and precisions: tests/string/convert_format_test.cpp, beside the narrow runtime.
  EXPECT_EQ(Format(WTEXT("%u|%#x|%.0d|%#08x"), 4294967295u, 0, 0, 3), WTEXT("4294967295|0||0x000003"));
  EXPECT_EQ(Format(WTEXT("%I64d|%lld|%I64x"), -1LL << 40, 1LL << 40, 1LL << 40),
            WTEXT("-1099511627776|1099511627776|10000000000"));
  EXPECT_EQ(Format(WTEXT("%ld|%lu|%hd|%I32d"), -5L, 5UL, 70000, 9), WTEXT("-5|5|4464|9"));
  EXPECT_EQ(Format(WTEXT("%*d|%-*d|%.*d|%*d|"), 4, 1, 4, 1, 3, 1, -4, 1), WTEXT("   1|1   |001|1   |"));
  const Text pointer = Format(WTEXT("%p"), reinterpret_cast<void*>(0x1ABC));
  EXPECT_EQ(pointer, Text(2 * sizeof(void*) - 4, u'0') + WTEXT("1ABC"));
}

TEST(Format, Texts) {
  EXPECT_EQ(Format(WTEXT("%s|%S|%hs|%ls|%ws"), WTEXT("w\x20AC"), "n", "h", WTEXT("l"), WTEXT("w")),
            WTEXT("w\x20AC|n|h|l|w"));
  EXPECT_EQ(Format(WTEXT("%5s|%-5s|%.2s|%05s"), WTEXT("ab"), WTEXT("ab"), WTEXT("abc"), WTEXT("ab")),
            WTEXT("   ab|ab   |ab|000ab"));
  EXPECT_EQ(Format(WTEXT("%c|%C|%hc|%lc|%3c"), u'w', 'n', 'h', u'l', u'x'), WTEXT("w|n|h|l|  x"));
  EXPECT_EQ(Format(WTEXT("%s%S"), static_cast<WCHAR*>(nullptr), static_cast<char*>(nullptr)), WTEXT("(null)(null)"));
  EXPECT_EQ(Format(WTEXT("100%%|%k|%5")), WTEXT("100%|k|"));
  EXPECT_EQ(Format(WTEXT("%n"), nullptr), WTEXT("refused"));
}

TEST(Format, FloatingPoint) {
  EXPECT_EQ(Format(WTEXT("%f|%.2f|%10.1f|%-8.1f|%010.2f"), 1.5, 1.005, -2.25, 3.0, -1.5),
            WTEXT("1.500000|1.00|      -2.3|3.0     |-000001.50"));
  EXPECT_EQ(Format(WTEXT("%e|%.3E|%g|%g|%g|%G|%#g"), 1e5, 1e-300, 1e20, 1e-5, 123456.0, 1e100, 1.0),
            WTEXT("1.000000e+005|1.000E-300|1e+020|1e-005|123456|1E+100|1.00000"));
  EXPECT_EQ(Format(WTEXT("%.0f|%.0f|%.1f|%.0f"), 0.5, 2.5, 0.25, 1.5), WTEXT("1|3|0.3|2"));  // ties go away from zero
  EXPECT_EQ(Format(WTEXT("%f|%f|%g|%e|%f"), HUGE_VAL, -HUGE_VAL, HUGE_VAL, HUGE_VAL, std::nan("")),
            WTEXT("1.#INF00|-1.#INF00|1.#INF|1.#INF00e+000|1.#QNAN0"));
  EXPECT_EQ(Format(WTEXT("%a|%A"), 1.0, 0.1), WTEXT("0x1.0000000000000p+0|0X1.999999999999AP-4"));
  EXPECT_EQ(Format(WTEXT("%f"), 1e308).size(), 316u);
}

TEST(Format, NothingIsWrittenPastTheBuffer) {
  const Text full = WTEXT("1234567");
  for (std::size_t capacity = 0; capacity < 12; ++capacity) {
    WCHAR buffer[16];
    for (WCHAR& c : buffer) c = u'#';
    const int length = WideFormat(buffer, capacity, WTEXT("%d%s"), 123, WTEXT("4567"));
    EXPECT_EQ(length, capacity > 7 ? 7 : -1);
    for (std::size_t i = capacity; i < 16; ++i) EXPECT_EQ(buffer[i], u'#');
    if (capacity > 0) {
      EXPECT_EQ(Text(buffer), full.substr(0, capacity - 1));
    }
  }
}

}  // namespace
