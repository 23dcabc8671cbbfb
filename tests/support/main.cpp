// The main of every test program: unattended, so no dialog of the system may wait for a person.

#include <gtest/gtest.h>

#include "qxcore/platform/win32.h"

#ifdef __GLIBC__
#include <malloc.h>
#endif

#ifdef _WIN32
static void SilenceDialogs() { SetErrorMode(SEM_FAILCRITICALERRORS | SEM_NOGPFAULTERRORBOX | SEM_NOOPENFILEERRORBOX); }
#else
static void SilenceDialogs() {}
#endif

// The buffer of a system message is not given back, once an exception; that is meant.
extern "C" const char* __lsan_default_suppressions() { return "leak:SECOMException::GetText"; }

// A request beyond all memory fails under the sanitizer, too, instead of ending the program.
extern "C" const char* __asan_default_options() { return "allocator_may_return_null=1"; }

// Memory of a young process is zero by chance: what comes from the heap here never is.
static void FillFreshMemory() {
#ifdef __GLIBC__
  mallopt(M_PERTURB, 0x5A);
#endif
}

int main(int argc, char** argv) {
  SilenceDialogs();
  FillFreshMemory();
  testing::InitGoogleTest(&argc, argv);
  return RUN_ALL_TESTS();
}
