// A program to stop in: the debugger shows these variables by their content.

#include "qxcore/container/list.h"
#include "qxcore/container/map.h"
#include "qxcore/container/string_map.h"
#include "qxcore/container/string_table.h"
#include "qxcore/container/table.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/container/table_mem.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/system/time/time.h"

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
  const SMap<int, SString>& byReference = map;
  SMap<int, SString>::iterator place = map.begin();
  SStringTable texts;
  texts.Add(SString(WTEXT("first")));
  texts.Add(SString(WTEXT("second")));
  STime time(86400);
  StopHere();
  return empty.Length() + text.Length() + none.GetCount() + list.GetCount() + byReference.GetCount() + place->m_key +
             texts.GetCount() + (time == STime()) ==
         0;
}
