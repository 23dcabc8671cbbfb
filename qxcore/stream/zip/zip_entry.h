// SZipEntry: what an archive says of one of its entries.
//
// Made by the two readers of archives, SZipFile and SZipInputStream.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SZipEntry {
 public:
  // Attributes: every entry is read-only; deflated ones are compressed, names that end with "/" are folders.
  enum Attributes : unsigned { kReadOnly = 0x1, kDirectory = 0x10, kCompressed = 0x800 };
  enum : std::int64_t { kUnknown = -1 };  // a number that the archive has not stated yet

  // The name as the archive has it, parts separated by "/" by those who keep to the format; it may be absolute,
  // lead upwards, or hold backslashes. Flag bit 11 makes it UTF-8, else it is in the ANSI code page; it ends
  // before a NUL.
  const SString& GetName() const { return m_name; }
  // Only the central directory has comments; decoded as the name.
  const SString& GetComment() const { return m_comment; }
  // The compression method as the archive has it: 0 is stored, 8 deflated; the library reads no other.
  unsigned GetMethod() const { return m_method; }
  // The general-purpose flags, see SZipFlags.
  unsigned GetFlags() const { return m_flags; }
  // The time of the last modification in the local time of who made the archive, to two seconds; 0 in both
  // halves when the archive has no valid one.
  const FILETIME& GetTime() const { return m_time; }
  // CRC-32 of the data, bytes of the data in the archive, and when it is read; all are kUnknown in an entry whose
  // local header leaves them to the descriptor behind the data, until that was read.
  std::int64_t GetCRC() const { return m_crc; }
  std::int64_t GetCompressedSize() const { return m_compressedSize; }
  std::int64_t GetSize() const { return m_size; }
  // Where the local header stands in the archive; for SZipInputStream counted from where the stream began.
  std::int64_t GetOffset() const { return m_offset; }
  // Bits of the enumeration above.
  unsigned long GetAttributes() const { return m_attributes; }
  // Type and rights of the file where the archive was made on a Unix system (st_mode), else 0. Only the central
  // directory has them.
  unsigned GetUnixMode() const { return m_unixMode; }
  int IsDirectory() const { return (m_attributes & kDirectory) != 0; }

 private:
  friend class SZipFile;
  friend class SZipInputStream;

  void Reset() { *this = SZipEntry(); }
  void SetMethod(unsigned method);
  void SetTime(unsigned date, unsigned time);
  // `flags` must be set before.
  void SetName(const char* bytes, int count);
  void SetComment(const char* bytes, int count);
  SString Decode(const char* bytes, int count) const;

  SString m_name;
  SString m_comment;
  unsigned m_method = 0;
  unsigned m_flags = 0;
  FILETIME m_time = {0, 0};
  std::int64_t m_crc = kUnknown;
  std::int64_t m_compressedSize = kUnknown;
  std::int64_t m_size = kUnknown;
  std::int64_t m_offset = 0;
  unsigned long m_attributes = kReadOnly;
  unsigned m_unixMode = 0;
};
