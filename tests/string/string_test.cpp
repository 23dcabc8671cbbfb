// Sharing, copy-on-write, lent-out buffers, size classes; all against a plain string as the model.

#include "qxcore/string/string.h"

#include <functional>
#include <thread>
#include <unordered_map>
#include <vector>

#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/string/string_buffer.h"
#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"

namespace {

SString Repeated(int length, WCHAR c = WTEXT('x')) {
  return SString(SStringView(WideString(static_cast<std::size_t>(length), c)));
}
std::int32_t RefsOf(const SString& text) { return SStringData::Of(text.GetSafePointer())->m_refs; }
bool Shares(const SString& a, const SString& b) { return a.GetSafePointer() == b.GetSafePointer(); }

TEST(StringConstruction, NumbersAndTruth_HaveTheirStatedForms) {
  EXPECT_TRUE(Shares(SString(5), SString::Yes));
  EXPECT_TRUE(Shares(SString(0), SString::No));
  EXPECT_EQ(SString(5L), WTEXT("5"));
  EXPECT_EQ(SString(-7L), WTEXT("-7"));
  EXPECT_EQ(SString(0.5), WTEXT("0.5"));
  EXPECT_TRUE(Shares(SString(nullptr), SString::null));
  EXPECT_TRUE(Shares(SString(static_cast<const WCHAR*>(nullptr)), SString::null));
  EXPECT_TRUE(Shares(SString(static_cast<const char*>(nullptr)), SString::null));
  EXPECT_EQ(SString("a\xE9z"), WTEXT("a\u00E9z"));
  EXPECT_EQ(SString("abcdef", 3), WTEXT("abc"));
  EXPECT_EQ(SString("ab", 9), WTEXT("ab"));
  EXPECT_FALSE((std::is_constructible_v<SString, char>));
  EXPECT_FALSE((std::is_constructible_v<SString, WCHAR>));
  EXPECT_FALSE((std::is_constructible_v<SString, unsigned>));
  EXPECT_FALSE((std::is_convertible_v<int, SString>));
}

// Pointers that are no texts were "Yes" once.
struct SomeClass {};
template <class... Arguments>
concept CanFormat = requires(SString text, const WCHAR* format, Arguments... arguments) {
  text.Format(format, arguments...);
  text.Format(218u, arguments...);
};
using OtherWide = std::conditional_t<std::is_same_v<WCHAR, wchar_t>, char16_t, wchar_t>;
static_assert(!std::is_constructible_v<SString, void*> && !std::is_constructible_v<SString, const int*>);
static_assert(!std::is_constructible_v<SString, const OtherWide*> && !std::is_constructible_v<SString, const char8_t*>);
static_assert(!std::is_constructible_v<SString, SomeClass*> && !std::is_constructible_v<SString, int (*)()>);
static_assert(!std::is_convertible_v<bool, SString> && std::is_constructible_v<SString, bool>);
static_assert(std::is_constructible_v<SString, WCHAR*> && std::is_constructible_v<SString, char*>);
static_assert(CanFormat<int, const WCHAR*, double, char> && CanFormat<>);
static_assert(!CanFormat<SString> && !CanFormat<int, SStringView> && !CanFormat<SomeClass>);

TEST(StringConstruction, Truth_IsOnlyATruth) {
  bool isSo = true;
  EXPECT_TRUE(Shares(SString(isSo), SString::Yes));
  EXPECT_TRUE(Shares(SString(!isSo), SString::No));
}

TEST(StringBuffers, TextsBeyondAnInt_AreRefused) {
  const SString text = WTEXT("text");
  const SStringView tooLong(text.GetSafePointer(), std::size_t{0x80000000});  // never looked at
  SString target = text;
  EXPECT_THROW(SString{tooLong}, SEOutOfMemory);
  EXPECT_THROW(target = tooLong, SEOutOfMemory);
  EXPECT_THROW(target += tooLong, SEOutOfMemory);
  SStringBuffer buffer(16u);
  if (sizeof(void*) > 4) {  // else no such text can be
    EXPECT_THROW(buffer += tooLong, SEOutOfMemory);
  }
  EXPECT_EQ(target, text);
  EXPECT_TRUE(buffer.IsEmpty());
}

TEST(StringBuffers, Length_DecidesTheSizeClass) {
  const struct {
    int length, allocated;
  } kCases[] = {{1, 16},      {16, 16},     {17, 32},     {32, 32},    {33, 64},    {64, 64},
                {65, 128},    {128, 128},   {129, 256},   {257, 512},  {513, 1024}, {1025, 2048},
                {2048, 2048}, {2049, 2560}, {2560, 2560}, {2561, 3072}};
  for (const auto& one : kCases) {
    SString text = Repeated(one.length);
    EXPECT_EQ(text.GetAllocLength(), one.allocated) << one.length;
    EXPECT_EQ(text.GetAt(one.length), 0);
  }
  EXPECT_EQ(SString().GetAllocLength(), 1);
  EXPECT_EQ(SString::CrLf.GetAllocLength(), 3);
  SString grown = Repeated(16);
  const WCHAR* before = grown;
  grown += WTEXT('y');
  EXPECT_NE(grown.GetSafePointer(), before);
  EXPECT_EQ(grown.GetAllocLength(), 32);
  before = grown;
  grown += WTEXT("zz");
  EXPECT_EQ(grown.GetSafePointer(), before);
}

TEST(StringBuffers, LargeOnes_AreCountedUntilTheyGo) {
  const long bytes = SString::GetLargeBufferBytes();
  const long count = SString::GetLargeBufferCount();
  {
    SString large = Repeated(5000);
    SString shared = large;
    EXPECT_EQ(SString::GetLargeBufferCount(), count + 1);
    EXPECT_EQ(SString::GetLargeBufferBytes(), bytes + 12 + (5120 + 1) * 2);
  }
  EXPECT_EQ(SString::GetLargeBufferCount(), count);
  EXPECT_EQ(SString::GetLargeBufferBytes(), bytes);
}

TEST(StringSharing, Copies_ShareUntilOneWrites) {
  SString a = WTEXT("shared text");
  SString b = a;
  SString c;
  c = b;
  EXPECT_TRUE(Shares(a, b) && Shares(b, c));
  EXPECT_EQ(RefsOf(a), 3);
  b.SetAt(0, WTEXT('S'));
  EXPECT_EQ(a, WTEXT("shared text"));
  EXPECT_EQ(b, WTEXT("Shared text"));
  EXPECT_EQ(RefsOf(a), 2);
  SString moved = std::move(c);
  EXPECT_TRUE(Shares(moved, a) && c.IsEmpty());
  SString& itself = a;
  a = itself;
  EXPECT_EQ(RefsOf(a), 2);
}

TEST(StringSharing, StaticTexts_AreNeverWritten) {
  SString text = SString::Yes;
  text.ToUpper();
  EXPECT_EQ(text, WTEXT("YES"));
  EXPECT_EQ(SString::Yes, WTEXT("Yes"));
  SString empty;
  empty.AssignCopy(0, nullptr);
  empty.ToUpper();
  empty.MakeReverse();
  empty.Unlock(0);
  empty.UnlockBuffer(true);
  empty.CopyBeforeWrite();
  EXPECT_TRUE(Shares(empty, SString::null));
  EXPECT_EQ(SString::null.Length(), 0);
}

TEST(StringLocking, LockedText_IsCopiedDeeply) {
  SString locked = WTEXT("abc");
  WCHAR* buffer = locked.LockBuffer(10);
  EXPECT_EQ(locked.Length(), 10);
  EXPECT_EQ(RefsOf(locked), SStringData::kLocked);
  buffer[3] = 0;
  SString copy = locked;
  EXPECT_FALSE(Shares(copy, locked));
  EXPECT_EQ(copy, WTEXT("abc"));
  SString assigned = WTEXT("previous");
  assigned = locked;
  EXPECT_EQ(assigned, WTEXT("abc"));
  locked.UnlockBuffer(true);
  EXPECT_EQ(locked.Length(), 3);
  SString sharing = locked;
  EXPECT_TRUE(Shares(sharing, locked));
}

TEST(StringLocking, EmptyTextToLockedTarget_KeepsBufferAndLength) {
  for (int way = 0; way < 3; ++way) {
    SString target = WTEXT("abcdef");
    WCHAR* buffer = target.LockBuffer();
    if (way == 0) target = SString();
    if (way == 1) target = SString(SString::null);
    if (way == 2) target.AssignCopy(0, nullptr);
    EXPECT_EQ(target.GetSafePointer(), buffer);
    EXPECT_EQ(buffer[0], 0);
    EXPECT_EQ(target.Length(), 6);
    target.UnlockBuffer(true);
    EXPECT_TRUE(Shares(target, SString::null));
  }
}

TEST(StringLocking, TextToLockedTarget_IsCopiedIntoItsBufferWhereItFits) {
  SString target;
  WCHAR* buffer = target.LockBuffer(16);
  SString source = WTEXT("0123456789");
  target = source;
  EXPECT_EQ(target.GetSafePointer(), buffer);
  EXPECT_EQ(target, source);
  EXPECT_EQ(RefsOf(source), 1);
  target = Repeated(40);
  EXPECT_NE(target.GetSafePointer(), buffer);
  EXPECT_EQ(target.Length(), 40);
}

TEST(StringLocking, Unlock_MeasuresOrCuts) {
  SString text = WTEXT("abcdef");
  text.Lock(0);
  text.Unlock(4);
  EXPECT_EQ(text, WTEXT("abcd"));
  SString other = text;
  other.Unlock(2);
  EXPECT_EQ(other, WTEXT("ab"));
  EXPECT_EQ(text, WTEXT("abcd"));
  SString fixed = SString::Yes;
  fixed.UnlockTchar(1);
  EXPECT_EQ(fixed, WTEXT("Y"));
  WCHAR* buffer = text.LockBuffer(100);
  buffer[1] = 0;
  text.Unlock(-1);
  EXPECT_EQ(text.Length(), 1);
  EXPECT_EQ(RefsOf(text), SStringData::kLocked) << "Unlock leaves the mark";
  text.UnlockBuffer(false);
  EXPECT_EQ(RefsOf(text), 1);
  text.Lock(8);
  text.Unlock(0);
  EXPECT_TRUE(Shares(text, SString::null));
  WCHAR* sized = text.GetBufferSetLength(3);
  EXPECT_EQ(sized[3], 0);
  EXPECT_EQ(text.Length(), 3);
}

// What others hold is never written, however the length came to be 0.
TEST(StringLocking, UnlockWithoutABufferOfItsOwn_WritesNothing) {
  SString constant;
  constant.Unlock(1);
  EXPECT_EQ(constant, WTEXT(""));
  EXPECT_EQ(*SString::null.GetSafePointer(), 0);
  SString lent;
  WCHAR* buffer = lent.Lock(10);
  buffer[0] = WTEXT('#');
  EXPECT_EQ(lent.Length(), 0);
  SString holder = lent;
  lent.Unlock(3);
  EXPECT_EQ(lent, WTEXT(""));
  EXPECT_EQ(holder.GetSafePointer()[0], WTEXT('#'));
  EXPECT_EQ(holder.Length(), 0);
  SString shared = WTEXT("abcdef");
  holder = shared;
  shared.Unlock(2);
  EXPECT_EQ(shared, WTEXT("ab"));
  EXPECT_EQ(holder, WTEXT("abcdef"));

  SString sized = WTEXT("abc");
  EXPECT_EQ(*sized.GetBufferSetLength(0), 0);
  EXPECT_EQ(sized.Length(), 0);
  EXPECT_EQ(SString().GetBufferSetLength(0)[0], 0);
}

TEST(StringLocking, NewTextsInALockedString_HaveTheirOwnLength) {
  const std::function<void(SString&)> kEmptying[] = {[](SString& text) { text.Init(WTEXT("")); },
                                                     [](SString& text) { text.Init(""); },
                                                     [](SString& text) { text.Init(SString()); },
                                                     [](SString& text) { text.Format(WTEXT("")); },
                                                     [](SString& text) { text.Format(WTEXT("%s"), WTEXT("")); },
                                                     [](SString& text) { text.LoadStringW(65000); }};
  for (std::size_t i = 0; i < std::size(kEmptying); ++i) {
    SString text = WTEXT("abcdef");
    text.LockBuffer(6);
    kEmptying[i](text);
    EXPECT_EQ(text.Length(), 0) << i;
    EXPECT_EQ(*text.GetSafePointer(), 0) << i;
  }
  SString text = WTEXT("abcdef");
  text.LockBuffer(6);
  text.Init(WTEXT("xy"));
  EXPECT_EQ(text, WTEXT("xy"));
  EXPECT_EQ(RefsOf(text), 1);
}

TEST(StringModel, EqualLengthReplacement_HappensInPlace) {
  SString text = WTEXT("one two one");
  const WCHAR* before = text;
  EXPECT_EQ(text.ReplaceAll(WTEXT("one"), WTEXT("six")), 2);
  EXPECT_EQ(text.GetSafePointer(), before);
  EXPECT_EQ(text, WTEXT("six two six"));
  EXPECT_EQ(text.ReplaceAllNoCase(WTEXT("SIX"), WTEXT("")), 2);
  EXPECT_EQ(text, WTEXT(" two "));
  EXPECT_EQ(text.ReplaceAll(WTEXT(""), WTEXT("x")), 0);
  EXPECT_EQ(text.ReplaceAll(nullptr, WTEXT("x")), 0);
  EXPECT_EQ(text.Replace(WTEXT("two"), WTEXT("2")), 1);
  EXPECT_EQ(text.Translate(WTEXT(" 2"), WTEXT("_")), 2);
  EXPECT_EQ(text, WTEXT("_2_"));
}

TEST(StringView, ConversionsOperatorsAndHash) {
  SString text = WTEXT("view");
  SStringView view = text;
  EXPECT_EQ(view, WTEXT("view"));
  EXPECT_EQ(SString(view), text);
  EXPECT_TRUE(text < SString(WTEXT("views")) && text > WTEXT("vie") && text == WTEXT("view"));
  std::unordered_map<SString, int> map;
  map[text] = 3;
  EXPECT_EQ(map[SString(WTEXT("view"))], 3);
  EXPECT_EQ(text[0u] + text[3L], WTEXT('v') + WTEXT('w'));
  EXPECT_EQ(WTEXT("a") + text + WTEXT('b') + "c" + 'd', WTEXT("aviewbcd"));
  EXPECT_EQ(WTEXT('<') + text, WTEXT("<view"));
}

TEST(StringMemory, EachAllocationFailing_LeavesTheTextAsItWas) {
  // A pool serves small buffers from its free list; buffers above 2048 characters always allocate.
  SString text = Repeated(3000);
  SString before = text;
  const SString insert = Repeated(100, WTEXT('y'));
  int failures = WithEachAllocationFailing(
      [&] {
        SString work = text;
        work += insert;
        work.Insert(insert, 5);
        work.ReplaceAll(WTEXT("x"), WTEXT("zz"));
        work.Format(WTEXT("%s-%s"), work.GetSafePointer(), insert.GetSafePointer());
        text = work;
        text = before;
      },
      [&] { EXPECT_EQ(text, before); });
  EXPECT_GT(failures, 3);
}

TEST(StringMemory, PoolFailure_TrimsThePoolsAndTriesOnceMore) {
  std::vector<SString> held;
  for (int i = 0; i < 9; ++i) held.push_back(Repeated(1500));
  SMemFailAt(1, true);
  EXPECT_THROW(
      {
        for (int i = 0; i < 10000; ++i) held.push_back(Repeated(1500, static_cast<WCHAR>(WTEXT('a') + i % 26)));
      },
      SEOutOfMemory);
  SMemFailAt(1, false);  // only the next one: the second try succeeds
  EXPECT_NO_THROW(held.push_back(Repeated(3000)));
  EXPECT_TRUE(SMemHasFailed());
  SMemFailAt(0);
  for (std::size_t i = 0; i + 1 < held.size(); ++i) EXPECT_EQ(held[i].Length(), 1500);
  held.clear();
  EXPECT_GT(SString::FreeUnused(), 0);
}

// Run under ThreadSanitizer, too.
TEST(StringThreads, SharedBuffers_SurviveManyHolders) {
  const SString shared = WTEXT("held by several threads");
  auto work = [shared] {
    for (int i = 0; i < 20000; ++i) {
      SString copy = shared;
      SString other = copy;
      if (i % 3 == 0) other += WTEXT("!");
      if (i % 5 == 0) copy.SetAt(0, WTEXT('H'));
      SString fresh = Repeated(i % 300 + 1);
    }
  };
  std::vector<std::thread> threads;
  for (int i = 0; i < 4; ++i) threads.emplace_back(work);
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(shared, WTEXT("held by several threads"));
  EXPECT_EQ(RefsOf(shared), 2);  // this one and the one in `work`
}

}  // namespace
