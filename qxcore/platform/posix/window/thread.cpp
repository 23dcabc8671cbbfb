#include "qxcore/platform/posix/window/thread.h"

#include <sys/syscall.h>
#include <time.h>
#include <unistd.h>

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/destroy.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

Thread* g_threads = nullptr;  // all that have a queue

}  // namespace

[[gnu::tls_model("initial-exec")]] constinit thread_local Thread* t_thread = nullptr;

Thread* MakeThread() {
  thread_local Thread thread;
  return &thread;
}

Thread::Thread() : id(static_cast<DWORD>(syscall(SYS_gettid))) {
  const Guard guard;
  next = g_threads;
  g_threads = this;
  t_thread = this;
}

Thread::~Thread() {
  FreeWindowsOf(this);
  const Guard guard;
  AnswerSentMessages(this, nullptr);
  for (std::atomic<Hook*>& first : hooks) {
    while (Hook* hook = first) {
      first = hook->next;
      RemoveObject(Kind::Hook, hook->handle);
      delete hook;
    }
  }
  Thread** link = &g_threads;
  while (*link != this) link = &(*link)->next;
  *link = next;
  t_thread = nullptr;
}

Thread* FindThread(DWORD id) {
  for (Thread* thread = g_threads; thread != nullptr; thread = thread->next)
    if (thread->id == id) return thread;
  return nullptr;
}

void Wake(Thread* thread) {
  thread->isWoken = true;
  thread->wake.notify_one();
  if (TheDisplay().Serves(thread->id)) TheDisplay().Wake();
}

std::uint64_t Now() {
  timespec time;
  clock_gettime(CLOCK_MONOTONIC_COARSE, &time);
  return static_cast<std::uint64_t>(time.tv_sec) * 1000 + time.tv_nsec / 1000000;
}

}  // namespace platform::model

using namespace platform::model;

DWORD GetCurrentThreadId() { return CurrentThread()->id; }

DWORD GetCurrentProcessId() { return static_cast<DWORD>(getpid()); }

void Sleep(DWORD milliseconds) {
  if (milliseconds == 0) {
    sched_yield();
    return;
  }
  timespec rest{milliseconds / 1000, static_cast<long>(milliseconds % 1000) * 1000000};
  while (nanosleep(&rest, &rest) != 0) {
  }
}
