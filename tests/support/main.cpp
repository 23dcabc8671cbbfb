// The main of every test program: unattended, so no dialog of the system may wait for a person.

#include <gtest/gtest.h>

#include "qxcore/platform/win32.h"

#ifdef _WIN32
static void SilenceDialogs() { SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOGPFAULTERRORBOX | SEM_NOOPENFILEERRORBOX); }
#else
static void SilenceDialogs() {}
#endif

// The buffer of a system message is not given back, once an exception; that is meant.
extern "C" const char* __lsan_default_suppressions() { return "leak:SECOMException::GetText"; }

int main(int argc, char** argv) {
  SilenceDialogs();
  testing::InitGoogleTest(&argc, argv);
  return RUN_ALL_TESTS();
}
