// Dialogs, message boxes and resource templates, as declared on Linux.
// Include qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32/message.h"

// --- dialogs ---

#define IDOK 1
#define IDCANCEL 2
#define IDABORT 3
#define IDRETRY 4
#define IDIGNORE 5
#define IDYES 6
#define IDNO 7
#define IDCLOSE 8
#define IDHELP 9
#define IDTRYAGAIN 10
#define IDCONTINUE 11
#define DS_ABSALIGN 0x01
#define DS_SYSMODAL 0x02
#define DS_LOCALEDIT 0x20
#define DS_SETFONT 0x40
#define DS_MODALFRAME 0x80
#define DS_NOIDLEMSG 0x100
#define DS_SETFOREGROUND 0x200
#define DS_3DLOOK 0x0004
#define DS_FIXEDSYS 0x0008
#define DS_NOFAILCREATE 0x0010
#define DS_CONTROL 0x0400
#define DS_CENTER 0x0800
#define DS_CENTERMOUSE 0x1000
#define DS_CONTEXTHELP 0x2000
#define DS_SHELLFONT (DS_SETFONT | DS_FIXEDSYS)
#define DM_GETDEFID (WM_USER + 0)
#define DM_SETDEFID (WM_USER + 1)
#define DM_REPOSITION (WM_USER + 2)
#define DC_HASDEFID 0x534B
#define DLGC_WANTARROWS 0x0001
#define DLGC_WANTTAB 0x0002
#define DLGC_WANTALLKEYS 0x0004
#define DLGC_WANTMESSAGE 0x0004
#define DLGC_HASSETSEL 0x0008
#define DLGC_DEFPUSHBUTTON 0x0010
#define DLGC_UNDEFPUSHBUTTON 0x0020
#define DLGC_RADIOBUTTON 0x0040
#define DLGC_WANTCHARS 0x0080
#define DLGC_STATIC 0x0100
#define DLGC_BUTTON 0x2000
#define DLGWINDOWEXTRA (3 * (int)sizeof(LONG_PTR) + 6)
#define DWL_MSGRESULT 0
#define DWLP_MSGRESULT 0
#define DWLP_DLGPROC ((int)sizeof(LRESULT))
#define DWLP_USER (DWLP_DLGPROC + (int)sizeof(LONG_PTR))
#define WC_DIALOG ((LPCWSTR)(ULONG_PTR)0x8002)

using DLGPROC = INT_PTR(CALLBACK*)(HWND, UINT, WPARAM, LPARAM);

#pragma pack(push, 2)
struct DLGTEMPLATE {
  DWORD style;
  DWORD dwExtendedStyle;
  WORD cdit;
  short x;
  short y;
  short cx;
  short cy;
};
struct DLGITEMTEMPLATE {
  DWORD style;
  DWORD dwExtendedStyle;
  short x;
  short y;
  short cx;
  short cy;
  WORD id;
};
#pragma pack(pop)
using LPDLGTEMPLATEW = DLGTEMPLATE*;
using LPCDLGTEMPLATEW = const DLGTEMPLATE*;

QXCORE_API HWND CreateDialogIndirectParamW(HINSTANCE instance, LPCDLGTEMPLATEW dialogTemplate, HWND parent,
                                           DLGPROC procedure, LPARAM parameter);
QXCORE_API HWND CreateDialogParamW(HINSTANCE instance, LPCWSTR name, HWND parent, DLGPROC procedure, LPARAM parameter);
QXCORE_API INT_PTR DialogBoxIndirectParamW(HINSTANCE instance, LPCDLGTEMPLATEW dialogTemplate, HWND parent,
                                           DLGPROC procedure, LPARAM parameter);
QXCORE_API INT_PTR DialogBoxParamW(HINSTANCE instance, LPCWSTR name, HWND parent, DLGPROC procedure, LPARAM parameter);
QXCORE_API BOOL EndDialog(HWND dialog, INT_PTR result);
QXCORE_API BOOL IsDialogMessageW(HWND dialog, MSG* message);
QXCORE_API LRESULT DefDlgProcW(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam);
QXCORE_API HWND GetDlgItem(HWND dialog, int id);
QXCORE_API int GetDlgCtrlID(HWND window);
QXCORE_API LRESULT SendDlgItemMessageW(HWND dialog, int id, UINT message, WPARAM wParam, LPARAM lParam);
QXCORE_API BOOL SetDlgItemTextW(HWND dialog, int id, LPCWSTR text);
QXCORE_API UINT GetDlgItemTextW(HWND dialog, int id, LPWSTR text, int capacity);
QXCORE_API BOOL SetDlgItemInt(HWND dialog, int id, UINT value, BOOL isSigned);
QXCORE_API UINT GetDlgItemInt(HWND dialog, int id, BOOL* translated, BOOL isSigned);
QXCORE_API HWND GetNextDlgTabItem(HWND dialog, HWND control, BOOL previous);
QXCORE_API HWND GetNextDlgGroupItem(HWND dialog, HWND control, BOOL previous);
QXCORE_API BOOL CheckDlgButton(HWND dialog, int id, UINT check);
QXCORE_API BOOL CheckRadioButton(HWND dialog, int first, int last, int id);
QXCORE_API UINT IsDlgButtonChecked(HWND dialog, int id);
QXCORE_API BOOL MapDialogRect(HWND dialog, LPRECT rect);
QXCORE_API LONG GetDialogBaseUnits();
#define CreateDialogIndirectParam CreateDialogIndirectParamW
#define CreateDialogParam CreateDialogParamW
#define DialogBoxIndirectParam DialogBoxIndirectParamW
#define DialogBoxParam DialogBoxParamW
#define IsDialogMessage IsDialogMessageW
#define DefDlgProc DefDlgProcW
#define SendDlgItemMessage SendDlgItemMessageW
#define SetDlgItemText SetDlgItemTextW
#define GetDlgItemText GetDlgItemTextW

// --- message boxes ---

#define MB_OK 0x00000000
#define MB_OKCANCEL 0x00000001
#define MB_ABORTRETRYIGNORE 0x00000002
#define MB_YESNOCANCEL 0x00000003
#define MB_YESNO 0x00000004
#define MB_RETRYCANCEL 0x00000005
#define MB_CANCELTRYCONTINUE 0x00000006
#define MB_ICONHAND 0x00000010
#define MB_ICONQUESTION 0x00000020
#define MB_ICONEXCLAMATION 0x00000030
#define MB_ICONASTERISK 0x00000040
#define MB_ICONERROR MB_ICONHAND
#define MB_ICONSTOP MB_ICONHAND
#define MB_ICONWARNING MB_ICONEXCLAMATION
#define MB_ICONINFORMATION MB_ICONASTERISK
#define MB_DEFBUTTON1 0x00000000
#define MB_DEFBUTTON2 0x00000100
#define MB_DEFBUTTON3 0x00000200
#define MB_DEFBUTTON4 0x00000300
#define MB_APPLMODAL 0x00000000
#define MB_SYSTEMMODAL 0x00001000
#define MB_TASKMODAL 0x00002000
#define MB_HELP 0x00004000
#define MB_NOFOCUS 0x00008000
#define MB_SETFOREGROUND 0x00010000
#define MB_TOPMOST 0x00040000
#define MB_RIGHT 0x00080000
#define MB_RTLREADING 0x00100000
#define MB_TYPEMASK 0x0000000F
#define MB_ICONMASK 0x000000F0
#define MB_DEFMASK 0x00000F00

QXCORE_API int MessageBoxW(HWND owner, LPCWSTR text, LPCWSTR caption, UINT style);
QXCORE_API BOOL MessageBeep(UINT kind);
#define MessageBox MessageBoxW

// --- resources ---

#define RT_MENU MAKEINTRESOURCEW(4)
#define RT_DIALOG MAKEINTRESOURCEW(5)
#define RT_ACCELERATOR MAKEINTRESOURCEW(9)

// The bytes of a resource that FindResourceW found; not for texts, which LoadStringW loads.
QXCORE_API HGLOBAL LoadResource(HMODULE module, HRSRC resource);
QXCORE_API LPVOID LockResource(HGLOBAL resource);

#endif
