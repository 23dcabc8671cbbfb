// Displays in modules of their own, so that the library depends on no window system.
//
// QXCORE_DISPLAY=NAME is looked for as the file qxcore-display-NAME.so in the folder that QXCORE_DISPLAY_PATH names,
// else beside the library and in the folder qxcore11e beside it. The file exports qxcore_open_display.
#pragma once

#include <cstdlib>
#include <memory>

#include "qxcore/platform/posix/display/display.h"

namespace platform {

// Goes up with every change of display.h: a module of another version is refused.
constexpr int kDisplayVersion = 1;

// What the module exports: opens the display for the calling thread. Null with a reason, a static text, when it
// cannot or when the version is not its own.
using OpenDisplayFunction = Display* (*)(int version, DisplayEvents& events, const char** reason);
constexpr char kOpenDisplayName[] = "qxcore_open_display";

// The display that shows nothing.
std::unique_ptr<Display> OpenHeadlessDisplay();
// The dots per inch that QXCORE_DPI asks for, 48 to 960; 0 for none.
inline UINT DpiOfEnvironment() {
  const char* text = std::getenv("QXCORE_DPI");
  const unsigned long dpi = text != nullptr ? std::strtoul(text, nullptr, 10) : 0;
  return dpi >= 48 && dpi <= 960 ? static_cast<UINT>(dpi) : 0;
}

}  // namespace platform
