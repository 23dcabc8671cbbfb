// How well a sample of bytes fits the candidate encodings.
//
// Counters: any negative value means rejected, larger values mean more evidence. Several scans may
// add to the same counters; what was rejected once stays so.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/stream/encoding/multi_format_support.h"

struct SDataAffinity {
  static constexpr std::int32_t kRejected = -1;          // any negative value says so
  static constexpr std::int32_t kCertain = 0x3FFFFFFF;   // every unit is an ASCII character in 16 bits
  static constexpr std::int32_t kLikely = 0x1FFFFFFF;    // by the platform's statistics
  static constexpr std::int32_t kControls = 0x0FFFFFFF;  // 16-bit line ends, blanks, tabs

  std::int32_t ascii = 0;              // minus the lead and stray bytes above 0x7F
  std::int32_t utf8 = 0;               // continuation bytes in place, and characters that convert
  std::int32_t active = 0;             // the active code page
  std::int32_t utf16 = 0;              // of either order
  std::int32_t littleZeros = 0;        // zero bytes at odd offsets
  std::int32_t bigZeros = 0;           // and at even ones
  std::int32_t specified = kRejected;  // a code page that the hint names

  // Adds the evidence of the bytes from begin to end. `codePage` is the one that the hint names: 0 for
  // none; 1 to 3 for the platform's OEM, Macintosh and thread code pages. Gives an encoding when the
  // sample settles it, else 0.
  SAbstractIO::SMultiFormatSupport::Encoding Scan(const unsigned char* begin, const unsigned char* end,
                                                  unsigned int codePage);
};
