// The clipboard of this process: one block of memory for each format, which belongs to it.

#include <utility>

#include "qxcore/platform/posix/window/thread.h"
#include "qxcore/platform/win32/clipboard.h"

namespace platform::model {
namespace {

struct Clipboard {
  const Thread* user = nullptr;  // the thread that has it open
  HWND window = nullptr;         // for which it was opened; the owner once it has emptied it
  HWND owner = nullptr;
  List<std::pair<UINT, HANDLE>> data;
};

Clipboard& TheClipboard() {
  static Clipboard& clipboard = *new Clipboard;
  return clipboard;
}

// Under the lock: the clipboard if the calling thread has it open; else null with the last error set.
Clipboard* Opened(const Thread* thread) {
  Clipboard& clipboard = TheClipboard();
  if (clipboard.user == thread) return &clipboard;
  return Fail<Clipboard*>(ERROR_CLIPBOARD_NOT_OPEN);
}

HANDLE* Find(Clipboard& clipboard, UINT format) {
  for (auto& [known, memory] : clipboard.data)
    if (known == format) return &memory;
  return nullptr;
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

BOOL OpenClipboard(HWND window) {
  Thread* thread = CurrentThread();
  const Guard guard;
  Clipboard& clipboard = TheClipboard();
  if (clipboard.user != nullptr && (clipboard.user != thread || clipboard.window != window))
    return Fail(ERROR_ACCESS_DENIED);
  if (window != nullptr && Expect(window) == nullptr) return FALSE;
  clipboard.user = thread;
  clipboard.window = window;
  return TRUE;
}

BOOL CloseClipboard() {
  Thread* thread = CurrentThread();
  const Guard guard;
  Clipboard* clipboard = Opened(thread);
  if (clipboard == nullptr) return FALSE;
  clipboard->user = nullptr;
  return TRUE;
}

BOOL EmptyClipboard() {
  Thread* thread = CurrentThread();
  const Guard guard;
  Clipboard* clipboard = Opened(thread);
  if (clipboard == nullptr) return FALSE;
  for (const auto& entry : clipboard->data) GlobalFree(entry.second);
  clipboard->data.clear();
  clipboard->owner = clipboard->window;
  return TRUE;
}

HANDLE SetClipboardData(UINT format, HANDLE memory) {
  Thread* thread = CurrentThread();
  return OrNoMemory<HANDLE>(nullptr, [&]() -> HANDLE {
    const Guard guard;
    Clipboard* clipboard = Opened(thread);
    if (clipboard == nullptr) return nullptr;
    if (HANDLE* former = Find(*clipboard, format)) {
      GlobalFree(std::exchange(*former, memory));
    } else {
      clipboard->data.push_back({format, memory});
    }
    return memory;
  });
}

HANDLE GetClipboardData(UINT format) {
  Thread* thread = CurrentThread();
  const Guard guard;
  Clipboard* clipboard = Opened(thread);
  const HANDLE* memory = clipboard != nullptr ? Find(*clipboard, format) : nullptr;
  return memory != nullptr ? *memory : nullptr;
}

BOOL IsClipboardFormatAvailable(UINT format) {
  const Guard guard;
  return Find(TheClipboard(), format) != nullptr;
}

HWND GetClipboardOwner() {
  const Guard guard;
  const HWND owner = TheClipboard().owner;
  return FindWindowObject(owner) != nullptr ? owner : nullptr;
}
