#include "qxcore/ui/window/menu.h"

#include <utility>

#include "qxcore/core/handle_map.h"
#include "qxcore/ui/app/interaction_mode.h"
#include "qxcore/ui/window/internal/resources.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SMenu, SObject, 2)

namespace {

class MenuMap final : public SHandleMap {
 protected:
  SObject* MakeTemporary(void* handle) override {
    SMenu* made = new SMenu;
    made->m_hMenu = static_cast<HMENU>(handle);
    return made;
  }
  void DestroyTemporary(SObject* object) override {
    static_cast<SMenu*>(object)->m_hMenu = nullptr;
    delete object;
  }
};

constexpr UINT kNone = static_cast<UINT>(-1);

}  // namespace

SHandleMap& SMenu::HandleMap() {
  static MenuMap& map = *new MenuMap;
  return map;
}

SMenu* SMenu::FromHandle(HMENU menu) { return static_cast<SMenu*>(HandleMap().FromHandle(menu)); }
SMenu* SMenu::FromHandlePermanent(HMENU menu) { return static_cast<SMenu*>(HandleMap().FromHandlePermanent(menu)); }
void SMenu::DeleteTempMap() { HandleMap().DeleteTempMap(); }

static HMENU HandleOrNull(const SMenu* menu) { return menu != nullptr ? menu->m_hMenu : nullptr; }

HMENU SMenu::GetSafeHandle() const { return HandleOrNull(this); }

SMenu::~SMenu() { DestroyMenu(); }

int SMenu::Attach(HMENU menu) {
  if (menu == nullptr) return 0;
  HandleMap().SetPermanent(menu, this);
  m_hMenu = menu;
  return 1;
}

HMENU SMenu::Detach() {
  const HMENU menu = std::exchange(m_hMenu, nullptr);
  if (menu == nullptr) return nullptr;
  if (FromHandlePermanent(menu) == this) {
    HandleMap().RemovePermanent(menu);
  } else {
    HandleMap().DiscardTemporary(menu);
  }
  return menu;
}

// A menu that cannot be entered in the map is not kept.
static int AttachOrDestroy(SMenu& object, HMENU menu) {
  try {
    return object.Attach(menu);
  } catch (...) {
    ::DestroyMenu(menu);
    throw;
  }
}

int SMenu::CreateMenu() { return AttachOrDestroy(*this, ::CreateMenu()); }
int SMenu::CreatePopupMenu() { return AttachOrDestroy(*this, ::CreatePopupMenu()); }

int SMenu::LoadMenuW(LPCWSTR name) { return AttachOrDestroy(*this, SLoadMenu(name)); }

int SMenu::LoadMenuIndirectW(const void* menuTemplate) {
  return AttachOrDestroy(*this, ::LoadMenuIndirectW(menuTemplate));
}

int SMenu::DestroyMenu() { return m_hMenu != nullptr ? ::DestroyMenu(Detach()) : 0; }

int SMenu::AppendMenuW(UINT flags, UINT_PTR id, LPCWSTR text) { return ::AppendMenuW(m_hMenu, flags, id, text); }
int SMenu::InsertMenuW(UINT item, UINT flags, UINT_PTR id, LPCWSTR text) {
  return ::InsertMenuW(m_hMenu, item, flags, id, text);
}
int SMenu::ModifyMenuW(UINT item, UINT flags, UINT_PTR id, LPCWSTR text) {
  return ::ModifyMenuW(m_hMenu, item, flags, id, text);
}
int SMenu::RemoveMenu(UINT item, UINT flags) { return ::RemoveMenu(m_hMenu, item, flags); }
int SMenu::DeleteMenu(UINT item, UINT flags) { return ::DeleteMenu(m_hMenu, item, flags); }
UINT SMenu::EnableMenuItem(UINT item, UINT flags) { return static_cast<UINT>(::EnableMenuItem(m_hMenu, item, flags)); }
UINT SMenu::CheckMenuItem(UINT item, UINT flags) { return static_cast<UINT>(::CheckMenuItem(m_hMenu, item, flags)); }
int SMenu::GetMenuItemCount() const { return ::GetMenuItemCount(m_hMenu); }
UINT SMenu::GetMenuItemID(int position) const { return ::GetMenuItemID(m_hMenu, position); }
UINT SMenu::GetMenuState(UINT item, UINT flags) const { return ::GetMenuState(m_hMenu, item, flags); }
SMenu* SMenu::GetSubMenu(int position) const { return FromHandle(::GetSubMenu(m_hMenu, position)); }

SString SMenu::GetMenuStringW(UINT item, UINT flags) const {
  const int length = ::GetMenuStringW(m_hMenu, item, nullptr, 0, flags);
  SString text;
  if (length <= 0 || GetMenuState(item, flags) == kNone) return text;
  const int copied = ::GetMenuStringW(m_hMenu, item, text.Lock(length + 1), length + 1, flags);
  text.Unlock(copied);
  return text;
}

int SMenu::TrackPopupMenu(UINT flags, int x, int y, SWnd* owner) {
  if (!SIsInteractive()) return 0;
  return SSent(::TrackPopupMenu(m_hMenu, flags, x, y, 0, owner->GetSafeHwnd(), nullptr));
}
