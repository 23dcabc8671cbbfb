// Orders, contexts, re-entrancy and reference counts of notifications, and random use beside a plain model.

#include "qxcore/system/notification_manager.h"

#include "qxcore/system/notification_sink.h"

#include <gtest/gtest.h>

#include <functional>
#include <string>
#include <vector>

#include "tests/support/failing_allocations.h"
#include "tests/support/text.h"

namespace {

std::string g_calls;  // the names of the sinks, in the order in which they were called

class Sink final : public ISNotificationSink {
 public:
  explicit Sink(char name = '?') : m_name(name) {}
  ~Sink() { SNotificationManager::UnadviseAll(this); }

  HRESULT WINAPI QueryInterface(const GUID&, void** object) override {
    *object = nullptr;
    return E_NOINTERFACE;
  }
  ULONG WINAPI AddRef() override { return ++refs; }
  ULONG WINAPI Release() override { return --refs; }
  int WINAPI OnNotification(int kind, void* context, unsigned long data) override {
    g_calls += m_name;
    lastKind = kind;
    lastContext = context;
    lastData = data;
    if (onCall) onCall();
    return -1;
  }

  std::function<void()> onCall;
  ULONG refs = 0;
  int lastKind = 0;
  void* lastContext = nullptr;
  unsigned long lastData = 0;

 private:
  char m_name;
};

int NewKind() {
  static int number = 0;
  WCHAR name[] = WTEXT("kind-of-this-test-?????");
  std::string digits = std::to_string(100'000 + ++number);
  for (int i = 0; i < 5; ++i) name[18 + i] = static_cast<WCHAR>(digits[static_cast<std::size_t>(i) + 1]);
  return SNotificationManager::NotificationKind(name);
}

std::string CallsOf(int kind, void* context = nullptr) {
  g_calls.clear();
  SNotificationManager::Notify(kind, context, 7);
  return g_calls;
}

TEST(NotificationManager, KindsCountUp_AndKeepTheirNumbers) {
  const int first = SNotificationManager::NotificationKind(WTEXT("first"));
  EXPECT_GE(first, 1);
  EXPECT_EQ(SNotificationManager::NotificationKind(WTEXT("second")), first + 1);
  EXPECT_EQ(SNotificationManager::NotificationKind(WTEXT("First")), first + 2) << "case tells names apart";
  EXPECT_EQ(SNotificationManager::NotificationKind(WTEXT("first")), first);
}

TEST(NotificationManager, RunsAreFirstOrdinaryLast) {
  Sink a('A'), b('B'), c('C'), d('D'), e('E'), f('F'), g('G');
  const int kind = NewKind();
  EXPECT_EQ(SNotificationManager::AdviseFirst(&a, kind), 1);
  SNotificationManager::AdviseFirst(&b, kind);
  SNotificationManager::Advise(&c, kind);
  SNotificationManager::Advise(&d, kind);
  SNotificationManager::AdviseLast(&e, kind);
  SNotificationManager::AdviseLast(&f, kind);
  SNotificationManager::Advise(&g, kind);
  EXPECT_EQ(CallsOf(kind), "BACDGEF");
  SNotificationManager::Advise(&g, kind);
  EXPECT_EQ(CallsOf(kind), "BACDGGEF") << "the same registration twice";
  // The counts of the runs do not fall: the ordinary run now seems to end two further to the front.
  EXPECT_EQ(SNotificationManager::Unadvise(&e, kind), 1);
  EXPECT_EQ(SNotificationManager::Unadvise(&f, kind), 1);
  SNotificationManager::Advise(&e, kind);
  EXPECT_EQ(CallsOf(kind), "BACDEGG");
  for (Sink* sink : {&a, &b, &c, &d, &e}) SNotificationManager::Unadvise(sink, kind);
  for (int i = 0; i < 3; ++i) SNotificationManager::AdviseLast(&f, kind), SNotificationManager::Unadvise(&f, kind);
  SNotificationManager::Advise(&a, kind);
  EXPECT_EQ(CallsOf(kind), "AGG") << "five counted, two there: clamped to the front";
  SNotificationManager::UnadviseAll(&g);
  SNotificationManager::UnadviseAll(&a);
  SNotificationManager::AdviseLast(&a, kind);
  SNotificationManager::Advise(&b, kind);
  EXPECT_EQ(CallsOf(kind), "BA") << "a kind without registrations starts anew";
}

TEST(NotificationManager, ContextsNarrow_AndNullIsAny) {
  Sink any('*'), x('X'), y('Y');
  int contextX, contextY;
  const int kind = NewKind();
  SNotificationManager::Advise(&any, kind);
  SNotificationManager::Advise(&x, kind, &contextX);
  SNotificationManager::Advise(&y, kind, &contextY);
  EXPECT_EQ(CallsOf(kind), "*XY");
  EXPECT_EQ(CallsOf(kind, &contextX), "*X");
  EXPECT_EQ(CallsOf(kind, &any), "*");
  EXPECT_EQ(SNotificationManager::Notify(kind, &contextY, 42), 3) << "registrations, not calls";
  EXPECT_TRUE(y.lastKind == kind && y.lastContext == &contextY && y.lastData == 42);

  SNotificationManager::Advise(&x, kind, &contextY);
  SNotificationManager::Advise(&x, kind);
  EXPECT_EQ(SNotificationManager::Unadvise(&x, kind, &contextX), 1);
  EXPECT_EQ(CallsOf(kind), "*YX") << "those for X and for any are gone, that for Y stays";
  EXPECT_EQ(SNotificationManager::Unadvise(&x, kind, &contextX), 0);
  EXPECT_EQ(SNotificationManager::Unadvise(&x, kind), 1);
  EXPECT_EQ(CallsOf(kind), "*Y");

  g_calls.clear();
  SNotificationManager::Advise(&any, 0);
  EXPECT_EQ(SNotificationManager::Notify(0, nullptr, 0), 0);
  EXPECT_EQ(SNotificationManager::Notify(NewKind(), nullptr, 0), 0);
  EXPECT_EQ(g_calls, "");
}

TEST(NotificationManager, OneReferenceASink_FromTheFirstRegistrationToUnadviseAll) {
  Sink sink;
  const int kind = NewKind(), other = NewKind();
  EXPECT_EQ(SNotificationManager::UnadviseAll(&sink), 0);
  SNotificationManager::Advise(&sink, kind);
  SNotificationManager::AdviseFirst(&sink, other);
  EXPECT_EQ(sink.refs, 1u);
  SNotificationManager::Unadvise(&sink, kind);
  SNotificationManager::Unadvise(&sink, other);
  EXPECT_EQ(sink.refs, 1u);
  EXPECT_EQ(SNotificationManager::UnadviseAll(&sink), 1);
  EXPECT_EQ(sink.refs, 0u);
  EXPECT_EQ(SNotificationManager::UnadviseAll(&sink), 0);
}

TEST(NotificationManager, APassGoesOverTheRegistrationsItBeganWith) {
  Sink a('A'), b('B'), c('C');
  const int kind = NewKind(), inner = NewKind();
  SNotificationManager::Advise(&c, inner);
  a.onCall = [&] {
    SNotificationManager::UnadviseAll(&b);        // still called in this pass
    SNotificationManager::AdviseFirst(&c, kind);  // not called in this pass
    SNotificationManager::Notify(inner, nullptr, 0);
    SNotificationManager::UnadviseAll(&a);
  };
  SNotificationManager::Advise(&a, kind);
  SNotificationManager::Advise(&b, kind);
  EXPECT_EQ(CallsOf(kind), "ACB");
  EXPECT_EQ(CallsOf(kind), "C");
  EXPECT_TRUE(a.refs == 0 && b.refs == 0 && c.refs == 1);
  c.onCall = [&] {  // the record of the kind goes away under the pass
    SNotificationManager::UnadviseAll(&c);
  };
  EXPECT_EQ(CallsOf(kind), "C");
  EXPECT_EQ(CallsOf(kind), "");
}

// The rules once more, in the plainest form.
struct Model {
  struct Entry {
    int sink;
    void* context;
  };
  std::vector<Entry> table;
  int lastCount = 0;

  static bool Concerns(const Entry& one, void* context) { return !one.context || !context || one.context == context; }
  void Advise(int sink, void* context, int place) {
    std::size_t at = place == 0 ? 0 : table.size();
    if (place == 1) at -= std::min<std::size_t>(at, static_cast<std::size_t>(lastCount));
    table.insert(table.begin() + static_cast<std::ptrdiff_t>(at), {sink, context});
    lastCount += place == 2;
  }
  void Remove(std::function<bool(const Entry&)> goes) {
    std::erase_if(table, goes);
    if (table.empty()) lastCount = 0;
  }
  std::string Calls(void* context) {
    std::string calls;
    for (const Entry& one : table) {
      if (Concerns(one, context)) calls += static_cast<char>('a' + one.sink);
    }
    return calls;
  }
};

TEST(NotificationManager, RandomUse_IsThatOfTheModel) {
  RandomText random(6);
  Sink sinks[] = {Sink('a'), Sink('b'), Sink('c'), Sink('d')};
  char contexts[3];
  const int kind = NewKind();
  Model model;
  for (int step = 0; step < 30000; ++step) {
    const int sink = random.Number(4);
    void* context = random.Number(2) == 0 ? nullptr : &contexts[random.Number(3)];
    // Short tables and long ones in turn.
    const bool endsAll = step / 500 % 2 == 0 || model.table.size() > 50;
    switch (random.Number(endsAll ? 6 : 5)) {
      case 0:
        SNotificationManager::AdviseFirst(&sinks[sink], kind, context);
        model.Advise(sink, context, 0);
        break;
      case 1:
        SNotificationManager::Advise(&sinks[sink], kind, context);
        model.Advise(sink, context, 1);
        break;
      case 2:
        SNotificationManager::AdviseLast(&sinks[sink], kind, context);
        model.Advise(sink, context, 2);
        break;
      case 3:
        SNotificationManager::Unadvise(&sinks[sink], kind, context);
        model.Remove([&](auto& one) { return one.sink == sink && Model::Concerns(one, context); });
        break;
      case 4:
        ASSERT_EQ(CallsOf(kind, context), model.Calls(context)) << "step " << step;
        break;
      default:
        SNotificationManager::UnadviseAll(&sinks[sink]);
        model.Remove([&](auto& one) { return one.sink == sink; });
    }
  }
}

TEST(NotificationManager, FailedAllocation_LeavesTheRegistrations) {
  Sink a('A'), b('B');
  const int kind = NewKind(), other = NewKind();
  std::string expected;
  SNotificationManager::Advise(&a, kind);
  const int failures = WithEachAllocationFailing(
      [&] {
        SNotificationManager::UnadviseAll(&b);
        expected = "A";
        SNotificationManager::Advise(&b, kind);
        expected = "AB";
        for (int i = 0; i < 20; ++i) SNotificationManager::Advise(&b, kind), expected += 'B';
        SNotificationManager::Advise(&b, other);
        expected += '+';
      },
      [&] {
        EXPECT_EQ(CallsOf(kind) + (SNotificationManager::Notify(other, nullptr, 0) != 0 ? "+" : ""), expected);
        EXPECT_EQ(b.refs, expected == "A" ? 0u : 1u);
      });
  EXPECT_GT(failures, 5);
}

class DerivedSink : public SNotificationSink {
 public:
  DerivedSink(Lifetime lifetime, int& calls, int& living)
      : SNotificationSink(lifetime), m_calls(calls), m_living(living) {
    ++m_living;
  }
  ~DerivedSink() override { --m_living; }
  int WINAPI OnNotification(int, void*, unsigned long) override { return ++m_calls; }

 private:
  int& m_calls;
  int& m_living;
};

TEST(NotificationSink, CountsAndUnregistersByItself) {
  const int kind = SNotificationManager::NotificationKind(WTEXT("DerivedSink"));
  int calls = 0, living = 0;
  {
    DerivedSink owned(SNotificationSink::Lifetime::kOwned, calls, living);
    SNotificationManager::Advise(&owned, kind);
    SNotificationManager::Notify(kind, nullptr, 0);
    EXPECT_EQ(calls, 1);
  }
  EXPECT_EQ(SNotificationManager::Notify(kind, nullptr, 0), 0) << "its registrations ended with it";
  auto* counted = new DerivedSink(SNotificationSink::Lifetime::kCounted, calls, living);
  SNotificationManager::Advise(counted, kind);
  counted->Release();
  EXPECT_EQ(living, 1) << "the manager holds it";
  SNotificationManager::Notify(kind, nullptr, 0);
  EXPECT_EQ(calls, 2);
  SNotificationManager::UnadviseAll(counted);
  EXPECT_EQ(living, 0);
  void* object = &calls;
  DerivedSink last(SNotificationSink::Lifetime::kOwned, calls, living);
  EXPECT_EQ(last.QueryInterface(GUID(), &object), E_NOINTERFACE);
  EXPECT_EQ(object, nullptr);
}

}  // namespace
