// The root of the library's exceptions and the members that belong to no subsystem.
//
// Every exception carries a text for the user and a 32-bit result code in the COM form; the codes of
// the library have facility 0x99 (0x8099xxxx). Exceptions are thrown by value and caught by reference.
// Threads: an exception belongs to the thread that caught it.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SException {
 public:
  // A failure with its text for the user and its result code.
  SException(const SString& text, HRESULT code) : m_text(text), m_code(code) {}
  SException(const SException&) = default;
  SException& operator=(const SException&) = default;
  virtual ~SException();

  // The message for the user; never null, valid as long as the exception.
  virtual const WCHAR* GetText() const;

  // The name of the exception's class, e.g. "SEIOException"; static storage.
  virtual const WCHAR* GetExceptionName() const;

  // The result code.
  HRESULT GetCode() const { return m_code; }

 protected:
  mutable SString m_text;  // a derived class may fetch its text on the first question
  HRESULT m_code;          // the result code
};

static_assert(sizeof(void*) != 4 || sizeof(SException) == 12, "the layout is public");

// A failure of the platform or of COM, described by its HRESULT.
class QXCORE_API SECOMException : public SException {
 public:
  // With the system's message, or a text of its own.
  explicit SECOMException(HRESULT code) : SException(SString(), code) {}
  SECOMException(HRESULT code, const SString& text) : SException(text, code) {}

  // The stored text, or, while that is empty, the system's message for the code, which is then kept.
  // Empty when the system has none.
  const WCHAR* GetText() const override;
  const WCHAR* GetExceptionName() const override;
};

// Memory is out: code E_OUTOFMEMORY, the text is the system's. Making one takes no memory.
class QXCORE_API SEOutOfMemory : public SECOMException {
 public:
  SEOutOfMemory() : SECOMException(E_OUTOFMEMORY) {}
  const WCHAR* GetExceptionName() const override;
};

// An object could not be constructed; code and text are the raiser's.
class QXCORE_API SEConstructor : public SException {
 public:
  // Text and code as the raiser has them.
  SEConstructor(const SString& text, HRESULT code) : SException(text, code) {}
  const WCHAR* GetExceptionName() const override;
};

// The code of every SEZipException that the library throws.
constexpr HRESULT kSZipFailed = static_cast<HRESULT>(0x80990040);

// A zip archive cannot be read; code and text are the raiser's.
class QXCORE_API SEZipException : public SException {
 public:
  // Text and code as the raiser has them.
  SEZipException(const SString& text, HRESULT code) : SException(text, code) {}
  const WCHAR* GetExceptionName() const override;
};

// A Win32 error code with its system message. Not thrown by the library; a value for clients.
class QXCORE_API SEWinError {
 public:
  // `code` as GetLastError returns it.
  explicit SEWinError(DWORD code) : m_code(static_cast<HRESULT>(code)) {}
  virtual ~SEWinError();

  // The system's message for the code, at most 511 characters, one trailing line feed removed; kept
  // after the first question. Empty when the system has none.
  virtual const WCHAR* GetText() const;
  virtual const WCHAR* GetExceptionName() const;

  DWORD GetCode() const { return static_cast<DWORD>(m_code); }  // the Win32 error code

 private:
  mutable SString m_text;
  HRESULT m_code;
};
