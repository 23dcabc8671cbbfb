// String tables beside std::sort and Qt's string lists.

#include <algorithm>
#include <cstring>
#include <random>
#include <string>
#include <vector>
#if BENCH_PEERS
#include <QString>
#include <QStringList>
#endif

#include "bench/bench.h"
#include "qxcore/container/string_table.h"

namespace {

using StdText = std::basic_string<WCHAR>;

constexpr int kLines = 100'000;
constexpr int kPieces = 1'000'000;

// Lines as file lists and logs have them: some common starts, words, numbers.
const std::vector<StdText>& Lines() {
  static const std::vector<StdText> lines = [] {
    const char* const kStarts[] = {"src/module", "src/model/table", "include/", "2026-11-", "build/objects/lib", ""};
    std::mt19937 random(1);
    std::vector<StdText> made;
    for (int i = 0; i < kLines; ++i) {
      std::string line = kStarts[random() % std::size(kStarts)] + std::to_string(random() % 5000) + '_';
      for (int letters = static_cast<int>(random() % 20); letters >= 0; --letters)
        line += static_cast<char>('a' + random() % 26);
      line += std::to_string(random() % 100) + ".txt";
      made.emplace_back(line.begin(), line.end());
    }
    return made;
  }();
  return lines;
}

SStringTable OwnLines() {
  SStringTable table;
  for (const StdText& line : Lines()) table.Add(SStringView(line));
  return table;
}

// A million texts of three to twelve letters.
const std::vector<StdText>& Pieces() {
  static const std::vector<StdText> pieces = [] {
    std::mt19937 random(2);
    std::vector<StdText> made(kPieces);
    for (StdText& piece : made) {
      for (int letters = 3 + static_cast<int>(random() % 10); letters > 0; --letters)
        piece += static_cast<WCHAR>('a' + random() % 26);
    }
    return made;
  }();
  return pieces;
}

StdText JoinedPieces() {
  StdText list;
  for (const StdText& piece : Pieces()) list += piece + WTEXT(',');
  list.pop_back();
  return list;
}

void SortOwn(benchmark::State& state, void (SStringTable::*sort)(int)) {
  const SStringTable lines = OwnLines();
  for (auto _ : state) {
    state.PauseTiming();
    SStringTable table = lines;
    state.ResumeTiming();
    (table.*sort)(SStringTable::kAscending);
    benchmark::DoNotOptimize(table.GetArray());
    state.PauseTiming();
    table.Clear();
    state.ResumeTiming();
  }
}

BENCH("sort 100,000 lines/ours") { SortOwn(state, &SStringTable::Sort); }
BENCH("sort 100,000 lines in natural order/ours") { SortOwn(state, &SStringTable::SortNumbered); }

BENCH("join a million strings/ours") {
  SStringTable table;
  for (const StdText& piece : Pieces()) table.Add(SStringView(piece));
  const SString separator = WTEXT(",");
  for (auto _ : state) {
    SString joined = table.Format(SString::null, separator, SString::null);
    benchmark::DoNotOptimize(joined.GetSafePointer());
  }
}

BENCH("split into a million strings/ours") {
  const StdText text = JoinedPieces();
  const SString list{SStringView(text)};
  for (auto _ : state) {
    SStringTable table;
    table.AddFromList(list, WTEXT(","), 0);
    benchmark::DoNotOptimize(table.GetArray());
  }
}

#if BENCH_PEERS
template <class Text, class Order>
void SortPeer(benchmark::State& state, const std::vector<Text>& lines, Order order) {
  for (auto _ : state) {
    state.PauseTiming();
    std::vector<Text> sorted = lines;
    state.ResumeTiming();
    std::sort(sorted.begin(), sorted.end(), order);
    benchmark::DoNotOptimize(sorted.data());
    state.PauseTiming();
    sorted = {};
    state.ResumeTiming();
  }
}

BENCH("sort 100,000 lines/std::u16string") { SortPeer(state, Lines(), std::less<>()); }

BENCH("sort 100,000 lines in natural order/strverscmp") {
  std::vector<std::string> lines;
  for (const StdText& line : Lines()) lines.emplace_back(line.begin(), line.end());
  SortPeer(state, lines,
           [](const std::string& a, const std::string& b) { return strverscmp(a.c_str(), b.c_str()) < 0; });
}

QString ToQt(const StdText& text) { return QString::fromUtf16(text.data(), static_cast<int>(text.size())); }

BENCH("join a million strings/QStringList") {
  QStringList list;
  for (const StdText& piece : Pieces()) list.append(ToQt(piece));
  const QString separator = ToQt(WTEXT(","));
  for (auto _ : state) {
    QString joined = list.join(separator);
    benchmark::DoNotOptimize(joined.constData());
  }
}

BENCH("split into a million strings/QString") {
  const QString list = ToQt(JoinedPieces());
  for (auto _ : state) {
    QStringList parts = list.split(QChar(','));
    benchmark::DoNotOptimize(parts.size());
  }
}
#endif

}  // namespace
