// Conversion with the tables of a code page.
#pragma once

#include "qxcore/platform/posix/code_page.h"

namespace platform {

// True when every byte (pair) is one of the page's; also returns the number of characters.
Decoded MeasureTable(const DecodeTable& table, const char* bytes, std::size_t count);
// Converts; invalid bytes become the page's replacement.
Decoded DecodeTableText(const DecodeTable& table, const char* bytes, std::size_t count, WCHAR* text,
                        std::size_t capacity);

struct EncodeOptions {
  bool bestFit;
  std::uint16_t defaultCode;  // stands for what has no equal
};
// `valid` is cleared when the default was used.
Decoded EncodeTableText(const EncodeTable& table, const EncodeOptions& options, const WCHAR* text, std::size_t count,
                        char* bytes, std::size_t capacity);

// Number of leading bytes below 0x80.
std::size_t AsciiPrefix(const char* bytes, std::size_t count);

}  // namespace platform
