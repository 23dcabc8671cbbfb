// The code pages of the portable layer, as its own sources see them.
//
// Single-byte pages and those of one or two bytes are tables, filled once from ICU's converter and
// corrected where the published tables differ; reading them takes no lock. UTF-7 and UTF-8 are written by hand;
// the stateful and the longer ones go through ICU's converters, one a page, made once.
#pragma once

#include <cstddef>
#include <cstdint>
#include <memory>
#include <string_view>

#include "qxcore/platform/win32.h"

namespace platform {

enum class CodePageKind : std::uint8_t { kTable, kUtf7, kUtf8, kIcu, kSymbol };

struct CodePageInfo {
  UINT number;
  CodePageKind kind;
  const char* converter;  // ICU's name, or the C library's for 1361
  const char* name;       // for people
  std::uint8_t maxBytes;
  std::uint8_t defaultByte;
  WCHAR defaultChar;
  std::string_view leadRanges;  // first, last, first, last, ...

  bool IsLead(std::uint8_t byte) const {
    for (std::size_t i = 0; i + 1 < leadRanges.size(); i += 2)
      if (byte >= static_cast<std::uint8_t>(leadRanges[i]) && byte <= static_cast<std::uint8_t>(leadRanges[i + 1]))
        return true;
    return false;
  }
};

// From bytes to characters.
struct DecodeTable {
  enum : std::uint8_t { kInvalid = 1, kLead = 2 };

  WCHAR single[256];
  std::uint8_t kind[256];            // 0, kInvalid or kLead
  std::unique_ptr<WCHAR[]> doubles;  // [lead * 256 + trail]; 0 where it is missing
  WCHAR defaultChar;
  bool asciiIdentity;  // the first 128 bytes stand for themselves
  bool hasInvalid;     // some single byte is invalid
};

// From characters to bytes: the code (one byte, or lead * 256 + trail), kNone where there is none.
struct EncodeTable {
  static constexpr std::uint32_t kNone = 0xFFFFFFFF;

  std::uint16_t exact[65536];  // both ways
  std::uint16_t fit[65536];    // or the nearest character that the page has
  std::uint32_t Lookup(WCHAR c, bool bestFit) const {
    const std::uint16_t code = bestFit ? fit[static_cast<std::uint16_t>(c)] : exact[static_cast<std::uint16_t>(c)];
    return code != 0 || c == 0 ? code : kNone;
  }
};

// The page of a number, or null when it is unknown or not installed. CP_ACP and its kin are resolved first.
UINT ResolveCodePage(UINT page);
const CodePageInfo* FindCodePage(UINT resolved);
// All pages of the list, for enumeration; not all need be installed.
struct CodePageRange {
  const CodePageInfo *first, *last;
};
CodePageRange AllCodePages();

// The tables of a page of kind kTable; made at the first call. They throw std::bad_alloc.
const DecodeTable& GetDecodeTable(const CodePageInfo& page);
const EncodeTable& GetEncodeTable(const CodePageInfo& page);

// Conversions: they return the number of units of the whole result, write at most `capacity` of them, and
// clear `valid` when something was invalid (decode) or had no equal (encode).
struct Decoded {
  std::size_t length;
  bool valid;
};
Decoded DecodeUtf8(const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity, bool stopAtInvalid);
Decoded EncodeUtf8(const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity);
Decoded DecodeUtf7(const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity);
Decoded EncodeUtf7(const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity);
Decoded DecodeIcu(const CodePageInfo& page, const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity);
Decoded EncodeIcu(const CodePageInfo& page, const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity);

// True where the page's converter can be made.
bool IsInstalled(const CodePageInfo& page);

}  // namespace platform
