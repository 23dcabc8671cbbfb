// What two sources call that include the system's headers and the library's in different orders.
#pragma once

#include "qxcore/string/string.h"

struct LinkedNames {
  const void* classInfo;  // the record that a query gives
  SString text;           // a text of the string table
  int order;              // of two texts without case
};

LinkedNames NamesSystemFirst();
LinkedNames NamesLibraryFirst();
