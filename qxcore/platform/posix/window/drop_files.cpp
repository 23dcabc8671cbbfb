// Files that are dropped on a window: making and reading the block that WM_DROPFILES carries.

#include "qxcore/platform/posix/window/drop_files.h"

#include <algorithm>
#include <cstring>

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

// The window that accepts files at a point of the screen, or null. A window that a modal dialog disables accepts none.
HWND AcceptingWindow(HWND top, POINT point) {
  if (!::IsWindowEnabled(top)) return nullptr;
  HWND window = top;
  for (HWND child = top; child != nullptr;) {
    window = child;
    POINT inside = point;
    ::ScreenToClient(window, &inside);
    child = ::ChildWindowFromPoint(window, inside);
    if (child == window) break;
  }
  while (window != nullptr && !(::GetWindowLongPtrW(window, GWL_EXSTYLE) & WS_EX_ACCEPTFILES)) {
    window = window != top ? ::GetAncestor(window, GA_PARENT) : nullptr;
  }
  return window;
}

// Paths follow the layout, each with its NUL, and one more NUL.
HGLOBAL BlockOf(const platform::model::List<platform::model::Text>& files, POINT point, bool isOutside) {
  std::size_t length = 1;
  for (const auto& file : files) length += file.size() + 1;
  const HGLOBAL block = ::GlobalAlloc(GMEM_MOVEABLE | GMEM_ZEROINIT, sizeof(Drop) + length * sizeof(WCHAR));
  auto* drop = block != nullptr ? static_cast<Drop*>(::GlobalLock(block)) : nullptr;
  if (drop == nullptr) throw std::bad_alloc();
  *drop = {sizeof(Drop), point, isOutside, TRUE};
  auto* target = reinterpret_cast<WCHAR*>(drop + 1);
  for (const auto& file : files) target = std::copy_n(file.c_str(), file.size() + 1, target);
  ::GlobalUnlock(block);
  return block;
}

}  // namespace

namespace platform::model {

bool PostDroppedFiles(HWND top, POINT point, const List<Text>& files) {
  const HWND window = AcceptingWindow(top, point);
  if (window == nullptr || files.empty()) return false;
  POINT inside = point;
  RECT client{};
  ::ScreenToClient(window, &inside);
  ::GetClientRect(window, &client);
  const HGLOBAL block = BlockOf(files, inside, !::PtInRect(&client, inside));
  if (::PostMessageW(window, WM_DROPFILES, reinterpret_cast<WPARAM>(block), 0)) return true;
  ::GlobalFree(block);
  return false;
}

}  // namespace platform::model

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
