// SMenu: the object of one menu.
//
// An object that made or attached its menu destroys it when it ends; a temporary one from FromHandle never does. A
// menu that a window shows is destroyed with that window: detach it before.
//
// Functions that only pass on a system call have its results. For the user-interface thread.
#pragma once

#include "qxcore/core/object.h"
#include "qxcore/string/string.h"

class SHandleMap;
class SWnd;

class QXCORE_API SMenu : public SObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SMenu)

 public:
  SMenu() = default;
  SMenu(const SMenu&) = delete;
  SMenu& operator=(const SMenu&) = delete;
  ~SMenu() override;

  int CreateMenu();       // an empty menu bar; nonzero on success
  int CreatePopupMenu();  // an empty menu that opens
  // A menu from the resources, by name or MAKEINTRESOURCEW number; 0 when the resources have none of this name.
  int LoadMenuW(LPCWSTR name);
  // Loads one from the published binary template.
  int LoadMenuIndirectW(const void* menuTemplate);
  int DestroyMenu();

  int Attach(HMENU menu);       // owns the menu from now on; 0 for a null handle. Throws SEOutOfMemory
  HMENU Detach();               // gives the menu up; returns its handle
  HMENU GetSafeHandle() const;  // the handle; null for a null object pointer, too

  // The object of a menu: the permanent one, else a temporary one; null for a null handle.
  static SMenu* FromHandle(HMENU menu);
  // The permanent object, or null.
  static SMenu* FromHandlePermanent(HMENU menu);
  // Destroys all temporary objects.
  static void DeleteTempMap();
  // The map of all menus' objects.
  static SHandleMap& HandleMap();

  // Items. `flags` are the system's MF_ flags; `item` is a position or an identifier, as they say.
  int AppendMenuW(UINT flags, UINT_PTR id = 0, LPCWSTR text = nullptr);
  int InsertMenuW(UINT item, UINT flags, UINT_PTR id = 0, LPCWSTR text = nullptr);
  int ModifyMenuW(UINT item, UINT flags, UINT_PTR id = 0, LPCWSTR text = nullptr);
  int RemoveMenu(UINT item, UINT flags);  // a menu that the item opens lives on
  int DeleteMenu(UINT item, UINT flags);  // that menu is destroyed, too
  UINT EnableMenuItem(UINT item, UINT flags);
  UINT CheckMenuItem(UINT item, UINT flags);
  int GetMenuItemCount() const;
  UINT GetMenuItemID(int position) const;
  UINT GetMenuState(UINT item, UINT flags) const;
  SString GetMenuStringW(UINT item, UINT flags) const;
  SMenu* GetSubMenu(int position) const;
  // Shows the menu at a place of the screen and waits for the choice; `flags` are the system's TPM_ flags. Refused
  // (0) in a mode in which nobody is there to choose.
  int TrackPopupMenu(UINT flags, int x, int y, SWnd* owner);

  HMENU m_hMenu = nullptr;  // null without a menu
};
