// Building long texts, and walking words, lines, parts and characters.

#include <vector>

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/string/string_iterators.h"
#include "tests/support/text.h"

namespace {

// All tokens; from wherever a walk is broken off, a reset one gives them anew.
template <class Iterator>
std::vector<SString> Tokens(Iterator token) {
  std::vector<SString> tokens;
  for (; token; ++token) tokens.push_back(*token);
  for (std::size_t passed = 0; passed <= tokens.size(); ++passed) {
    token.reset();
    for (std::size_t i = 0; i < passed; ++i) ++token;
    token.reset();
    std::vector<SString> again;
    for (; token; ++token) again.push_back(*token);
    EXPECT_EQ(again, tokens) << "reset behind " << passed;
  }
  return tokens;
}

std::vector<SString> Texts(std::initializer_list<const WCHAR*> texts) { return {texts.begin(), texts.end()}; }

TEST(StringBuffer, Defaults_ReserveMuchAndGrowByFiveThirds) {
  SStringBuffer buffer;
  buffer += WTEXT("ab");
  EXPECT_EQ(buffer.Length(), 2);
  EXPECT_GE(buffer.GetCapacity(), 262144);
  buffer.Reset(100, 1, 2);
  EXPECT_EQ(buffer.GetNumerator(), 5u);
  EXPECT_EQ(buffer.GetDenominator(), 3u);
  buffer += WTEXT("x");
  EXPECT_EQ(buffer.GetCapacity(), 128) << "100 rounded up to a size class";
  buffer.Reset(10, 3, 1);
  EXPECT_EQ(buffer.GetNumerator(), 3u);
}

TEST(StringBuffer, RandomAppends_AgreeWithPlainString) {
  RandomText random(3);
  for (unsigned capacity : {1u, 7u, 100u, 5000u}) {
    SStringBuffer buffer(capacity, 4, 3);
    WideString model;
    for (int i = 0; i < 3000; ++i) {
      WideString piece = random.Make(20, WTEXT("abc"));
      switch (random.Number(6)) {
        case 0:
          buffer += piece.empty() ? WTEXT('-') : piece[0];
          model += piece.empty() ? WTEXT('-') : piece[0];
          break;
        case 1:
          buffer.Concat(piece.c_str(), random.Number(30) + 20);
          model += piece;
          break;
        case 2:
          if (model.size() < 2000) {
            buffer += static_cast<const WCHAR*>(buffer);  // its own content
            model += model;
          }
          break;
        case 3:
          buffer += SString(piece.c_str());
          model += piece;
          break;
        case 4:
          buffer.Concat(piece.data(), piece.data() + piece.size());
          model += piece;
          break;
        default:
          if (random.Number(300) == 0) {
            buffer = SString(piece.c_str());
            model = piece;
          }
      }
      ASSERT_EQ(buffer.View(), SStringView(model));
    }
    SString copy(buffer);
    EXPECT_LE(copy.GetAllocLength(), std::max(2 * copy.Length(), 512)) << "sized for the content";
    SString detached = buffer.Detach();
    EXPECT_EQ(detached, copy);
    EXPECT_TRUE(buffer.IsEmpty());
  }
}

// Large buffers grow where they are; what is appended may lie in them.
TEST(StringBuffer, ClearedInPlace_IsAnEmptyText) {
  SStringBuffer buffer(100);
  buffer += WTEXT("former");
  buffer.Clear();
  EXPECT_TRUE(buffer.IsEmpty());
  EXPECT_EQ(SString(static_cast<const WCHAR*>(buffer)), WTEXT(""));
  EXPECT_GE(buffer.GetCapacity(), 100) << "the room stays";
  buffer += WTEXT("new");
  EXPECT_EQ(buffer.Detach(), WTEXT("new"));
  buffer += WTEXT("of two");
  SStringBuffer copy(buffer);
  copy.Clear();
  EXPECT_TRUE(copy.IsEmpty());
  EXPECT_EQ(buffer.Detach(), WTEXT("of two"));
}

TEST(StringBuffer, LargeContent_AppendsPartsOfItself) {
  const long before = SString::GetLargeBufferBytes();
  {
    RandomText random(23);
    SStringBuffer buffer(100);
    WideString expected = random.Make(90, WTEXT("abc"));
    buffer += SStringView(expected);
    while (expected.size() < 2'000'000) {
      const int from = random.Number(static_cast<int>(expected.size()));
      const int n = 1 + random.Number(static_cast<int>(expected.size()) - from);
      const WCHAR* text = buffer.View().data() + from;
      buffer.Concat(text, text + n);
      expected += expected.substr(static_cast<std::size_t>(from), static_cast<std::size_t>(n));
      ASSERT_TRUE(buffer.View() == expected) << expected.size();
      ASSERT_EQ(buffer.View().data()[buffer.Length()], 0) << "it ends with a NUL";
    }
    EXPECT_GE(SString::GetLargeBufferBytes() - before, 2 * buffer.GetCapacity());
    EXPECT_LE(SString::GetLargeBufferBytes() - before, 2 * buffer.GetCapacity() + 100);
  }
  EXPECT_EQ(SString::GetLargeBufferBytes(), before);
}

TEST(StringBuffer, FailedGrowth_KeepsTheContent) {
  SStringBuffer buffer(3000, 5, 3);
  buffer += SString(SStringView(WideString(2999, WTEXT('a'))));
  SString before(buffer);
  SMemFailAt(1, true);
  EXPECT_THROW(buffer.Concat(WideString(4000, WTEXT('b')).c_str(), 4000), SEOutOfMemory);
  SMemFailAt(0);
  EXPECT_TRUE(buffer.View() == before.View());
}

TEST(TokenIterators, PartsLinesAndWords) {
  SString text = WTEXT("a,,b");
  EXPECT_EQ(Tokens(parts_iterator(text, WTEXT(','))), Texts({WTEXT("a"), WTEXT(""), WTEXT("b")}));
  text = WTEXT("a,");
  EXPECT_EQ(Tokens(parts_iterator(text, WTEXT(','))), Texts({WTEXT("a"), WTEXT("")}));
  text = WTEXT("");
  EXPECT_EQ(Tokens(parts_iterator(text, WTEXT(','))), Texts({WTEXT("")}));
  EXPECT_EQ(Tokens(word_iterator(text)), Texts({}));
  text = WTEXT("  x  y ");
  EXPECT_EQ(Tokens(word_iterator(text)), Texts({WTEXT(""), WTEXT("x"), WTEXT("y")}));
  text = WTEXT("l1\r\nl2\nl3");
  EXPECT_EQ(Tokens(line_iterator(text)), Texts({WTEXT("l1"), WTEXT("l2"), WTEXT("l3")}));
  text = WTEXT("\n\ra\r\r\n\n");
  EXPECT_EQ(Tokens(line_iterator(text)), Texts({WTEXT(""), WTEXT(""), WTEXT("a"), WTEXT(""), WTEXT("")}));
}

TEST(TokenIterators, ResetAndPostIncrement) {
  SString text = WTEXT("one two");
  word_iterator word(text);
  word_iterator first = word++;
  EXPECT_EQ(*first, WTEXT("one"));
  EXPECT_EQ(*word, WTEXT("two"));
  EXPECT_TRUE(word != first);
  word.reset();
  EXPECT_TRUE(word == first);
  EXPECT_EQ(word.GetPointer(), text.GetSafePointer());
}

TEST(CharacterIterator, WalksAndReturns) {
  SString text = WTEXT("a b\n");
  const_iterator at(text, 1);
  EXPECT_TRUE(at.IsWhitespace());
  at.SaveState();
  at += 2;
  EXPECT_TRUE(at.IsEoln());
  ++at;
  EXPECT_FALSE(static_cast<bool>(at));
  at.RestoreState();
  EXPECT_EQ(*at, WTEXT(' '));
  EXPECT_TRUE(const_iterator(text, 0) < at);
  at.reset();
  EXPECT_EQ(*at++, WTEXT('a'));
}

}  // namespace
