// Menus, accelerators and dialog templates by name: those that a program registered in memory, else those of the
// module's resources.
#pragma once

#include "qxcore/platform/win32.h"

// The resource's bytes in the published binary layout; null when neither has this name.
const void* SFindResource(LPCWSTR name, LPCWSTR type);
// A menu that the caller owns; null when neither has this name.
HMENU SLoadMenu(LPCWSTR name);
// An accelerator table that the caller owns; null when neither has this name.
HACCEL SLoadAccelerators(LPCWSTR name);
