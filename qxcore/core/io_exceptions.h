// The exceptions of streams and encodings. Each one's code and text are fixed when it is made, so
// that they survive the unwinding of the code that raised it. The texts come from the library's
// string table; the codes follow 0x80990050 + (string id - 200) where nothing else is said.
// Threads: an exception belongs to the thread that caught it.
#pragma once

#include "qxcore/core/exception.h"

class QXCORE_API SEIOException : public SException {
 public:
  // The failure that errno names: its text, and the code 0x80990040.
  SEIOException();
  explicit SEIOException(HRESULT code);  // the text is errno's
  SEIOException(HRESULT code, const SString& text) : SException(text, code) {}
  // Text `stringId` of the library's string table.
  SEIOException(HRESULT code, unsigned int stringId);
  const WCHAR* GetExceptionName() const override;
};

// Base of all encoding failures; alone, the generic one: 0x80990056 "Unexpected UTF encoding!".
class QXCORE_API SEEncodingException : public SEIOException {
 public:
  SEEncodingException();
  // With a code and a text of the library's string table.
  SEEncodingException(HRESULT code, unsigned int stringId) : SEIOException(code, stringId) {}
  const WCHAR* GetExceptionName() const override;
};

// Declares one exception with a code and a text of its own.
#define QXCORE_IO_EXCEPTION(Name)                   \
  struct QXCORE_API Name : SEIOException {          \
    Name();                                         \
    const WCHAR* GetExceptionName() const override; \
  }
// Declares one encoding exception. The second constructor is for the finer reasons of one direction,
// e.g. an illegal byte sequence instead of a character that has no equal.
#define QXCORE_ENCODING_EXCEPTION(Name)                                                \
  struct QXCORE_API Name : SEEncodingException {                                       \
    Name();                                                                            \
    Name(HRESULT code, unsigned int stringId) : SEEncodingException(code, stringId) {} \
    const WCHAR* GetExceptionName() const override;                                    \
  }

QXCORE_IO_EXCEPTION(SEEOFException);          // 0x80990041 "Unexpected end of file."
QXCORE_IO_EXCEPTION(SEIODiskFullException);   // 0x80990042 "Disk Full."
QXCORE_IO_EXCEPTION(SEIOAbortedException);    // E_ABORT "User aborted."
QXCORE_IO_EXCEPTION(SEIOCantOpenForReading);  // 0x80990050 "Cannot open for reading"
QXCORE_IO_EXCEPTION(SEIOCantOpenForWriting);  // 0x80990051 "Cannot open for writing"
QXCORE_IO_EXCEPTION(SEIOWriteFailed);         // 0x80990052 "Write failed"
QXCORE_IO_EXCEPTION(SEIOCouldNotTrunc);       // 0x80990053 "Could not truncate file!"
QXCORE_IO_EXCEPTION(SEIOPushBackFull);        // 0x80990054 "Push back buffer is full"
QXCORE_IO_EXCEPTION(SEIOResetInvalid);        // 0x80990055 "Resetting to invalid mark"

QXCORE_ENCODING_EXCEPTION(SEIONoUnicodeBOM);        // 0x80990057
QXCORE_ENCODING_EXCEPTION(SEIOMismatchedBOM);       // 0x80990058
QXCORE_ENCODING_EXCEPTION(SEIODetectFailed);        // 0x80990059
QXCORE_ENCODING_EXCEPTION(SEIOInvalidEncoding);     // 0x8099005A
QXCORE_ENCODING_EXCEPTION(SEIONonASCII);            // 0x8099005B
QXCORE_ENCODING_EXCEPTION(SEIOCantMap_OEM_UTF16);   // 0x8099005E
QXCORE_ENCODING_EXCEPTION(SEIOCantMap_UTF8_UTF16);  // 0x8099005F
QXCORE_ENCODING_EXCEPTION(SEIOCantMap_MBCS_UTF16);  // 0x80990060
QXCORE_ENCODING_EXCEPTION(SEIOCantMap_OEM_MBCS);    // 0x80990063
QXCORE_ENCODING_EXCEPTION(SEIOCantMap_UTF16_MBCS);  // 0x80990065
QXCORE_ENCODING_EXCEPTION(SEIOCantMap_UTF16_UTF8);  // 0x80990066

#undef QXCORE_IO_EXCEPTION
#undef QXCORE_ENCODING_EXCEPTION
