// The code pages agree between the targets, byte by byte, and follow the published rules for flags,
// sizes and errors.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "qxcore/platform/win32.h"
#include "tests/support/wine.h"

namespace {

using Text = std::basic_string<WCHAR>;

class Hash {
 public:
  void Add(unsigned value) {
    for (int shift = 0; shift < 16; shift += 8) m_value = (m_value ^ (value >> shift & 0xFF)) * 16777619u;
  }
  std::uint32_t Value() const { return m_value; }

 private:
  std::uint32_t m_value = 2166136261u;
};

struct One {
  WCHAR value;
  bool valid;
};

// What one code stands for without and with MB_ERR_INVALID_CHARS.
One DecodeOne(UINT page, const char* bytes, int count) {
  WCHAR text[4] = {}, strict[4] = {};
  const int length = MultiByteToWideChar(page, 0, bytes, count, text, 4);
  const int strictLength = MultiByteToWideChar(page, MB_ERR_INVALID_CHARS, bytes, count, strict, 4);
  return {length == 1 ? text[0] : WCHAR(0xFFFF), strictLength == 1};
}

// All single bytes, then all pairs with a lead byte.
template <class Visit>
void ForEachCode(UINT page, Visit visit) {
  for (int byte = 0; byte < 256; ++byte) {
    char bytes[2] = {static_cast<char>(byte), 0};
    if (!IsDBCSLeadByteEx(page, static_cast<BYTE>(byte))) {
      visit(bytes, 1);
      continue;
    }
    for (int trail = 1; trail < 256; ++trail) {
      bytes[1] = static_cast<char>(trail);
      visit(bytes, 2);
    }
  }
}

struct Golden {
  UINT page;
  std::uint32_t hash;
};

// Made by the loop below on Windows' side. Not on Linux: 10001, 10002, 10003 and 10008.
const Golden kGolden[] = {
#include "code_page_golden.inc"
};

TEST(CodePages, TablesAreTheSameOnEveryTarget) {
  for (const Golden& golden : kGolden) {
    ASSERT_TRUE(IsValidCodePage(golden.page)) << golden.page;
    Hash hash;
    ForEachCode(golden.page, [&](const char* bytes, int count) {
      const One one = DecodeOne(golden.page, bytes, count);
      hash.Add(one.value);
      hash.Add(one.valid);
    });
    EXPECT_EQ(hash.Value(), golden.hash) << "page " << golden.page;
  }
}

TEST(CodePages, ValidCharactersSurviveTheWayBack) {
  for (const Golden& golden : kGolden) {
    int lost = 0;
    ForEachCode(golden.page, [&](const char* bytes, int count) {
      const One one = DecodeOne(golden.page, bytes, count);
      if (!one.valid) return;
      char back[4];
      BOOL usedDefault = TRUE;
      const int length =
          WideCharToMultiByte(golden.page, WC_NO_BEST_FIT_CHARS, &one.value, 1, back, 4, nullptr, &usedDefault);
      if (usedDefault || length < 1 || DecodeOne(golden.page, back, length).value != one.value) ++lost;
    });
    // Wine has no way back for the control characters 80 to 9F of this page.
    EXPECT_EQ(lost, golden.page == 20932 && IsWindows() ? 31 : 0) << "page " << golden.page;
  }
}

int Decode(UINT page, DWORD flags, const std::string& bytes, Text* text = nullptr) {
  WCHAR buffer[64];
  SetLastError(0);
  const int length = MultiByteToWideChar(page, flags, bytes.data(), static_cast<int>(bytes.size()), buffer, 64);
  if (text != nullptr) text->assign(buffer, static_cast<std::size_t>(length));
  return length;
}

TEST(CodePages, SizesAndErrors) {
  WCHAR text[8];
  char bytes[8];
  EXPECT_EQ(MultiByteToWideChar(1252, 0, "abc", -1, nullptr, 0), 4);
  EXPECT_EQ(MultiByteToWideChar(1252, 0, "abc", 3, nullptr, 0), 3);
  EXPECT_EQ(MultiByteToWideChar(1252, 0, "abcdef", 6, text, 3), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
  EXPECT_EQ(text[2], 'c');
  EXPECT_EQ(MultiByteToWideChar(1252, 0, nullptr, 1, text, 8), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(MultiByteToWideChar(1252, 0, "a", 0, text, 8), 0);
  EXPECT_EQ(MultiByteToWideChar(12345, 0, "a", 1, text, 8), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(MultiByteToWideChar(1252, 0x10, "a", 1, text, 8), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_FLAGS));
  EXPECT_EQ(MultiByteToWideChar(65000, MB_ERR_INVALID_CHARS, "a", 1, text, 8), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_FLAGS));
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("ab\x20AC"), -1, nullptr, 0, nullptr, nullptr), 4);
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("abcdef"), 6, bytes, 3, nullptr, nullptr), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INSUFFICIENT_BUFFER));
}

TEST(CodePages, Utf8IsStrict) {
  const std::string bad[] = {"\x80",
                             "\xC0\x80",
                             "\xC3",
                             "\xE0\x80\x80",
                             "\xED\xA0\x80",
                             "\xF4\x90\x80\x80",
                             "\xF5\x80\x80\x80",
                             "\xE2\x82",
                             "\xF0\x9F\x98",
                             "ab\xFF"
                             "cd"};
  for (const std::string& bytes : bad) {
    EXPECT_EQ(Decode(CP_UTF8, MB_ERR_INVALID_CHARS, bytes), 0);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_UNICODE_TRANSLATION));
    Text text;
    EXPECT_GT(Decode(CP_UTF8, 0, bytes, &text), 0);
    EXPECT_NE(text.find(WCHAR(0xFFFD)), Text::npos);
  }
  Text text;
  EXPECT_EQ(Decode(CP_UTF8, MB_ERR_INVALID_CHARS, "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80", &text), 5);
  EXPECT_EQ(text, Text(WTEXT("a\x00E9\x20AC\xD83D\xDE00")));
  char bytes[16];
  EXPECT_EQ(WideCharToMultiByte(CP_UTF8, 0, text.data(), 5, bytes, 16, nullptr, nullptr), 10);
  EXPECT_EQ(std::string(bytes, 10), "a\xC3\xA9\xE2\x82\xAC\xF0\x9F\x98\x80");
  EXPECT_EQ(WideCharToMultiByte(CP_UTF8, WC_ERR_INVALID_CHARS, WTEXT("\xDC00"), 1, bytes, 16, nullptr, nullptr), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_UNICODE_TRANSLATION));
}

// Every sequence of up to three units out of the interesting ones, against the definition.
TEST(CodePages, Utf8ValidityAgreesWithTheDefinition) {
  const unsigned char units[] = {0x41, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC1, 0xC2, 0xDF,
                                 0xE0, 0xE1, 0xEC, 0xED, 0xEE, 0xEF, 0xF0, 0xF1, 0xF4, 0xF5, 0xFF};
  const auto isValid = [](const std::string& s) {
    for (std::size_t i = 0; i < s.size();) {
      const auto at = [&](std::size_t k) { return k < s.size() ? static_cast<unsigned char>(s[k]) : 0u; };
      const unsigned lead = at(i);
      const std::size_t size = lead < 0x80   ? 1
                               : lead < 0xC0 ? 9
                               : lead < 0xE0 ? 2
                               : lead < 0xF0 ? 3
                               : lead < 0xF8 ? 4
                                             : 9;
      if (size == 9) return false;
      unsigned value = size == 1 ? lead : lead & (0x7Fu >> size);
      for (std::size_t k = 1; k < size; ++k) {
        if ((at(i + k) & 0xC0) != 0x80) return false;
        value = value << 6 | (at(i + k) & 0x3F);
      }
      const unsigned least[] = {0, 0, 0x80, 0x800, 0x10000};
      if (value < least[size] || value > 0x10FFFF || (value >= 0xD800 && value < 0xE000)) return false;
      i += size;
    }
    return true;
  };
  int wrong = 0;
  for (unsigned char a : units)
    for (unsigned char b : units)
      for (unsigned char c : units)
        for (unsigned char d : units) {
          const std::string bytes{static_cast<char>(a), static_cast<char>(b), static_cast<char>(c),
                                  static_cast<char>(d)};
          const bool valid = MultiByteToWideChar(CP_UTF8, MB_ERR_INVALID_CHARS, bytes.data(), 4, nullptr, 0) > 0;
          if (valid != isValid(bytes)) ++wrong;
        }
  EXPECT_EQ(wrong, 0);
}

TEST(CodePages, DefaultsAndBestFit) {
  char bytes[8];
  BOOL used = FALSE;
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("\x4E00"), 1, bytes, 8, nullptr, &used), 1);
  EXPECT_EQ(bytes[0], '?');
  EXPECT_TRUE(used);
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("\x4E00"), 1, bytes, 8, "#", &used), 1);
  EXPECT_EQ(bytes[0], '#');
  EXPECT_EQ(WideCharToMultiByte(1252, 0, WTEXT("\x0101"), 1, bytes, 8, nullptr, &used), 1);
  EXPECT_EQ(bytes[0], 'a');
  EXPECT_FALSE(used);
  WideCharToMultiByte(1252, WC_NO_BEST_FIT_CHARS, WTEXT("\x0101"), 1, bytes, 8, nullptr, &used);
  EXPECT_TRUE(used);
  // A letter and its accent join before they are converted.
  EXPECT_EQ(
      WideCharToMultiByte(1252, WC_COMPOSITECHECK | WC_DEFAULTCHAR, WTEXT("e\x0301"), 2, bytes, 8, nullptr, &used), 1);
  EXPECT_EQ(bytes[0], '\xE9');
}

TEST(CodePages, DoubleByteEdges) {
  Text text;
  EXPECT_EQ(Decode(949, 0, "a\x81", &text), 2);  // a lead byte at the end
  EXPECT_EQ(text, Text(WTEXT("a?")));
  EXPECT_EQ(Decode(949, MB_ERR_INVALID_CHARS, "a\x81"), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_NO_UNICODE_TRANSLATION));
  EXPECT_TRUE(IsDBCSLeadByteEx(932, 0x81));
  EXPECT_FALSE(IsDBCSLeadByteEx(932, 0xA1));
  EXPECT_FALSE(IsDBCSLeadByteEx(1252, 0x81));
  CPINFO info;
  ASSERT_TRUE(GetCPInfo(932, &info));
  EXPECT_EQ(info.MaxCharSize, 2u);
  EXPECT_EQ(info.LeadByte[0], 0x81);
  EXPECT_EQ(info.LeadByte[3], 0xFC);
  EXPECT_FALSE(GetCPInfo(12345, &info));
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
}

std::vector<UINT> g_enumerated;

BOOL CALLBACK NotePage(LPWSTR name) {
  UINT page = 0;
  for (; *name != 0; ++name) page = page * 10 + static_cast<UINT>(*name - '0');
  g_enumerated.push_back(page);
  return TRUE;
}

TEST(CodePages, EnumerationListsWhatIsValid) {
  g_enumerated.clear();
  ASSERT_TRUE(EnumSystemCodePagesW(NotePage, CP_INSTALLED));
  for (const Golden& golden : kGolden)
    EXPECT_NE(std::find(g_enumerated.begin(), g_enumerated.end(), golden.page), g_enumerated.end()) << golden.page;
  for (UINT page : g_enumerated) EXPECT_TRUE(IsValidCodePage(page)) << page;
  EXPECT_FALSE(IsValidCodePage(0));
  EXPECT_FALSE(IsValidCodePage(1200));
}

// A text may hold NULs, and some converters take it in pieces for that: what is lost in any piece is lost in the whole,
// and the bytes are those of the pieces.
TEST(CodePages, ATextWithNULsIsItsPieces) {
  const Text good = WTEXT("ab"), bad = WTEXT("x\xD800y");  // half a pair is in no page
  for (const UINT page : {437u, 850u, 1252u, 932u, 936u, 949u, 950u, 50220u, 50225u, 52936u, 54936u, 57002u}) {
    if (!IsValidCodePage(page)) continue;
    const auto encode = [page](const Text& text, BOOL& used) {
      char bytes[64];
      const int size =
          WideCharToMultiByte(page, 0, text.data(), static_cast<int>(text.size()), bytes, 64, nullptr, &used);
      return std::string(bytes, static_cast<std::size_t>(size));
    };
    for (int pieces = 0; pieces < 8; ++pieces) {
      Text whole;
      std::string expected;
      for (int i = 0; i < 3; ++i) {
        const Text& piece = (pieces >> i & 1) != 0 ? bad : good;
        BOOL used = FALSE;
        if (i > 0) whole += WCHAR{0}, expected += '\0';
        whole += piece;
        expected += encode(piece, used);
        EXPECT_EQ(used != FALSE, &piece == &bad) << page;
      }
      BOOL used = FALSE;
      EXPECT_EQ(encode(whole, used), expected) << page;
      EXPECT_EQ(used != FALSE, pieces != 0) << page << " " << pieces;
    }
  }
}

#ifndef _WIN32
// Documented rules that Wine does not know, and pages that it does not have.
TEST(CodePages, PublishedRulesBeyondWine) {
  char bytes[8];
  BOOL used;
  EXPECT_EQ(WideCharToMultiByte(CP_UTF8, 0, WTEXT("a"), 1, bytes, 8, "?", nullptr), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_PARAMETER));
  EXPECT_EQ(WideCharToMultiByte(CP_UTF8, 0, WTEXT("a"), 1, bytes, 8, nullptr, &used), 0);
  EXPECT_EQ(Decode(CP_UTF8, MB_PRECOMPOSED, "a"), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_FLAGS));
  EXPECT_EQ(Decode(1252, MB_COMPOSITE, "a"), 0);
  EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_FLAGS));
  for (UINT page : {50220u, 50225u, 52936u, 54936u, 57002u, 65000u}) {
    EXPECT_EQ(Decode(page, 0, "a"), 1) << page;
    EXPECT_EQ(Decode(page, MB_PRECOMPOSED, "a"), 0);
    EXPECT_EQ(GetLastError(), DWORD(ERROR_INVALID_FLAGS));
  }
  Text text;
  EXPECT_EQ(Decode(50220, 0, "\x1B$B\x46\x7C\x1B(B", &text), 1);
  EXPECT_EQ(text, Text(WTEXT("\x65E5")));
  EXPECT_EQ(Decode(54936, 0, "\x94\x39\xFC\x36", &text), 2);  // outside the first plane
  EXPECT_EQ(text, Text(WTEXT("\xD83D\xDE00")));
  EXPECT_EQ(Decode(42, 0, "\x41", &text), 1);
  EXPECT_EQ(text[0], 0xF041);
}
#endif

}  // namespace
