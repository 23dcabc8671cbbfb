// Telling eight sinks, beside a signal of Qt that eight slots are connected to.

#if BENCH_PEERS
#include <QObject>
#endif

#include "bench/bench.h"
#include "qxcore/system/notification_manager.h"

namespace {

constexpr int kSinks = 8;

class CountingSink final : public ISNotificationSink {
 public:
  HRESULT WINAPI QueryInterface(const GUID&, void** object) override {
    *object = nullptr;
    return E_NOINTERFACE;
  }
  ULONG WINAPI AddRef() override { return 1; }
  ULONG WINAPI Release() override { return 1; }
  int WINAPI OnNotification(int, void*, unsigned long data) override {
    m_sum += data;
    return 0;
  }
  unsigned long m_sum = 0;
};

BENCH("notify eight sinks/ours") {
  CountingSink sinks[kSinks];
  const int kind = SNotificationManager::NotificationKind(WTEXT("bench"));
  for (CountingSink& sink : sinks) SNotificationManager::Advise(&sink, kind);
  unsigned long data = 0;
  for (auto _ : state) benchmark::DoNotOptimize(SNotificationManager::Notify(kind, nullptr, ++data));
  for (CountingSink& sink : sinks) SNotificationManager::UnadviseAll(&sink);
}

#if BENCH_PEERS
BENCH("notify eight sinks/Qt signal") {
  QObject sender;
  unsigned long sums[kSinks] = {};
  // QObject::destroyed is a signal that needs no generated code of our own.
  for (unsigned long& sum : sums) {
    QObject::connect(
        &sender, &QObject::destroyed, &sender, [&sum](QObject* object) { sum += object != nullptr; },
        Qt::DirectConnection);
  }
  for (auto _ : state) {
    sender.destroyed(&sender);
    benchmark::DoNotOptimize(sums[0]);
  }
}
#endif

}  // namespace
