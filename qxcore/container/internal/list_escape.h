// The escapes of the flat list forms of tables and maps.
#pragma once

#include "qxcore/string/string_buffer.h"

// Appends the text with an escape before each separator and each escape character; 0 is no escape. What
// needs none is appended in one piece.
inline void AppendEscaped(SStringBuffer& list, SStringView text, WCHAR separator, WCHAR escape) {
  const WCHAR* end = text.data() + text.size();
  const WCHAR* run = text.data();
  for (const WCHAR* at = run; escape != 0 && at != end; ++at) {
    if (*at != escape && *at != separator) continue;
    list.Concat(run, at);
    list += escape;
    run = at;
  }
  list.Concat(run, end);
}
