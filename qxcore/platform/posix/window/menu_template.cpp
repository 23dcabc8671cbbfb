// Menus and accelerator tables from the published binary layouts.

#include <cstring>

#include "qxcore/platform/posix/window/menu.h"
#include "qxcore/platform/resource_table.h"

namespace platform::model {
namespace {

// Reads a template piece by piece. A template of the program is trusted, as the system trusts it; one with a
// known size is not left.
class Reader {
 public:
  Reader(const void* data, std::size_t size)
      : m_start(static_cast<const BYTE*>(data)), m_at(m_start), m_end(m_start + size) {}
  bool Fails() const { return m_fails; }
  template <class Value>
  Value Read() {
    Value value{};
    if (static_cast<std::size_t>(m_end - m_at) < sizeof value) {
      m_fails = true;
      return value;
    }
    std::memcpy(&value, m_at, sizeof value);
    m_at += sizeof value;
    return value;
  }
  Text ReadText() {
    Text text;
    while (const WORD c = Read<WORD>()) text += static_cast<WCHAR>(c);
    return text;
  }
  void Skip(std::size_t count) {
    if (static_cast<std::size_t>(m_end - m_at) < count) {
      m_fails = true;
    } else {
      m_at += count;
    }
  }
  void Align() { Skip(static_cast<std::size_t>(-(m_at - m_start)) & 3); }

 private:
  const BYTE* m_start;
  const BYTE* m_at;
  const BYTE* m_end;
  bool m_fails = false;
};

constexpr std::size_t kUnknownSize = 0x100000;
constexpr int kDeepest = 32;

bool ReadPlain(Reader& reader, HMENU menu, int depth) {
  for (WORD flags = 0; !(flags & MF_END);) {
    flags = reader.Read<WORD>();
    const bool isPopup = flags & MF_POPUP;
    const WORD id = isPopup ? WORD(0) : reader.Read<WORD>();
    const Text text = reader.ReadText();
    if (reader.Fails() || depth > kDeepest) return false;
    const UINT kept = flags & ~static_cast<UINT>(MF_END);
    if (isPopup) {
      const HMENU below = CreatePopupMenu();
      if (below == nullptr || !AppendMenuW(menu, kept, reinterpret_cast<UINT_PTR>(below), text.c_str())) {
        if (below != nullptr) DestroyMenu(below);
        return false;
      }
      if (!ReadPlain(reader, below, depth + 1)) return false;
    } else if (!AppendMenuW(menu, text.empty() && id == 0 ? kept | MF_SEPARATOR : kept, id, text.c_str())) {
      return false;
    }
  }
  return true;
}

bool ReadExtended(Reader& reader, HMENU menu, int depth) {
  constexpr WORD kIsPopup = 0x01, kIsLast = 0x80;
  for (WORD flags = 0; !(flags & kIsLast);) {
    MENUITEMINFOW info{};
    info.cbSize = sizeof info;
    info.fMask = MIIM_FTYPE | MIIM_STATE | MIIM_ID | MIIM_STRING;
    info.fType = reader.Read<DWORD>();
    info.fState = reader.Read<DWORD>();
    info.wID = reader.Read<DWORD>();
    flags = reader.Read<WORD>();
    Text text = reader.ReadText();
    reader.Align();
    if (reader.Fails() || depth > kDeepest) return false;
    info.dwTypeData = text.data();
    if (flags & kIsPopup) {
      reader.Skip(sizeof(DWORD));  // the help identifier
      info.hSubMenu = CreatePopupMenu();
      info.fMask |= MIIM_SUBMENU;
      if (info.hSubMenu == nullptr) return false;
    }
    if (!InsertMenuItemW(menu, static_cast<UINT>(-1), TRUE, &info)) {
      if (info.hSubMenu != nullptr) DestroyMenu(info.hSubMenu);
      return false;
    }
    if (info.hSubMenu != nullptr && !ReadExtended(reader, info.hSubMenu, depth + 1)) return false;
  }
  return true;
}

HMENU MenuFrom(const void* data, std::size_t size) {
  Reader reader(data, size);
  const WORD version = reader.Read<WORD>(), offset = reader.Read<WORD>();
  reader.Skip(offset);
  if (version > 1 || reader.Fails()) return Fail<HMENU>(ERROR_INVALID_DATA);
  const HMENU menu = CreateMenu();
  if (menu == nullptr) return nullptr;
  if (version == 0 ? ReadPlain(reader, menu, 0) : ReadExtended(reader, menu, 0)) return menu;
  DestroyMenu(menu);
  return Fail<HMENU>(ERROR_INVALID_DATA);
}

struct Accelerators : OnModelHeap {
  List<ACCEL> entries;
};

HACCEL NewAccelerators(List<ACCEL>&& entries) {
  const Guard guard;
  Accelerators* table = new Accelerators;
  try {
    table->entries = std::move(entries);
    return static_cast<HACCEL>(AddObject(Kind::Accelerators, table, nullptr));
  } catch (...) {
    delete table;
    throw;
  }
}

List<ACCEL> EntriesOf(HACCEL handle) {
  const Guard guard;
  const auto* table = FindAs<Accelerators, Kind::Accelerators>(handle);
  return table != nullptr ? table->entries : List<ACCEL>();
}

// Whether the message is the entry's key with just its shift keys.
bool Fits(const ACCEL& entry, const MSG& message) {
  if (entry.fVirt & FVIRTKEY) {
    if (message.message != WM_KEYDOWN && message.message != WM_SYSKEYDOWN) return false;
    const int keys = (GetKeyState(VK_SHIFT) < 0 ? FSHIFT : 0) | (GetKeyState(VK_CONTROL) < 0 ? FCONTROL : 0) |
                     (GetKeyState(VK_MENU) < 0 ? FALT : 0);
    return message.wParam == entry.key && keys == (entry.fVirt & (FSHIFT | FCONTROL | FALT));
  }
  const UINT wanted = entry.fVirt & FALT ? WM_SYSCHAR : WM_CHAR;
  return message.message == wanted && message.wParam == entry.key;
}

// The menus of the window as they are before the command; a disabled item swallows the key.
bool IsBlocked(HWND window, HMENU menu, WORD command, bool isSystem) {
  const UINT state = GetMenuState(menu, command, MF_BYCOMMAND);
  if (state == static_cast<UINT>(-1)) return false;
  SendMessageW(window, WM_INITMENU, reinterpret_cast<WPARAM>(menu), 0);
  HMENU popup = nullptr;
  int position = 0;
  {
    const Guard guard;
    const ItemPlace place = FindItem(menu, command, MF_BYCOMMAND);
    const Menu* top = FindMenu(menu);
    if (place.menu != nullptr && top != nullptr && place.menu != top) {
      popup = place.menu->handle;
      for (std::size_t i = 0; i < top->items.size(); ++i)
        if (top->items[i].subMenu == popup) position = static_cast<int>(i);
    }
  }
  if (popup != nullptr)
    SendMessageW(window, WM_INITMENUPOPUP, reinterpret_cast<WPARAM>(popup), MAKELPARAM(position, isSystem));
  const UINT now = GetMenuState(menu, command, MF_BYCOMMAND);
  return now != static_cast<UINT>(-1) && (now & (MF_GRAYED | MF_DISABLED));
}

void Command(HWND window, WORD command) {
  const HMENU systemMenu = GetSystemMenu(window, FALSE), menu = GetMenu(window);
  if (command >= 0xF000 && systemMenu != nullptr &&
      GetMenuState(systemMenu, command, MF_BYCOMMAND) != static_cast<UINT>(-1)) {
    if (!IsBlocked(window, systemMenu, command, true)) SendMessageW(window, WM_SYSCOMMAND, command, 0x10000);
    return;
  }
  if (menu != nullptr && IsBlocked(window, menu, command, false)) return;
  if (IsWindowEnabled(window)) SendMessageW(window, WM_COMMAND, MAKEWPARAM(command, 1), 0);
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

HMENU LoadMenuIndirectW(const void* data) {
  if (data == nullptr) return Fail<HMENU>(ERROR_INVALID_PARAMETER);
  return OrNoMemory<HMENU>(nullptr, [&] { return MenuFrom(data, kUnknownSize); });
}

HMENU LoadMenuW(HINSTANCE instance, LPCWSTR name) {
  const platform::ResourceBytes found = platform::FindRegisteredResource(instance, RT_MENU, name);
  if (found.data == nullptr) return Fail<HMENU>(ERROR_RESOURCE_NAME_NOT_FOUND);
  return OrNoMemory<HMENU>(nullptr, [&] { return MenuFrom(found.data, found.size); });
}

HACCEL LoadAcceleratorsW(HINSTANCE instance, LPCWSTR name) {
  const platform::ResourceBytes found = platform::FindRegisteredResource(instance, RT_ACCELERATOR, name);
  if (found.data == nullptr) return Fail<HACCEL>(ERROR_RESOURCE_NAME_NOT_FOUND);
  return OrNoMemory<HACCEL>(nullptr, [&]() -> HACCEL {
    constexpr WORD kIsLast = 0x80;
    List<ACCEL> entries;
    Reader reader(found.data, found.size);
    for (WORD flags = 0; !(flags & kIsLast);) {
      flags = reader.Read<WORD>();
      const WORD key = reader.Read<WORD>(), command = reader.Read<WORD>();
      reader.Skip(sizeof(WORD));
      if (reader.Fails()) return Fail<HACCEL>(ERROR_INVALID_DATA);
      entries.push_back({static_cast<BYTE>(flags & 0x7F), key, command});
    }
    return NewAccelerators(std::move(entries));
  });
}

HACCEL CreateAcceleratorTableW(LPACCEL entries, int count) {
  if (entries == nullptr || count < 1) return Fail<HACCEL>(ERROR_INVALID_PARAMETER);
  return OrNoMemory<HACCEL>(nullptr, [&] { return NewAccelerators(List<ACCEL>(entries, entries + count)); });
}

int CopyAcceleratorTableW(HACCEL handle, LPACCEL entries, int count) {
  return OrNoMemory<int>(0, [&] {
    const List<ACCEL> all = EntriesOf(handle);
    if (entries == nullptr) return static_cast<int>(all.size());
    const int copied = std::min(count, static_cast<int>(all.size()));
    std::copy_n(all.begin(), copied, entries);
    return copied;
  });
}

BOOL DestroyAcceleratorTable(HACCEL handle) {
  const Guard guard;
  auto* table = static_cast<Accelerators*>(RemoveObject(Kind::Accelerators, handle));
  if (table == nullptr) return Fail(ERROR_INVALID_ACCEL_HANDLE);
  delete table;
  return TRUE;
}

int TranslateAcceleratorW(HWND window, HACCEL handle, MSG* message) {
  if (message == nullptr || !IsWindow(window)) return 0;
  if (message->message < WM_KEYFIRST || message->message > WM_KEYLAST) return 0;
  return OrNoMemory<int>(0, [&] {
    for (const ACCEL& entry : EntriesOf(handle)) {
      if (!Fits(entry, *message)) continue;
      Command(window, entry.cmd);
      return 1;
    }
    return 0;
  });
}
