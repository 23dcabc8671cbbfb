#include "qxcore/core/raise_error.h"

#include <utility>

#include "qxcore/core/internal/quietly.h"

namespace {
SErrorReporter g_reporter = nullptr;
}

void g_RaiseError(const WCHAR* text) noexcept {
  if (g_reporter == nullptr) return;
  SQuietly([text] { g_reporter(text != nullptr ? text : WTEXT("")); });
}

SErrorReporter g_SetErrorReporter(SErrorReporter reporter) noexcept { return std::exchange(g_reporter, reporter); }
