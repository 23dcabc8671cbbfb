#include "qxcore/core/exception.h"

SException::~SException() = default;
const WCHAR* SException::GetText() const { return m_text; }
const WCHAR* SException::GetExceptionName() const { return WTEXT("SException"); }

const WCHAR* SECOMException::GetText() const {
  if (m_text.IsEmpty()) {
    WCHAR* message = nullptr;
    FormatMessageW(FORMAT_MESSAGE_ALLOCATE_BUFFER | FORMAT_MESSAGE_FROM_SYSTEM, nullptr, static_cast<DWORD>(m_code), 0,
                   reinterpret_cast<WCHAR*>(&message), 0, nullptr);
    // The system's buffer is not given back; it is small and asked for once an exception.
    if (message != nullptr) m_text += message;
  }
  return m_text;
}

const WCHAR* SECOMException::GetExceptionName() const { return WTEXT("SECOMException"); }
const WCHAR* SEOutOfMemory::GetExceptionName() const { return WTEXT("SEOutOfMemory"); }
const WCHAR* SEConstructor::GetExceptionName() const { return WTEXT("SEConstructor"); }
const WCHAR* SEZipException::GetExceptionName() const { return WTEXT("SEZipException"); }

SEWinError::~SEWinError() = default;

const WCHAR* SEWinError::GetText() const {
  if (m_text.IsEmpty()) {
    constexpr int kCapacity = 512;
    WCHAR* text = m_text.LockTchar(kCapacity);
    DWORD length = FormatMessageW(FORMAT_MESSAGE_FROM_SYSTEM, nullptr, GetCode(), 0, text, kCapacity, nullptr);
    text[length] = 0;
    if (length > 1 && text[length - 1] == WTEXT('\n')) text[length - 1] = 0;
    m_text.UnlockTchar(-1);
  }
  return m_text;
}

const WCHAR* SEWinError::GetExceptionName() const { return WTEXT("SEWinError"); }
