// The clipboard of this process: one block of memory for each format, which belongs to it. With a display, text is
// exchanged with other programs: theirs replaces all that is here when somebody looks, ours goes out on closing. There
// lines end with LF, here with CR and LF.

#include <utility>

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/thread.h"
#include "qxcore/platform/win32/clipboard.h"

namespace platform::model {
namespace {

struct Clipboard {
  const Thread* user = nullptr;  // the thread that has it open
  HWND window = nullptr;         // for which it was opened; the owner once it has emptied it
  HWND owner = nullptr;
  List<std::pair<UINT, HANDLE>> data;
  bool hasChanged = false;  // since it was opened
  std::u16string sent;      // what other programs got last
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

void Empty(Clipboard& clipboard) {
  for (const auto& entry : clipboard.data) GlobalFree(entry.second);
  clipboard.data.clear();
}

// --- text for and from other programs ---

bool IsExchanged() { return TheDisplay().Serves(CurrentThread()->id); }

HANDLE BlockOfText(std::u16string_view lines) {
  std::u16string text;
  for (const char16_t unit : lines) {
    if (unit == '\n' && !text.ends_with('\r')) text += '\r';
    text += unit;
  }
  const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, (text.size() + 1) * sizeof(WCHAR));
  auto* target = block != nullptr ? static_cast<WCHAR*>(GlobalLock(block)) : nullptr;
  if (target == nullptr) throw std::bad_alloc();
  std::copy_n(text.c_str(), text.size() + 1, target);
  GlobalUnlock(block);
  return block;
}

std::u16string TextOfBlock(HANDLE block) {
  std::u16string text;
  const auto* units = static_cast<const WCHAR*>(GlobalLock(block));
  if (units == nullptr) return text;
  for (const WCHAR* end = units + GlobalSize(block) / sizeof(WCHAR); units != end && *units != 0; ++units) {
    if (*units != '\r' || units + 1 == end || units[1] != '\n') text += *units;
  }
  GlobalUnlock(block);
  return text;
}

// Without the lock. Does nothing while somebody has the clipboard open.
void TakeFromOthers() {
  std::u16string text;
  if (!IsExchanged() || !TheDisplay().ClipboardText(&text)) return;
  const Guard guard;
  Clipboard& clipboard = TheClipboard();
  if (clipboard.user != nullptr || text == clipboard.sent) return;
  const HANDLE block = BlockOfText(text);
  Empty(clipboard);
  clipboard.owner = nullptr;
  clipboard.sent = text;
  clipboard.data.push_back({CF_UNICODETEXT, block});
}

// Without the lock: after a change.
void GiveToOthers() {
  std::u16string text;
  {
    const Guard guard;
    Clipboard& clipboard = TheClipboard();
    if (!std::exchange(clipboard.hasChanged, false)) return;
    if (const HANDLE* block = Find(clipboard, CF_UNICODETEXT)) text = TextOfBlock(*block);
    clipboard.sent = text;
  }
  if (IsExchanged()) TheDisplay().SetClipboardText(text);
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

BOOL OpenClipboard(HWND window) {
  Thread* thread = CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    TakeFromOthers();
    const Guard guard;
    Clipboard& clipboard = TheClipboard();
    if (clipboard.user != nullptr && (clipboard.user != thread || clipboard.window != window))
      return Fail(ERROR_ACCESS_DENIED);
    if (window != nullptr && Expect(window) == nullptr) return FALSE;
    clipboard.user = thread;
    clipboard.window = window;
    return TRUE;
  });
}

BOOL CloseClipboard() {
  Thread* thread = CurrentThread();
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    {
      const Guard guard;
      Clipboard* clipboard = Opened(thread);
      if (clipboard == nullptr) return FALSE;
      clipboard->user = nullptr;
    }
    GiveToOthers();
    return TRUE;
  });
}

BOOL EmptyClipboard() {
  Thread* thread = CurrentThread();
  const Guard guard;
  Clipboard* clipboard = Opened(thread);
  if (clipboard == nullptr) return FALSE;
  Empty(*clipboard);
  clipboard->owner = clipboard->window;
  clipboard->hasChanged = true;
  return TRUE;
}

HANDLE SetClipboardData(UINT format, HANDLE memory) {
  Thread* thread = CurrentThread();
  return OrNoMemory<HANDLE>(nullptr, [&]() -> HANDLE {
    const Guard guard;
    Clipboard* clipboard = Opened(thread);
    if (clipboard == nullptr) return nullptr;
    clipboard->hasChanged = true;
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
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    TakeFromOthers();
    const Guard guard;
    return Find(TheClipboard(), format) != nullptr;
  });
}

HWND GetClipboardOwner() {
  const Guard guard;
  const HWND owner = TheClipboard().owner;
  return FindWindowObject(owner) != nullptr ? owner : nullptr;
}
