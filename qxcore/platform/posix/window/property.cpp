// Values that a program hangs on a window under a name.

#include "qxcore/platform/posix/window/atom.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

Property* FindProperty(Window* window, LPCWSTR name) {
  const ATOM atom = FindName(name);
  for (Property& property : window->properties)
    if (atom != 0 && property.name == atom) return &property;
  return nullptr;
}

}  // namespace
}  // namespace platform::model

using namespace platform::model;

BOOL SetPropW(HWND handle, LPCWSTR name, HANDLE value) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    const Guard guard;
    Window* window = Expect(handle);
    if (window == nullptr) return FALSE;
    const ATOM atom = InternName(name);
    if (atom == 0) return Fail(ERROR_INVALID_PARAMETER);
    if (Property* property = FindProperty(window, name)) {
      property->value = value;
    } else {
      window->properties.push_back({atom, value});
    }
    return TRUE;
  });
}

HANDLE GetPropW(HWND handle, LPCWSTR name) {
  const Guard guard;
  Window* window = Expect(handle);
  const Property* property = window != nullptr ? FindProperty(window, name) : nullptr;
  return property != nullptr ? property->value : nullptr;
}

HANDLE RemovePropW(HWND handle, LPCWSTR name) {
  const Guard guard;
  Window* window = Expect(handle);
  Property* property = window != nullptr ? FindProperty(window, name) : nullptr;
  if (property == nullptr) return nullptr;
  const HANDLE value = property->value;
  window->properties.erase(window->properties.begin() + (property - window->properties.data()));
  return value;
}

int EnumPropsExW(HWND handle, PROPENUMPROCEXW callback, LPARAM data) {
  return OrNoMemory<int>(-1, [&]() -> int {
    List<std::pair<Text, HANDLE>> properties;
    {
      const Guard guard;
      const Window* window = Expect(handle);
      if (window == nullptr) return -1;
      NumberText digits;
      for (const Property& property : window->properties)
        properties.push_back({Text(NameOf(property.name, digits)), property.value});
    }
    int result = -1;
    for (auto& [name, value] : properties) {
      result = [&, &text = name, &held = value]() noexcept {
        return callback(handle, text.data(), held, static_cast<ULONG_PTR>(data));
      }();
      if (!result) break;
    }
    return result;
  });
}
