#include "qxcore/platform/posix/controls/clipboard_text.h"

#include <algorithm>

#include "qxcore/platform/win32/clipboard.h"

namespace platform::controls {
namespace {

class OpenedClipboard {
 public:
  explicit OpenedClipboard(HWND window) : m_isOpen(OpenClipboard(window)) {}
  ~OpenedClipboard() {
    if (m_isOpen) CloseClipboard();
  }
  OpenedClipboard(const OpenedClipboard&) = delete;
  OpenedClipboard& operator=(const OpenedClipboard&) = delete;
  explicit operator bool() const { return m_isOpen; }

 private:
  const bool m_isOpen;
};

HGLOBAL BlockOf(const model::Text& text) {
  const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, (text.size() + 1) * sizeof(WCHAR));
  if (block == nullptr) return nullptr;
  auto* target = static_cast<WCHAR*>(GlobalLock(block));
  std::copy_n(text.c_str(), text.size() + 1, target);
  GlobalUnlock(block);
  return block;
}

}  // namespace

bool CopyToClipboard(HWND owner, const model::Text& text) {
  const OpenedClipboard clipboard(owner);
  if (!clipboard || !EmptyClipboard()) return false;
  const HGLOBAL block = BlockOf(text);
  if (block == nullptr) return false;
  if (SetClipboardData(CF_UNICODETEXT, block) != nullptr) return true;
  GlobalFree(block);
  return false;
}

// The text ends at its NUL, or with its block.
model::Text TextOfClipboard(HWND reader) {
  const OpenedClipboard clipboard(reader);
  if (!clipboard) return {};
  const HGLOBAL block = GetClipboardData(CF_UNICODETEXT);
  const auto* text = block != nullptr ? static_cast<const WCHAR*>(GlobalLock(block)) : nullptr;
  if (text == nullptr) return {};
  struct Unlocked {
    HGLOBAL block;
    ~Unlocked() { GlobalUnlock(block); }
  } unlocked{block};
  const WCHAR* end = text + GlobalSize(block) / sizeof(WCHAR);
  return model::Text(text, std::find(text, end, WCHAR(0)));
}

}  // namespace platform::controls
