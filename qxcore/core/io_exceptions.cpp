#include "qxcore/core/io_exceptions.h"

#include <cerrno>
#include <cstring>

#include "qxcore/core/module_state.h"

namespace {

constexpr HRESULT Code(std::uint32_t value) { return static_cast<HRESULT>(value); }

SString LibraryText(unsigned int id) { return SCoreGetModuleState()->LoadStringW(id); }

}  // namespace

SEIOException::SEIOException() : SEIOException(Code(0x80990040)) {}
SEIOException::SEIOException(HRESULT code) : SException(SString(std::strerror(errno)), code) {}
SEIOException::SEIOException(HRESULT code, unsigned int stringId) : SException(LibraryText(stringId), code) {}
const WCHAR* SEIOException::GetExceptionName() const { return WTEXT("SEIOException"); }

SEEncodingException::SEEncodingException() : SEEncodingException(Code(0x80990056), 199) {}
const WCHAR* SEEncodingException::GetExceptionName() const { return WTEXT("SEEncodingException"); }

#define QXCORE_EXCEPTION(Name, Base, code, stringId)                      \
  Name::Name() : Base(Code(code), static_cast<unsigned int>(stringId)) {} \
  const WCHAR* Name::GetExceptionName() const { return WTEXT(#Name); }

QXCORE_EXCEPTION(SEEOFException, SEIOException, 0x80990041, 196)
QXCORE_EXCEPTION(SEIODiskFullException, SEIOException, 0x80990042, 197)
QXCORE_EXCEPTION(SEIOAbortedException, SEIOException, 0x80004004, 198)
QXCORE_EXCEPTION(SEIOCantOpenForReading, SEIOException, 0x80990050, 200)
QXCORE_EXCEPTION(SEIOCantOpenForWriting, SEIOException, 0x80990051, 201)
QXCORE_EXCEPTION(SEIOWriteFailed, SEIOException, 0x80990052, 202)
QXCORE_EXCEPTION(SEIOCouldNotTrunc, SEIOException, 0x80990053, 203)
QXCORE_EXCEPTION(SEIOPushBackFull, SEIOException, 0x80990054, 204)
QXCORE_EXCEPTION(SEIOResetInvalid, SEIOException, 0x80990055, 205)

QXCORE_EXCEPTION(SEIONoUnicodeBOM, SEEncodingException, 0x80990057, 207)
QXCORE_EXCEPTION(SEIOMismatchedBOM, SEEncodingException, 0x80990058, 208)
QXCORE_EXCEPTION(SEIODetectFailed, SEEncodingException, 0x80990059, 209)
QXCORE_EXCEPTION(SEIOInvalidEncoding, SEEncodingException, 0x8099005A, 210)
QXCORE_EXCEPTION(SEIONonASCII, SEEncodingException, 0x8099005B, 211)
QXCORE_EXCEPTION(SEIOCantMap_OEM_UTF16, SEEncodingException, 0x8099005E, 242)
QXCORE_EXCEPTION(SEIOCantMap_UTF8_UTF16, SEEncodingException, 0x8099005F, 243)
QXCORE_EXCEPTION(SEIOCantMap_MBCS_UTF16, SEEncodingException, 0x80990060, 244)
QXCORE_EXCEPTION(SEIOCantMap_OEM_MBCS, SEEncodingException, 0x80990063, 241)
QXCORE_EXCEPTION(SEIOCantMap_UTF16_MBCS, SEEncodingException, 0x80990065, 216)
QXCORE_EXCEPTION(SEIOCantMap_UTF16_UTF8, SEEncodingException, 0x80990066, 246)
