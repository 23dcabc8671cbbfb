// Which entries are links to other places.
#pragma once

#include "qxcore/platform/win32.h"

// Takes the mark of a link from an entry that has it for another reason: file systems also mark what they fetch only
// when it is wanted, such as folders of a cloud. Only tags with the published bit for name surrogates are links.
inline void KeepLinkMark(WIN32_FIND_DATAW& data) {
  constexpr DWORD kNameSurrogate = 0x20000000;
  if ((data.dwFileAttributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0 && (data.dwReserved0 & kNameSurrogate) == 0)
    data.dwFileAttributes &= ~static_cast<DWORD>(FILE_ATTRIBUTE_REPARSE_POINT);
}
