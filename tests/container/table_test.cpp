// The three tables beside std::vector, their growth, sharing, and failures at every point.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstring>
#include <functional>
#include <numeric>
#include <random>
#include <set>
#include <utility>
#include <vector>

#include "counted.h"
#include "qxcore/container/table.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/container/table_mem.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/core/memory.h"

namespace {

// A table that knows the blocks that it has from its memory, so that one that is lost is noticed without a sanitizer.
template <class Base>
class Watched : public Base {
 public:
  static inline std::set<const void*> blocks;

  Watched() = default;
  Watched(const Watched&) = default;
  ~Watched() override { this->Clear(); }

 protected:
  void* Allocate(int n) override {
    void* block = Base::Allocate(n);
    blocks.insert(block);
    return block;
  }
  void Free(void* block) override {
    EXPECT_EQ(blocks.erase(block), 1u) << "freed, but not one of its own";
    Base::Free(block);
  }
};

// --- copies that fail in the middle of a change ---

template <class Change>
void WithEachCopyFailing(Change change, int mayGo, int room = 20) {
  for (long failAt = 1;; ++failAt) {
    Counted::failAt = 0;
    {
      Watched<STable<Counted>> table;
      for (int value = 0; value < 6; ++value) table.Add(Counted(value));
      table.GrowTo(room);
      bool hasFailed = false;
      Counted::failAt = failAt;
      try {
        change(table);
      } catch (const CopyFailed&) {
        hasFailed = true;
      }
      Counted::failAt = 0;
      EXPECT_EQ(Counted::living.size(), static_cast<std::size_t>(table.GetCount())) << failAt;
      if (hasFailed) {
        EXPECT_GE(table.GetCount(), 6 - mayGo) << failAt;
      }
      for (const Counted& element : table) element.Get();
      EXPECT_EQ(table.blocks.size(), 1u) << failAt;
      if (!hasFailed) return;
      ASSERT_LT(failAt, 100);
    }
    EXPECT_TRUE(Counted::living.empty());
    EXPECT_TRUE(Watched<STable<Counted>>::blocks.empty());
  }
}

TEST(TableFaults, FailedCopiesLoseNothingTwice) {
  WithEachCopyFailing([](auto& table) { table.Swap(1, 4); }, 0);
  WithEachCopyFailing([](auto& table) { table.Reverse(); }, 0);
  WithEachCopyFailing([](auto& table) { table.MoveTo(1, 4); }, 0);
  WithEachCopyFailing([](auto& table) { table.MoveTo(5, 0); }, 0);
  WithEachCopyFailing([](auto& table) { table.Remove(1); }, 5);
  WithEachCopyFailing([](auto& table) { table.Insert(2, Counted(9)); }, 4);
  WithEachCopyFailing([](auto& table) { table.Insert(2, Counted(9)); }, 4, 6);  // which has to grow first
  WithEachCopyFailing([](auto& table) { table.GrowTo(30); }, 0);
}

// A table with memory of its own: growing must not go past its Allocate and Free.
class ArenaTable : public __STableMem {
 public:
  ArenaTable() : __STableMem(sizeof(int)) {}
  ~ArenaTable() override { Clear(); }
  void Add(int value) { Insert(GetCount(), &value); }
  int At(int i) const { return *static_cast<const int*>(GetAt(i)); }
  int blocks = 0;

 protected:
  void* Allocate(int n) override {
    ++blocks;
    char* outer = static_cast<char*>(SMemAlloc(64 + 16 + static_cast<std::size_t>(n) * sizeof(int)));
    void* made = __STableMem::Allocate(n);  // for its header
    std::memcpy(outer + 64, made, 16);
    __STableMem::Free(made);
    return outer + 64;
  }
  void Free(void* block) override {
    --blocks;
    SMemFree(static_cast<char*>(block) - 64);
  }
};

TEST(TableMem, GrowsInTheMemoryOfADerivedClass) {
  ArenaTable table;
  for (int i = 0; i < 1000; ++i) table.Add(i);
  for (int i = 0; i < 1000; ++i) ASSERT_EQ(table.At(i), i);
  EXPECT_EQ(table.blocks, 1);
}

int ValueOf(int value) { return value; }
int ValueOf(const Counted& value) { return value.Get(); }
int ValueOf(const Movable& value) { return value.Get(); }

template <class Table>
std::vector<int> Values(const Table& table) {
  std::vector<int> values;
  for (const auto& element : table) values.push_back(ValueOf(element));
  return values;
}

// Leaves no element behind, whatever a test did.
template <class Table>
class TableTest : public testing::Test {
 protected:
  ~TableTest() override {
    SMemFailAt(0);
    Counted::failAt = 0;
    EXPECT_TRUE(Counted::living.empty());
    EXPECT_TRUE(Movable::living.empty());
  }
};

using AllTables = testing::Types<STable<Counted>, STableDumb<int>, STableMem<Movable>>;
TYPED_TEST_SUITE(TableTest, AllTables);

// One random change, made to a table and to a vector.
template <class Table>
void Change(std::mt19937& random, Table& table, std::vector<int>& peer) {
  using T = typename Table::value_type;
  int count = table.GetCount();
  auto any = [&random](int below) { return static_cast<int>(random() % static_cast<unsigned>(below)); };
  int value = any(1000);
  switch (any(10)) {
    case 0:
    case 1:
      EXPECT_EQ(table.Add(T(value)), count);
      peer.push_back(value);
      break;
    case 2: {
      int at = any(count + 1);
      table.Insert(at, T(value));
      peer.insert(peer.begin() + at, value);
      break;
    }
    case 3:
      if (count > 0) {  // one of its own elements
        int at = any(count + 1), own = any(count);
        table.Insert(at, std::as_const(table)[own]);
        value = peer[static_cast<std::size_t>(own)];
        peer.insert(peer.begin() + at, value);
      }
      break;
    case 4:
      if (count > 0) {
        int at = any(count);
        table.Remove(at);
        peer.erase(peer.begin() + at);
      }
      break;
    case 5:
      if (count > 0) {
        int from = any(count), to = any(count);
        table.MoveTo(from, to);
        value = peer[static_cast<std::size_t>(from)];
        peer.erase(peer.begin() + from);
        peer.insert(peer.begin() + to, value);
      }
      break;
    case 6:
      if (count > 0) {
        int i = any(count), j = any(count);
        table.Swap(i, j);
        std::swap(peer[static_cast<std::size_t>(i)], peer[static_cast<std::size_t>(j)]);
      }
      break;
    case 7:
      if (any(10) == 0) {
        table.Reverse();
        std::reverse(peer.begin(), peer.end());
      } else if (count > 0) {
        table[any(1) + count / 2] = T(value);
        peer[static_cast<std::size_t>(count / 2)] = value;
      }
      break;
    case 8:
      if (any(40) == 0) {
        table.Clear();
        peer.clear();
      } else {
        table.GrowTo(count + any(5));
      }
      break;
    case 9:
      if constexpr (requires { table.CopyArray(nullptr, 0); }) {
        if (count > 0 && any(2) == 0) {  // a part of its own elements
          int from = any(count), copied = any(count - from + 1);
          table.CopyArray(std::as_const(table).GetArray() + from, copied);
          peer = std::vector<int>(peer.begin() + from, peer.begin() + from + copied);
        } else if (any(10) == 0) {
          peer.resize(static_cast<std::size_t>(any(40)));
          std::iota(peer.begin(), peer.end(), value);
          const std::vector<T> source(peer.begin(), peer.end());
          table.CopyArray(source.data(), static_cast<int>(source.size()));
        }
      }
  }
}

TYPED_TEST(TableTest, RandomChanges_AreThoseOfAVector) {
  std::mt19937 random(7);
  TypeParam table;
  std::vector<int> peer;
  for (int step = 0; step < 5000; ++step) {
    const bool isHeldTwice = random() % 2 == 0;
    TypeParam before;
    if (isHeldTwice) before = table;
    std::vector<int> peerBefore(isHeldTwice ? peer : std::vector<int>());
    Change(random, table, peer);
    ASSERT_EQ(Values(table), peer) << "step " << step;
    ASSERT_EQ(Values(before), peerBefore) << "a copy must not change, step " << step;
    if (step % 50 == 0 && isHeldTwice) table = before, peer = peerBefore;
  }
}

TYPED_TEST(TableTest, Growth_FollowsTheRule) {
  TypeParam table;
  table.GrowTo(0);
  EXPECT_EQ(table.GetCapacity(), 0);
  std::vector<int> capacities;
  for (int i = 0; i < 26; ++i) {
    table.Add(typename TypeParam::value_type(i));
    if (capacities.empty() || capacities.back() != table.GetCapacity()) capacities.push_back(table.GetCapacity());
  }
  EXPECT_EQ(capacities, (std::vector<int>{4, 7, 11, 17, 26}));
  while (table.GetCount() > 1) table.Remove(0);
  EXPECT_EQ(table.GetCapacity(), 26) << "only Clear gives memory back";
  table.GrowTo(5);
  EXPECT_EQ(table.GetCapacity(), 5);
  table.Clear();
  EXPECT_EQ(table.GetCapacity(), 0);
  EXPECT_EQ(table.GetArray(), nullptr);
}

TYPED_TEST(TableTest, SelfAssignmentMoveAndAlgorithms) {
  using T = typename TypeParam::value_type;
  TypeParam table;
  for (int value : {5, 3, 9, 1}) table.Add(T(value));
  const TypeParam& alias = table;
  table = alias;
  EXPECT_EQ(Values(table), (std::vector<int>{5, 3, 9, 1}));
  std::sort(table.begin(), table.end(), [](const T& a, const T& b) { return ValueOf(a) < ValueOf(b); });
  EXPECT_EQ(Values(table), (std::vector<int>{1, 3, 5, 9}));
  EXPECT_EQ(ValueOf(*std::find(table.cbegin(), table.cend(), T(5))), 5);
  EXPECT_EQ(ValueOf(*table.rbegin()), 9);
  TypeParam moved(std::move(table));
  EXPECT_EQ(moved.size(), 4u);
  EXPECT_TRUE(table.empty());
  EXPECT_THROW(moved.At(4), SECOMException);
  EXPECT_THROW(moved.At(-1), SECOMException);
  EXPECT_EQ(ValueOf(moved.At(3)), 9);
}

TYPED_TEST(TableTest, OutOfMemory_LeavesTheTableAsItWas) {
  using T = typename TypeParam::value_type;
  auto operations = std::vector<std::function<void(TypeParam&)>>{
      [](TypeParam& t) { t.Add(T(1)); },    [](TypeParam& t) { t.Insert(0, std::as_const(t)[3]); },
      [](TypeParam& t) { t.GrowTo(100); },  [](TypeParam& t) { t.Remove(1); },
      [](TypeParam& t) { t.Swap(0, 2); },   [](TypeParam& t) { t.Reverse(); },
      [](TypeParam& t) { t.MoveTo(0, 3); }, [](TypeParam& t) { t[0] = T(7); },
  };
  for (std::size_t i = 0; i < operations.size(); ++i) {
    for (bool forever : {false, true}) {
      for (long n = 1;; ++n) {
        TypeParam table;
        for (int value : {5, 3, 9, 1}) table.Add(T(value));
        TypeParam other(table);  // shares, where tables share
        SMemFailAt(n, forever);
        bool hasThrown = false;
        try {
          operations[i](table);
        } catch (const SEOutOfMemory&) {
          hasThrown = true;
        }
        bool hasFailed = SMemHasFailed();
        SMemFailAt(0);
        EXPECT_EQ(hasThrown, hasFailed);
        EXPECT_EQ(Values(other), (std::vector<int>{5, 3, 9, 1}));
        if (!hasThrown) break;
        EXPECT_EQ(Values(table), (std::vector<int>{5, 3, 9, 1})) << "operation " << i << ", allocation " << n;
      }
    }
  }
  if (sizeof(void*) > 4) return;  // there, the system promises any amount
  TypeParam table;
  EXPECT_THROW(table.GrowTo(0x7FFFFFFF), SEOutOfMemory) << "more bytes than can be addressed";
  EXPECT_EQ(table.GetCapacity(), 0);
}

// STable copies elements all the time, and each copy may fail: what is left is in order and lives.
TEST(Table, CopyThatThrows_LeavesLivingElementsInOrder) {
  for (int operation = 0; operation < 6; ++operation) {
    for (long n = 1;; ++n) {
      STable<Counted> table;
      for (int value = 0; value < 7; ++value) table.Add(Counted(value));
      if (operation == 1) table.GrowTo(8);
      Counted extra(100);
      Counted::failAt = n;
      bool hasThrown = false;
      try {
        if (operation == 0) table.Add(extra);        // grows
        if (operation == 1) table.Insert(2, extra);  // shifts
        if (operation == 2) table.Remove(2);
        if (operation == 3) table.MoveTo(1, 5);
        if (operation == 4) STable<Counted> copy(table);
        if (operation == 5) STable<Counted>{extra, extra, extra};
      } catch (const CopyFailed&) {
        hasThrown = true;
      }
      Counted::failAt = 0;
      if (!hasThrown) break;
      auto values = Values(table);
      if (operation == 0 || operation >= 3) {
        EXPECT_EQ(values.size(), 7u);
      }
      if (operation == 3) values.erase(std::remove(values.begin(), values.end(), 1), values.end());  // on its way
      values.erase(std::remove(values.begin(), values.end(), 100), values.end());
      EXPECT_TRUE(std::is_sorted(values.begin(), values.end())) << "operation " << operation << ", copy " << n;
    }
    EXPECT_TRUE(Counted::living.empty());
  }
}

TEST(TableShared, Copies_ShareUntilOneIsWritten) {
  STableDumb<int> table{1, 2, 3};
  table.GrowTo(10);
  STableDumb<int> copy(table);
  EXPECT_TRUE(table.IsShared());
  EXPECT_EQ(std::as_const(table).GetArray(), std::as_const(copy).GetArray());
  for (int value : std::as_const(copy)) EXPECT_GT(value, 0);
  EXPECT_TRUE(table.IsShared()) << "reading does not detach";
  copy[0] = 9;
  EXPECT_FALSE(table.IsShared());
  EXPECT_EQ(copy.GetCapacity(), 10) << "a private block of the same capacity";
  EXPECT_EQ(Values(table), (std::vector<int>{1, 2, 3}));
  EXPECT_EQ(STableDumb<double>().ElemSize(), 8);
  STableDumb<int> empty;
  table = empty;
  EXPECT_EQ(table.GetCount(), 0);
  EXPECT_EQ(table.ElemSize(), 4);
}

// May move as bytes, and its n-th copy fails.
class FailingMovable : public Movable {
 public:
  static inline long failAt = 0;
  using Movable::Movable;
  FailingMovable(const FailingMovable& other) : Movable(other) {
    if (failAt != 0 && --failAt == 0) throw CopyFailed();
  }
  FailingMovable& operator=(const FailingMovable& other) = default;
};

// While another table holds the same block, a change copies it first; when that fails, both keep what they had.
TEST(TableShared, CopiesThatFailInADetachingChange_LeaveBothTables) {
  using Table = Watched<STableMem<FailingMovable>>;
  const FailingMovable source[] = {FailingMovable(6), FailingMovable(7), FailingMovable(8), FailingMovable(9)};
  const std::function<void(Table&)> kChanges[] = {[](Table& table) { table.Remove(2); },
                                                  [](Table& table) { table.MoveTo(0, 3); },
                                                  [](Table& table) { table.Swap(1, 2); },
                                                  [](Table& table) { table.Reverse(); },
                                                  [](Table& table) { table.GrowTo(50); },
                                                  [](Table& table) { table.Insert(1, FailingMovable(9)); },
                                                  [](Table& table) { table.Add(std::as_const(table)[3]); },
                                                  [&source](Table& table) { table.CopyArray(source, 4); },
                                                  [](Table& table) { table.At(0); }};
  for (const auto& change : kChanges) {
    int failures = 0;
    for (long n = 1;; ++n, ++failures) {
      Table table;
      for (int value = 1; value <= 4; ++value) table.Add(FailingMovable(value));
      const Table other(table);
      FailingMovable::failAt = n;
      bool hasFailed = false;
      try {
        change(table);
      } catch (const CopyFailed&) {
        hasFailed = true;
      }
      FailingMovable::failAt = 0;
      EXPECT_EQ(Values(other), (std::vector<int>{1, 2, 3, 4}));
      if (!hasFailed) break;
      EXPECT_EQ(Values(table), (std::vector<int>{1, 2, 3, 4}));
      EXPECT_TRUE(table.IsShared());
      EXPECT_EQ(Movable::living.size(), 4u + std::size(source));
      EXPECT_EQ(Table::blocks.size(), 1u);
    }
    EXPECT_GE(failures, 4) << "each element was copied";
    EXPECT_EQ(Movable::living.size(), std::size(source));
    EXPECT_TRUE(Table::blocks.empty());
  }
}

// A capacity below the number of elements is no order, shared or not; neither is an empty array to copy.
TYPED_TEST(TableTest, Capacities_NeverCutElements) {
  using T = typename TypeParam::value_type;
  TypeParam table{T(1), T(2), T(3)}, copy(table);
  for (int n : {0, 1, 2}) {
    copy.GrowTo(n);
    table.GrowTo(n);
    EXPECT_EQ(Values(copy), (std::vector<int>{1, 2, 3}));
    EXPECT_GE(copy.GetCapacity(), 3);
  }
  copy.GrowTo(9);
  EXPECT_EQ(copy.GetCapacity(), 9);
  EXPECT_EQ(Values(copy), Values(table));
  if constexpr (requires { copy.CopyArray(nullptr, 0); }) {
    const T source[] = {T(7), T(8)};
    copy.CopyArray(source, 2);
    EXPECT_EQ(Values(copy), (std::vector<int>{7, 8}));
    copy.CopyArray(source, 0);
    EXPECT_TRUE(copy.IsEmpty());
    copy.CopyArray(source, -1);
    EXPECT_TRUE(copy.IsEmpty());
  }
}

TEST(TableShared, GrowToTheSameCapacity_ChangesNothing) {
  STableDumb<int> table{1, 2, 3};
  const int* before = std::as_const(table).GetArray();
  table.GrowTo(3);
  EXPECT_EQ(std::as_const(table).GetArray(), before);
}

template <class Table>
class SharedTableTest : public TableTest<Table> {};
using SharedTables = testing::Types<STableDumb<int>, STableMem<Movable>>;
TYPED_TEST_SUITE(SharedTableTest, SharedTables);

TYPED_TEST(SharedTableTest, DetachAndAttach_HandTheBlockOver) {
  using T = typename TypeParam::value_type;
  T source[] = {T(4), T(5), T(6)};
  TypeParam a, b;
  EXPECT_EQ(a.Detach(), nullptr);
  a.CopyArray(source, 3);
  const T* array = std::as_const(a).GetArray();
  void* block = a.Detach();
  EXPECT_EQ(a.GetCount(), 0);
  EXPECT_EQ(a.ElemSize(), static_cast<int>(sizeof(T)));
  b.Add(T(1));
  b.Attach(block);
  EXPECT_EQ(std::as_const(b).GetArray(), array);
  EXPECT_EQ(Values(b), (std::vector<int>{4, 5, 6}));
  TypeParam c(b);
  b.Attach(c.Detach());  // the block it has already
  EXPECT_FALSE(b.IsShared());
  b.CopyArray(std::as_const(b).GetArray() + 1, 2);  // from itself
  EXPECT_EQ(Values(b), (std::vector<int>{5, 6}));
  b.Attach(nullptr);
  EXPECT_TRUE(b.IsEmpty());
}

// The untyped base works on its own for elements of any size, also ones too large for the stack.
TEST(TableUntyped, ElementsOfAnySize) {
  struct Raw : __STableDumb {
    using __STableDumb::GetAt;
    using __STableDumb::Insert;
    using __STableDumb::MoveTo;
    using __STableDumb::Reverse;
    explicit Raw(int size) : __STableDumb(size) {}
  };
  for (int size : {1, 3, 16, 127, 1000}) {
    Raw table(size);
    std::vector<char> element(static_cast<std::size_t>(size));
    for (char c = 0; c < 20; ++c) {
      std::fill(element.begin(), element.end(), c);
      table.Insert(c / 2, element.data());
    }
    table.Reverse();
    table.MoveTo(0, 19);
    const char* first = static_cast<const char*>(std::as_const(table).GetAt(0));
    std::vector<char> order;
    for (int i = 0; i < 20; ++i) {
      ASSERT_EQ(std::count(first + i * size, first + (i + 1) * size, first[i * size]), size);
      order.push_back(first[i * size]);
    }
    std::vector<char> expected;
    for (char c = 0; c < 20; ++c) expected.insert(expected.begin() + c / 2, c);
    std::reverse(expected.begin(), expected.end());
    std::rotate(expected.begin(), expected.begin() + 1, expected.end());
    EXPECT_EQ(order, expected) << "size " << size;
  }
}

}  // namespace
