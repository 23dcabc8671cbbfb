#include "qxcore/stream/zip/zip_entry.h"

#include <cstring>

#include "qxcore/core/exception.h"
#include "qxcore/stream/zip/internal/zip_format.h"

void SThrowZip(const WCHAR* text) { throw SEZipException(text, kSZipFailed); }

void SZipEntry::SetMethod(unsigned method) {
  m_method = method;
  if (method == kSZipDeflated) {
    m_attributes |= kCompressed;
  } else {
    m_attributes &= ~static_cast<unsigned long>(kCompressed);
  }
}

void SZipEntry::SetTime(unsigned date, unsigned time) {
  if (!::DosDateTimeToFileTime(static_cast<WORD>(date), static_cast<WORD>(time), &m_time)) m_time = {0, 0};
}

void SZipEntry::SetName(const char* bytes, int count) {
  m_name = Decode(bytes, count);
  if (!m_name.IsEmpty() && m_name[m_name.Length() - 1] == '/') m_attributes |= kDirectory;
}

void SZipEntry::SetComment(const char* bytes, int count) { m_comment = Decode(bytes, count); }

SString SZipEntry::Decode(const char* bytes, int count) const {
  if ((m_flags & kSZipUtf8) == 0) return SString(bytes, count);
  // As the other constructor, the text ends before a NUL.
  if (const void* end = std::memchr(bytes, 0, static_cast<std::size_t>(count)))
    count = static_cast<int>(static_cast<const char*>(end) - bytes);
  if (count == 0) return SString();
  SString text;
  // No more characters than bytes.
  const int length = ::MultiByteToWideChar(CP_UTF8, 0, bytes, count, text.Lock(count), count);
  text.Unlock(length);
  return text;
}
