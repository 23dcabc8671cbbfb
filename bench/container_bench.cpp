// Maps, tables and lists beside the standard containers.

#include <algorithm>
#include <list>
#include <map>
#include <random>
#include <string>
#include <vector>
#if BENCH_PEERS
#include <malloc.h>
#endif

#include "bench/bench.h"
#include "qxcore/container/list.h"
#include "qxcore/container/string_map.h"
#include "qxcore/container/table.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/container/table_mem.h"

namespace {

constexpr int kEntries = 100'000;
constexpr int kMillion = 1'000'000;
using StdText = std::basic_string<WCHAR>;

// Random keys of 20 letters, each its own value.
const std::vector<StdText>& Keys() {
  static const std::vector<StdText> keys = [] {
    std::mt19937 random(1);
    std::vector<StdText> made(kEntries);
    for (StdText& key : made) {
      for (int i = 0; i < 20; ++i) key += static_cast<WCHAR>('a' + random() % 26);
    }
    return made;
  }();
  return keys;
}

// The same as strings of our own, so that both sides start from their own type.
const std::vector<SString>& OwnKeys() {
  static const std::vector<SString> keys = [] {
    std::vector<SString> made;
    for (const StdText& key : Keys()) made.push_back(SString(SStringView(key)));
    return made;
  }();
  return keys;
}

// A key that shares no buffer with the one it was made from.
SString Unshared(const SString& text) { return SString(text.View()); }

// Keys and values are made anew from their characters, for both sides.
void Fill(SStringMap& map) {
  for (const SString& key : OwnKeys()) map.Add(Unshared(key), Unshared(key));
}

// The order in which keys are looked up.
std::vector<int> Shuffled() {
  std::vector<int> order(kEntries);
  for (int i = 0; i < kEntries; ++i) order[static_cast<std::size_t>(i)] = i;
  std::shuffle(order.begin(), order.end(), std::mt19937(2));
  return order;
}

BENCH("100,000 keys into the string map/ours") {
  OwnKeys();
  for (auto _ : state) {
    SStringMap map;
    Fill(map);
    benchmark::DoNotOptimize(map.GetCount());
  }
}

BENCH("find in the string map/ours") {
  SStringMap map;
  Fill(map);
  std::vector<int> order = Shuffled();
  for (auto _ : state) {
    for (int i : order) benchmark::DoNotOptimize(map.Retrieve(OwnKeys()[static_cast<std::size_t>(i)]));
  }
}

BENCH("iterate the string map/ours") {
  SStringMap map;
  Fill(map);
  for (auto _ : state) {
    long length = 0;
    for (const auto& [key, value] : map) length += value.Length();
    benchmark::DoNotOptimize(length);
  }
}

BENCH("append a million to a table of int/ours") {
  for (auto _ : state) {
    STableDumb<int> table;
    for (int i = 0; i < kMillion; ++i) table.Add(i);
    benchmark::DoNotOptimize(table.GetCount());
  }
}

const std::vector<int>& Numbers() {
  static const std::vector<int> numbers(kMillion, 7);
  return numbers;
}

BENCH("append a million to a table of int, in one call/ours") {
  for (auto _ : state) {
    STableDumb<int> table;
    table.CopyArray(Numbers().data(), kMillion);
    benchmark::DoNotOptimize(table.GetCount());
  }
}

BENCH("append a million to a table of strings/ours") {
  SString text(WTEXT("a string of 30 characters here"));
  for (auto _ : state) {
    STableMem<SString> table;
    for (int i = 0; i < kMillion; ++i) table.Add(Unshared(text));
    benchmark::DoNotOptimize(table.GetCount());
  }
}

BENCH("push, walk and erase a million list nodes/ours") {
  for (auto _ : state) {
    SList<int> list;
    for (int i = 0; i < kMillion; ++i) list.AddBack(i);
    long sum = 0;
    for (int value : list) sum += value;
    benchmark::DoNotOptimize(sum);
    for (auto place = list.begin(); place != list.end();) place = list.Erase(place);
  }
}

#if BENCH_PEERS

using StdMap = std::map<StdText, StdText>;

void Fill(StdMap& map) {
  for (const StdText& key : Keys()) map.insert_or_assign(StdText(key), StdText(key));
}

BENCH("100,000 keys into the string map/std::map") {
  Keys();
  for (auto _ : state) {
    StdMap map;
    Fill(map);
    benchmark::DoNotOptimize(map.size());
  }
}

BENCH("find in the string map/std::map") {
  StdMap map;
  Fill(map);
  std::vector<int> order = Shuffled();
  for (auto _ : state) {
    for (int i : order) benchmark::DoNotOptimize(map.find(Keys()[static_cast<std::size_t>(i)]));
  }
}

BENCH("iterate the string map/std::map") {
  StdMap map;
  Fill(map);
  for (auto _ : state) {
    long length = 0;
    for (const auto& [key, value] : map) length += static_cast<long>(value.size());
    benchmark::DoNotOptimize(length);
  }
}

// What the heap hands out for the entries, its own overhead included. The pools are emptied before, so
// that all blocks they take are counted, and nothing but whole blocks is ever taken.
template <class Map>
double BytesAnEntry() {
  SString::FreeUnused();
  SStringMapAllocator::m_Nodes.FreeUnused();
  auto inUse = [] {
    struct mallinfo2 info = mallinfo2();
    return static_cast<double>(info.uordblks + info.hblkhd);
  };
  double before = inUse();
  Map map;
  Fill(map);
  return (inUse() - before) / kEntries;
}

BENCH("bytes an entry of the string map/ours") {
  OwnKeys();
  for (auto _ : state) state.counters["bytes"] = BytesAnEntry<SStringMap>();
}

BENCH("bytes an entry of the string map/std::map") {
  Keys();
  for (auto _ : state) state.counters["bytes"] = BytesAnEntry<StdMap>();
}

BENCH("append a million to a table of int/std::vector") {
  for (auto _ : state) {
    std::vector<int> table;
    for (int i = 0; i < kMillion; ++i) table.push_back(i);
    benchmark::DoNotOptimize(table.data());
  }
}

BENCH("append a million to a table of int, in one call/std::vector") {
  for (auto _ : state) {
    std::vector<int> table;
    table.insert(table.end(), Numbers().begin(), Numbers().end());
    benchmark::DoNotOptimize(table.data());
  }
}

BENCH("append a million to a table of strings/std::vector") {
  StdText text(WTEXT("a string of 30 characters here"));
  for (auto _ : state) {
    std::vector<StdText> table;
    for (int i = 0; i < kMillion; ++i) table.push_back(StdText(text));
    benchmark::DoNotOptimize(table.data());
  }
}

BENCH("push, walk and erase a million list nodes/std::list") {
  for (auto _ : state) {
    std::list<int> list;
    for (int i = 0; i < kMillion; ++i) list.push_back(i);
    long sum = 0;
    for (int value : list) sum += value;
    benchmark::DoNotOptimize(sum);
    for (auto place = list.begin(); place != list.end();) place = list.erase(place);
  }
}

#endif

}  // namespace
