// What the workbench remembers from one run to the next, below the library's key of the registry.
#pragma once

#include "qxcore/string/string.h"

// A setting as text; empty when it was never kept.
SString ReadSetting(const SString& name);
// A setting that cannot be kept is forgotten: the next run begins as the first one did.
void KeepSetting(const SString& name, const SString& value);
