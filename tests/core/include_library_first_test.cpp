// The order in which a client includes the system's headers and the library's must not change what it
// links to, although the former rename functions by macros.

// clang-format off: the order is the point
#include "qxcore/qxcore.h"
#include "tests/core/include_order.h"
#if __has_include(<windows.h>)
#include <windows.h>

#include <tchar.h>
#endif

#include <gtest/gtest.h>

LinkedNames NamesLibraryFirst() {
  SInputBuffer stream("", 0);
  const SObject& object = stream;
  SString text;
  text.LoadString(200);
  return {object.GetClassInfo(), text, _tcsicmpi(WTEXT("a10"), WTEXT("A9"))};
}

TEST(IncludeOrder, DoesNotChangeWhatIsLinked) {
  LinkedNames systemFirst = NamesSystemFirst();
  LinkedNames libraryFirst = NamesLibraryFirst();
  EXPECT_EQ(systemFirst.classInfo, &SInputBuffer::classSInputBuffer);
  EXPECT_EQ(libraryFirst.classInfo, systemFirst.classInfo);
  EXPECT_TRUE(libraryFirst.text == systemFirst.text && !libraryFirst.text.IsEmpty());
  EXPECT_GT(systemFirst.order, 0);
  EXPECT_GT(libraryFirst.order, 0);
}
