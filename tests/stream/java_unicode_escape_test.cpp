// Escaping and unescaping beside plain readings of the rules, in every way of reading, and failing sources.

#include "qxcore/stream/java_unicode_escape_filter_stream.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <regex>
#include <string>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_buffer.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/steps.h"
#include "tests/support/text.h"

namespace {

using Filter = SJavaUnicodeEscapeFilterStream;

// The characters of a text; throws once at each place where there is a NUL.
class Characters : public SInputStream {
 public:
  explicit Characters(const WideString& text) : m_text(text) {}
  using SInputStream::Read;
  int Read() override {
    if (m_at == m_text.size()) return -1;
    const WCHAR next = m_text[m_at++];
    if (next == 0) throw SEIOAbortedException();
    return next;
  }
  int IsEOF() override { return m_at == m_text.size(); }
  WideString Rest() const { return m_text.substr(m_at); }

 private:
  WideString m_text;
  std::size_t m_at = 0;
};

// Reads to the end; `piece` bytes at a time, 0 for single reads, -1 for pieces of any size. Counts failures.
std::string ReadAll(Filter& filter, int piece, int* failures = nullptr) {
  std::string text;
  RandomText random(8);
  char buffer[3000];
  for (test::Steps steps;; steps.Take()) {
    try {
      if (piece == 0) {
        const int c = filter.Read();
        if (c < 0) return text;
        text += static_cast<char>(c);
        continue;
      }
      const int wanted = piece > 0 ? piece : 1 + random.Number(200);
      const unsigned long got = filter.Read(buffer, static_cast<unsigned long>(wanted));
      text.append(buffer, got);
      if (got == 0) return text;
    } catch (const SEIOAbortedException&) {
      if (failures == nullptr) throw;
      ++*failures;
    }
  }
}

std::string Escaped(const WideString& text, int piece = 0) {
  Characters in(text);
  Filter filter(in);
  return ReadAll(filter, piece);
}

// The rules as two steps over the whole text: mark the escapes that are there, then make new ones.
std::string EscapedByTheRules(const WideString& text) {
  std::string out;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (text[i] >= 128) {
      char escape[8];
      std::snprintf(escape, sizeof escape, "\\u%04X", static_cast<unsigned>(text[i]));
      out += escape;
      continue;
    }
    out += static_cast<char>(text[i]);
    if (text[i] != '\\') continue;
    std::size_t at = i + 1;
    while (at < text.size() && text[at] == 'u') ++at;
    auto isDigit = [&](std::size_t k) { return k < text.size() && text[k] < 128 && std::isxdigit(text[k]) != 0; };
    const bool isEscape = at > i + 1 && isDigit(at) && isDigit(at + 1) && isDigit(at + 2) && isDigit(at + 3);
    if (isEscape) out += 'u';
  }
  return out;
}

WideString UnescapedByTheRules(const std::string& text) {
  WideString out;
  const std::regex escape("\\\\(u+)([0-9A-Fa-f]{4})");
  for (std::size_t i = 0; i < text.size();) {
    std::smatch match;
    const auto from = text.begin() + static_cast<std::ptrdiff_t>(i);
    if (!std::regex_search(from, text.end(), match, escape, std::regex_constants::match_continuous)) {
      out += static_cast<WCHAR>(static_cast<unsigned char>(text[i++]));
    } else if (match.length(1) == 1) {
      out += static_cast<WCHAR>(std::stoi(match.str(2), nullptr, 16));
      i += 6;
    } else {
      out += '\\';
      i += 2;
      for (; i < static_cast<std::size_t>(match[0].second - text.begin()); ++i) out += static_cast<WCHAR>(text[i]);
    }
  }
  return out;
}

WideString Unescaped(const std::string& text) { return WideString(Filter::Unescape(text.c_str()).View()); }

// Wherever it is closed: nothing that was read ahead is left, and what comes then is the source's alone.
TEST(UnicodeEscape, AClosedFilterHoldsNothing) {
  const WideString text = WTEXT("a\\b\\uc\\uu12x\\u00E9\u00E9\\\\u4E2D\u4E2D!");
  for (int reads = 0; reads < 60; ++reads) {
    Characters source(text);
    Filter filter(source);
    for (int i = 0; i < reads; ++i) filter.Read();
    const WideString rest = source.Rest();
    filter.Close();
    EXPECT_EQ(filter.Available(), 0u) << reads;
    EXPECT_EQ(filter.IsEOF() != 0, rest.empty()) << reads;
    Characters alone(rest);
    Filter fresh(alone);
    EXPECT_EQ(ReadAll(filter, 0), ReadAll(fresh, 0)) << reads;
  }
}

TEST(UnicodeEscape, EscapesAndMarks) {
  EXPECT_EQ(Escaped(WTEXT("\x00E9")), "\\u00E9");
  EXPECT_EQ(Escaped(WTEXT("\\u0041")), "\\uu0041");
  EXPECT_EQ(Escaped(WTEXT("\\uu00411")), "\\uuu00411") << "whatever follows the four digits";
  EXPECT_EQ(Escaped(WTEXT("\\u004")), "\\u004") << "too few digits";
  EXPECT_EQ(Escaped(WTEXT("\\u004\x00E9")), "\\u004\\u00E9");
  EXPECT_EQ(Escaped(WTEXT("\\\\u0041\\")), "\\\\uu0041\\");
  EXPECT_EQ(Escaped(WTEXT("\xD83D\xDE00")), "\\uD83D\\uDE00");
}

TEST(UnicodeEscape, Unescapes) {
  EXPECT_EQ(Unescaped("\\u00e9"), WideString(WTEXT("\x00E9")));
  EXPECT_EQ(Unescaped("\\uu0041"), WideString(WTEXT("\\u0041")));
  EXPECT_EQ(Unescaped("\\u00411\\u004"), WideString(WTEXT("A1\\u004")));
  EXPECT_EQ(Unescaped("caf\xE9"), WideString(WTEXT("caf\x00E9"))) << "8-bit characters are widened";
  EXPECT_EQ(Filter::Unescape(nullptr), SString::null);
  const char text[] = "ab\\u0041cd\0ef";
  SString copy = WTEXT("former");
  EXPECT_EQ(Filter::Unescape(text, text + 6, &copy), WTEXT("ab\\u00")) << "the end cuts the escape";
  EXPECT_EQ(copy, WTEXT("ab\\u00"));
  EXPECT_EQ(Filter::Unescape(text, text + sizeof text), WTEXT("abAcd")) << "the NUL ends it";
  EXPECT_EQ(Filter::Unescape(text, text), SString::null);
}

TEST(UnicodeEscape, EveryWayOfReading_GivesTheSame_AndTheWayBackToo) {
  RandomText random(9);
  for (int round = 0; round < 4000; ++round) {
    const int length = round % 50 == 0 ? 9000 : 40;  // beyond one run
    const WideString text = random.Make(length, WTEXT("\\\\\\uuu0Af9gx\x7F\x80\x00E9\xD83D\xFFFF"));
    const std::string expected = EscapedByTheRules(text);
    for (int piece : {0, 1, 5, 13, 2999, -1}) ASSERT_EQ(Escaped(text, piece), expected) << "pieces of " << piece;
    ASSERT_EQ(Unescaped(expected), text);
    std::string any(text.begin(), text.end());  // also what is no escaped text
    ASSERT_EQ(Unescaped(any), UnescapedByTheRules(any));
  }
}

TEST(UnicodeEscape, LongRunsOfLetters_CostNoMore) {
  WideString text(1'000'000, 'u');
  text.insert(0, 1, '\\');
  text += WTEXT("0041\x00E9");
  const std::string escaped = Escaped(text, 2999);
  EXPECT_EQ(escaped.size(), text.size() + 1 + 5);
  EXPECT_EQ(Unescaped(escaped), text);
}

TEST(UnicodeEscape, ReadersOfText_AreTakenByTheBlock) {
  std::string utf8;
  for (int i = 0; i < 3000; ++i) utf8 += "Gr\xC3\xBC\xC3\x9F\x65 \\u0041 ";
  SInputBuffer bytes(utf8.data(), static_cast<unsigned long>(utf8.size()));
  SMultiFormatReaderUnicode reader(bytes, SAbstractIO::SMultiFormatSupport::kUTF8);
  Filter filter(reader);
  std::string expected;
  for (int i = 0; i < 3000; ++i) expected += "Gr\\u00FC\\u00DFe \\uu0041 ";
  EXPECT_EQ(ReadAll(filter, 2000), expected);
  EXPECT_TRUE(filter.IsEOF());

  SInputBuffer latin("caf\xE9", 4);  // a stream of bytes: its bytes are the characters
  Filter plain(latin);
  EXPECT_EQ(plain.Skip(3), 3ul);
  EXPECT_EQ(plain.Available(), 1ul);
  EXPECT_EQ(ReadAll(plain, 100), "\\u00E9");
}

TEST(UnicodeEscape, FailingSource_LosesNothing) {
  RandomText random(10);
  for (int round = 0; round < 1000; ++round) {
    WideString text = random.Make(100, WTEXT("abcdefgh\x00E9\x20AC"));
    const std::string expected = EscapedByTheRules(text);
    const int wanted = random.Number(4);
    for (int i = 0; i < wanted; ++i) {
      text.insert(static_cast<std::size_t>(random.Number(static_cast<int>(text.size()) + 1)), 1, 0);
    }
    for (int piece : {0, 1, 50, -1}) {
      Characters in(text);
      Filter filter(in);
      int failures = 0;
      ASSERT_EQ(ReadAll(filter, piece, &failures), expected) << "pieces of " << piece;
      ASSERT_EQ(failures, wanted);
    }
  }
  // In the middle of an escape: what was taken is delivered, then the failure is told.
  const WCHAR cut[] = WTEXT("\\u0\0z");
  Characters in(WideString(cut, 5));
  Filter filter(in);
  char buffer[100];
  EXPECT_EQ(filter.Read(buffer, 100), 3ul);
  EXPECT_THROW(filter.Read(buffer, 100), SEIOAbortedException);
  EXPECT_EQ(filter.Read(buffer, 100), 1ul);
}

TEST(UnicodeEscape, FailedAllocation_LeavesTheCopy) {
  SString copy = WTEXT("former");
  const std::string text = std::string(5000, 'x') + "\\u00E9";
  EXPECT_GT(WithEachAllocationFailing([&] { Filter::Unescape(text.c_str(), &(copy = WTEXT("former"))); },
                                      [&] { EXPECT_EQ(copy, WTEXT("former")); }),
            0);
}

}  // namespace
