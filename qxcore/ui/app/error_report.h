// What the framework does with failures that no caller learns of; see qxcore/core/raise_error.h for the reporter.
// For the user-interface thread.
#pragma once

#include <exception>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Passes the exception's text to g_RaiseError.
QXCORE_API void SReportException(const std::exception_ptr& exception) noexcept;

// The reporter that the framework installs when it is loaded: a message box where somebody is there to read it,
// otherwise a line on the standard error stream.
QXCORE_API void SShowError(const WCHAR* text);
