// Dialogs from templates of the published binary layouts.

#include <cstring>

#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/dialog.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/resource_table.h"

namespace platform::model {
namespace {

// A text or a number, where a template may have either.
struct Name {
  LPCWSTR text = nullptr;  // null for a number, and for nothing
  WORD number = 0;
  LPCWSTR Given() const { return text != nullptr ? text : MAKEINTRESOURCEW(number); }
};

struct Header {
  bool isExtended = false;
  DWORD style = 0, exStyle = 0, helpId = 0;
  int count = 0;
  short x = 0, y = 0, width = 0, height = 0;
  Name menu, windowClass;
  LPCWSTR caption = nullptr;
  bool hasFont = false;
  WORD pointSize = 0, weight = 400;
  bool isItalic = false;
  LPCWSTR face = nullptr;
};

struct Item {
  DWORD style = 0, exStyle = 0;
  short x = 0, y = 0, width = 0, height = 0;
  DWORD id = 0;
  Name windowClass, text;
  const void* data = nullptr;
};

// A template is an array of words; the caller answers for its end, as with the system's own call.
class Reader {
 public:
  explicit Reader(const void* data) : m_start(static_cast<const WORD*>(data)), m_at(m_start) {}
  WORD Word() { return *m_at++; }
  DWORD Long() {
    const WORD low = Word();
    return low | static_cast<DWORD>(Word()) << 16;
  }
  short Short() { return static_cast<short>(Word()); }
  void Align() {
    if ((m_at - m_start) & 1) ++m_at;
  }
  LPCWSTR String() {
    const auto text = reinterpret_cast<LPCWSTR>(m_at);
    while (*m_at++ != 0) {
    }
    return text;
  }
  Name TextOrNumber() {
    if (*m_at == 0) {
      ++m_at;
      return {};
    }
    if (*m_at == 0xFFFF) {
      ++m_at;
      return {nullptr, Word()};
    }
    return {String(), 0};
  }
  // Skips `size` bytes of creation data, the count of which stands first.
  const void* Data(bool isExtended) {
    const WORD size = *m_at;
    const void* data = size != 0 ? m_at : nullptr;
    ++m_at;
    if (size != 0) m_at += (isExtended ? size : std::max(size - 2, 0)) / 2;
    return data;
  }

 private:
  const WORD* m_start;
  const WORD* m_at;
};

Header ReadHeader(Reader& reader) {
  Header header;
  const DWORD first = reader.Long();
  header.isExtended = HIWORD(first) == 0xFFFF;
  if (header.isExtended) {
    header.helpId = reader.Long();
    header.exStyle = reader.Long();
    header.style = reader.Long();
  } else {
    header.style = first;
    header.exStyle = reader.Long();
  }
  header.count = reader.Word();
  header.x = reader.Short();
  header.y = reader.Short();
  header.width = reader.Short();
  header.height = reader.Short();
  header.menu = reader.TextOrNumber();
  header.windowClass = reader.TextOrNumber();
  header.caption = reader.String();
  header.hasFont = header.style & DS_SETFONT;
  if (header.hasFont) {
    header.pointSize = reader.Word();
    if (header.isExtended) {
      header.weight = reader.Word();
      header.isItalic = LOBYTE(reader.Word()) != 0;
    }
    header.face = reader.String();
  }
  return header;
}

Item ReadItem(Reader& reader, bool isExtended) {
  Item item;
  reader.Align();
  if (isExtended) {
    reader.Long();  // the help identifier
    item.exStyle = reader.Long();
    item.style = reader.Long();
  } else {
    item.style = reader.Long();
    item.exStyle = reader.Long();
  }
  item.x = reader.Short();
  item.y = reader.Short();
  item.width = reader.Short();
  item.height = reader.Short();
  item.id = isExtended ? reader.Long() : reader.Word();
  item.windowClass = reader.TextOrNumber();
  item.text = reader.TextOrNumber();
  item.data = reader.Data(isExtended);
  return item;
}

LPCWSTR ClassOf(const Name& name) {
  static constexpr LPCWSTR kClasses[] = {WTEXT("Button"),  WTEXT("Edit"),      WTEXT("Static"),
                                         WTEXT("ListBox"), WTEXT("ScrollBar"), WTEXT("ComboBox")};
  if (name.text != nullptr) return name.text;
  const unsigned int index = name.number - 0x80u;
  return index < std::size(kClasses) ? kClasses[index] : MAKEINTRESOURCEW(name.number);
}

struct Units {
  int x, y;
};

// The units of a font where no text can be measured: those of the usual face, by its size.
Units UnitsOf(const Header& header, HFONT* font) {
  const LONG usual = GetDialogBaseUnits();
  *font = nullptr;
  if (!header.hasFont) return {LOWORD(usual), HIWORD(usual)};
  const int pixels = MulDiv(header.pointSize, static_cast<int>(GetDpiForSystem()), 72);
  if (g_painter.dialogFont != nullptr) {
    SIZE size{};
    *font = g_painter.dialogFont(header.face, -pixels, header.weight, header.isItalic, &size);
    if (*font != nullptr) return {size.cx, size.cy};
  }
  return {std::max(MulDiv(pixels, 6, 11), 1), std::max(MulDiv(pixels, 13, 11), 1)};
}

bool MakeControls(Reader& reader, const Header& header, HWND dialog, Units units, HFONT font, HINSTANCE instance) {
  for (int i = 0; i < header.count; ++i) {
    const Item item = ReadItem(reader, header.isExtended);
    const HWND control = CreateWindowExW(
        item.exStyle | WS_EX_NOPARENTNOTIFY, ClassOf(item.windowClass), item.text.Given(), item.style | WS_CHILD,
        MulDiv(item.x, units.x, 4), MulDiv(item.y, units.y, 8), MulDiv(item.width, units.x, 4),
        MulDiv(item.height, units.y, 8), dialog, reinterpret_cast<HMENU>(static_cast<UINT_PTR>(item.id)), instance,
        const_cast<void*>(item.data));
    if (control == nullptr) {
      if (header.style & DS_NOFAILCREATE) continue;
      return false;
    }
    if (font != nullptr) Send(control, WM_SETFONT, reinterpret_cast<WPARAM>(font), FALSE);
    if (Send(control, WM_GETDLGCODE) & DLGC_DEFPUSHBUTTON) {
      const Guard guard;
      if (Dialog* made = FindDialog(dialog)) made->defaultId = item.id;
    }
  }
  return true;
}

// The place of the window: the template's is the client area's, relative to the owner's.
RECT PlaceOf(const Header& header, DWORD style, DWORD exStyle, Units units, HWND owner, bool hasMenu) {
  RECT rect{0, 0, MulDiv(header.width, units.x, 4), MulDiv(header.height, units.y, 8)};
  AdjustWindowRectEx(&rect, style, hasMenu, exStyle);
  const int width = Width(rect), height = Height(rect);
  const SIZE screen{GetSystemMetrics(SM_CXSCREEN), GetSystemMetrics(SM_CYSCREEN)};
  POINT place{MulDiv(header.x, units.x, 4) + rect.left, MulDiv(header.y, units.y, 8) + rect.top};
  if (header.style & DS_CENTER) {
    place = {(screen.cx - width) / 2, (screen.cy - height) / 2};
  } else if (!(header.style & DS_ABSALIGN) && !(style & WS_CHILD) && owner != nullptr) {
    ClientToScreen(owner, &place);
  }
  if (!(style & WS_CHILD)) {
    place.x = std::max<LONG>(std::min<LONG>(place.x, screen.cx - width), 0);
    place.y = std::max<LONG>(std::min<LONG>(place.y, screen.cy - height), 0);
  }
  return {place.x, place.y, place.x + width, place.y + height};
}

HWND CreateDialogFrom(HINSTANCE instance, LPCDLGTEMPLATEW dialogTemplate, HWND owner, DLGPROC procedure,
                      LPARAM parameter) {
  if (dialogTemplate == nullptr) return Fail<HWND>(ERROR_INVALID_PARAMETER);
  Reader reader(dialogTemplate);
  const Header header = ReadHeader(reader);
  HFONT font;
  const Units units = UnitsOf(header, &font);
  DWORD style = header.style & ~static_cast<DWORD>(WS_VISIBLE);
  DWORD exStyle = header.exStyle;
  if (style & DS_MODALFRAME) exStyle |= WS_EX_DLGMODALFRAME;
  if (style & DS_CONTROL) {
    style &= ~static_cast<DWORD>(WS_CAPTION | WS_SYSMENU);
    exStyle |= WS_EX_CONTROLPARENT;
  }
  const bool hasMenuName = header.menu.text != nullptr || header.menu.number != 0;
  const HMENU menu = hasMenuName ? LoadMenuW(instance, header.menu.Given()) : nullptr;
  const RECT rect = PlaceOf(header, style, exStyle, units, owner, menu != nullptr);
  const bool hasClass = header.windowClass.text != nullptr || header.windowClass.number != 0;
  const HWND dialog = CreateWindowExW(exStyle, hasClass ? header.windowClass.Given() : WC_DIALOG, header.caption, style,
                                      rect.left, rect.top, Width(rect), Height(rect), owner, menu, instance, nullptr);
  if (dialog == nullptr || !MakeDialog(dialog)) {
    if (menu != nullptr && dialog == nullptr) DestroyMenu(menu);
    return nullptr;
  }
  {
    const Guard guard;
    Dialog* made = FindDialog(dialog);
    made->baseX = units.x;
    made->baseY = units.y;
    made->font = font;
  }
  SetWindowLongPtrW(dialog, DWLP_DLGPROC, reinterpret_cast<LONG_PTR>(procedure));
  if (font != nullptr) Send(dialog, WM_SETFONT, reinterpret_cast<WPARAM>(font), FALSE);
  if (!MakeControls(reader, header, dialog, units, font, instance)) {
    if (IsWindow(dialog)) DestroyWindow(dialog);
    return nullptr;
  }

  HWND focus = GetNextDlgTabItem(dialog, nullptr, FALSE);
  if (focus == nullptr) focus = GetNextDlgGroupItem(dialog, nullptr, FALSE);
  const bool takesFocus = Send(dialog, WM_INITDIALOG, reinterpret_cast<WPARAM>(focus), parameter) && IsWindow(dialog);
  if (!IsWindow(dialog)) return nullptr;
  if (takesFocus && (!(style & DS_CONTROL) || header.style & WS_VISIBLE)) {
    focus = GetNextDlgTabItem(dialog, nullptr, FALSE);
    if (focus != nullptr) {
      FocusControl(focus);
    } else if (!(style & WS_CHILD)) {
      SetFocus(dialog);
    }
    ShowDefaultButton(dialog, focus);
  }
  bool isEnded = false;
  {
    const Guard guard;
    const Dialog* made = FindDialog(dialog);
    isEnded = made == nullptr || made->isEnded;
  }
  if (header.style & WS_VISIBLE && !isEnded && !IsWindowVisible(dialog)) ShowWindow(dialog, SW_SHOWNORMAL);
  return IsWindow(dialog) ? dialog : nullptr;
}

bool IsEnded(HWND handle) {
  const Guard guard;
  const Dialog* dialog = FindDialog(handle);
  return dialog == nullptr || dialog->isEnded;
}

}  // namespace

INT_PTR RunDialog(HWND handle, HWND owner) {
  bool isShown = IsWindowVisible(handle);
  const bool tellsIdle = !(GetWindowLongW(handle, GWL_STYLE) & DS_NOIDLEMSG) && owner != nullptr;
  while (!IsEnded(handle)) {
    MSG message;
    if (!PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) {
      if (!isShown) {
        isShown = true;
        ShowWindow(handle, SW_SHOWNORMAL);
        continue;
      }
      if (tellsIdle) Send(owner, WM_ENTERIDLE, MSGF_DIALOGBOX, reinterpret_cast<LPARAM>(handle));
      if (IsEnded(handle)) break;
      if (GetMessageW(&message, nullptr, 0, 0) < 0) break;
    }
    if (message.message == WM_QUIT) {
      PostQuitMessage(static_cast<int>(message.wParam));
      break;
    }
    if (!IsWindow(handle)) break;
    if (!IsDialogMessageW(handle, &message)) {
      TranslateMessage(&message);
      DispatchMessageW(&message);
    }
  }
  const Guard guard;
  const Dialog* dialog = FindDialog(handle);
  return dialog != nullptr ? dialog->result : 0;
}

}  // namespace platform::model

using namespace platform::model;

HWND CreateDialogIndirectParamW(HINSTANCE instance, LPCDLGTEMPLATEW dialogTemplate, HWND owner, DLGPROC procedure,
                                LPARAM parameter) {
  return CreateDialogFrom(instance, dialogTemplate, owner, procedure, parameter);
}

HWND CreateDialogParamW(HINSTANCE instance, LPCWSTR name, HWND owner, DLGPROC procedure, LPARAM parameter) {
  const platform::ResourceBytes found = platform::FindRegisteredResource(instance, RT_DIALOG, name);
  if (found.data == nullptr) return Fail<HWND>(ERROR_RESOURCE_NAME_NOT_FOUND);
  return CreateDialogIndirectParamW(instance, static_cast<LPCDLGTEMPLATEW>(found.data), owner, procedure, parameter);
}

INT_PTR DialogBoxIndirectParamW(HINSTANCE instance, LPCDLGTEMPLATEW dialogTemplate, HWND owner, DLGPROC procedure,
                                LPARAM parameter) {
  if (owner != nullptr && !IsWindow(owner)) return Fail<INT_PTR>(ERROR_INVALID_WINDOW_HANDLE);
  const HWND top = owner != nullptr ? GetAncestor(owner, GA_ROOT) : nullptr;
  const bool disables = top != nullptr && IsWindowEnabled(top);
  if (disables) EnableWindow(top, FALSE);
  const HWND dialog = CreateDialogFrom(instance, dialogTemplate, top, procedure, parameter);
  if (dialog == nullptr) {
    if (disables && IsWindow(top)) EnableWindow(top, TRUE);
    return -1;
  }
  const INT_PTR result = RunDialog(dialog, top);
  if (disables && IsWindow(top) && !IsWindowEnabled(top)) EnableWindow(top, TRUE);
  if (IsWindow(dialog)) DestroyWindow(dialog);
  return result;
}

INT_PTR DialogBoxParamW(HINSTANCE instance, LPCWSTR name, HWND owner, DLGPROC procedure, LPARAM parameter) {
  const platform::ResourceBytes found = platform::FindRegisteredResource(instance, RT_DIALOG, name);
  if (found.data == nullptr) return Fail<INT_PTR>(ERROR_RESOURCE_NAME_NOT_FOUND, -1);
  return DialogBoxIndirectParamW(instance, static_cast<LPCDLGTEMPLATEW>(found.data), owner, procedure, parameter);
}
