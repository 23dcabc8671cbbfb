// The error reporter: where a failure goes that no caller learns of otherwise.
//
// Code that may not throw (a merge that has to return what it has, a procedure that the system called)
// passes its message to g_RaiseError. What then happens is the program's choice: the window framework
// installs a reporter that shows the message; without a reporter nothing is shown.
// Threads: the reporter is set at start-up and runs in the thread that reports.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Receives a message for the user; never null, valid during the call, not a format.
using SErrorReporter = void (*)(const WCHAR* text);

// Passes the text (null counts as empty) to the reporter. Takes no memory. An exception that the reporter
// throws ends here.
QXCORE_API void g_RaiseError(const WCHAR* text) noexcept;

// Sets the process's reporter and returns the former one; null means none. Not locked: set it where the
// program starts, or on the thread that raises errors.
QXCORE_API SErrorReporter g_SetErrorReporter(SErrorReporter reporter) noexcept;
