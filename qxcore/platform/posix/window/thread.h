// What the model knows of one thread: its queue, hooks, timers, focus and the like. Guarded by the one lock,
// except what a comment says. Every thread that calls the model has one; it ends with the thread.
#pragma once

#include <condition_variable>
#include <deque>

#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// A message that another thread waits for. It lies on the sender's stack.
struct SentMessage {
  HWND window;
  UINT message;
  WPARAM wParam;
  LPARAM lParam;
  LRESULT result = 0;
  bool isDone = false;
  Thread* sender = nullptr;
};

// An input event as the device reported it; the window is found when it is taken.
struct Input {
  MSG message;
  WCHAR typed = 0;  // of a key, see ReportKey
};

struct Hook : OnModelHeap {
  HHOOK handle = nullptr;
  int kind = 0;
  HOOKPROC procedure = nullptr;
  Thread* thread = nullptr;
  Hook* next = nullptr;  // the one that was set before
};

struct Timer {
  HWND window;
  UINT_PTR id;
  UINT interval;
  TIMERPROC procedure;
  std::uint64_t due;  // of Now()
};

struct Caret {
  HWND window = nullptr;
  int x = 0, y = 0, width = 0, height = 0;
  int hidden = 1;  // shown while it is 0
};

// A queue of records that grows and keeps its room.
template <class T>
class Ring {
 public:
  bool IsEmpty() const { return m_count == 0; }
  std::size_t Count() const { return m_count; }
  T& At(std::size_t index) { return m_items[(m_first + index) & (m_items.size() - 1)]; }
  void Push(const T& item) {
    if (m_count == m_items.size()) Grow();
    ++m_count;
    At(m_count - 1) = item;
  }
  void Remove(std::size_t index) {
    if (index == 0) {
      m_first = (m_first + 1) & (m_items.size() - 1);
    } else {
      for (std::size_t i = index; i + 1 < m_count; ++i) At(i) = At(i + 1);
    }
    --m_count;
  }

 private:
  void Grow() {
    List<T> items(m_items.empty() ? 16 : m_items.size() * 2);
    for (std::size_t i = 0; i < m_count; ++i) items[i] = At(i);
    m_items.swap(items);
    m_first = 0;
  }
  List<T> m_items;
  std::size_t m_first = 0, m_count = 0;
};

struct Thread {
  Thread();
  ~Thread();

  DWORD id;
  Thread* next = nullptr;  // in the list of all
  std::condition_variable wake;
  bool isWoken = false;

  Ring<MSG> posted;
  Ring<Input> input;
  Input lastKey{};  // the one that was taken last
  Ring<SentMessage*> sent;
  bool quits = false;
  int quitCode = 0;
  int paints = 0;  // windows that want WM_PAINT
  List<Timer> timers;
  UINT changed = 0;   // QS_ flags since the last GetQueueStatus
  int sendDepth = 0;  // messages of other threads that are being handled

  HWND active = nullptr, focus = nullptr, capture = nullptr;
  std::uint32_t activations = 0;  // how often the thread became active or inactive
  HWND menuOwner = nullptr;       // whose menu is being used
  bool inMenuLoop = false;
  Caret caret;
  HCURSOR cursor = nullptr;
  BYTE keys[256] = {};
  MSG lastClick{};
  HWND trackedLeave = nullptr;  // waits for WM_MOUSELEAVE

  std::atomic<Hook*> hooks[2] = {};  // WH_CBT, WH_CALLWNDPROC; the newest first; written under the lock
  HHOOK nextHook = nullptr;          // where CallNextHookEx goes on; the thread's own
  DeferredCopies deferredCopies;     // the thread's own
  DWORD messageTime = 0;
  POINT messagePoint{};
  LPARAM messageExtra = 0;
};

// The calling thread's own. Never null. Constant-initialised, and placed where the loader puts it, so that reaching it
// costs neither a guard nor a call.
[[gnu::tls_model("initial-exec")]] extern constinit thread_local Thread* t_thread;
Thread* MakeThread();
inline Thread* CurrentThread() { return t_thread != nullptr ? t_thread : MakeThread(); }
// Under the lock: the thread with this number; null without.
Thread* FindThread(DWORD id);
// Under the lock: lets the thread look at its queue again.
void Wake(Thread* thread);

// Milliseconds of a clock that only goes forward.
std::uint64_t Now();

}  // namespace platform::model
