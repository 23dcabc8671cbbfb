#include "qxcore/core/raise_error.h"

#include <utility>

namespace {
SErrorReporter g_reporter = nullptr;
}

void g_RaiseError(const WCHAR* text) noexcept {
  if (g_reporter == nullptr) return;
  try {
    g_reporter(text != nullptr ? text : WTEXT(""));
  } catch (...) {
  }
}

SErrorReporter g_SetErrorReporter(SErrorReporter reporter) noexcept { return std::exchange(g_reporter, reporter); }
