#include "qxcore/ui/app/interaction_mode.h"

#include "qxcore/core/module_state.h"
#include "qxcore/core/raise_error.h"
#include "qxcore/core/throw_target.h"

namespace {

constinit InteractiveMode g_mode = kInteractiveDefault;
constinit InteractiveMode g_defaultMode = kInteractiveShow;

constexpr unsigned int kAbortingText = 268;
constexpr unsigned int kAdviceText = 269;

}  // namespace

InteractiveMode g_GetInteractionMode() { return g_mode; }

InteractiveMode g_GetDeftInteractionMode() { return g_defaultMode; }

InteractiveMode SInteractionModeInForce() {
  const InteractiveMode mode = g_mode != kInteractiveDefault ? g_mode : g_defaultMode;
  return mode != kInteractiveDefault ? mode : kInteractiveShow;
}

SModeSetter::SModeSetter(InteractiveMode& mode) : m_mode(mode), m_former(mode) {}
SModeSetter::~SModeSetter() { m_mode = m_former; }
void SModeSetter::Set(InteractiveMode mode) { m_mode = mode; }

SetInteractiveMode::SetInteractiveMode() : SModeSetter(g_mode) {}
SetInteractiveMode::SetInteractiveMode(InteractiveMode mode) : SModeSetter(g_mode) { g_mode = mode; }

SetDeftInteractiveMode::SetDeftInteractiveMode() : SModeSetter(g_defaultMode) {}
SetDeftInteractiveMode::SetDeftInteractiveMode(InteractiveMode mode) : SModeSetter(g_defaultMode) {
  g_defaultMode = mode;
}

void g_ThrowAbort(const SString& text) {
  g_RaiseError(text);
  throw STargetedException(WTEXT("Scripting,DlgAbort"), text);
}

// The text as a quotation: each of its lines behind " > ".
static SString Quoted(const SString& text) {
  SString quoted(text);
  quoted.ReplaceAll(WTEXT("\r\n"), WTEXT("\n"));
  quoted.ReplaceAll(WTEXT("\n"), WTEXT("\n > "));
  return quoted;
}

void g_ThrowAbortOnDlg(const SString& title, const SString& text) {
  SModuleState* module = SCoreGetModuleState();
  SString message = module->Format(kAbortingText, title.GetSafePointer());
  if (!text.IsEmpty()) {
    message += WTEXT(":\n\n > ");
    message += Quoted(text);
    message += WTEXT("\n > \n");
  }
  message += WTEXT("\n");
  message += module->LoadStringW(kAdviceText);
  g_ThrowAbort(message);
}
