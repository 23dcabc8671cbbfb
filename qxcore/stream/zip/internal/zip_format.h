// The records of the zip format (PKWARE's APPNOTE), as the two readers of archives need them.
//
// All numbers are little endian. Offsets are into the record; sizes are those of the fixed part.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Throws SEZipException with the text (null: an empty one) and kSZipFailed.
[[noreturn]] void SThrowZip(const WCHAR* text);

// Compression methods of an entry.
enum SZipMethod : unsigned { kSZipStored = 0, kSZipDeflated = 8 };
// General-purpose flags of an entry.
enum SZipFlags : unsigned {
  kSZipEncrypted = 0x0001,
  kSZipHasDescriptor = 0x0008,  // CRC and sizes stand behind the data
  kSZipUtf8 = 0x0800,           // name and comment are UTF-8
};

// Reads a number of 16 bits, of 32 bits.
constexpr unsigned SZipGet16(const unsigned char* at) { return at[0] | static_cast<unsigned>(at[1]) << 8; }
constexpr std::uint32_t SZipGet32(const unsigned char* at) {
  return SZipGet16(at) | static_cast<std::uint32_t>(SZipGet16(at + 2)) << 16;
}

// Local header, in front of an entry's data.
struct SZipLOC {
  // The record's first four bytes; behind them its fields.
  static constexpr std::uint32_t kSignature = 0x04034B50;
  enum : int {
    kFlags = 6,
    kMethod = 8,
    kTime = 10,
    kDate = 12,
    kCRC = 14,
    kCompressedSize = 18,
    kSize = 22,
    kNameLength = 26,
    kExtraLength = 28,
    kRecordSize = 30
  };
};

// Data descriptor, behind the data of an entry with kSZipHasDescriptor.
struct SZipEXT {
  // The record's first four bytes; behind them its fields.
  static constexpr std::uint32_t kSignature = 0x08074B50;
  enum : int { kCRC = 4, kCompressedSize = 8, kSize = 12, kRecordSize = 16 };
};

// Entry of the central directory.
struct SZipCEN {
  // The record's first four bytes; behind them its fields.
  static constexpr std::uint32_t kSignature = 0x02014B50;
  enum : int {
    kMadeBy = 4,  // the version, and above it the system
    kFlags = 8,
    kMethod = 10,
    kTime = 12,
    kDate = 14,
    kCRC = 16,
    kCompressedSize = 20,
    kSize = 24,
    kNameLength = 28,
    kExtraLength = 30,
    kCommentLength = 32,
    kExternalAttributes = 38,
    kLocalOffset = 42,
    kRecordSize = 46
  };
};

// End of the central directory, at the archive's end but for a comment.
struct SZipEND {
  // The record's first four bytes; behind them its fields.
  static constexpr std::uint32_t kSignature = 0x06054B50;
  enum : int {
    kEntriesOnDisk = 8,
    kEntries = 10,
    kDirectoryLength = 12,
    kDirectoryOffset = 16,
    kCommentLength = 20,
    kRecordSize = 22
  };
};
