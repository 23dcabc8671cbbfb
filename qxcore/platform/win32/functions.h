// The Win32 calls that the library uses, as declared on Linux; implemented in qxcore/platform/posix/. They do what is
// published for them, last-error values included. What each does otherwise, or not at all, is said in one place, by
// function: docs/portable-layer.md. Include qxcore/platform/win32.h, not this header; on Windows it is empty.
#pragma once

#include "qxcore/platform/win32.h"

#ifndef _WIN32

#include "qxcore/platform/export.h"

// --- records ---

struct FILETIME {
  DWORD dwLowDateTime;
  DWORD dwHighDateTime;
};

struct SYSTEMTIME {
  WORD wYear;
  WORD wMonth;
  WORD wDayOfWeek;
  WORD wDay;
  WORD wHour;
  WORD wMinute;
  WORD wSecond;
  WORD wMilliseconds;
};

union LARGE_INTEGER {
  struct {
    DWORD LowPart;
    LONG HighPart;
  } u;
  LONGLONG QuadPart;
};

union ULARGE_INTEGER {
  struct {
    DWORD LowPart;
    DWORD HighPart;
  } u;
  ULONGLONG QuadPart;
};

struct SECURITY_ATTRIBUTES {
  DWORD nLength;
  LPVOID lpSecurityDescriptor;  // ignored
  BOOL bInheritHandle;
};

struct OVERLAPPED;

struct SYSTEM_INFO {
  DWORD dwPageSize;
  DWORD dwNumberOfProcessors;
  DWORD dwAllocationGranularity;
};

struct CPINFO {
  UINT MaxCharSize;
  BYTE DefaultChar[MAX_DEFAULTCHAR];
  BYTE LeadByte[MAX_LEADBYTES];
};

struct CPINFOEXW {
  UINT MaxCharSize;
  BYTE DefaultChar[MAX_DEFAULTCHAR];
  BYTE LeadByte[MAX_LEADBYTES];
  WCHAR UnicodeDefaultChar;
  UINT CodePage;
  WCHAR CodePageName[MAX_PATH];
};

struct WIN32_FIND_DATAW {
  DWORD dwFileAttributes;
  FILETIME ftCreationTime;
  FILETIME ftLastAccessTime;
  FILETIME ftLastWriteTime;
  DWORD nFileSizeHigh;
  DWORD nFileSizeLow;
  DWORD dwReserved0;
  DWORD dwReserved1;
  WCHAR cFileName[MAX_PATH];
  WCHAR cAlternateFileName[14];
};
enum FINDEX_INFO_LEVELS { FindExInfoStandard, FindExInfoBasic };
enum FINDEX_SEARCH_OPS { FindExSearchNameMatch, FindExSearchLimitToDirectories };

struct WIN32_FILE_ATTRIBUTE_DATA {
  DWORD dwFileAttributes;
  FILETIME ftCreationTime;
  FILETIME ftLastAccessTime;
  FILETIME ftLastWriteTime;
  DWORD nFileSizeHigh;
  DWORD nFileSizeLow;
};

enum GET_FILEEX_INFO_LEVELS { GetFileExInfoStandard };

using CODEPAGE_ENUMPROCW = BOOL(CALLBACK*)(LPWSTR);

// --- last error, one a thread ---

QXCORE_API DWORD GetLastError() noexcept;
QXCORE_API void SetLastError(DWORD code) noexcept;

// --- the system ---

QXCORE_API void GetSystemInfo(SYSTEM_INFO* info);
// The low byte is the major version of the system whose behaviour the functions here have: 10.
QXCORE_API DWORD GetVersion();
QXCORE_API int MulDiv(int number, int numerator, int denominator);
QXCORE_API UINT GetACP();
QXCORE_API UINT GetOEMCP();

// --- the program ---

// The words that the program was started with, quoted where they need it.
QXCORE_API LPWSTR GetCommandLineW();
// The program's own file, for a null module only; others yield ERROR_MOD_NOT_FOUND. A path that does not fit is cut,
// with ERROR_INSUFFICIENT_BUFFER.
QXCORE_API DWORD GetModuleFileNameW(HMODULE module, LPWSTR path, DWORD capacity);
#define GetCommandLine GetCommandLineW
#define GetModuleFileName GetModuleFileNameW

// --- time ---

QXCORE_API void GetSystemTime(SYSTEMTIME* time);
QXCORE_API void GetLocalTime(SYSTEMTIME* time);
QXCORE_API void GetSystemTimeAsFileTime(FILETIME* time);
QXCORE_API DWORD GetTickCount();
QXCORE_API BOOL FileTimeToSystemTime(const FILETIME* fileTime, SYSTEMTIME* time);
QXCORE_API BOOL SystemTimeToFileTime(const SYSTEMTIME* time, FILETIME* fileTime);
QXCORE_API BOOL FileTimeToLocalFileTime(const FILETIME* fileTime, FILETIME* localTime);
QXCORE_API BOOL DosDateTimeToFileTime(WORD date, WORD time, FILETIME* fileTime);
QXCORE_API LONG CompareFileTime(const FILETIME* a, const FILETIME* b);

QXCORE_API int GetDateFormatW(LCID locale, DWORD flags, const SYSTEMTIME* date, LPCWSTR format, LPWSTR text,
                              int capacity);
QXCORE_API int GetTimeFormatW(LCID locale, DWORD flags, const SYSTEMTIME* time, LPCWSTR format, LPWSTR text,
                              int capacity);

// --- code pages ---

QXCORE_API int MultiByteToWideChar(UINT page, DWORD flags, LPCSTR bytes, int count, LPWSTR text, int capacity);
QXCORE_API int WideCharToMultiByte(UINT page, DWORD flags, LPCWSTR text, int count, LPSTR bytes, int capacity,
                                   LPCSTR defaultChar, LPBOOL usedDefault);
QXCORE_API BOOL GetCPInfo(UINT page, CPINFO* info);
QXCORE_API BOOL GetCPInfoExW(UINT page, DWORD flags, CPINFOEXW* info);
QXCORE_API BOOL IsDBCSLeadByteEx(UINT page, BYTE byte);
QXCORE_API BOOL IsValidCodePage(UINT page);
QXCORE_API BOOL EnumSystemCodePagesW(CODEPAGE_ENUMPROCW callback, DWORD flags);
QXCORE_API BOOL IsTextUnicode(const void* data, int size, LPINT tests);
QXCORE_API int FoldStringW(DWORD flags, LPCWSTR text, int count, LPWSTR folded, int capacity);

// --- resources and messages ---

QXCORE_API int LoadStringW(HINSTANCE instance, UINT id, LPWSTR buffer, int size);
// Strings, whose result can be tested for null and nothing else, and what was registered
// (qxcore/platform/resource_table.h).
QXCORE_API HRSRC FindResourceW(HMODULE module, LPCWSTR name, LPCWSTR type);
QXCORE_API HMODULE GetModuleHandleW(LPCWSTR name);
QXCORE_API DWORD FormatMessageW(DWORD flags, LPCVOID source, DWORD messageId, DWORD language, LPWSTR buffer, DWORD size,
                                std::va_list* arguments);
QXCORE_API HLOCAL LocalFree(HLOCAL block);

// --- global memory ---

QXCORE_API HGLOBAL GlobalAlloc(UINT flags, SIZE_T size);
QXCORE_API HGLOBAL GlobalReAlloc(HGLOBAL block, SIZE_T size, UINT flags);
QXCORE_API LPVOID GlobalLock(HGLOBAL block);
QXCORE_API BOOL GlobalUnlock(HGLOBAL block);
QXCORE_API SIZE_T GlobalSize(HGLOBAL block);
QXCORE_API HGLOBAL GlobalFree(HGLOBAL block);

// --- the registry: one database under the user's data folder (docs/settings.md) ---

QXCORE_API LSTATUS RegOpenKeyExW(HKEY key, LPCWSTR path, DWORD options, REGSAM access, HKEY* result);
QXCORE_API LSTATUS RegCreateKeyExW(HKEY key, LPCWSTR path, DWORD reserved, LPWSTR className, DWORD options,
                                   REGSAM access, const SECURITY_ATTRIBUTES* security, HKEY* result,
                                   LPDWORD disposition);
QXCORE_API LSTATUS RegCloseKey(HKEY key);
QXCORE_API LSTATUS RegDeleteKeyW(HKEY key, LPCWSTR path);
QXCORE_API LSTATUS RegEnumKeyExW(HKEY key, DWORD index, LPWSTR name, LPDWORD nameLength, LPDWORD reserved,
                                 LPWSTR className, LPDWORD classLength, FILETIME* lastWrite);
QXCORE_API LSTATUS RegEnumValueW(HKEY key, DWORD index, LPWSTR name, LPDWORD nameLength, LPDWORD reserved, LPDWORD type,
                                 BYTE* data, LPDWORD size);
QXCORE_API LSTATUS RegSetValueExW(HKEY key, LPCWSTR name, DWORD reserved, DWORD type, const BYTE* data, DWORD size);
QXCORE_API LSTATUS RegQueryValueExW(HKEY key, LPCWSTR name, LPDWORD reserved, LPDWORD type, BYTE* data, LPDWORD size);
QXCORE_API LSTATUS RegDeleteValueW(HKEY key, LPCWSTR name);
QXCORE_API DWORD ExpandEnvironmentStringsW(LPCWSTR text, LPWSTR expanded, DWORD capacity);

// --- initialisation files ---

QXCORE_API DWORD GetPrivateProfileStringW(LPCWSTR section, LPCWSTR key, LPCWSTR standard, LPWSTR text, DWORD capacity,
                                          LPCWSTR file);
QXCORE_API BOOL WritePrivateProfileStringW(LPCWSTR section, LPCWSTR key, LPCWSTR text, LPCWSTR file);

// --- files ---

QXCORE_API HANDLE CreateFileW(LPCWSTR path, DWORD access, DWORD share, SECURITY_ATTRIBUTES* security, DWORD disposition,
                              DWORD flags, HANDLE templateFile);
QXCORE_API BOOL ReadFile(HANDLE file, LPVOID buffer, DWORD count, LPDWORD done, OVERLAPPED* overlapped);
QXCORE_API BOOL WriteFile(HANDLE file, LPCVOID buffer, DWORD count, LPDWORD done, OVERLAPPED* overlapped);
QXCORE_API BOOL CloseHandle(HANDLE handle);
QXCORE_API BOOL SetFilePointerEx(HANDLE file, LARGE_INTEGER distance, LARGE_INTEGER* position, DWORD method);
QXCORE_API BOOL SetEndOfFile(HANDLE file);
QXCORE_API BOOL FlushFileBuffers(HANDLE file);
QXCORE_API DWORD GetFileSize(HANDLE file, LPDWORD high);
QXCORE_API BOOL GetFileSizeEx(HANDLE file, LARGE_INTEGER* size);
QXCORE_API BOOL GetFileTime(HANDLE file, FILETIME* creation, FILETIME* access, FILETIME* write);
QXCORE_API BOOL DuplicateHandle(HANDLE sourceProcess, HANDLE source, HANDLE targetProcess, HANDLE* target, DWORD access,
                                BOOL inherit, DWORD options);
QXCORE_API HANDLE GetCurrentProcess();

// --- file mappings ---

QXCORE_API HANDLE CreateFileMappingW(HANDLE file, SECURITY_ATTRIBUTES* security, DWORD protection, DWORD sizeHigh,
                                     DWORD sizeLow, LPCWSTR name);
QXCORE_API LPVOID MapViewOfFile(HANDLE mapping, DWORD access, DWORD offsetHigh, DWORD offsetLow, SIZE_T size);
QXCORE_API BOOL UnmapViewOfFile(LPCVOID view);
QXCORE_API BOOL FlushViewOfFile(LPCVOID view, SIZE_T size);

QXCORE_API DWORD GetFileAttributesW(LPCWSTR path);
QXCORE_API BOOL GetFileAttributesExW(LPCWSTR path, GET_FILEEX_INFO_LEVELS level, LPVOID data);
QXCORE_API BOOL SetFileAttributesW(LPCWSTR path, DWORD attributes);
QXCORE_API BOOL MoveFileW(LPCWSTR from, LPCWSTR to);
QXCORE_API BOOL MoveFileExW(LPCWSTR from, LPCWSTR to, DWORD flags);
QXCORE_API BOOL CopyFileW(LPCWSTR from, LPCWSTR to, BOOL failIfExists);
QXCORE_API BOOL DeleteFileW(LPCWSTR path);
QXCORE_API BOOL CreateDirectoryW(LPCWSTR path, SECURITY_ATTRIBUTES* security);
QXCORE_API BOOL RemoveDirectoryW(LPCWSTR path);
QXCORE_API DWORD GetCurrentDirectoryW(DWORD size, LPWSTR buffer);
QXCORE_API BOOL SetCurrentDirectoryW(LPCWSTR path);
QXCORE_API DWORD GetFullPathNameW(LPCWSTR path, DWORD size, LPWSTR buffer, LPWSTR* filePart);
QXCORE_API DWORD GetLongPathNameW(LPCWSTR path, LPWSTR buffer, DWORD size);
QXCORE_API DWORD GetShortPathNameW(LPCWSTR path, LPWSTR buffer, DWORD size);
QXCORE_API UINT GetSystemDirectoryW(LPWSTR buffer, UINT size);
QXCORE_API UINT GetWindowsDirectoryW(LPWSTR buffer, UINT size);
QXCORE_API BOOL GetDiskFreeSpaceExW(LPCWSTR directory, ULARGE_INTEGER* available, ULARGE_INTEGER* total,
                                    ULARGE_INTEGER* free);
QXCORE_API DWORD GetTempPathW(DWORD size, LPWSTR buffer);
QXCORE_API UINT GetTempFileNameW(LPCWSTR directory, LPCWSTR prefix, UINT unique, LPWSTR name);

QXCORE_API HANDLE FindFirstFileW(LPCWSTR pattern, WIN32_FIND_DATAW* data);
// The level changes nothing, for there are no short names; `filter` must be null and the flags are not used.
QXCORE_API HANDLE FindFirstFileExW(LPCWSTR pattern, FINDEX_INFO_LEVELS level, LPVOID data, FINDEX_SEARCH_OPS search,
                                   LPVOID filter, DWORD flags);
QXCORE_API BOOL FindNextFileW(HANDLE search, WIN32_FIND_DATAW* data);
QXCORE_API BOOL FindClose(HANDLE search);

#endif
