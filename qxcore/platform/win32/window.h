// Windows: classes, creation, the tree, styles, text, data, places, painting and hooks, as declared on Linux.
// Include qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"

// --- styles ---

#define WS_OVERLAPPED 0x00000000
#define WS_POPUP 0x80000000
#define WS_CHILD 0x40000000
#define WS_MINIMIZE 0x20000000
#define WS_VISIBLE 0x10000000
#define WS_DISABLED 0x08000000
#define WS_CLIPSIBLINGS 0x04000000
#define WS_CLIPCHILDREN 0x02000000
#define WS_MAXIMIZE 0x01000000
#define WS_CAPTION 0x00C00000
#define WS_BORDER 0x00800000
#define WS_DLGFRAME 0x00400000
#define WS_VSCROLL 0x00200000
#define WS_HSCROLL 0x00100000
#define WS_SYSMENU 0x00080000
#define WS_THICKFRAME 0x00040000
#define WS_GROUP 0x00020000
#define WS_TABSTOP 0x00010000
#define WS_MINIMIZEBOX 0x00020000
#define WS_MAXIMIZEBOX 0x00010000
#define WS_SIZEBOX WS_THICKFRAME
#define WS_OVERLAPPEDWINDOW (WS_OVERLAPPED | WS_CAPTION | WS_SYSMENU | WS_THICKFRAME | WS_MINIMIZEBOX | WS_MAXIMIZEBOX)
#define WS_POPUPWINDOW (WS_POPUP | WS_BORDER | WS_SYSMENU)
#define WS_CHILDWINDOW (WS_CHILD)
#define WS_EX_DLGMODALFRAME 0x00000001
#define WS_EX_NOPARENTNOTIFY 0x00000004
#define WS_EX_TOPMOST 0x00000008
#define WS_EX_ACCEPTFILES 0x00000010
#define WS_EX_TRANSPARENT 0x00000020
#define WS_EX_MDICHILD 0x00000040
#define WS_EX_TOOLWINDOW 0x00000080
#define WS_EX_WINDOWEDGE 0x00000100
#define WS_EX_CLIENTEDGE 0x00000200
#define WS_EX_CONTEXTHELP 0x00000400
#define WS_EX_RIGHT 0x00001000
#define WS_EX_LEFT 0x00000000
#define WS_EX_RTLREADING 0x00002000
#define WS_EX_LTRREADING 0x00000000
#define WS_EX_LEFTSCROLLBAR 0x00004000
#define WS_EX_RIGHTSCROLLBAR 0x00000000
#define WS_EX_CONTROLPARENT 0x00010000
#define WS_EX_STATICEDGE 0x00020000
#define WS_EX_APPWINDOW 0x00040000
#define WS_EX_OVERLAPPEDWINDOW (WS_EX_WINDOWEDGE | WS_EX_CLIENTEDGE)
#define WS_EX_PALETTEWINDOW (WS_EX_WINDOWEDGE | WS_EX_TOOLWINDOW | WS_EX_TOPMOST)
#define WS_EX_LAYERED 0x00080000
#define WS_EX_LAYOUTRTL 0x00400000
#define WS_EX_NOACTIVATE 0x08000000

// --- classes ---

#define CS_VREDRAW 0x0001
#define CS_HREDRAW 0x0002
#define CS_DBLCLKS 0x0008
#define CS_OWNDC 0x0020
#define CS_CLASSDC 0x0040
#define CS_PARENTDC 0x0080
#define CS_NOCLOSE 0x0200
#define CS_SAVEBITS 0x0800
#define CS_BYTEALIGNCLIENT 0x1000
#define CS_BYTEALIGNWINDOW 0x2000
#define CS_GLOBALCLASS 0x4000
#define CS_DROPSHADOW 0x00020000
#define GCL_MENUNAME (-8)
#define GCL_HBRBACKGROUND (-10)
#define GCL_HCURSOR (-12)
#define GCL_HICON (-14)
#define GCL_HMODULE (-16)
#define GCL_CBWNDEXTRA (-18)
#define GCL_CBCLSEXTRA (-20)
#define GCL_WNDPROC (-24)
#define GCL_STYLE (-26)
#define GCW_ATOM (-32)
#define GCL_HICONSM (-34)
#define GCLP_MENUNAME (-8)
#define GCLP_HBRBACKGROUND (-10)
#define GCLP_HCURSOR (-12)
#define GCLP_HICON (-14)
#define GCLP_HMODULE (-16)
#define GCLP_WNDPROC (-24)
#define GCLP_HICONSM (-34)

using WNDENUMPROC = BOOL(CALLBACK*)(HWND, LPARAM);
using PROPENUMPROCW = BOOL(CALLBACK*)(HWND, LPCWSTR, HANDLE);
using PROPENUMPROCEXW = BOOL(CALLBACK*)(HWND, LPWSTR, HANDLE, ULONG_PTR);

struct WNDCLASSW {
  UINT style;
  WNDPROC lpfnWndProc;
  int cbClsExtra;
  int cbWndExtra;
  HINSTANCE hInstance;
  HICON hIcon;
  HCURSOR hCursor;
  HBRUSH hbrBackground;
  LPCWSTR lpszMenuName;
  LPCWSTR lpszClassName;
};
using LPWNDCLASSW = WNDCLASSW*;
using WNDCLASS = WNDCLASSW;

struct WNDCLASSEXW {
  UINT cbSize;
  UINT style;
  WNDPROC lpfnWndProc;
  int cbClsExtra;
  int cbWndExtra;
  HINSTANCE hInstance;
  HICON hIcon;
  HCURSOR hCursor;
  HBRUSH hbrBackground;
  LPCWSTR lpszMenuName;
  LPCWSTR lpszClassName;
  HICON hIconSm;
};
using WNDCLASSEX = WNDCLASSEXW;

QXCORE_API ATOM RegisterClassW(const WNDCLASSW* windowClass);
QXCORE_API ATOM RegisterClassExW(const WNDCLASSEXW* windowClass);
QXCORE_API BOOL UnregisterClassW(LPCWSTR className, HINSTANCE instance);
QXCORE_API BOOL GetClassInfoW(HINSTANCE instance, LPCWSTR className, WNDCLASSW* windowClass);
QXCORE_API BOOL GetClassInfoExW(HINSTANCE instance, LPCWSTR className, WNDCLASSEXW* windowClass);
QXCORE_API int GetClassNameW(HWND window, LPWSTR name, int capacity);
QXCORE_API DWORD GetClassLongW(HWND window, int index);
QXCORE_API DWORD SetClassLongW(HWND window, int index, LONG value);
QXCORE_API ULONG_PTR GetClassLongPtrW(HWND window, int index);
QXCORE_API ULONG_PTR SetClassLongPtrW(HWND window, int index, LONG_PTR value);
#define RegisterClass RegisterClassW
#define RegisterClassEx RegisterClassExW
#define UnregisterClass UnregisterClassW
#define GetClassInfoEx GetClassInfoExW
#define GetClassName GetClassNameW
#define GetClassLong GetClassLongW
#define SetClassLong SetClassLongW

// --- creation and destruction ---

#define CW_USEDEFAULT ((int)0x80000000)
#define HWND_DESKTOP ((HWND)0)
#define HWND_TOP ((HWND)0)
#define HWND_BOTTOM ((HWND)(LONG_PTR)1)
#define HWND_TOPMOST ((HWND)(LONG_PTR)-1)
#define HWND_NOTOPMOST ((HWND)(LONG_PTR)-2)
#define HWND_MESSAGE ((HWND)(LONG_PTR)-3)
#define HWND_BROADCAST ((HWND)(LONG_PTR)0xFFFF)

struct CREATESTRUCTW {
  LPVOID lpCreateParams;
  HINSTANCE hInstance;
  HMENU hMenu;
  HWND hwndParent;
  int cy;
  int cx;
  int y;
  int x;
  LONG style;
  LPCWSTR lpszName;
  LPCWSTR lpszClass;
  DWORD dwExStyle;
};
using LPCREATESTRUCTW = CREATESTRUCTW*;
using CREATESTRUCT = CREATESTRUCTW;
using LPCREATESTRUCT = CREATESTRUCTW*;

QXCORE_API HWND CreateWindowExW(DWORD exStyle, LPCWSTR className, LPCWSTR name, DWORD style, int x, int y, int width,
                                int height, HWND parent, HMENU menu, HINSTANCE instance, LPVOID parameter);
#define CreateWindowW(className, name, style, x, y, width, height, parent, menu, instance, parameter) \
  CreateWindowExW(0, className, name, style, x, y, width, height, parent, menu, instance, parameter)
QXCORE_API BOOL DestroyWindow(HWND window);
QXCORE_API BOOL CloseWindow(HWND window);
QXCORE_API BOOL IsWindow(HWND window);
#define CreateWindowEx CreateWindowExW
#define CreateWindow CreateWindowW

// --- the tree ---

#define GW_HWNDFIRST 0
#define GW_HWNDLAST 1
#define GW_HWNDNEXT 2
#define GW_HWNDPREV 3
#define GW_OWNER 4
#define GW_CHILD 5
#define GW_ENABLEDPOPUP 6
#define GA_PARENT 1
#define GA_ROOT 2
#define GA_ROOTOWNER 3
#define CWP_ALL 0x0000
#define CWP_SKIPINVISIBLE 0x0001
#define CWP_SKIPDISABLED 0x0002
#define CWP_SKIPTRANSPARENT 0x0004

QXCORE_API HWND GetParent(HWND window);
QXCORE_API HWND SetParent(HWND window, HWND parent);
QXCORE_API HWND GetAncestor(HWND window, UINT which);
QXCORE_API HWND GetWindow(HWND window, UINT which);
QXCORE_API HWND GetTopWindow(HWND window);
QXCORE_API HWND GetDesktopWindow();
QXCORE_API HWND GetLastActivePopup(HWND window);
QXCORE_API HWND FindWindowW(LPCWSTR className, LPCWSTR name);
QXCORE_API HWND FindWindowExW(HWND parent, HWND after, LPCWSTR className, LPCWSTR name);
QXCORE_API BOOL IsChild(HWND parent, HWND window);
QXCORE_API BOOL EnumWindows(WNDENUMPROC callback, LPARAM data);
QXCORE_API BOOL EnumChildWindows(HWND parent, WNDENUMPROC callback, LPARAM data);
QXCORE_API BOOL EnumThreadWindows(DWORD thread, WNDENUMPROC callback, LPARAM data);
QXCORE_API DWORD GetWindowThreadProcessId(HWND window, LPDWORD process);
QXCORE_API HWND WindowFromPoint(POINT point);
QXCORE_API HWND ChildWindowFromPoint(HWND parent, POINT point);
QXCORE_API HWND ChildWindowFromPointEx(HWND parent, POINT point, UINT flags);
#define FindWindow FindWindowW
#define FindWindowEx FindWindowExW
#define GetNextWindow GetWindow

// --- data, styles and text of a window ---

#define GWL_WNDPROC (-4)
#define GWL_HINSTANCE (-6)
#define GWL_HWNDPARENT (-8)
#define GWL_STYLE (-16)
#define GWL_EXSTYLE (-20)
#define GWL_USERDATA (-21)
#define GWL_ID (-12)
#define GWLP_WNDPROC (-4)
#define GWLP_HINSTANCE (-6)
#define GWLP_HWNDPARENT (-8)
#define GWLP_ID (-12)
#define GWLP_USERDATA (-21)

struct STYLESTRUCT {
  DWORD styleOld;
  DWORD styleNew;
};
using LPSTYLESTRUCT = STYLESTRUCT*;

// The 32-bit forms are refused (ERROR_INVALID_INDEX) for the fields that hold a pointer or a handle.
QXCORE_API LONG GetWindowLongW(HWND window, int index);
QXCORE_API LONG SetWindowLongW(HWND window, int index, LONG value);
QXCORE_API LONG_PTR GetWindowLongPtrW(HWND window, int index);
QXCORE_API LONG_PTR SetWindowLongPtrW(HWND window, int index, LONG_PTR value);
QXCORE_API BOOL SetWindowTextW(HWND window, LPCWSTR text);
QXCORE_API int GetWindowTextW(HWND window, LPWSTR text, int capacity);
QXCORE_API int GetWindowTextLengthW(HWND window);
QXCORE_API BOOL SetPropW(HWND window, LPCWSTR name, HANDLE value);
QXCORE_API HANDLE GetPropW(HWND window, LPCWSTR name);
QXCORE_API HANDLE RemovePropW(HWND window, LPCWSTR name);
QXCORE_API int EnumPropsExW(HWND window, PROPENUMPROCEXW callback, LPARAM data);
QXCORE_API BOOL EnableWindow(HWND window, BOOL enable);
QXCORE_API BOOL IsWindowEnabled(HWND window);
QXCORE_API BOOL IsWindowVisible(HWND window);
QXCORE_API BOOL IsWindowUnicode(HWND window);
#define GetWindowLong GetWindowLongW
#define SetWindowLong SetWindowLongW
#define GetWindowLongPtr GetWindowLongPtrW
#define SetWindowLongPtr SetWindowLongPtrW
#define SetWindowText SetWindowTextW
#define GetWindowText GetWindowTextW
#define GetWindowTextLength GetWindowTextLengthW
#define SetProp SetPropW
#define GetProp GetPropW
#define RemoveProp RemovePropW

// --- the place of a window ---

#define SWP_NOSIZE 0x0001
#define SWP_NOMOVE 0x0002
#define SWP_NOZORDER 0x0004
#define SWP_NOREDRAW 0x0008
#define SWP_NOACTIVATE 0x0010
#define SWP_FRAMECHANGED 0x0020
#define SWP_SHOWWINDOW 0x0040
#define SWP_HIDEWINDOW 0x0080
#define SWP_NOCOPYBITS 0x0100
#define SWP_NOOWNERZORDER 0x0200
#define SWP_NOSENDCHANGING 0x0400
#define SWP_DRAWFRAME SWP_FRAMECHANGED
#define SWP_NOREPOSITION SWP_NOOWNERZORDER
#define SWP_DEFERERASE 0x2000
#define SWP_ASYNCWINDOWPOS 0x4000
#define SW_HIDE 0
#define SW_SHOWNORMAL 1
#define SW_NORMAL 1
#define SW_SHOWMINIMIZED 2
#define SW_SHOWMAXIMIZED 3
#define SW_MAXIMIZE 3
#define SW_SHOWNOACTIVATE 4
#define SW_SHOW 5
#define SW_MINIMIZE 6
#define SW_SHOWMINNOACTIVE 7
#define SW_SHOWNA 8
#define SW_RESTORE 9
#define SW_SHOWDEFAULT 10
#define SW_FORCEMINIMIZE 11
#define SW_PARENTCLOSING 1
#define SW_PARENTOPENING 3
#define WPF_SETMINPOSITION 0x0001
#define WPF_RESTORETOMAXIMIZED 0x0002
#define WPF_ASYNCWINDOWPLACEMENT 0x0004
#define SIZE_RESTORED 0
#define SIZE_MINIMIZED 1
#define SIZE_MAXIMIZED 2
#define SIZE_MAXSHOW 3
#define SIZE_MAXHIDE 4
#define WVR_ALIGNTOP 0x0010
#define WVR_ALIGNLEFT 0x0020
#define WVR_ALIGNBOTTOM 0x0040
#define WVR_ALIGNRIGHT 0x0080
#define WVR_HREDRAW 0x0100
#define WVR_VREDRAW 0x0200
#define WVR_REDRAW (WVR_HREDRAW | WVR_VREDRAW)
#define WVR_VALIDRECTS 0x0400

struct WINDOWPOS {
  HWND hwnd;
  HWND hwndInsertAfter;
  int x;
  int y;
  int cx;
  int cy;
  UINT flags;
};
using LPWINDOWPOS = WINDOWPOS*;
using PWINDOWPOS = WINDOWPOS*;

struct NCCALCSIZE_PARAMS {
  RECT rgrc[3];
  PWINDOWPOS lppos;
};
using LPNCCALCSIZE_PARAMS = NCCALCSIZE_PARAMS*;

struct MINMAXINFO {
  POINT ptReserved;
  POINT ptMaxSize;
  POINT ptMaxPosition;
  POINT ptMinTrackSize;
  POINT ptMaxTrackSize;
};
using LPMINMAXINFO = MINMAXINFO*;

struct WINDOWPLACEMENT {
  UINT length;
  UINT flags;
  UINT showCmd;
  POINT ptMinPosition;
  POINT ptMaxPosition;
  RECT rcNormalPosition;
};

QXCORE_API BOOL SetWindowPos(HWND window, HWND after, int x, int y, int width, int height, UINT flags);
QXCORE_API BOOL MoveWindow(HWND window, int x, int y, int width, int height, BOOL repaint);
QXCORE_API HDWP BeginDeferWindowPos(int count);
QXCORE_API HDWP DeferWindowPos(HDWP batch, HWND window, HWND after, int x, int y, int width, int height, UINT flags);
QXCORE_API BOOL EndDeferWindowPos(HDWP batch);
QXCORE_API BOOL ShowWindow(HWND window, int how);
QXCORE_API BOOL ShowOwnedPopups(HWND owner, BOOL show);
QXCORE_API BOOL BringWindowToTop(HWND window);
QXCORE_API BOOL OpenIcon(HWND window);
QXCORE_API BOOL IsIconic(HWND window);
QXCORE_API BOOL IsZoomed(HWND window);
QXCORE_API BOOL GetWindowPlacement(HWND window, WINDOWPLACEMENT* placement);
QXCORE_API BOOL SetWindowPlacement(HWND window, const WINDOWPLACEMENT* placement);
QXCORE_API BOOL GetWindowRect(HWND window, LPRECT rect);
QXCORE_API BOOL GetClientRect(HWND window, LPRECT rect);
QXCORE_API BOOL ClientToScreen(HWND window, LPPOINT point);
QXCORE_API BOOL ScreenToClient(HWND window, LPPOINT point);
QXCORE_API int MapWindowPoints(HWND from, HWND to, LPPOINT points, UINT count);
QXCORE_API BOOL AdjustWindowRect(LPRECT rect, DWORD style, BOOL menu);
QXCORE_API BOOL AdjustWindowRectEx(LPRECT rect, DWORD style, BOOL menu, DWORD exStyle);

// --- activation ---

#define WA_INACTIVE 0
#define WA_ACTIVE 1
#define WA_CLICKACTIVE 2
#define MA_ACTIVATE 1
#define MA_ACTIVATEANDEAT 2
#define MA_NOACTIVATE 3
#define MA_NOACTIVATEANDEAT 4

QXCORE_API HWND GetActiveWindow();
QXCORE_API HWND SetActiveWindow(HWND window);
QXCORE_API HWND GetForegroundWindow();
QXCORE_API BOOL SetForegroundWindow(HWND window);

// --- what must be painted ---

#define RDW_INVALIDATE 0x0001
#define RDW_INTERNALPAINT 0x0002
#define RDW_ERASE 0x0004
#define RDW_VALIDATE 0x0008
#define RDW_NOINTERNALPAINT 0x0010
#define RDW_NOERASE 0x0020
#define RDW_NOCHILDREN 0x0040
#define RDW_ALLCHILDREN 0x0080
#define RDW_UPDATENOW 0x0100
#define RDW_ERASENOW 0x0200
#define RDW_FRAME 0x0400
#define RDW_NOFRAME 0x0800
#define DCX_WINDOW 0x00000001
#define DCX_CACHE 0x00000002
#define DCX_NORESETATTRS 0x00000004
#define DCX_CLIPCHILDREN 0x00000008
#define DCX_CLIPSIBLINGS 0x00000010
#define DCX_PARENTCLIP 0x00000020
#define DCX_EXCLUDERGN 0x00000040
#define DCX_INTERSECTRGN 0x00000080
#define DCX_EXCLUDEUPDATE 0x00000100
#define DCX_INTERSECTUPDATE 0x00000200
#define DCX_LOCKWINDOWUPDATE 0x00000400
#define DCX_VALIDATE 0x00200000
#define PRF_CHECKVISIBLE 0x00000001
#define PRF_NONCLIENT 0x00000002
#define PRF_CLIENT 0x00000004
#define PRF_ERASEBKGND 0x00000008
#define PRF_CHILDREN 0x00000010
#define PRF_OWNED 0x00000020

QXCORE_API BOOL InvalidateRect(HWND window, const RECT* rect, BOOL erase);
QXCORE_API BOOL InvalidateRgn(HWND window, HRGN region, BOOL erase);
QXCORE_API BOOL ValidateRect(HWND window, const RECT* rect);
QXCORE_API BOOL ValidateRgn(HWND window, HRGN region);
QXCORE_API BOOL RedrawWindow(HWND window, const RECT* rect, HRGN region, UINT flags);
QXCORE_API BOOL UpdateWindow(HWND window);
QXCORE_API BOOL GetUpdateRect(HWND window, LPRECT rect, BOOL erase);
QXCORE_API int GetUpdateRgn(HWND window, HRGN region, BOOL erase);
QXCORE_API BOOL LockWindowUpdate(HWND window);

// --- hooks: WH_CBT and WH_CALLWNDPROC of the calling process's own threads; others are refused ---

#define WH_MSGFILTER (-1)
#define WH_GETMESSAGE 3
#define WH_CALLWNDPROC 4
#define WH_CBT 5
#define WH_KEYBOARD 2
#define WH_MOUSE 7
#define HC_ACTION 0
#define HCBT_MOVESIZE 0
#define HCBT_MINMAX 1
#define HCBT_QS 2
#define HCBT_CREATEWND 3
#define HCBT_DESTROYWND 4
#define HCBT_ACTIVATE 5
#define HCBT_CLICKSKIPPED 6
#define HCBT_KEYSKIPPED 7
#define HCBT_SYSCOMMAND 8
#define HCBT_SETFOCUS 9

using HOOKPROC = LRESULT(CALLBACK*)(int, WPARAM, LPARAM);

struct CBT_CREATEWNDW {
  CREATESTRUCTW* lpcs;
  HWND hwndInsertAfter;
};
using LPCBT_CREATEWNDW = CBT_CREATEWNDW*;
using CBT_CREATEWND = CBT_CREATEWNDW;

struct CBTACTIVATESTRUCT {
  BOOL fMouse;
  HWND hWndActive;
};

struct CWPSTRUCT {
  LPARAM lParam;
  WPARAM wParam;
  UINT message;
  HWND hwnd;
};

QXCORE_API HHOOK SetWindowsHookExW(int kind, HOOKPROC procedure, HINSTANCE instance, DWORD thread);
QXCORE_API BOOL UnhookWindowsHookEx(HHOOK hook);
QXCORE_API LRESULT CallNextHookEx(HHOOK hook, int code, WPARAM wParam, LPARAM lParam);
#define SetWindowsHookEx SetWindowsHookExW

#endif
