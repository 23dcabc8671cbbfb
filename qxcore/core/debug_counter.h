// Named figures for diagnostics: a class registers where it keeps a figure, a report walks them all.
//
// Safe for several threads as far as the registry goes; the figures themselves are read as they are.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Registers `*value` under a name and a unit ("bytes", "elements"); the name is copied, the unit and
// the figure have to stay until SDbgRemoveCounter. Several counters may have one name. When memory is
// out the counter is left out: 0, else 1.
QXCORE_API int SDbgAddCounter(const WCHAR* name, const WCHAR* unit, const std::int32_t* value) noexcept;

// Takes out the counter of this figure; one that is not registered is ignored.
QXCORE_API void SDbgRemoveCounter(const std::int32_t* value) noexcept;

// Calls `visit` for every counter, in the order in which they were registered. `visit` must not add or
// remove counters. Returns the number of counters.
QXCORE_API int SDbgForEachCounter(void (*visit)(const WCHAR* name, const WCHAR* unit, std::int32_t value,
                                                void* context),
                                  void* context);
