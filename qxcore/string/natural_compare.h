// Natural order: digit runs compare as numbers, so that "a9" stands before "a10".
//
//  1. Outside digit runs ('0' to '9') the first different code unit decides; the end of one text
//     decides against the other.
//  2. Where both sides stand at a digit, leading zeros are counted and skipped, and the rest of the
//     runs is compared as numbers of any length; a side with nothing left but zeros is the smaller.
//  3. Equal numbers: more leading zeros are greater ("a01" after "a1").
// Results are negative, 0 or positive; the difference itself is given where it fits an int. A null text
// is an empty one. The order is total. Threads: the functions may be called in any thread.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// The narrow/wide switches of the runtime's headers would rename these functions.
#undef _tcscmpi
#undef _tcsicmpi
#undef _tcsncmpi
#undef _tcsnicmpi

QXCORE_API int _tcscmpi(const WCHAR* a, const WCHAR* b);
// Letters compare by their one-to-one lower-case forms.
QXCORE_API int _tcsicmpi(const WCHAR* a, const WCHAR* b);
// At most `count` characters of each text; digit runs end there, too.
QXCORE_API int _tcsncmpi(const WCHAR* a, const WCHAR* b, int count);
QXCORE_API int _tcsnicmpi(const WCHAR* a, const WCHAR* b, int count);
