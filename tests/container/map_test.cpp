// Trees and maps beside std::map: order, addresses, the balance, failures.

#include "qxcore/container/map.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <map>
#include <random>
#include <vector>

#include "counted.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

namespace {

using Map = SMap<int, Counted>;
using UnsortedMap = SUnsortedMap<int, Counted>;

// Looks inside, and lets the untyped operations be called.
struct OpenMap : Map {
  using __STree::AddCopy;
  using __STree::CompareKey;
  using __STree::GetVoid;
  using __STree::KeyOf;
  void* FindVoid(long key) const { return __STree::Find(key); }

  // The number of black entries on every way down; -1 where an invariant does not hold.
  static int BlackHeight(const Entry* entry, const Entry* parent) {
    if (entry == nullptr) return 1;
    if (entry->m_parent != parent) return -1;
    if (entry->m_color == kRed && (_Color(parent) == kRed || parent == nullptr)) return -1;
    int left = BlackHeight(entry->m_left, entry);
    if (left < 0 || left != BlackHeight(entry->m_right, entry)) return -1;
    return left + (entry->m_color == kBlack ? 1 : 0);
  }
  bool IsSound() const {
    if (BlackHeight(m_root, nullptr) < 0) return false;
    int count = 0;
    for (Entry* entry = GetFirstEntry(); entry != nullptr; entry = Successor(entry)) {
      Entry* next = Successor(entry);
      if (next != nullptr && CompareKey(KeyOf(entry->Payload()), KeyOf(next->Payload())) >= 0) return false;
      if (next != nullptr && Predecessor(next) != entry) return false;
      ++count;
    }
    return count == m_count;
  }
};

std::vector<std::pair<int, int>> Entries(const auto& map) {
  std::vector<std::pair<int, int>> entries;
  for (const auto& [key, value] : map) entries.emplace_back(key, value.Get());
  return entries;
}

TEST(Map, RandomChanges_AreThoseOfAStdMapAndKeepTheBalance) {
  std::mt19937 random(1);
  {
    OpenMap map;
    std::map<int, int> peer;
    std::map<int, const Counted*> addresses;
    for (int step = 0; step < 20000; ++step) {
      // Grows and shrinks by turns, from narrow ranges and wide ones.
      bool grows = step / 1000 % 2 == 0;
      int key = static_cast<int>(random() % (step < 10000 ? 60 : 5000));
      if (random() % 10 < (grows ? 7u : 2u)) {
        int value = static_cast<int>(random() % 1000);
        if (step % 2 == 0) {
          map.Add(key, Counted(value));
        } else {
          map[key] = Counted(value);
        }
        peer[key] = value;
        addresses.emplace(key, map.Retrieve(key));
      } else if (step % 3 != 0 || peer.empty()) {
        ASSERT_EQ(map.Remove(key), peer.erase(key) != 0);
        addresses.erase(key);
      } else {
        auto place = map.Find(
            std::next(peer.begin(), static_cast<long>(random() % std::min<std::size_t>(peer.size(), 9)))->first);
        auto next = std::next(peer.find(place->m_key));
        addresses.erase(place->m_key);
        peer.erase(place->m_key);
        map.Remove(place);
        ASSERT_EQ(place == map.end(), next == peer.end());
        if (next != peer.end()) {
          ASSERT_EQ(place->m_key, next->first);
        }
      }
      ASSERT_TRUE(map.IsSound()) << "step " << step;
      if (step % 100 == 0) {
        ASSERT_EQ(Entries(map), (std::vector<std::pair<int, int>>(peer.begin(), peer.end())));
      }
    }
    ASSERT_FALSE(peer.empty());
    for (auto [key, address] : addresses) ASSERT_EQ(map.Retrieve(key), address) << "payloads do not move";
    OpenMap copy(map);
    EXPECT_TRUE(copy.IsSound());
    EXPECT_EQ(Entries(copy), Entries(map));
    const Map& alias = map;
    map.Map::operator=(alias);
    EXPECT_EQ(map.GetCount(), copy.GetCount());
    int last = std::prev(copy.end())->m_key;
    EXPECT_EQ(last, peer.rbegin()->first);
  }
  EXPECT_TRUE(Counted::living.empty());
}

TEST(Map, LookupOfAnAbsentKey_InsertsNothing) {
  const SMap<int, int> map{{1, 10}};
  EXPECT_EQ(map[2], 0);
  EXPECT_EQ(map.Retrieve(2), nullptr);
  EXPECT_EQ(map.Find(2), map.end());
  EXPECT_EQ(map.GetCount(), 1);
}

TEST(Tree, UntypedInsertion_ReplacesAndFindsUnconstructedEntries) {
  {
    OpenMap map;
    SMapEntry<int, Counted> source{5, Counted(50)};
    EXPECT_EQ(static_cast<decltype(source)*>(map.AddCopy(&source))->m_value.Get(), 50);
    source.m_value = Counted(51);
    void* payload = map.AddCopy(&source);
    EXPECT_EQ(map.GetCount(), 1);
    EXPECT_EQ(map.AddCopy(map.KeyOf(payload), payload), payload) << "the payload that is there already";
    EXPECT_EQ(map[5].Get(), 51);
    void* found;
    EXPECT_FALSE(map.GetVoid(map.KeyOf(&source), &found));
    EXPECT_EQ(found, payload);
    EXPECT_EQ(map.FindVoid(map.KeyOf(&source)), payload);
    const SMapEntry<int, Counted> absent{6, Counted(60)};
    EXPECT_EQ(map.FindVoid(map.KeyOf(&absent)), nullptr);
    Counted::failAt = 1;
    EXPECT_THROW(map.AddCopy(&source), CopyFailed);
    Counted::failAt = 0;
    EXPECT_TRUE(map.IsSound());
  }
  EXPECT_TRUE(Counted::living.empty());
}

TEST(UnsortedMap, RandomChanges_KeepTheOrderOfInsertion) {
  std::mt19937 random(2);
  UnsortedMap map;
  std::vector<std::pair<int, int>> peer;
  for (int step = 0; step < 5000; ++step) {
    int key = static_cast<int>(random() % 50);
    auto place = std::find_if(peer.begin(), peer.end(), [key](auto& entry) { return entry.first == key; });
    if (random() % 2 == 0) {
      int value = static_cast<int>(random() % 1000);
      map.Add(key, Counted(value));
      if (place != peer.end()) {
        place->second = value;
      } else {
        peer.emplace_back(key, value);
      }
    } else if (step % 2 == 0 || place == peer.end()) {
      ASSERT_EQ(map.Remove(key), place != peer.end());
      if (place != peer.end()) peer.erase(place);
    } else {
      auto own = std::next(map.begin(), place - peer.begin());
      ASSERT_EQ(own->m_key, key);
      map.Remove(own);
      place = peer.erase(place);
      if (place != peer.end()) {
        ASSERT_EQ(own->m_key, place->first);
      }
    }
    ASSERT_EQ(Entries(map), peer);
  }
  UnsortedMap copy(map), moved(std::move(map));
  EXPECT_EQ(Entries(copy), peer);
  EXPECT_EQ(Entries(moved), peer);
  EXPECT_TRUE(map.IsEmpty());
  copy.Clear();
  EXPECT_EQ(copy.begin(), copy.end());
  copy[3];
  EXPECT_EQ(copy.begin()->m_key, 3);
}

template <class MapType>
class MapFailureTest : public testing::Test {};
using BothMaps = testing::Types<SMap<int, std::vector<int>>, SUnsortedMap<int, std::vector<int>>>;
TYPED_TEST_SUITE(MapFailureTest, BothMaps);

TYPED_TEST(MapFailureTest, OutOfMemory_LeavesTheMapAsItWas) {
  for (bool forever : {false, true}) {
    for (int count : {0, 4, 7, 200}) {
      for (long n = 1;; ++n) {
        TypeParam map;
        for (int key = 0; key < count; ++key) map.Add(key, {key});
        SMemFailAt(n, forever);
        bool hasThrown = false;
        try {
          for (int key = count; key < count + 200; ++key) map.Add(key, {key});
        } catch (const SEOutOfMemory&) {
          hasThrown = true;
        }
        SMemFailAt(0);
        int key = 0;
        for (auto& [k, v] : map) {
          ASSERT_EQ(k, key);
          ASSERT_EQ(v, std::vector<int>{key++});
        }
        ASSERT_EQ(key, map.GetCount());
        ASSERT_GE(key, count);
        if (!hasThrown) break;
        map.Add(-1, {});
        ASSERT_TRUE(map.Remove(-1));
      }
    }
  }
}

}  // namespace
