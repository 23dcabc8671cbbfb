// Menus and accelerators, as declared on Linux.
// Include qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32/message.h"

// --- menus ---

#define MF_INSERT 0x00000000
#define MF_CHANGE 0x00000080
#define MF_APPEND 0x00000100
#define MF_DELETE 0x00000200
#define MF_REMOVE 0x00001000
#define MF_BYCOMMAND 0x00000000
#define MF_BYPOSITION 0x00000400
#define MF_SEPARATOR 0x00000800
#define MF_ENABLED 0x00000000
#define MF_GRAYED 0x00000001
#define MF_DISABLED 0x00000002
#define MF_UNCHECKED 0x00000000
#define MF_CHECKED 0x00000008
#define MF_USECHECKBITMAPS 0x00000200
#define MF_STRING 0x00000000
#define MF_BITMAP 0x00000004
#define MF_OWNERDRAW 0x00000100
#define MF_POPUP 0x00000010
#define MF_MENUBARBREAK 0x00000020
#define MF_MENUBREAK 0x00000040
#define MF_UNHILITE 0x00000000
#define MF_HILITE 0x00000080
#define MF_DEFAULT 0x00001000
#define MF_SYSMENU 0x00002000
#define MF_HELP 0x00004000
#define MF_RIGHTJUSTIFY 0x00004000
#define MF_MOUSESELECT 0x00008000
#define MF_END 0x00000080
#define MFT_STRING MF_STRING
#define MFT_BITMAP MF_BITMAP
#define MFT_MENUBARBREAK MF_MENUBARBREAK
#define MFT_MENUBREAK MF_MENUBREAK
#define MFT_OWNERDRAW MF_OWNERDRAW
#define MFT_RADIOCHECK 0x00000200
#define MFT_SEPARATOR MF_SEPARATOR
#define MFT_RIGHTORDER 0x00002000
#define MFT_RIGHTJUSTIFY MF_RIGHTJUSTIFY
#define MFS_GRAYED 0x00000003
#define MFS_DISABLED MFS_GRAYED
#define MFS_CHECKED MF_CHECKED
#define MFS_HILITE MF_HILITE
#define MFS_ENABLED MF_ENABLED
#define MFS_UNCHECKED MF_UNCHECKED
#define MFS_UNHILITE MF_UNHILITE
#define MFS_DEFAULT MF_DEFAULT
#define MIIM_STATE 0x00000001
#define MIIM_ID 0x00000002
#define MIIM_SUBMENU 0x00000004
#define MIIM_CHECKMARKS 0x00000008
#define MIIM_TYPE 0x00000010
#define MIIM_DATA 0x00000020
#define MIIM_STRING 0x00000040
#define MIIM_BITMAP 0x00000080
#define MIIM_FTYPE 0x00000100
#define TPM_LEFTBUTTON 0x0000
#define TPM_RIGHTBUTTON 0x0002
#define TPM_LEFTALIGN 0x0000
#define TPM_CENTERALIGN 0x0004
#define TPM_RIGHTALIGN 0x0008
#define TPM_TOPALIGN 0x0000
#define TPM_VCENTERALIGN 0x0010
#define TPM_BOTTOMALIGN 0x0020
#define TPM_NONOTIFY 0x0080
#define TPM_RETURNCMD 0x0100
#define MNC_IGNORE 0
#define MNC_CLOSE 1
#define MNC_EXECUTE 2
#define MNC_SELECT 3

struct MENUITEMINFOW {
  UINT cbSize;
  UINT fMask;
  UINT fType;
  UINT fState;
  UINT wID;
  HMENU hSubMenu;
  HBITMAP hbmpChecked;
  HBITMAP hbmpUnchecked;
  ULONG_PTR dwItemData;
  LPWSTR dwTypeData;
  UINT cch;
  HBITMAP hbmpItem;
};
using LPMENUITEMINFOW = MENUITEMINFOW*;
using LPCMENUITEMINFOW = const MENUITEMINFOW*;
using MENUITEMINFO = MENUITEMINFOW;

struct TPMPARAMS {
  UINT cbSize;
  RECT rcExclude;
};

QXCORE_API HMENU CreateMenu();
QXCORE_API HMENU CreatePopupMenu();
QXCORE_API BOOL DestroyMenu(HMENU menu);
QXCORE_API BOOL IsMenu(HMENU menu);
QXCORE_API HMENU LoadMenuW(HINSTANCE instance, LPCWSTR name);
// A menu from a template of the published binary layout, plain or extended.
QXCORE_API HMENU LoadMenuIndirectW(const void* menuTemplate);
QXCORE_API HMENU GetMenu(HWND window);
QXCORE_API BOOL SetMenu(HWND window, HMENU menu);
QXCORE_API HMENU GetSystemMenu(HWND window, BOOL revert);
QXCORE_API HMENU GetSubMenu(HMENU menu, int position);
QXCORE_API int GetMenuItemCount(HMENU menu);
QXCORE_API UINT GetMenuItemID(HMENU menu, int position);
QXCORE_API UINT GetMenuState(HMENU menu, UINT item, UINT flags);
QXCORE_API int GetMenuStringW(HMENU menu, UINT item, LPWSTR text, int capacity, UINT flags);
QXCORE_API BOOL GetMenuItemInfoW(HMENU menu, UINT item, BOOL byPosition, LPMENUITEMINFOW info);
QXCORE_API BOOL SetMenuItemInfoW(HMENU menu, UINT item, BOOL byPosition, LPCMENUITEMINFOW info);
QXCORE_API BOOL InsertMenuItemW(HMENU menu, UINT item, BOOL byPosition, LPCMENUITEMINFOW info);
QXCORE_API BOOL AppendMenuW(HMENU menu, UINT flags, UINT_PTR item, LPCWSTR text);
QXCORE_API BOOL InsertMenuW(HMENU menu, UINT position, UINT flags, UINT_PTR item, LPCWSTR text);
QXCORE_API BOOL ModifyMenuW(HMENU menu, UINT position, UINT flags, UINT_PTR item, LPCWSTR text);
QXCORE_API BOOL RemoveMenu(HMENU menu, UINT position, UINT flags);
QXCORE_API BOOL DeleteMenu(HMENU menu, UINT position, UINT flags);
QXCORE_API BOOL EnableMenuItem(HMENU menu, UINT item, UINT flags);
QXCORE_API DWORD CheckMenuItem(HMENU menu, UINT item, UINT flags);
QXCORE_API BOOL CheckMenuRadioItem(HMENU menu, UINT first, UINT last, UINT item, UINT flags);
QXCORE_API BOOL HiliteMenuItem(HWND window, HMENU menu, UINT item, UINT flags);
QXCORE_API BOOL SetMenuDefaultItem(HMENU menu, UINT item, UINT byPosition);
QXCORE_API UINT GetMenuDefaultItem(HMENU menu, UINT byPosition, UINT flags);
QXCORE_API BOOL GetMenuItemRect(HWND window, HMENU menu, UINT position, LPRECT rect);
QXCORE_API BOOL DrawMenuBar(HWND window);
QXCORE_API BOOL TrackPopupMenu(HMENU menu, UINT flags, int x, int y, int reserved, HWND owner, const RECT* ignored);
QXCORE_API BOOL TrackPopupMenuEx(HMENU menu, UINT flags, int x, int y, HWND owner, TPMPARAMS* parameters);
QXCORE_API BOOL EndMenu();
#define LoadMenu LoadMenuW
#define LoadMenuIndirect LoadMenuIndirectW
#define GetMenuString GetMenuStringW
#define GetMenuItemInfo GetMenuItemInfoW
#define SetMenuItemInfo SetMenuItemInfoW
#define InsertMenuItem InsertMenuItemW
#define AppendMenu AppendMenuW
#define InsertMenu InsertMenuW
#define ModifyMenu ModifyMenuW

// --- accelerators ---

#define FVIRTKEY TRUE
#define FNOINVERT 0x02
#define FSHIFT 0x04
#define FCONTROL 0x08
#define FALT 0x10

struct ACCEL {
  BYTE fVirt;
  WORD key;
  WORD cmd;
};
using LPACCEL = ACCEL*;

QXCORE_API HACCEL LoadAcceleratorsW(HINSTANCE instance, LPCWSTR name);
QXCORE_API HACCEL CreateAcceleratorTableW(LPACCEL entries, int count);
QXCORE_API int CopyAcceleratorTableW(HACCEL table, LPACCEL entries, int count);
QXCORE_API BOOL DestroyAcceleratorTable(HACCEL table);
QXCORE_API int TranslateAcceleratorW(HWND window, HACCEL table, MSG* message);
#define LoadAccelerators LoadAcceleratorsW
#define CreateAcceleratorTable CreateAcceleratorTableW
#define CopyAcceleratorTable CopyAcceleratorTableW
#define TranslateAccelerator TranslateAcceleratorW

#endif
