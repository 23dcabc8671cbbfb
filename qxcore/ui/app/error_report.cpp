#include "qxcore/ui/app/error_report.h"

#include <cstdio>

#include "qxcore/core/exception.h"
#include "qxcore/core/raise_error.h"
#include "qxcore/core/throw_target.h"
#include "qxcore/string/string.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/interaction_mode.h"
#include "qxcore/ui/app/message_box.h"

static SString TextOf(const std::exception_ptr& exception) {
  try {
    std::rethrow_exception(exception);
  } catch (const SException& failure) {
    return failure.GetText();
  } catch (const STargetedException& abort) {
    return abort.GetMessageText();
  } catch (const std::exception& failure) {
    return failure.what();
  } catch (...) {
    return WTEXT("An unknown exception was thrown.");
  }
}

void SReportException(const std::exception_ptr& exception) noexcept {
  if (exception == nullptr) return;
  try {
    g_RaiseError(TextOf(exception));
  } catch (...) {
    g_RaiseError(WTEXT("Out of memory."));
  }
}

void SShowError(const WCHAR* text) {
  if (SIsInteractive()) {
    const SWinApp* app = SGetApp();
    SMessageBox(text, MB_OK | MB_ICONERROR, app != nullptr ? app->GetAppName() : nullptr);
    return;
  }
  std::fprintf(stderr, "%s\n", SString(text).ToUtf8().c_str());
}

// Before any code of a program runs; a program that sets its own reporter replaces it.
[[maybe_unused]] static const SErrorReporter g_former = g_SetErrorReporter(&SShowError);
