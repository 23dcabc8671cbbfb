// How well a sample of bytes fits the candidate encodings.
#pragma once

#include "qxcore/stream/encoding/detection_counters.h"
#include "qxcore/stream/encoding/multi_format_support.h"

// By which rules UTF-8 and UTF-16 are judged (see SMultiFormatSupport::kFullUnicode).
enum class SUnicodeRules { kBasic, kFull };

// Where a sample lies in the text. The platform's tests for 16-bit text look at the first characters only, so that
// they mean something at the text's beginning; of what lies behind it only the zeros count.
enum class SSamplePlace { kBeginning, kBehind };

// Adds the evidence of the bytes from begin to end. `codePage` is the one that the hint names: 0 for
// none; 1 to 3 for the platform's OEM, Macintosh and thread code pages. Returns an encoding when the sample
// settles it, else 0.
SAbstractIO::SMultiFormatSupport::Encoding SScanAffinity(const unsigned char* begin, const unsigned char* end,
                                                         SDetectionCounters& counters, unsigned int codePage,
                                                         SUnicodeRules rules, SSamplePlace place);

// Where a long sample is best cut, at `end` or up to 64 KB before it: behind a byte that ends a character in every
// encoding of bytes, at an even offset from `begin`.
const unsigned char* SEndOfPiece(const unsigned char* begin, const unsigned char* end);

// Adds the evidence of samples that lie one behind the other, each scanned by itself. It takes sums beyond
// 32 bits and scales them down together at the end, so that the order of the candidates stays. Zeros are judged
// over all samples, as if they had been one.
class SAffinitySum {
 public:
  // Begins with what the first sample, of `size` bytes, gave.
  SAffinitySum(const SDetectionCounters& first, std::int64_t size);
  // What the next sample's counters must be before its scan: what was rejected stays so.
  SDetectionCounters Fresh() const;
  void Add(const SDetectionCounters& sample, std::int64_t size);
  SDetectionCounters Total() const;

 private:
  static constexpr int kCounters = 7;
  std::int64_t m_sums[kCounters];
  std::int64_t m_size;
};
