// Conversions between UTF-16, UTF-8 and the ANSI code page on plain buffers.
// Threads: the functions may be called in any thread; g_bSwcstombszHadLoss is shared and not locked.
#pragma once

#include <string_view>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SString;

// Encodes at most `max` code units of src, stopping at its NUL: one byte below 0x80, two below 0x800,
// else three. Surrogates are encoded one by one, not as pairs, on purpose: the files of the
// library hold them so. Always terminates; dst needs 3 * max + 1 bytes. Returns dst.
QXCORE_API char* ST2UTF8Helper(char* dst, const WCHAR* src, int max);

// Decodes at most `max` sequences of src, stopping at its NUL, also within a sequence. Lead bytes up
// to 0xDF take one more byte, 0xE0 to 0xEF two more, which are not validated; a stray continuation byte
// or a lead byte from 0xF0 on is dropped, but counts. Always terminates; dst needs max + 1 characters.
// Returns dst.
QXCORE_API WCHAR* SUTF82THelper(WCHAR* dst, const char* src, int max);

// The same for texts of a known length, up to their first NUL; they return the end of what was written, where the
// terminator is. dst needs 3 * size + 1 bytes, or size + 1 characters.
QXCORE_API char* SEncodeUTF8(char* dst, SStringView src);
QXCORE_API WCHAR* SDecodeUTF8(WCHAR* dst, std::string_view src);

// Not 0 when the last Swcstombsz had to use a default character. Process-wide, not locked.
extern QXCORE_API int g_bSwcstombszHadLoss;

// Converts the terminated src to the ANSI code page into dst, which holds 2 * n + 1 bytes; sets
// g_bSwcstombszHadLoss. Returns the bytes written, the NUL included; 0 and an empty dst when src is null or
// dst is too small. With a null dst and n = 0: the bytes needed; with a null dst and another n: 0.
QXCORE_API int Swcstombsz(char* dst, const WCHAR* src, unsigned int n);

// Converts the terminated src from the ANSI code page into dst, which holds n + 1 characters. Returns the
// characters written, the NUL included; 0 and an empty dst when src is null or dst is too small. With a
// null dst and n = 0: the characters needed; with a null dst and another n: 0.
QXCORE_API int Smbstowcsz(WCHAR* dst, const char* src, unsigned int n);

// At most `count` bytes of ANSI text, stopping at a NUL, as a string. A null text is empty.
QXCORE_API SString SAnsiToString(const char* text, int count);
