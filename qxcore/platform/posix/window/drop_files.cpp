// Files that are dropped on a window: reading the block that WM_DROPFILES carries.

#include <algorithm>
#include <cstring>

#include "qxcore/platform/win32.h"

namespace {

// The published layout.
struct Drop {
  DWORD files;  // where the paths begin, in bytes
  POINT point;
  BOOL isOutside;
  BOOL isWide;
};
static_assert(sizeof(Drop) == 20, "the layout is public");

// The block for a scope; null for an invalid handle.
class Locked {
 public:
  explicit Locked(HDROP drop) : m_block(drop), m_drop(static_cast<const Drop*>(::GlobalLock(m_block))) {}
  Locked(const Locked&) = delete;
  Locked& operator=(const Locked&) = delete;
  ~Locked() {
    if (m_drop != nullptr) ::GlobalUnlock(m_block);
  }
  bool IsValid() const { return m_drop != nullptr && ::GlobalSize(m_block) >= sizeof(Drop); }
  const Drop* operator->() const { return m_drop; }

  // The characters behind the layout; nobody makes a narrow block on this system.
  std::u16string_view Paths() const {
    const std::size_t size = ::GlobalSize(m_block);
    if (!IsValid() || !m_drop->isWide || m_drop->files > size) return {};
    const auto* begin = reinterpret_cast<const char*>(m_drop) + m_drop->files;
    return {reinterpret_cast<const WCHAR*>(begin), (size - m_drop->files) / sizeof(WCHAR)};
  }

 private:
  HGLOBAL m_block;
  const Drop* m_drop;
};

}  // namespace

UINT DragQueryFileW(HDROP drop, UINT index, LPWSTR buffer, UINT capacity) {
  const Locked block(drop);
  std::u16string_view rest = block.Paths();
  UINT count = 0;
  while (!rest.empty() && rest[0] != 0) {
    const std::u16string_view path = rest.substr(0, rest.find(WCHAR{0}));
    if (count == index) {
      if (buffer == nullptr || capacity == 0) return static_cast<UINT>(path.size());
      const std::size_t copied = std::min<std::size_t>(path.size(), capacity - 1);
      std::copy_n(path.data(), copied, buffer);
      buffer[copied] = 0;
      return static_cast<UINT>(copied);
    }
    ++count;
    rest.remove_prefix(std::min(path.size() + 1, rest.size()));
  }
  return index == ~UINT{0} ? count : 0;
}

BOOL DragQueryPoint(HDROP drop, POINT* point) {
  const Locked block(drop);
  if (!block.IsValid() || point == nullptr) return FALSE;
  *point = block->point;
  return !block->isOutside;
}

void DragFinish(HDROP drop) { ::GlobalFree(drop); }

void DragAcceptFiles(HWND window, BOOL accept) {
  const LONG_PTR style = ::GetWindowLongPtrW(window, GWL_EXSTYLE);
  ::SetWindowLongPtrW(window, GWL_EXSTYLE, accept ? style | WS_EX_ACCEPTFILES : style & ~LONG_PTR{WS_EX_ACCEPTFILES});
}
