// Settings: values of a registry key, and of the peer's initialisation file.

#include <cstdlib>
#include <string>
#include <vector>

#include "bench/bench.h"
#include "qxcore/platform/wide.h"
#include "qxcore/system/settings/registry.h"

#if BENCH_PEERS
#include <unistd.h>

#include <QSettings>
#include <QTemporaryDir>
#endif

namespace {

constexpr int kReads = 100'000;
constexpr int kValues = 1000;

std::basic_string<WCHAR> Name(int i) {
  WCHAR name[32];
  platform::WideFormat(name, 32, WTEXT("value %d"), i);
  return name;
}

#if BENCH_PEERS
// A registry and a file of the benchmark's own.
const QTemporaryDir& Folder() {
  static const QTemporaryDir folder;
  return folder;
}
#endif

SRegistry& Key() {
  static SRegistry& key = *[] {
#if BENCH_PEERS
    setenv("QXCORE_REGISTRY", (Folder().path() + "/registry.db").toUtf8().constData(), 1);
#endif
    auto* made = new SRegistry(HKEY_CURRENT_USER, SString(WTEXT("Software\\qxcore bench")), 1);
    for (int i = 0; i < kValues; ++i) made->WriteProfile(Name(i).c_str(), SString(WTEXT("a setting of some length")));
    return made;
  }();
  return key;
}

const std::vector<SString>& Names() {
  static const std::vector<SString> names = [] {
    std::vector<SString> made;
    for (int i = 0; i < kValues; ++i) made.emplace_back(Name(i).c_str());
    return made;
  }();
  return names;
}

}  // namespace

BENCH("100,000 settings read/ours") {
  const SRegistry& key = Key();
  for (auto _ : state) {
    for (int i = 0; i < kReads; ++i) {
      SString value;
      key.GetProfile(Names()[static_cast<std::size_t>(i % kValues)], &value, SString::null);
      benchmark::DoNotOptimize(value.GetSafePointer());
    }
  }
}

BENCH("a setting written/ours") {
  SRegistry& key = Key();
  const SString values[] = {SString(WTEXT("the first value")), SString(WTEXT("the second value"))};
  int i = 0;
  for (auto _ : state) {
    key.WriteProfile(Names()[static_cast<std::size_t>(i % kValues)], values[i / kValues % 2]);
    ++i;
  }
}

#if BENCH_PEERS
namespace {

QSettings& Peer() {
  static QSettings& settings = *[] {
    auto* made = new QSettings(Folder().path() + "/peer.ini", QSettings::IniFormat);
    for (int i = 0; i < kValues; ++i) made->setValue(QString("value %1").arg(i), QString("a setting of some length"));
    made->sync();
    return made;
  }();
  return settings;
}

const std::vector<QString>& PeerNames() {
  static const std::vector<QString> names = [] {
    std::vector<QString> made;
    for (int i = 0; i < kValues; ++i) made.push_back(QString("value %1").arg(i));
    return made;
  }();
  return names;
}

}  // namespace

BENCH("100,000 settings read/QSettings") {
  const QSettings& settings = Peer();
  for (auto _ : state) {
    for (int i = 0; i < kReads; ++i) {
      const QString value = settings.value(PeerNames()[static_cast<std::size_t>(i % kValues)]).toString();
      benchmark::DoNotOptimize(value.constData());
    }
  }
}

BENCH("a setting written/QSettings") {
  QSettings& settings = Peer();
  const QString values[] = {QString("the first value"), QString("the second value")};
  int i = 0;
  for (auto _ : state) {
    settings.setValue(PeerNames()[static_cast<std::size_t>(i % kValues)], values[i / kValues % 2]);
    settings.sync();
    ++i;
  }
}
#endif
