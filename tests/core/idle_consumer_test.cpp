// Idle consumers: rotation, the common list behind the null pointer, changes while a list is walked.

#include "qxcore/core/idle_consumer.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>
#include <string>
#include <utility>

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

namespace {

std::string g_calls;

// Writes its letter to g_calls when it is served.
class Worker : public SIdleConsumer {
 public:
  Worker(SIdleConsumerList* list, char letter) : SIdleConsumer(list), m_letter(letter) {}
  int OnIdle(int count) override {
    g_calls += m_letter;
    m_lastCount = count;
    if (m_action) m_action();
    return m_wantsMore;
  }

  char m_letter;
  int m_lastCount = -1;
  int m_wantsMore = 0;
  std::function<void()> m_action;
};

std::string CallsOf(const std::function<void()>& work) {
  g_calls.clear();
  work();
  return g_calls;
}

TEST(IdleConsumerList, OnIdleNext_RotatesAndReportsTheEndOfACycle) {
  SIdleConsumerList list;
  Worker a(&list, 'a'), b(&list, 'b'), c(&list, 'c');
  std::string results;
  EXPECT_EQ(CallsOf([&] {
              for (int i = 0; i < 6; ++i) results += static_cast<char>('0' + list.OnIdleNext(0));
            }),
            "abcabc");
  EXPECT_EQ(results, "001001");
  results.clear();
  EXPECT_EQ(CallsOf([&] {
              for (int i = 0; i < 4; ++i) results += static_cast<char>('0' + list.OnIdleNext(1));
            }),
            "abca");
  EXPECT_EQ(results, "0000") << "a count begins the cycle anew each time";
  b.m_wantsMore = 1;
  EXPECT_EQ(CallsOf([&] {
              for (int i = 0; i < 3; ++i) EXPECT_EQ(list.OnIdleNext(0), 1);
            }),
            "bbb")
      << "one that wants more keeps its place";
}

TEST(IdleConsumerList, OnIdleAll_CallsAllAndCollectsTheResults) {
  SIdleConsumerList list;
  Worker a(&list, 'a'), b(&list, 'b');
  EXPECT_EQ(CallsOf([&] { EXPECT_EQ(list.OnIdleAll(0), 0); }), "");
  EXPECT_EQ(CallsOf([&] { EXPECT_EQ(list.OnIdleAll(7), 0); }), "ab");
  EXPECT_EQ(b.m_lastCount, 7);
  a.m_wantsMore = 5;
  EXPECT_EQ(list.OnIdleAll(1), 1);
}

TEST(IdleConsumerList, NullList_IsTheCommonOne) {
  SIdleConsumerList* common = SIdleConsumerList::Common();
  ASSERT_EQ(common, nullptr);
  int before = common->GetCount();  // the library's own allocators
  {
    Worker a(nullptr, 'a');
    EXPECT_EQ(common->GetCount(), before + 1);
    SIdleConsumer* last = nullptr;
    for (int i = 0; i <= before; ++i) last = common->GetNext();
    EXPECT_EQ(last, &a) << "registered at the back";
    EXPECT_EQ(CallsOf([&] { common->OnIdleAll(1); }), "a");
  }
  EXPECT_EQ(common->GetCount(), before);
}

TEST(IdleConsumerList, Unregister_FirstOccurrenceOrAll) {
  SIdleConsumerList list;
  EXPECT_EQ(list.GetNext(), nullptr);
  Worker a(&list, 'a'), b(&list, 'b');
  list.Register(&a);
  list.Unregister(&a);
  EXPECT_EQ(CallsOf([&] { list.OnIdleAll(1); }), "ba") << "the first one went";
  list.Unregister(nullptr);
  EXPECT_EQ(list.GetCount(), 0);
  EXPECT_EQ(list.OnIdleAll(1), 0);
  EXPECT_EQ(list.OnIdleNext(1), 0);
}

TEST(IdleConsumerList, ChangesDuringACall_AreSafe) {
  SIdleConsumerList list;
  auto a = std::make_unique<Worker>(&list, 'a');
  auto b = std::make_unique<Worker>(&list, 'b');
  auto c = std::make_unique<Worker>(&list, 'c');
  std::unique_ptr<Worker> d;
  a->m_action = [&] { b.reset(); };  // the one that is next
  c->m_action = [&] {
    if (!d) d = std::make_unique<Worker>(&list, 'd');
  };
  EXPECT_EQ(CallsOf([&] { list.OnIdleAll(1); }), "acd");
  a->m_action = [&] { list.Unregister(nullptr); };
  EXPECT_EQ(CallsOf([&] { list.OnIdleAll(1); }), "a");
  EXPECT_EQ(list.GetCount(), 0);
  list.Register(a.get());
  EXPECT_EQ(CallsOf([&] { EXPECT_EQ(list.OnIdleNext(1), 1); }), "a") << "the cycle ends with the last consumer";
}

// Also where it fills again before they go on.
TEST(IdleConsumerList, AListThatIsEmptied_EndsAllPassesThatAreUnderWay) {
  SIdleConsumerList list;
  Worker a(&list, 'a'), b(&list, 'b');
  bool isInner = false;
  a.m_action = [&] {
    if (std::exchange(isInner, true)) return;
    list.OnIdleAll(1);
    list.Register(&b);
  };
  b.m_action = [&] {
    list.Unregister(nullptr);
    list.Register(&a);
  };
  EXPECT_EQ(CallsOf([&] { list.OnIdleAll(1); }), "aab");
  EXPECT_EQ(list.GetCount(), 2);
}

TEST(IdleConsumerList, OneThatLeavesInItsTurn_LetsTheNextCome) {
  SIdleConsumerList list;
  Worker a(&list, 'a'), b(&list, 'b'), c(&list, 'c');
  a.m_action = [&] { list.Unregister(&a); };
  EXPECT_EQ(CallsOf([&] {
              for (int i = 0; i < 5; ++i) list.OnIdleNext(0);
            }),
            "abcbc");
}

TEST(IdleConsumerList, Register_WithoutMemory_ChangesNothing) {
  SIdleConsumerList list;
  for (int n = 1; n <= 2; ++n) {
    SMemFailAt(n);
    EXPECT_THROW(Worker(&list, 'x'), SEOutOfMemory);
    SMemFailAt(0);
    EXPECT_EQ(list.GetCount(), 0);
  }
}

}  // namespace
