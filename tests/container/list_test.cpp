// SList beside std::list, and SDList with its iterator, its order and its item-relative operations.

#include "qxcore/container/list.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <list>
#include <random>
#include <vector>

#include "counted.h"
#include "qxcore/container/dlist.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"

namespace {

std::vector<int> Values(const SList<Counted>& list) {
  std::vector<int> values, backwards;
  // One step more than there are elements shows a ring that does not close.
  const std::size_t most = list.size() + 1;
  for (auto place = list.begin(); place != list.end() && values.size() < most; ++place) values.push_back(place->Get());
  for (auto place = list.rbegin(); place != list.rend() && backwards.size() < most; ++place)
    backwards.push_back(place->Get());
  EXPECT_TRUE(std::equal(values.begin(), values.end(), backwards.rbegin(), backwards.rend()));
  EXPECT_EQ(static_cast<int>(values.size()), list.GetCount());
  return values;
}

TEST(List, RandomChanges_AreThoseOfAStdList) {
  std::mt19937 random(3);
  {
    SList<Counted> list;
    std::list<int> peer;
    for (int step = 0; step < 5000; ++step) {
      int value = static_cast<int>(random() % 1000);
      int at = peer.empty() ? 0 : static_cast<int>(random() % peer.size());
      auto place = std::next(list.begin(), at);
      auto peerPlace = std::next(peer.begin(), at);
      switch (random() % 8) {
        case 0:
          list.AddFront(Counted(value)), peer.push_front(value);
          break;
        case 1:
          list.AddBack(Counted(value)), peer.push_back(value);
          break;
        case 2:
          list.Insert(place, Counted(value)), peer.insert(peerPlace, value);
          break;
        case 3:
          if (!peer.empty()) {
            EXPECT_EQ(list.GetAt(at).Get(), *peerPlace);
            auto next = list.Erase(place);
            EXPECT_EQ(std::distance(list.begin(), next), at);
            peer.erase(peerPlace);
          }
          break;
        case 4:
          if (!peer.empty()) list.MoveToBack(place), peer.splice(peer.end(), peer, peerPlace);
          break;
        case 5:
          if (!peer.empty()) list.MoveToFront(place), peer.splice(peer.begin(), peer, peerPlace);
          break;
        case 6:
          if (!peer.empty()) list.RemoveBack(), peer.pop_back();
          break;
        case 7:
          if (step % 100 == 0) {
            SList<Counted> copy(list), swapped;
            swapped.Swap(copy);
            EXPECT_TRUE(copy.IsEmpty());
            EXPECT_EQ(Values(copy), std::vector<int>());
            list = swapped;
          }
      }
      ASSERT_EQ(Values(list), std::vector<int>(peer.begin(), peer.end())) << "step " << step;
    }
    const Counted* address = &list.AddBack(Counted(1)).operator*();
    while (list.GetCount() > 1) list.RemoveFront();
    EXPECT_EQ(&list.GetFront(), address) << "elements do not move";
    list.RemoveFront();
    EXPECT_EQ(list.begin(), list.end());
  }
  EXPECT_TRUE(Counted::living.empty());
}

TEST(List, Failures_LeaveTheListAsItWas) {
  struct Large {  // not from a pool
    int m_value;
    char m_rest[200];
  };
  SList<Large> large{Large{1, {}}};
  SMemFailAt(1);
  EXPECT_THROW(large.AddBack(Large{2, {}}), SEOutOfMemory);
  SMemFailAt(0);
  EXPECT_EQ(large.GetCount(), 1);
  {
    SList<Counted> list{Counted(1), Counted(2)};
    Counted third(3);
    Counted::failAt = 1;
    EXPECT_THROW(list.AddFront(third), CopyFailed);
    EXPECT_EQ(Values(list), (std::vector<int>{1, 2}));
    Counted::failAt = 2;
    EXPECT_THROW(SList<Counted> copy(list), CopyFailed);
    Counted::failAt = 0;
  }
  EXPECT_TRUE(Counted::living.empty());
}

// --- SDList ---

class Item : public SDListItem {
 public:
  static inline int living = 0;
  explicit Item(int value) : m_value(value) { ++living; }
  ~Item() override { --living; }
  int m_value;
};

int ValueOf(const SDListItem* item) { return item != nullptr ? static_cast<const Item*>(item)->m_value : -1; }

std::vector<int> Values(const SDList& list) {
  // Links that went wrong may lead in a circle.
  const std::size_t most = static_cast<std::size_t>(list.GetCount()) + 1;
  std::vector<int> values;
  for (SDListItem* item = list.GetHead(); item != nullptr && values.size() < most; item = item->GetNext())
    values.push_back(ValueOf(item));
  std::vector<int> backwards;
  for (SDListItem* item = list.GetTail(); item != nullptr && backwards.size() < most; item = item->GetPrevious())
    backwards.push_back(ValueOf(item));
  EXPECT_TRUE(std::equal(values.begin(), values.end(), backwards.rbegin(), backwards.rend()));
  EXPECT_EQ(static_cast<int>(values.size()), list.GetCount());
  return values;
}

int CompareItems(SDListItem* a, SDListItem* b) { return ValueOf(a) - ValueOf(b); }

TEST(DList, AddAndGetAt_AtAndBeyondTheEnds) {
  SDList list;
  list.AddAt(new Item(1), 0);
  list.AddAtTail(new Item(2));
  list.AddAt(new Item(3), 5);
  list.AddAt(new Item(4), 1);
  list.AddAt(new Item(5), -2);
  list.AddAtHead(nullptr);
  EXPECT_EQ(Values(list), (std::vector<int>{5, 1, 4, 2, 3}));
  EXPECT_EQ(ValueOf(list.GetAt(-3)), 5);
  EXPECT_EQ(ValueOf(list.GetAt(4)), 3);
  EXPECT_EQ(list.GetAt(5), nullptr);
  list.DeleteAt(7);
  list.DeleteAt(-1);
  EXPECT_EQ(list.GetCount(), 5);
  list.DeleteAt(2);
  list.DeleteAtTail();
  SDListItem* head = list.DetachAtHead();
  EXPECT_EQ(ValueOf(head), 5);
  EXPECT_EQ(Values(list), (std::vector<int>{1, 2}));
  list.Init(head, 0);
  EXPECT_EQ(Values(list), (std::vector<int>{5, 1, 2})) << "other flags keep the items";
  list.Init(nullptr, 1);
  EXPECT_EQ(Item::living, 0);
  EXPECT_EQ(Values(list), std::vector<int>());
  list.DeleteAtHead();
  EXPECT_EQ(list.DetachAtTail(), nullptr);
  EXPECT_EQ(list.GetAt(0), nullptr);
}

TEST(DList, SwapAndSort_RandomOrders) {
  std::mt19937 random(5);
  for (int round = 0; round < 300; ++round) {
    SDList list;
    std::vector<int> peer;
    for (unsigned count = random() % 30; count > 0; --count) {
      peer.push_back(static_cast<int>(random() % 20));
      list.AddAtTail(new Item(peer.back()));
    }
    if (!peer.empty()) {
      auto i = random() % peer.size(), j = random() % peer.size();
      list.Swap(static_cast<long>(i), static_cast<long>(j));
      std::swap(peer[i], peer[j]);
      list.Swap(-1, 0);
      list.Swap(0, static_cast<long>(peer.size()));
    }
    ASSERT_EQ(Values(list), peer);
    list.Sort(CompareItems);
    std::sort(peer.begin(), peer.end());
    ASSERT_EQ(Values(list), peer);
  }
  SDList sorted;
  for (int i = 0; i < 5000; ++i) sorted.AddAtTail(new Item(i));
  sorted.Sort(CompareItems);  // the worst case for the pivot: neither stack nor patience runs out
  EXPECT_EQ(ValueOf(sorted.GetTail()), 4999);
}

TEST(DList, ForEach_VisitsAllAndCounts) {
  SDList list;
  for (int i = 0; i < 5; ++i) list.AddAtTail(new Item(i));
  EXPECT_EQ(list.ForEach([](SDListItem* item) { return ValueOf(item) % 2; }), 2);
}

TEST(DList, Iterator_WalksSkipsAndDeletes) {
  SDList list;
  for (int i = 0; i < 6; ++i) list.AddAtTail(new Item(i));
  SDListIterator place(list, 2);
  EXPECT_EQ(ValueOf(place.Next()), 3);
  EXPECT_EQ(ValueOf(place.Skip(-2)), 1);
  EXPECT_EQ(ValueOf(place.Skip(4)), 5);
  SDListIterator copy(place);
  EXPECT_EQ(place.Next(), nullptr);
  EXPECT_EQ(place.Previous(), nullptr) << "beyond the end until First or Last";
  EXPECT_EQ(ValueOf(copy.Previous()), 4);
  EXPECT_EQ(ValueOf(place.First()), 0);
  while (place.GetCurrent() != nullptr) {
    if (ValueOf(place.GetCurrent()) % 2 == 0) {
      place.DeleteCurrent();
    } else {
      place.Next();
    }
  }
  EXPECT_EQ(Values(list), (std::vector<int>{1, 3, 5}));
  EXPECT_EQ(ValueOf(place.Last()), 5);
}

// Nothing is done for items that are not there, and nothing is lost.
TEST(XDList, AbsentItems_ChangeNothing) {
  class OpenList : public SXDList {
   public:
    using SXDList::QuickSort;
  } list;
  for (int i = 0; i < 4; ++i) list.AddAtTail(new Item(i));
  Item* const other = new Item(9);
  list.AddAtTail(nullptr);
  list.AddAt(nullptr, 1);
  list.AddBefore(nullptr, other);
  list.AddAfter(nullptr, other);
  list.AddBefore(list.GetHead(), nullptr);
  list.AddAfter(list.GetHead(), nullptr);
  list.Swap(nullptr, list.GetHead());
  list.Swap(list.GetHead(), nullptr);
  list.Swap(list.GetTail(), list.GetTail());
  list.Swap(0L, -1L);
  list.Swap(7L, 8L);
  list.Delete(nullptr);
  list.DeleteBefore(list.GetHead());
  list.DeleteAfter(list.GetTail());
  EXPECT_EQ(list.GetBefore(nullptr), nullptr);
  list.QuickSort(CompareItems, 2, 1);
  list.QuickSort(CompareItems, -1, 2);
  list.QuickSort(CompareItems, 0, 4);
  EXPECT_EQ(Values(list), (std::vector<int>{0, 1, 2, 3}));
  EXPECT_EQ(Item::living, 5) << "the one that found no place is still its maker's";
  SDListIterator place(list, 9);
  EXPECT_EQ(place.GetCurrent(), nullptr);
  EXPECT_EQ(place.Skip(2), nullptr);
  EXPECT_EQ(place.Skip(-2), nullptr);
  EXPECT_EQ(place.DeleteCurrent(), nullptr);
  EXPECT_EQ(ValueOf(place.First()), 0);
  EXPECT_EQ(place.Skip(-1), nullptr) << "before the beginning";
  EXPECT_EQ(place.Next(), nullptr);
  delete other;
}

TEST(XDList, OperationsRelativeToAnItem) {
  SXDList list;
  Item* middle = new Item(2);
  list.AddAtTail(middle);
  list.AddBefore(middle, new Item(1));
  list.AddAfter(middle, new Item(3));
  EXPECT_EQ(Values(list), (std::vector<int>{1, 2, 3}));
  EXPECT_EQ(ValueOf(list.GetBefore(middle)), 1);
  EXPECT_EQ(ValueOf(list.GetAfter(middle)), 3);
  list.DeleteBefore(middle);
  list.DeleteBefore(middle);  // there is none
  delete list.DetachAfter(middle);
  EXPECT_EQ(list.DetachAfter(middle), nullptr);
  EXPECT_EQ(list.GetAfter(nullptr), nullptr);
  EXPECT_EQ(Values(list), (std::vector<int>{2}));
  list.Delete(middle);
  EXPECT_EQ(Values(list), std::vector<int>());
  EXPECT_EQ(Item::living, 0);
}

// All of them in any order, with and without a neighbour; what was detached is the caller's.
TEST(XDList, RandomChanges_AreThoseOfAVector) {
  std::mt19937 random(9);
  SXDList list;
  std::vector<int> peer;
  for (int step = 0; step < 20000; ++step) {
    const int count = static_cast<int>(peer.size());
    const int at = count != 0 ? static_cast<int>(random() % peer.size()) : 0;
    SDListItem* const reference = list.GetAt(at);
    SDListItem* detached = nullptr;
    int gone = -1;  // the index that leaves the list
    const auto add = [&](int index) { peer.insert(peer.begin() + index, step); };
    switch (random() % (count > 40 ? 14u : 11u)) {
      case 0:
        list.AddAt(new Item(step), at);
        add(at);
        break;
      case 1:
        list.AddAtHead(new Item(step));
        add(0);
        break;
      case 2:
        if (reference == nullptr) break;
        list.AddBefore(reference, new Item(step));
        add(at);
        break;
      case 3:
        if (reference == nullptr) break;
        list.AddAfter(reference, new Item(step));
        add(at + 1);
        break;
      case 4:
        list.DeleteBefore(reference);
        gone = at - 1;
        break;
      case 5:
        list.DeleteAfter(reference);
        gone = at + 1;
        break;
      case 6:
        detached = list.DetachBefore(reference);
        gone = at - 1;
        break;
      case 7:
        detached = list.DetachAfter(reference);
        gone = at + 1;
        break;
      case 8:
        detached = list.Detach(reference);
        gone = at;
        break;
      case 9:
        EXPECT_EQ(list.DetachAt(-1), nullptr);
        EXPECT_EQ(list.DetachAt(count), nullptr);
        detached = list.DetachAt(at);
        gone = at;
        break;
      case 10:
        list.AddAtTail(new Item(step));
        add(count);
        break;
      case 11:
        list.DeleteAt(at);
        gone = at;
        break;
      case 12:
        list.DeleteAtHead();
        gone = 0;
        break;
      case 13:
        detached = list.DetachAtTail();
        gone = count - 1;
    }
    const bool isGone = gone >= 0 && gone < count;
    if (detached != nullptr) {
      ASSERT_TRUE(isGone);
      ASSERT_EQ(ValueOf(detached), peer[static_cast<std::size_t>(gone)]);
      ASSERT_TRUE(detached->GetNext() == nullptr && detached->GetPrevious() == nullptr);
      delete detached;
    }
    if (isGone) peer.erase(peer.begin() + gone);
    ASSERT_EQ(Values(list), peer) << "step " << step;
    ASSERT_EQ(Item::living, static_cast<int>(peer.size()));
  }
}

}  // namespace
