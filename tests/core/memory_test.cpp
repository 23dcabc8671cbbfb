// The library's memory, the figures it keeps for diagnostics, and the reporter of failures nobody is told of.

#include "qxcore/core/memory.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <string>

#include "qxcore/core/assert_valid.h"
#include "qxcore/core/debug_counter.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/core/raise_error.h"

namespace {

TEST(Memory, ResizingKeepsTheContentAndAFailureTheBlock) {
  auto* block = static_cast<char*>(SMemRealloc(nullptr, 10));
  std::fill_n(block, 10, 'x');
  for (std::size_t size = 10; size < 100000; size = size * 3 / 2) {
    SMemFailAt(1, true);
    EXPECT_THROW(SMemRealloc(block, size * 2), SEOutOfMemory);
    EXPECT_EQ(SMemTryAlloc(size), nullptr);
    SMemFailAt(0);
    block = static_cast<char*>(SMemRealloc(block, size));
    EXPECT_EQ(std::count(block, block + 10, 'x'), 10);
  }
  block = static_cast<char*>(SMemRealloc(block, 0));
  EXPECT_NE(block, nullptr) << "a block of nothing is one all the same";
  SMemFree(block);
  void* const nothing = SMemTryAlloc(0);
  EXPECT_NE(nothing, nullptr);
  SMemFree(nothing);
}

using Figures = std::multimap<std::basic_string<WCHAR>, std::int32_t>;

Figures AllFigures() {
  Figures figures;
  const int count = SDbgForEachCounter([](const WCHAR* name, const WCHAR*, std::int32_t value,
                                          void* context) { static_cast<Figures*>(context)->emplace(name, value); },
                                       &figures);
  EXPECT_EQ(static_cast<std::size_t>(count), figures.size());
  return figures;
}

TEST(DebugCounters, AreWalkedWhileTheyAreRegistered) {
  const Figures before = AllFigures();
  std::int32_t first = 3, second = 5, never = 7;
  std::basic_string<WCHAR> name = WTEXT("of a test");
  EXPECT_EQ(SDbgAddCounter(name.c_str(), WTEXT("pieces"), &first), 1);
  EXPECT_EQ(SDbgAddCounter(name.c_str(), WTEXT("pieces"), &second), 1);
  name = WTEXT("the name was copied");
  first = 4;
  SMemFailAt(1, true);
  EXPECT_EQ(SDbgAddCounter(WTEXT("without memory"), WTEXT("pieces"), &never), 0);
  SMemFailAt(0);
  EXPECT_EQ(AllFigures().size(), before.size() + 2);
  EXPECT_EQ(AllFigures().lower_bound(WTEXT("of a test"))->second, 4);
  SDbgRemoveCounter(&never);
  SDbgRemoveCounter(&first);
  EXPECT_EQ(AllFigures().lower_bound(WTEXT("of a test"))->second, 5);
  SDbgRemoveCounter(&second);
  EXPECT_EQ(AllFigures(), before);
}

std::basic_string<WCHAR> g_reported;

TEST(ErrorReporter, GetsTheTextAndItsExceptionsEndThere) {
  const SErrorReporter before = g_SetErrorReporter(nullptr);
  g_RaiseError(WTEXT("nobody hears it"));
  EXPECT_EQ(g_SetErrorReporter([](const WCHAR* text) { g_reported = text; }), nullptr);
  g_RaiseError(WTEXT("failed: 100 %s"));
  EXPECT_EQ(g_reported, WTEXT("failed: 100 %s"));
  g_RaiseError(nullptr);
  EXPECT_EQ(g_reported, WTEXT(""));
  g_SetErrorReporter([](const WCHAR*) { throw SEOutOfMemory(); });
  g_RaiseError(WTEXT("x"));
  g_SetErrorReporter(before);
}

// Modules link to them; whatever they are given, they look at nothing.
TEST(AssertValid, IsCompiledOut) {
  int flag = 3;
  const void* const bad = reinterpret_cast<const void*>(std::uintptr_t{8});
  EXPECT_EQ(SAssertValidObject(static_cast<const SObject*>(bad), "file", 1, &flag), 1);
  EXPECT_EQ(SAssertValidObjectPtr(bad, nullptr, 0), 1);
  EXPECT_EQ(SAssertValidInterface(static_cast<const IUnknown*>(bad), "file", 1, &flag), 1);
  EXPECT_EQ(SAssertValidVirtual(nullptr, "file", 1), 1);
  EXPECT_EQ(flag, 3);
}

}  // namespace
