// SCmdUI: the state of one command's menu item, button or pane, which an update handler sets.
//
// Whoever shows commands makes an SCmdUI for an item, sets its fields and calls DoUpdate with the first target
// of the routing. The base class updates a menu item, or the window m_sender when there is no menu; bars derive
// a class of their own and override the setters. For the user-interface thread.
#pragma once

#include "qxcore/ui/window/message_map.h"

class SMenu;
class SWnd;

class QXCORE_API SCmdUI {
 public:
  SCmdUI() = default;
  SCmdUI(const SCmdUI&) = delete;
  SCmdUI& operator=(const SCmdUI&) = delete;
  virtual ~SCmdUI();

  UINT GetID() const { return m_id; }              // the command's identifier
  UINT GetIndex() const { return m_index; }        // the item's position in its menu or bar
  SMenu* GetMenu() const { return m_menu; }        // the menu that holds the item; null outside menus
  SMenu* GetSubMenu() const { return m_subMenu; }  // the menu that the item opens; null for a plain item
  SWnd* GetSender() const { return m_sender; }     // the window that owns the item; may be null

  // Enables (nonzero) or disables (0) the item.
  virtual void Enable(int enable);
  // Sets the check mark: 0 off, 1 on, 2 undecided where the item can show that.
  virtual void SetCheck(int check);
  // The same with a dot for one choice of several.
  virtual void SetRadio(int on);
  // Sets the item's text.
  virtual void SetText(LPCWSTR text);

  // Asks the target's update handler for the state; when none is found and `disableIfNoHandler` is nonzero,
  // the item is enabled exactly when the command has a handler. Returns nonzero when the state was set.
  int DoUpdate(SCmdTarget* target, int disableIfNoHandler);

  // For an update handler that leaves the question to the next target.
  void ContinueRouting() { m_continueRouting = true; }

  // Calls an update handler; returns 1, or 0 when the handler passed the question on.
  int CallHandler(SMsgHandler handler, SCmdTarget* target, UINT id);

  // What the setters work on; filled by whoever shows the item.
  UINT m_id = 0;
  UINT m_index = 0;
  SMenu* m_menu = nullptr;  // none is owned
  SMenu* m_subMenu = nullptr;
  SWnd* m_sender = nullptr;

 protected:
  bool m_enableChanged = false;    // a handler called Enable
  bool m_continueRouting = false;  // a handler called ContinueRouting
};

// The same for items of a window's system menu, whose identifiers begin at 0xF000. m_sender is the window.
class QXCORE_API SSysCmdUI : public SCmdUI {
 public:
  void Enable(int enable) override;
  void SetCheck(int check) override;
  void SetRadio(int on) override;
  void SetText(LPCWSTR text) override;

 private:
  HMENU SystemMenu() const;
};
