// Formatting a time.

#include "bench/bench.h"
#include "qxcore/system/time/time.h"

#if BENCH_PEERS
#include <QDateTime>
#include <ctime>
#endif

namespace {

constexpr std::int32_t kStart = 1700000000, kStep = 12345;

// Another time in each round, over the range of a year.
std::int32_t Next(std::int32_t time) { return time > kStart + 31536000 ? kStart : time + kStep; }

}  // namespace

BENCH("format a time/ours") {
  std::int32_t time = kStart;
  for (auto _ : state) {
    const SString text = STime(time = Next(time)).Format(WTEXT("%Y-%m-%d %H:%M:%S"));
    benchmark::DoNotOptimize(text.GetSafePointer());
  }
}

#if BENCH_PEERS
BENCH("format a time/strftime") {
  std::int32_t time = kStart;
  for (auto _ : state) {
    const std::time_t value = time = Next(time);
    std::tm fields;
    localtime_r(&value, &fields);
    char text[128];
    benchmark::DoNotOptimize(std::strftime(text, sizeof text, "%Y-%m-%d %H:%M:%S", &fields));
    benchmark::ClobberMemory();
  }
}

BENCH("format a time/QDateTime") {
  std::int32_t time = kStart;
  const QString format = QStringLiteral("yyyy-MM-dd HH:mm:ss");
  for (auto _ : state) {
    const QString text = QDateTime::fromSecsSinceEpoch(time = Next(time)).toString(format);
    benchmark::DoNotOptimize(text.constData());
  }
}
#endif
