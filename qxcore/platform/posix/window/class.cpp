#include "qxcore/platform/posix/window/class.h"

#include <cstring>

#include "qxcore/platform/posix/window/atom.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/thread.h"

namespace platform::model {
namespace {

List<Class*>& Classes() {
  static auto* classes = new List<Class*>;
  return *classes;
}

bool IsNumber(LPCWSTR name) { return reinterpret_cast<std::uintptr_t>(name) <= 0xFFFF; }

Class* FindClass(ATOM name, HINSTANCE instance) {
  Class* shared = nullptr;
  for (Class* each : Classes()) {
    if (each->name != name) continue;
    if (!each->isSystem && each->instance == instance) return each;
    if (each->isSystem || (each->style & CS_GLOBALCLASS)) shared = each;
  }
  return shared;
}

Class* NewClass(const WNDCLASSEXW& wanted) {
  Class* made = new Class;
  try {
    made->name = InternName(wanted.lpszClassName);
    made->style = wanted.style;
    made->procedure = wanted.lpfnWndProc;
    made->windowExtra = wanted.cbWndExtra;
    made->instance = wanted.hInstance;
    made->icon = wanted.hIcon;
    made->smallIcon = wanted.hIconSm;
    made->cursor = wanted.hCursor;
    made->background = wanted.hbrBackground;
    made->extra.resize(static_cast<std::size_t>(wanted.cbClsExtra));
    if (IsNumber(wanted.lpszMenuName)) {
      made->menuNumber = wanted.lpszMenuName;
    } else {
      made->menuName = wanted.lpszMenuName;
    }
    Classes().push_back(made);
    return made;
  } catch (...) {
    delete made;
    throw;
  }
}

LPCWSTR MenuNameOf(const Class* each) { return each->menuName.empty() ? each->menuNumber : each->menuName.c_str(); }

void Describe(const Class* each, WNDCLASSEXW* description) {
  description->style = each->style;
  description->lpfnWndProc = each->procedure;
  description->cbClsExtra = static_cast<int>(each->extra.size());
  description->cbWndExtra = each->windowExtra;
  description->hInstance = each->isSystem ? nullptr : each->instance;
  description->hIcon = each->icon;
  description->hCursor = each->cursor;
  description->hbrBackground = each->background;
  description->lpszMenuName = MenuNameOf(each);
  description->hIconSm = each->smallIcon;
}

ULONG_PTR* Field(Class* each, int index) {
  switch (index) {
    case GCLP_HBRBACKGROUND:
      return reinterpret_cast<ULONG_PTR*>(&each->background);
    case GCLP_HCURSOR:
      return reinterpret_cast<ULONG_PTR*>(&each->cursor);
    case GCLP_HICON:
      return reinterpret_cast<ULONG_PTR*>(&each->icon);
    case GCLP_HICONSM:
      return reinterpret_cast<ULONG_PTR*>(&each->smallIcon);
    case GCLP_HMODULE:
      return reinterpret_cast<ULONG_PTR*>(&each->instance);
    case GCLP_WNDPROC:
      return reinterpret_cast<ULONG_PTR*>(&each->procedure);
    default:
      return nullptr;
  }
}

// Reads a field, and writes it when `value` is given. The size is that of the caller's type, for extra bytes.
template <class Value>
ULONG_PTR Access(HWND handle, int index, const Value* value) {
  const Guard guard;
  Window* window = Expect(handle);
  if (window == nullptr) return 0;
  Class* each = window->windowClass;
  ULONG_PTR old = 0;
  if (index >= 0) {
    if (index + sizeof(Value) > each->extra.size()) return Fail<ULONG_PTR>(ERROR_INVALID_INDEX);
    Value stored;
    std::memcpy(&stored, each->extra.data() + index, sizeof stored);
    if (value != nullptr) std::memcpy(each->extra.data() + index, value, sizeof stored);
    return static_cast<ULONG_PTR>(stored);
  }
  if (index == GCL_STYLE) {
    old = each->style;
    if (value != nullptr) each->style = static_cast<UINT>(*value);
    return old;
  }
  if (index == GCL_CBWNDEXTRA) return static_cast<ULONG_PTR>(each->windowExtra);
  if (index == GCL_CBCLSEXTRA) return each->extra.size();
  if (index == GCW_ATOM) return each->name;
  ULONG_PTR* field = Field(each, index);
  if (field == nullptr || sizeof(Value) != sizeof(*field)) return Fail<ULONG_PTR>(ERROR_INVALID_INDEX);
  old = *field;
  if (value != nullptr) *field = static_cast<ULONG_PTR>(*value);
  return old;
}

LPCWSTR Numbered(ATOM atom) { return reinterpret_cast<LPCWSTR>(static_cast<ULONG_PTR>(atom)); }

}  // namespace

Class* FindClass(LPCWSTR name, HINSTANCE instance) {
  const ATOM atom = FindName(name);
  return atom != 0 ? FindClass(atom, instance) : nullptr;
}

void AddSystemClass(LPCWSTR name, UINT style, WNDPROC procedure, int windowExtra, HCURSOR cursor, HBRUSH background) {
  WNDCLASSEXW wanted{};
  wanted.style = style;
  wanted.lpfnWndProc = procedure;
  wanted.cbWndExtra = windowExtra;
  wanted.hCursor = cursor;
  wanted.hbrBackground = background;
  wanted.lpszClassName = name;
  NewClass(wanted)->isSystem = true;
}

void EnsureSystemClasses() {
  static bool isDone = false;
  if (isDone) return;
  isDone = true;
  const auto color = [](int index) { return reinterpret_cast<HBRUSH>(static_cast<ULONG_PTR>(index + 1)); };
  AddSystemClass(Numbered(0x8000), CS_SAVEBITS, &MenuWindowProcedure, sizeof(LONG_PTR), nullptr, color(COLOR_MENU));
  AddSystemClass(Numbered(0x8001), CS_DBLCLKS, &DefWindowProcW, 0, nullptr, color(COLOR_BACKGROUND));
  AddSystemClass(WC_DIALOG, CS_SAVEBITS | CS_DBLCLKS, &DefDlgProcW, DLGWINDOWEXTRA, LoadStandardCursor(IDC_ARROW),
                 nullptr);
  AddControlClasses();
}

}  // namespace platform::model

using namespace platform::model;

ATOM RegisterClassExW(const WNDCLASSEXW* wanted) {
  CurrentThread();
  return OrNoMemory<ATOM>(0, [&]() -> ATOM {
    const Guard guard;
    if (wanted == nullptr || wanted->cbSize != sizeof(WNDCLASSEXW) || wanted->cbClsExtra < 0 ||
        wanted->cbWndExtra < 0 || wanted->lpfnWndProc == nullptr || wanted->lpszClassName == nullptr)
      return Fail<ATOM>(ERROR_INVALID_PARAMETER);
    EnsureSystemClasses();
    const ATOM name = InternName(wanted->lpszClassName);
    for (const Class* each : Classes())
      if (each->name == name && !each->isSystem && each->instance == wanted->hInstance)
        return Fail<ATOM>(ERROR_CLASS_ALREADY_EXISTS);
    return NewClass(*wanted)->name;
  });
}

ATOM RegisterClassW(const WNDCLASSW* wanted) {
  if (wanted == nullptr) return Fail<ATOM>(ERROR_INVALID_PARAMETER);
  const WNDCLASSEXW extended{sizeof(WNDCLASSEXW),   wanted->style,        wanted->lpfnWndProc,   wanted->cbClsExtra,
                             wanted->cbWndExtra,    wanted->hInstance,    wanted->hIcon,         wanted->hCursor,
                             wanted->hbrBackground, wanted->lpszMenuName, wanted->lpszClassName, nullptr};
  return RegisterClassExW(&extended);
}

BOOL UnregisterClassW(LPCWSTR name, HINSTANCE instance) {
  const Guard guard;
  Class* each = FindClass(name, instance);
  if (each == nullptr || each->isSystem) return Fail(ERROR_CLASS_DOES_NOT_EXIST);
  if (each->windows > 0) return Fail(ERROR_CLASS_HAS_WINDOWS);
  std::erase(Classes(), each);
  delete each;
  return TRUE;
}

BOOL GetClassInfoExW(HINSTANCE instance, LPCWSTR name, WNDCLASSEXW* description) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    const Guard guard;
    EnsureSystemClasses();
    const Class* each = FindClass(name, instance);
    if (each == nullptr) return Fail(ERROR_CLASS_DOES_NOT_EXIST);
    Describe(each, description);
    description->lpszClassName = name;
    return each->name;
  });
}

BOOL GetClassInfoW(HINSTANCE instance, LPCWSTR name, WNDCLASSW* description) {
  WNDCLASSEXW extended;
  const BOOL found = GetClassInfoExW(instance, name, &extended);
  if (!found) return FALSE;
  *description = {extended.style,        extended.lpfnWndProc,  extended.cbClsExtra, extended.cbWndExtra,
                  extended.hInstance,    extended.hIcon,        extended.hCursor,    extended.hbrBackground,
                  extended.lpszMenuName, extended.lpszClassName};
  return found;
}

int GetClassNameW(HWND handle, LPWSTR buffer, int capacity) {
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return 0;
  if (buffer == nullptr || capacity <= 0) return Fail<int>(ERROR_INSUFFICIENT_BUFFER);
  NumberText digits;
  const SStringView name = NameOf(window->windowClass->name, digits);
  const std::size_t count = std::min(name.size(), static_cast<std::size_t>(capacity - 1));
  std::copy_n(name.data(), count, buffer);
  buffer[count] = 0;
  return static_cast<int>(count);
}

DWORD GetClassLongW(HWND window, int index) { return static_cast<DWORD>(Access<LONG>(window, index, nullptr)); }
DWORD SetClassLongW(HWND window, int index, LONG value) { return static_cast<DWORD>(Access(window, index, &value)); }
ULONG_PTR GetClassLongPtrW(HWND window, int index) { return Access<LONG_PTR>(window, index, nullptr); }
ULONG_PTR SetClassLongPtrW(HWND window, int index, LONG_PTR value) { return Access(window, index, &value); }
