// The instance handles of one module, used to look up its resources.
//
// Threads: written when a module is attached, and only read afterwards, in any thread; not locked.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SModuleState {
 public:
  // All handles null, not initialised.
  constexpr SModuleState() noexcept = default;
  SModuleState(const SModuleState&) = default;
  SModuleState& operator=(const SModuleState&) = default;

  // Takes `instance` as module and resource handle, the first time only; later calls do nothing.
  void Init(HINSTANCE instance);

  int IsInitialized() const { return m_initialized; }                 // 1 after Init, else 0
  HINSTANCE GetInstance() const { return m_instance; }                // the module itself
  HINSTANCE GetResInstance() const { return m_resInstance; }          // where resources are looked up
  HINSTANCE GetLangResInstance() const { return m_langResInstance; }  // the module of translated resources, or null

  // Text `id` of the resource handle's string table; empty when there is none.
  SString LoadStringW(unsigned int id);
  // The same text, formatted with the arguments like SString::Format.
  SString Format(unsigned int id, ...);
  // Objects are no arguments, as there.
  template <class... Arguments, class = SIfNoFormatArguments<Arguments...>>
  SString Format(unsigned int id, const Arguments&... arguments) = delete;

 protected:
  // Redirects the resource handle and returns the former one. A null handle changes nothing and
  // returns null.
  static HINSTANCE SetResInstance(SModuleState* state, HINSTANCE instance);

 private:
  std::int32_t m_initialized = 0;
  HINSTANCE m_instance = nullptr;
  HINSTANCE m_resInstance = nullptr;
  HINSTANCE m_langResInstance = nullptr;  // a satellite with localised resources, if a client sets one
};

static_assert(sizeof(void*) != 4 || sizeof(SModuleState) == 16, "the layout is public");

// The library's own state, initialised with the library's handle.
QXCORE_API SModuleState* SCoreGetModuleState();

// The module in which a resource is looked up when a caller names none: the library's resource
// handle. `name` and `type` are resource names or ordinals as FindResourceW takes them.
QXCORE_API HINSTANCE SGetResInstance(const WCHAR* name, const WCHAR* type);
