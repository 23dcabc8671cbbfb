// A program to stop in: the debugger shows these variables by their content.

#include "qxcore/container/list.h"
#include "qxcore/container/map.h"
#include "qxcore/container/string_map.h"
#include "qxcore/container/table.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/container/table_mem.h"
#include "qxcore/string/string_buffer.h"

__attribute__((noinline)) void StopHere() { asm volatile(""); }

int main() {
  SString empty;
  SString text = WTEXT("Größe \u6f22 \xD83D\xDE42");
  SStringBuffer buffer(SString(WTEXT("built")));
  STable<SString> table{SString(WTEXT("one")), SString(WTEXT("two"))};
  STableDumb<int> numbers{3, 1, 2};
  STableDumb<int> none;
  STableMem<SString> strings{SString(WTEXT("three"))};
  SList<int> list{7, 8};
  SMap<int, SString> map{{2, SString(WTEXT("b"))}, {1, SString(WTEXT("a"))}};
  SUnsortedMap<int, int> order{{2, 20}, {1, 10}};
  SStringMap names;
  names.Add(SString(WTEXT("key")), SString(WTEXT("value")));
  StopHere();
  return empty.Length() + text.Length() + none.GetCount() + list.GetCount() + map.GetCount() == 0;
}
