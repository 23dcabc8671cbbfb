#include "qxcore/core/module_state.h"

#include "qxcore/platform/module.h"

void SModuleState::Init(HINSTANCE instance) {
  if (m_initialized != 0) return;
  m_initialized = 1;
  m_instance = instance;
  m_resInstance = instance;
}

HINSTANCE SModuleState::SetResInstance(SModuleState* state, HINSTANCE instance) {
  if (instance == nullptr) return nullptr;
  HINSTANCE previous = state->m_resInstance;
  state->m_resInstance = instance;
  return previous;
}

SString SModuleState::LoadStringW(unsigned int id) {
  SString text;
  text.LoadStringW(id, m_resInstance);
  return text;
}

SString SModuleState::Format(unsigned int id, ...) {
  SString format = LoadStringW(id);
  SString text;
  std::va_list arguments;
  va_start(arguments, id);
  text.FormatV(format, arguments);
  va_end(arguments);
  return text;
}

SModuleState* SCoreGetModuleState() {
  static SModuleState state = [] {
    SModuleState made;
    made.Init(platform::ModuleHandle());
    return made;
  }();
  return &state;
}

HINSTANCE SGetResInstance(const WCHAR*, const WCHAR*) { return SCoreGetModuleState()->GetResInstance(); }
