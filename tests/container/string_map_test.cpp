// The four string maps: keys with and without case, order, comparison, and the list form.

#include "qxcore/container/string_map.h"

#include <gtest/gtest.h>

#include <map>
#include <random>
#include <string>

#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

namespace {

using Text = std::basic_string<WCHAR>;

Text KeysOf(const auto& map) {
  Text keys;
  for (const auto& [key, value] : map) keys.append(key).append(WTEXT(" "));
  return keys;
}

TEST(StringMap, OrderAndCaseOfTheFourKinds) {
  SStringMap map;
  SStringMapNoCase noCase;
  SStringUnsortedMap unsorted;
  SStringUnsortedMapNoCase unsortedNoCase;
  auto fill = [](auto& filled) {
    for (const WCHAR* key :
         {WTEXT("b"), WTEXT("Key"), WTEXT("_x"), WTEXT("KEY"), WTEXT("a"), WTEXT("\u00C4"), WTEXT("\u00E4")}) {
      filled.Add(key, key);
    }
  };
  fill(map), fill(noCase), fill(unsorted), fill(unsortedNoCase);
  EXPECT_EQ(KeysOf(map), WTEXT("KEY Key _x a b \u00C4 \u00E4 "));
  EXPECT_EQ(KeysOf(noCase), WTEXT("_x a b Key \u00C4 ")) << "the key that came first stays";
  EXPECT_EQ(KeysOf(unsorted), WTEXT("b Key _x KEY a \u00C4 \u00E4 "));
  EXPECT_EQ(KeysOf(unsortedNoCase), WTEXT("b Key _x a \u00C4 "));
  EXPECT_EQ(noCase[WTEXT("kEy")], WTEXT("KEY")) << "with the value that came last";
  EXPECT_EQ(*unsortedNoCase.Retrieve(WTEXT("\u00E4")), WTEXT("\u00E4"));
  EXPECT_FALSE(map.Contains(WTEXT("kEy")));
  EXPECT_TRUE(unsortedNoCase.Remove(WTEXT("key")));
  EXPECT_EQ(KeysOf(unsortedNoCase), WTEXT("b _x a \u00C4 "));
}

TEST(StringMap, Assignment_MixesTheKinds) {
  SStringMap map{{WTEXT("a"), WTEXT("1")}, {WTEXT("B"), WTEXT("2")}};
  SStringUnsortedMapNoCase other;
  other.Add(WTEXT("b"), WTEXT("2"));
  other.Add(WTEXT("A"), WTEXT("1"));
  EXPECT_TRUE(map == other) << "the other map's comparison counts";
  EXPECT_FALSE(other == map);
  other.Add(WTEXT("a"), WTEXT("x"));
  EXPECT_FALSE(map == other);
  EXPECT_TRUE(map != other);
  map += other;
  EXPECT_EQ(KeysOf(map), WTEXT("A B a b "));
  other = map;
  EXPECT_EQ(KeysOf(other), WTEXT("A B "));
  map = SStringMap::null;
  EXPECT_TRUE(map == SStringUnsortedMap::null);
  map += map;
  EXPECT_TRUE(map.IsEmpty());
}

TEST(StringMap, ConstantLookup_InsertsNothing) {
  const SStringMap map{{WTEXT("a"), WTEXT("1")}};
  EXPECT_EQ(map[WTEXT("b")], WTEXT(""));
  EXPECT_EQ(map.GetCount(), 1);
  SStringMap writable(map);
  EXPECT_EQ(writable[WTEXT("b")], WTEXT(""));
  EXPECT_EQ(writable.GetCount(), 2);
}

TEST(StringMap, Entries_ComeFromOnePool) {
  int before = SStringMapAllocator::m_Nodes.GetElementsInUse();
  SStringMap map;
  SStringUnsortedMapNoCase other;
  for (int i = 0; i < 200; ++i)
    map.Add(SString(static_cast<long>(i)), SString()), other.Add(SString(static_cast<long>(i)), SString());
  EXPECT_EQ(SStringMapAllocator::m_Nodes.GetElementsInUse(), before + 400);
  EXPECT_EQ(SStringMapAllocator::m_Nodes.GetElementsPerBlock(), 128u);
  EXPECT_EQ(SStringMapAllocator::m_Nodes.GetAllocSize(), sizeof(__STree::Entry) + 2 * sizeof(SString));
  map.Clear();
  other.Clear();
  EXPECT_EQ(SStringMapAllocator::m_Nodes.GetElementsInUse(), before);
}

TEST(StringMapList, GetAsList_EscapesByItsRule) {
  SStringMap map{{WTEXT("a"), WTEXT("b")}, {WTEXT("c"), WTEXT("d")}};
  EXPECT_EQ(map.GetAsList(',', '=', '\\'), WTEXT("a=b,c=d"));
  SStringMap odd{{WTEXT("a=x"), WTEXT("=")}, {WTEXT("k,l"), WTEXT("1,2")}, {WTEXT("\\"), WTEXT("\\")}};
  EXPECT_EQ(odd.GetAsList(',', '=', '\\'), WTEXT("\\\\=\\\\,a\\=x==,k,l=1\\,2"))
      << "a key escapes only the pair separator, a value only the item separator";
  EXPECT_EQ(SStringMap::null.GetAsList(',', '=', '\\'), WTEXT(""));
  EXPECT_EQ((SStringMap{{WTEXT(""), WTEXT("")}}).GetAsList(',', '=', '\\'), WTEXT("="));
  EXPECT_EQ(map.GetAsList(';', ':', 0), WTEXT("a:b;c:d"));
}

TEST(StringMapList, AddFromList_ReadsLeniently) {
  SStringUnsortedMap map;
  map.Add(WTEXT("old"), WTEXT("1"));
  EXPECT_EQ(map.AddFromList(WTEXT("k=v,old=2,x"), WTEXT("none"), ',', '=', WTEXT("\\^"), 0), 3);
  EXPECT_EQ(map.GetAsList(',', '=', '\\'), WTEXT("old=1,k=v,x=none"));
  EXPECT_EQ(map.AddFromList(WTEXT("old=2,^^\\==^,,"), nullptr, ',', '=', WTEXT("\\^"), 1), 2);
  EXPECT_EQ(map[WTEXT("old")], WTEXT("2"));
  EXPECT_EQ(map[WTEXT("^=")], WTEXT(","));
  EXPECT_EQ(map.AddFromList(WTEXT("end=\\"), nullptr, ',', '=', WTEXT("\\"), 1), 1);
  EXPECT_EQ(map[WTEXT("end")], WTEXT("\\"));
  EXPECT_EQ(map.AddFromList(WTEXT(""), ',', '=', '\\'), 0);
  EXPECT_EQ(map.AddFromList(nullptr, ',', '=', '\\'), 0);
  map.Clear();
  map.Add(WTEXT("list"), WTEXT("list=a,b=c"));
  EXPECT_EQ(map.AddFromList(map[WTEXT("list")], ',', '=', '\\'), 2) << "the list may be a value that it replaces";
  EXPECT_EQ(map.GetAsList(',', '=', '\\'), WTEXT("list=a,b=c"));
}

TEST(StringMapList, RandomMaps_SurviveTheWayToTextAndBack) {
  std::mt19937 random(4);
  auto text = [&random] {
    SString made;
    for (unsigned n = random() % 6; n > 0; --n) made += WTEXT(",=\\ab\u20AC")[random() % 6];
    return made;
  };
  for (int round = 0; round < 2000; ++round) {
    SStringUnsortedMap map;
    for (unsigned n = random() % 5; n > 0; --n) map.Add(text(), text());
    SString list = map.GetAsList(',', '=', '\\');
    SStringUnsortedMap read;
    ASSERT_EQ(read.AddFromList(list, ',', '=', '\\'), map.GetCount());
    ASSERT_TRUE(read == map);
    ASSERT_EQ(read.GetAsList(',', '=', '\\'), list) << "the order, too";
  }
}

TEST(StringMap, ManyRandomKeys_AreInTheOrderOfAStdMap) {
  std::mt19937 random(6);
  SStringMap map;
  std::map<Text, Text> peer;
  for (int i = 0; i < 20000; ++i) {
    Text key;
    for (unsigned n = random() % 20; n > 0; --n) key += static_cast<WCHAR>('a' + random() % 3);
    if (random() % 4 == 0) {
      ASSERT_EQ(map.Remove(key.c_str()), peer.erase(key) == 1);
    } else {
      map.Add(key.c_str(), key.c_str());
      peer[key] = key;
    }
  }
  ASSERT_EQ(map.size(), peer.size());
  ASSERT_TRUE(std::equal(map.begin(), map.end(), peer.begin(), [](const auto& own, const auto& other) {
    return own.m_key == other.first.c_str() && own.m_value == other.second.c_str();
  }));
}

TEST(StringMap, OutOfMemory_LeavesTheMapAsItWas) {
  for (long n = 1;; ++n) {
    SStringUnsortedMap map{{WTEXT("a"), WTEXT("1")}, {WTEXT("b"), WTEXT("2")}};
    SString big;
    for (int i = 0; i < 3000; ++i) big += WCHAR('x');
    SString before = map.GetAsList(',', '=', '\\');
    bool hasThrown = false;
    SMemFailAt(n, true);
    try {
      map.AddFromList(big, nullptr, ',', '=', nullptr, 1);  // one new key
    } catch (const SEOutOfMemory&) {
      hasThrown = true;
    }
    SMemFailAt(0);
    if (!hasThrown) break;
    EXPECT_EQ(map.GetAsList(',', '=', '\\'), before) << "allocation " << n;
  }
}

}  // namespace
