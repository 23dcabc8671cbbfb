// The Win32 names that the library uses. On Windows this is <windows.h>; elsewhere the published
// types, constants and functions are declared here and implemented in platform/posix/, as far as
// the library calls them. Differences from the published behaviour: docs/portable-layer.md.
//
// One character type serves both targets: WCHAR, a UTF-16 code unit. Literals of it are written
// WTEXT("..."), which does not depend on UNICODE.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdint>
#include <string_view>

#ifdef _WIN32
#ifndef NOMINMAX
#define NOMINMAX
#endif
#ifndef WIN32_LEAN_AND_MEAN
#define WIN32_LEAN_AND_MEAN
#endif
#include <windows.h>

#include <commctrl.h>
#include <commdlg.h>
#include <shellapi.h>

// From a header whose other macros are named like members of the library.
#ifndef GET_X_LPARAM
#define GET_X_LPARAM(lParam) ((int)(short)LOWORD(lParam))
#define GET_Y_LPARAM(lParam) ((int)(short)HIWORD(lParam))
#endif

#define WTEXT_PASTE(text) L##text
#define WTEXT(text) WTEXT_PASTE(text)

#else

#define WTEXT_PASTE(text) u##text
#define WTEXT(text) WTEXT_PASTE(text)

// --- types: 32-bit names stay 32-bit, whatever the size of the machine's long ---

using WCHAR = char16_t;
using BYTE = std::uint8_t;
using WORD = std::uint16_t;
using DWORD = std::uint32_t;
using UINT = std::uint32_t;
using LONG = std::int32_t;  // differs from <windows.h>, where it is a long
using ULONG = std::uint32_t;
using LONGLONG = std::int64_t;
using ULONGLONG = std::uint64_t;
using BOOL = int;
using HRESULT = std::int32_t;
using HANDLE = void*;
using HGLOBAL = HANDLE;
using LPVOID = void*;
using LPCVOID = const void*;
using LPWSTR = WCHAR*;
using LPCWSTR = const WCHAR*;
using LPSTR = char*;
using LPCSTR = const char*;
using SIZE_T = std::size_t;
using LCID = DWORD;
using USHORT = std::uint16_t;
using UCHAR = std::uint8_t;
using INT = int;
using UINT_PTR = std::uintptr_t;
using ULONG_PTR = std::uintptr_t;
using DWORD_PTR = std::uintptr_t;
using HLOCAL = HANDLE;
using LPBOOL = BOOL*;
using LPDWORD = DWORD*;
using LPINT = int*;
using LPCCH = const char*;
using LPCWCH = const WCHAR*;

struct GUID {
  DWORD Data1;
  WORD Data2, Data3;
  BYTE Data4[8];
};

struct HINSTANCE__;
using HINSTANCE = HINSTANCE__*;
using HMODULE = HINSTANCE;
struct HRSRC__;
using HRSRC = HRSRC__*;
struct HKEY__;
using HKEY = HKEY__*;
using LSTATUS = LONG;
using REGSAM = DWORD;

// --- constants ---

#define TRUE 1
#define FALSE 0
#define CP_ACP 0
#define CP_OEMCP 1
#define CP_MACCP 2
#define CP_THREAD_ACP 3
#define CP_UTF7 65000
#define CP_UTF8 65001
#define S_OK ((HRESULT)0)
#define S_FALSE ((HRESULT)1)
#define E_OUTOFMEMORY ((HRESULT)0x8007000E)
#define E_NOINTERFACE ((HRESULT)0x80004002)
#define E_ABORT ((HRESULT)0x80004004)
#define E_POINTER ((HRESULT)0x80004003)
#define E_FAIL ((HRESULT)0x80004005)
#define E_INVALIDARG ((HRESULT)0x80070057)
#define WINAPI
#define CALLBACK
#include "qxcore/platform/win32/constants.h"
#include "qxcore/platform/win32/gdi.h"
#include "qxcore/platform/win32/handles.h"
#include "qxcore/platform/win32/metrics.h"

// --- names that the Windows headers change: a client may write either form here, too ---

#define GetClassInfo GetClassInfoW
#define LoadString LoadStringW
#define CharToOem CharToOemW
#define OemToChar OemToCharW
#define FindNextFile FindNextFileW
#define GetFileTitle GetFileTitleW
#define GetCurrentDirectory GetCurrentDirectoryW
#define SetCurrentDirectory SetCurrentDirectoryW
#define CreateDirectory CreateDirectoryW
#define RemoveDirectory RemoveDirectoryW
#define GetSystemDirectory GetSystemDirectoryW
#define GetWindowsDirectory GetWindowsDirectoryW
#define GetTempFileName GetTempFileNameW
#define GetCurrentTime() GetTickCount()
#define GetObject GetObjectW
#define CreateFontIndirect CreateFontIndirectW
#define GetTextMetrics GetTextMetricsW
#define GetTextFace GetTextFaceW
#define TextOut TextOutW
#define ExtTextOut ExtTextOutW
#define DrawText DrawTextW
#define CreateMetaFile CreateMetaFileW
#define CreateEnhMetaFile CreateEnhMetaFileW

#include "qxcore/platform/win32/control.h"
#include "qxcore/platform/win32/dialog.h"
#include "qxcore/platform/win32/functions.h"
#include "qxcore/platform/win32/input.h"
#include "qxcore/platform/win32/menu.h"
#include "qxcore/platform/win32/message.h"
#include "qxcore/platform/win32/scroll.h"
#include "qxcore/platform/win32/shell.h"
#include "qxcore/platform/win32/window.h"

#endif

static_assert(sizeof(WCHAR) == 2, "a character is one UTF-16 code unit");
static_assert(sizeof(long) == sizeof(void*), "a long holds a pointer");

// Text as a view; converts freely with the standard string view of the target.
using SStringView = std::basic_string_view<WCHAR>;
