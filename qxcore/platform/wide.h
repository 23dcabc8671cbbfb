// The runtime's wide-character functions for WCHAR, under names of their own.
//
// On Windows most are msvcrt's; on Linux, where the runtime's wide character is another type, they
// are written here and no wide function of the C library is called. Texts are terminated and never
// null unless a function says otherwise. Differences between the targets are listed in
// docs/portable-layer.md; case and classes of characters (bmp.h) are the same on both.
// Threads: the functions may be called in any thread; two threads may not write one buffer.
#pragma once

#include <cstdarg>
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <string_view>

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

namespace platform {

// --- length, comparison, search ---

// Number of characters before the terminator.
inline std::size_t WideLength(const WCHAR* text) { return std::char_traits<WCHAR>::length(text); }
// The same, but looks at no more than `limit` characters and returns `limit` when none of them is NUL.
QXCORE_API std::size_t WideLength(const WCHAR* text, std::size_t limit);

// By code unit: negative, 0 or positive. The counted forms end after `count` characters.
QXCORE_API int WideCompare(const WCHAR* a, const WCHAR* b);
QXCORE_API int WideCompare(const WCHAR* a, const WCHAR* b, std::size_t count);
// By code unit after the one-to-one mapping to lower case (bmp.h).
QXCORE_API int WideCompareNoCase(const WCHAR* a, const WCHAR* b);
QXCORE_API int WideCompareNoCase(const WCHAR* a, const WCHAR* b, std::size_t count);
// By the rules of the runtime's LC_COLLATE locale; in the "C" locale by code unit, without case after
// mapping to lower case.
QXCORE_API int WideCollate(const WCHAR* a, const WCHAR* b);
QXCORE_API int WideCollate(const WCHAR* a, const WCHAR* b, std::size_t count);
QXCORE_API int WideCollateNoCase(const WCHAR* a, const WCHAR* b);
QXCORE_API int WideCollateNoCase(const WCHAR* a, const WCHAR* b, std::size_t count);

// First and last occurrence, or null. The terminator can be searched, too.
QXCORE_API const WCHAR* WideFind(const WCHAR* text, WCHAR character);
QXCORE_API const WCHAR* WideReverseFind(const WCHAR* text, WCHAR character);
// First occurrence of a text, or null; an empty one is found at once.
QXCORE_API const WCHAR* WideFind(const WCHAR* text, const WCHAR* wanted);
// Length of the leading part that consists of (does not hold any of) the characters of `set`.
QXCORE_API std::size_t WideSpan(const WCHAR* text, const WCHAR* set);
QXCORE_API std::size_t WideSpanNot(const WCHAR* text, const WCHAR* set);

// --- numbers ---

// White space, a sign, a prefix ("0x" for base 16, also "0" for base 8 when base is 0), digits of ASCII. A prefix
// without a digit behind it is not one: the number in "0x" is "0", as in C. What exceeds 32 bits is clipped to the
// nearest value and sets errno to ERANGE. *end (if not null) is set behind the last character used, to the start when
// there was no number.
QXCORE_API long WideToLong(const WCHAR* text, const WCHAR** end = nullptr, int base = 10);
// A negative number is taken modulo 2^32.
QXCORE_API unsigned long WideToULong(const WCHAR* text, const WCHAR** end = nullptr, int base = 10);
// White space, a sign, decimal digits with at most one '.', an exponent. The point is '.' whatever
// the locale; hexadecimal forms, infinity and NaN are not read. Too big yields infinity, with ERANGE.
QXCORE_API double WideToDouble(const WCHAR* text, const WCHAR** end = nullptr);

// --- formatting ---

// printf with the conventions of the Microsoft runtime: %s and %c take wide text, %S, %C, %hs and %hc
// narrow text (the ANSI code page), %ls and %lc wide, %I64d and %lld 64-bit integers, %Id pointer-sized
// ones, %ld a long, %p a pointer in upper-case hexadecimal of full width. Exponents have at least three
// digits; infinity and NaN print as "1.#INF", "1.#QNAN" and "-1.#IND". %n is refused.
// Writes at most `capacity` characters, the terminator included, and always terminates. Returns
// the length, or -1 when the text did not fit (its start is there) or the format is invalid.
QXCORE_API int WideFormatV(WCHAR* buffer, std::size_t capacity, const WCHAR* format, std::va_list arguments);
QXCORE_API int WideFormat(WCHAR* buffer, std::size_t capacity, const WCHAR* format, ...);
// The length that the text would have, or -1.
QXCORE_API int WideFormatLengthV(const WCHAR* format, std::va_list arguments);

// --- files of the C runtime ---

// fopen with a wide path and mode. Null on failure, with errno; a folder cannot be opened (EACCES).
QXCORE_API std::FILE* WideFileOpen(const WCHAR* path, const WCHAR* mode);
// The absolute form of a path: drive, no "." and "..", backslashes only. The result, terminated, must
// fit into `capacity` characters. Returns buffer, or null.
QXCORE_API WCHAR* WideFullPath(WCHAR* buffer, const WCHAR* path, std::size_t capacity);
// fseek and ftell with 64-bit positions; 0 (non-zero) on success (failure), the position or -1.
QXCORE_API int FileSeek(std::FILE* file, std::int64_t offset, int origin);
QXCORE_API std::int64_t FileTell(std::FILE* file);

}  // namespace platform
