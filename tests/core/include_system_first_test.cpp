// clang-format off: the order is the point
#if __has_include(<windows.h>)
#include <windows.h>

#include <tchar.h>
#endif
#include "qxcore/qxcore.h"
#include "tests/core/include_order.h"

LinkedNames NamesSystemFirst() {
  SInputBuffer stream("", 0);
  const SObject& object = stream;
  SString text;
  text.LoadString(200);
  return {object.GetClassInfo(), text, _tcsicmpi(WTEXT("a10"), WTEXT("A9"))};
}
