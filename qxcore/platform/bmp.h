// Case and classes of the characters of the Basic Multilingual Plane, without regard to a locale.
//
// The tables hold the simple one-to-one mappings and the general categories of Unicode 15.0; they are
// the same on every target, so that what is ordered on one machine is in order on every other. A
// character with no one-to-one mapping inside the plane, and a surrogate, maps to itself.
// Threads: the functions may be called in any thread.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

namespace platform {

// One value for each character of the plane.
template <class T>
struct BmpTable {
  T values[65536];  // by code unit
  // The value of a character.
  constexpr const T& operator[](WCHAR c) const { return values[static_cast<std::uint16_t>(c)]; }
};

// The lower-case form, the upper-case form and the CharClass bits of each character.
extern QXCORE_API const BmpTable<WCHAR> g_lowerBmp;
extern QXCORE_API const BmpTable<WCHAR> g_upperBmp;
extern QXCORE_API const BmpTable<std::uint8_t> g_classBmp;

// What a character is; several bits may be set.
enum CharClass : std::uint8_t {
  kClassAlpha = 1,     // letters (general categories L*)
  kClassDigit = 2,     // decimal digits of every script (Nd)
  kClassUpper = 4,     // Lu
  kClassLower = 8,     // Ll
  kClassSpace = 16,    // White_Space: blanks, line ends, tabs
  kClassPunct = 32,    // P*, and the printable ASCII characters that are neither letter nor digit
  kClassControl = 64,  // Cc, Cf, Zl, Zp
  kClassPrint = 128,   // everything but controls and unassigned characters
};

// The lower-case form and the upper-case form; the character itself where it has none.
inline WCHAR ToLowerBmp(WCHAR c) { return g_lowerBmp[c]; }
inline WCHAR ToUpperBmp(WCHAR c) { return g_upperBmp[c]; }
// Whether a character belongs to one of the classes.
inline bool HasClass(WCHAR c, unsigned classes) { return (g_classBmp[c] & classes) != 0; }

// Whether a character belongs to the class of that name.
inline bool IsAlpha(WCHAR c) { return HasClass(c, kClassAlpha); }
inline bool IsDigit(WCHAR c) { return HasClass(c, kClassDigit); }
inline bool IsAlphaNum(WCHAR c) { return HasClass(c, kClassAlpha | kClassDigit); }
inline bool IsUpper(WCHAR c) { return HasClass(c, kClassUpper); }
inline bool IsLower(WCHAR c) { return HasClass(c, kClassLower); }
inline bool IsSpace(WCHAR c) { return HasClass(c, kClassSpace); }
inline bool IsPunct(WCHAR c) { return HasClass(c, kClassPunct); }
inline bool IsControl(WCHAR c) { return HasClass(c, kClassControl); }
inline bool IsPrint(WCHAR c) { return HasClass(c, kClassPrint); }
// The hexadecimal digits of ASCII only.
inline bool IsXDigit(WCHAR c) { return (c >= '0' && c <= '9') || (c >= 'A' && c <= 'F') || (c >= 'a' && c <= 'f'); }

}  // namespace platform
