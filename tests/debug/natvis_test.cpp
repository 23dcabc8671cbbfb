// What Visual Studio shows by the natvis file: its expressions, which natvis_views.py makes functions of, find the
// content of the objects. The file is compiled without access control, as debuggers know none.

#include <gtest/gtest.h>

#include <type_traits>
#include <utility>
#include <vector>

#include "qxcore/container/list.h"
#include "qxcore/container/map.h"
#include "qxcore/container/string_table.h"
#include "qxcore/container/table.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/container/table_mem.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/system/time/time.h"

#include "natvis_views.h"

namespace {

template <class View, class Object>
View& As(Object& object) {
  static_assert(sizeof(View) == sizeof(Object));
  return reinterpret_cast<View&>(object);
}

// The elements that lie behind one another.
template <class View, class Table>
auto ArrayOf(Table& table) {
  View& view = As<View>(table);
  const auto* first = view.ValuePointer();
  return std::vector(first, first + static_cast<int>(view.Size()));
}

template <class Container>
auto ContentOf(const Container& container) {
  return std::vector(container.begin(), container.end());
}

}  // namespace

TEST(Natvis, ShowsATextWithItsHeader) {
  SString text(SStringView(WTEXT("seven\0!!"), 8));
  const SString other = text;
  auto& view = As<natvis::Text>(text);
  EXPECT_EQ(SStringView(view.Shown0(), static_cast<std::size_t>(view.Shown0Length())), text.View());
  EXPECT_EQ(SStringView(view.StringView(), static_cast<std::size_t>(view.StringViewLength())), text.View());
  EXPECT_EQ(view.Item_length(), text.Length());
  EXPECT_EQ(view.Item_capacity(), text.GetAllocLength());
  EXPECT_EQ(view.Item_references(), 2);

  SStringBuffer buffer(text);
  EXPECT_EQ(As<natvis::Buffer>(buffer).Shown0(), text);
}

TEST(Natvis, WalksOverTables) {
  STable<int> table{4, 9, 2};
  EXPECT_EQ(ArrayOf<natvis::Table>(table), ContentOf(table));
  EXPECT_EQ(As<natvis::Table>(table).Shown0(), 3);

  SStringTable texts{SString(WTEXT("a")), SString(WTEXT("b"))};
  EXPECT_EQ(ArrayOf<natvis::Texts>(texts), (std::vector<SString>{texts[0], texts[1]}));
  EXPECT_EQ(As<natvis::Texts>(texts).Shown0(), 2);

  STableDumb<int> numbers;
  EXPECT_TRUE(As<natvis::DumbTable>(numbers).Condition0());
  EXPECT_FALSE(As<natvis::DumbTable>(numbers).HasItems());
  for (int i = 0; i < 40; ++i) numbers.Add(i * i);
  EXPECT_FALSE(As<natvis::DumbTable>(numbers).Condition0());
  EXPECT_TRUE(As<natvis::DumbTable>(numbers).HasItems());
  EXPECT_EQ(static_cast<int>(As<natvis::DumbTable>(numbers).Shown0()), 40);
  EXPECT_EQ(ArrayOf<natvis::DumbTable>(numbers), ContentOf(numbers));

  STableMem<SString> strings;
  EXPECT_TRUE(As<natvis::MemTable>(strings).Condition0());
  EXPECT_FALSE(As<natvis::MemTable>(strings).HasItems());
  strings.Add(SString(WTEXT("one")));
  EXPECT_FALSE(As<natvis::MemTable>(strings).Condition0());
  EXPECT_TRUE(As<natvis::MemTable>(strings).HasItems());
  EXPECT_EQ(static_cast<int>(As<natvis::MemTable>(strings).Shown0()), 1);
  EXPECT_EQ(ArrayOf<natvis::MemTable>(strings), ContentOf(strings));
}

TEST(Natvis, WalksOverNodes) {
  SList<int> list{7, 8, 9};
  auto& listView = As<natvis::List>(list);
  std::vector<int> listed;
  auto* place = listView.HeadPointer();
  for (int left = listView.Size(); left > 0; --left) {
    auto& node = As<natvis::ListNode>(*place);
    listed.push_back(node.ValueNode());
    place = node.NextPointer();
  }
  EXPECT_EQ(listed, ContentOf(list));
  EXPECT_EQ(listView.Shown0(), 3);

  SMap<int, SString> map;
  for (int i = 0; i < 50; ++i) map.Add(i * 7 % 50, SString(static_cast<long>(i)));
  auto& mapView = As<natvis::Map>(map);
  std::vector<std::pair<int, SString>> shown, content;
  const auto walk = [&shown](auto& walkOn, auto* entry) {
    if (entry == nullptr) return;
    auto& node = As<natvis::MapNode>(*entry);
    walkOn(walkOn, node.LeftPointer());
    auto& pair = As<natvis::Entry>(node.ValueNode());
    shown.emplace_back(pair.Shown0(), pair.Shown1());
    walkOn(walkOn, node.RightPointer());
  };
  walk(walk, mapView.HeadPointer());
  for (const auto& [key, value] : map) content.emplace_back(key, value);
  EXPECT_EQ(shown, content);
  EXPECT_EQ(mapView.Size(), 50);
  EXPECT_EQ(mapView.Shown0(), 50);
}

TEST(Natvis, ShowsATime) {
  STime time(86400), invalid(-1);
  EXPECT_FALSE(As<natvis::Time>(time).Condition0());
  EXPECT_EQ(As<natvis::Time>(time).Shown0(), 86400);
  EXPECT_TRUE(As<natvis::Time>(invalid).Condition0());
}
