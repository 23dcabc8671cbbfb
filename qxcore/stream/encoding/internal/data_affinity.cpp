#include "qxcore/stream/encoding/internal/data_affinity.h"

#include <algorithm>
#include <array>
#include <climits>
#include <numeric>

#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/win32.h"
#include "qxcore/stream/encoding/internal/utf8_blocks.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

using Support = SAbstractIO::SMultiFormatSupport;
using Counters = SDetectionCounters;

namespace {

constexpr std::ptrdiff_t kPatience = 4096;  // bytes after which a rejection ends the walk

void Add(std::int32_t& counter, std::int64_t amount) {
  counter = static_cast<std::int32_t>(std::clamp<std::int64_t>(counter + amount, INT_MIN, INT_MAX));
}

// Zeros of both orders are evidence only when one of them clearly prevails among `size` bytes.
void DropUnclearZeros(std::int64_t& little, std::int64_t& big, std::int64_t size) {
  if (little <= 0 || big <= 0) return;
  const bool isClear = std::max(little, big) >= size >> 2 && std::min(little, big) <= size >> 5;
  if (!isClear) little = big = 0;
}

// Moves over bytes that say nothing: 0x01 to 0x7F.
const unsigned char* SkipPlain(const unsigned char* at, const unsigned char* end) {
#ifdef __SSE2__
  constexpr std::ptrdiff_t kBlock = 16;
  const __m128i zero = _mm_setzero_si128();
  const auto load = [](const unsigned char* from) { return _mm_loadu_si128(reinterpret_cast<const __m128i*>(from)); };
  for (; end - at >= 4 * kBlock; at += 4 * kBlock) {
    // As signed numbers the plain bytes are those above zero.
    __m128i plain = _mm_and_si128(
        _mm_and_si128(_mm_cmpgt_epi8(load(at), zero), _mm_cmpgt_epi8(load(at + kBlock), zero)),
        _mm_and_si128(_mm_cmpgt_epi8(load(at + 2 * kBlock), zero), _mm_cmpgt_epi8(load(at + 3 * kBlock), zero)));
    if (_mm_movemask_epi8(plain) != 0xFFFF) break;
  }
  for (; end - at >= kBlock; at += kBlock) {
    if (_mm_movemask_epi8(_mm_cmpgt_epi8(load(at), zero)) != 0xFFFF) break;
  }
#endif
  while (at != end && *at > 0 && *at < 0x80) ++at;
  return at;
}

// The walk over the bytes; counts into plain locals, which the loop keeps in registers.
class Walk {
 public:
  Walk(const unsigned char* begin, const unsigned char* end, const Counters& before, SUnicodeRules rules)
      : m_begin(begin),
        m_end(end),
        m_isFull(rules == SUnicodeRules::kFull),
        m_countsZeros(before.utf16 >= 0),
        m_utf8Rejected(before.utf8 < 0) {}

  void Run() {
    const unsigned char* at = m_begin;
    while ((at = SkipPlain(at, m_end)) != m_end) {
      const unsigned char* next = WalkBlocks(at);
      if (next == m_end) {
        at = next;
        break;
      }
      at = next != at ? next : m_isFull ? WalkByteFully(at) : WalkByte(at);
      if (m_mayStop && at - m_begin > kPatience) break;
      m_mayStop = false;
    }
    m_walked = at - m_begin;
  }

  void AddTo(Counters& counters) const {
    Add(counters.ascii, -m_nonAscii);
    if (m_utf8Rejected) {
      counters.utf8 = Counters::kRejected;
    } else {
      Add(counters.utf8, m_continuations);
    }
    std::int64_t little = m_zeros[1];
    std::int64_t big = m_zeros[0];
    DropUnclearZeros(little, big, m_walked);
    Add(counters.littleZeros, little);
    Add(counters.bigZeros, big);
  }

  bool SawZeros() const { return m_zeros[0] + m_zeros[1] > 0; }
  bool WalkedAny() const { return m_walked > 0; }

 private:
  const unsigned char* WalkZero(const unsigned char* at) {
    if (m_countsZeros && at != m_end) ++m_zeros[(at - 1 - m_begin) & 1];
    return at;
  }

  const unsigned char* WalkByte(const unsigned char* at) {
    const unsigned char byte = *at++;
    switch (byte >> 4) {
      case 0x0:
        return WalkZero(at);
      case 0xC:
      case 0xD:
        ++m_nonAscii;
        return TakeContinuations(at, 1);
      case 0xE:
        ++m_nonAscii;
        return TakeContinuations(at, 2);
      case 0xF:
        // Neither evidence nor a rejection by itself; its continuation bytes count as stray ones. That is on
        // purpose: by the basic rules readers do not support sequences of four bytes.
        ++m_nonAscii;
        m_mayStop = true;
        return at;
      default:
        ++m_nonAscii;
        Reject();
        return at;
    }
  }

  // By the full rules; a sequence that the end of the sample cuts is no rejection.
  const unsigned char* WalkByteFully(const unsigned char* at) {
    if (*at == 0) return WalkZero(at + 1);
    const platform::Utf8Step step = platform::StepUtf8(at, m_end);
    ++m_nonAscii;
    if (!step.isValid && !step.isCut) {
      Reject();
      return at + 1;
    }
    m_continuations += step.length - 1;
    return at + step.length;
  }

  // Walks whole blocks of well-formed sequences, and zeros; returns where that ends, which is between two sequences.
  const unsigned char* WalkBlocks(const unsigned char* at) {
    const SUtf8BlockWalk walk = SWalkUtf8Blocks(at, m_end, m_isFull ? SUtf8BlockRules::kFull : SUtf8BlockRules::kBasic);
    m_nonAscii += walk.leads;
    m_continuations += walk.continuations;
    if (m_countsZeros) {
      const int first = static_cast<int>((at - m_begin) & 1);
      m_zeros[first] += walk.zeros[0];
      m_zeros[first ^ 1] += walk.zeros[1];
    }
    if (walk.expected == 0) return walk.stop;
    if (!m_isFull) return TakeContinuations(walk.stop, walk.expected);
    return FinishSequence(walk.stop);
  }

  // A sequence that the end of the sample cuts is no rejection.
  const unsigned char* TakeContinuations(const unsigned char* at, int count) {
    for (; count > 0 && at != m_end; --count, ++at) {
      if (!platform::IsUtf8Continuation(*at)) {
        Reject();
        return at;
      }
      ++m_continuations;
    }
    return at;
  }

  // The same by the full rules: the sequence began before `at` and was counted up to there.
  const unsigned char* FinishSequence(const unsigned char* at) {
    const unsigned char* lead = at - 1;
    while (platform::IsUtf8Continuation(*lead)) --lead;
    const platform::Utf8Step step = platform::StepUtf8(lead, m_end);
    if (!step.isValid && !step.isCut) {
      const std::ptrdiff_t strays = at - lead - 1;  // which were counted as continuations
      m_nonAscii += strays;
      m_continuations -= strays;
      Reject();
      return at;
    }
    m_continuations += lead + step.length - at;
    return lead + step.length;
  }

  void Reject() {
    m_utf8Rejected = true;
    m_mayStop = true;
  }

  const unsigned char* m_begin;
  const unsigned char* m_end;
  bool m_isFull;
  bool m_countsZeros;
  bool m_utf8Rejected;
  bool m_mayStop = false;
  std::int64_t m_zeros[2] = {0, 0};  // at even and at odd offsets
  std::int64_t m_nonAscii = 0;
  std::int64_t m_continuations = 0;
  std::int64_t m_walked = 0;
};

// Code pages for which the platform's conversion takes no flags.
bool ForbidsFlags(unsigned page) {
  return page == 42 || (page >= 50220 && page <= 50222) || page == 50225 || page == 50227 || page == 50229 ||
         page == 52936 || page == 54936 || (page >= 57002 && page <= 57011) || page == 65000 || page == 65001;
}

unsigned ResolvePage(unsigned page) {
  switch (page) {
    case CP_ACP:
      return GetACP();
    case CP_OEMCP:
      return GetOEMCP();
    case CP_MACCP:
    case CP_THREAD_ACP: {
      CPINFOEXW info;
      return GetCPInfoExW(page, 0, &info) ? info.CodePage : page;
    }
    default:
      return page;
  }
}

bool Converts(unsigned page, const unsigned char* begin, std::ptrdiff_t size) {
  DWORD flags = ForbidsFlags(page) ? 0 : MB_PRECOMPOSED | MB_ERR_INVALID_CHARS;
  const char* bytes = reinterpret_cast<const char*>(begin);
  return size == 0 || MultiByteToWideChar(page, flags, bytes, static_cast<int>(size), nullptr, 0) > 0;
}

// Whether every byte is a character of its own, so that any text converts.
bool TakesAnyBytes(unsigned page) {
  CPINFO info;
  if (!GetCPInfo(page, &info) || info.MaxCharSize != 1) return false;
  std::array<unsigned char, 256> all;
  std::iota(all.begin(), all.end(), static_cast<unsigned char>(0));
  return Converts(page, all.data(), all.size());
}

// The end of the sample may cut a double-byte character: then the test is repeated without its lead byte.
bool ConvertsSample(unsigned page, const unsigned char* begin, const unsigned char* end) {
  constexpr std::ptrdiff_t kLong = 4096;  // bytes that take longer to convert than to ask for what the page takes
  std::ptrdiff_t size = end - begin;
  if (size >= kLong && TakesAnyBytes(page)) return true;
  return Converts(page, begin, size) || (IsDBCSLeadByteEx(page, end[-1]) && Converts(page, begin, size - 1));
}

void TestPage(std::int32_t& counter, unsigned page, std::int32_t ascii, const unsigned char* begin,
              const unsigned char* end) {
  if (counter < 0) return;
  if (ConvertsSample(page, begin, end)) {
    Add(counter, -static_cast<std::int64_t>(ascii));
  } else {
    counter = Counters::kRejected;
  }
}

// The platform's own opinion on 16-bit text. Its tests for illegal characters and NULs decide nothing here, and
// would read all of the sample once more.
Support::Encoding TestUtf16(Counters& counters, const unsigned char* begin, const unsigned char* end) {
  int verdict = IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_CONTROLS |
                IS_TEXT_UNICODE_REVERSE_ASCII16 | IS_TEXT_UNICODE_REVERSE_STATISTICS | IS_TEXT_UNICODE_REVERSE_CONTROLS;
  IsTextUnicode(begin, static_cast<int>(end - begin), &verdict);

  counters.utf16 = std::max(counters.littleZeros, counters.bigZeros);
  struct Order {
    int ascii16, statistics, controls;
    std::int32_t Counters::*zeros;
    Support::Encoding encoding;
  };
  static constexpr Order kOrders[] = {
      {IS_TEXT_UNICODE_ASCII16, IS_TEXT_UNICODE_STATISTICS, IS_TEXT_UNICODE_CONTROLS, &Counters::littleZeros,
       Support::kUTF16LE | Support::kOptionalBOM},
      {IS_TEXT_UNICODE_REVERSE_ASCII16, IS_TEXT_UNICODE_REVERSE_STATISTICS, IS_TEXT_UNICODE_REVERSE_CONTROLS,
       &Counters::bigZeros, Support::kUTF16BE | Support::kOptionalBOM}};
  for (const Order& order : kOrders) {
    if (verdict & order.ascii16) {
      counters.utf16 = counters.*order.zeros = Counters::kCertain;
      return order.encoding;
    }
    if (verdict & order.statistics) counters.utf16 = counters.*order.zeros = Counters::kLikely;
    if (verdict & order.controls) {
      Add(counters.utf16, Counters::kControls);
      Add(counters.*order.zeros, Counters::kControls);
    }
  }
  return 0;
}

// UTF-16 whose bytes are all below 0x80. The upper halves of its units are small numbers, zero for blanks, line ends
// and Latin letters, up to 0x1F for the alphabets below U+2000; 8-bit text has neither NULs nor other controls at
// every second place. One unit in eight may lie elsewhere (quotation marks, arrows), and hardly any lower half is zero.
Support::Encoding TestPlainUtf16(Counters& counters, const unsigned char* begin, const unsigned char* end) {
  const std::int64_t units = (end - begin) / 2;
  std::int64_t zeros[2] = {0, 0}, small[2] = {0, 0};
  for (const unsigned char* at = begin; at != begin + 2 * units; at += 2) {
    for (int half = 0; half < 2; ++half) {
      zeros[half] += at[half] == 0;
      small[half] += at[half] < 0x20;
    }
  }
  struct Order {
    int upper;
    std::int32_t Counters::*zeros;
    Support::Encoding encoding;
  };
  static constexpr Order kOrders[] = {{1, &Counters::littleZeros, Support::kUTF16LE | Support::kOptionalBOM},
                                      {0, &Counters::bigZeros, Support::kUTF16BE | Support::kOptionalBOM}};
  for (const Order& order : kOrders) {
    const int lower = 1 - order.upper;
    if (zeros[order.upper] == 0 || small[order.upper] < units - units / 8) continue;
    if (zeros[lower] > units / 32 || small[lower] > units / 2) continue;
    counters.utf16 = counters.*order.zeros = Counters::kCertain;
    return order.encoding;
  }
  return 0;
}

}  // namespace

Support::Encoding SScanAffinity(const unsigned char* begin, const unsigned char* end, Counters& counters,
                                unsigned int codePage, SUnicodeRules rules, SSamplePlace place) {
  if (begin == end) return 0;
  Walk walk(begin, end, counters, rules);
  walk.Run();
  walk.AddTo(counters);

  if (counters.ascii < 0 && !walk.SawZeros()) {
    if (codePage != 0) TestPage(counters.specified, ResolvePage(codePage), counters.ascii, begin, end);
    TestPage(counters.active, GetACP(), counters.ascii, begin, end);
    // Without flags the platform converts any bytes as UTF-8, so its test only adds.
    if (counters.utf8 >= 0) Add(counters.utf8, -static_cast<std::int64_t>(counters.ascii));
  }
  if (counters.utf16 < 0) return 0;
  if (place == SSamplePlace::kBehind) {
    counters.utf16 = std::max(counters.littleZeros, counters.bigZeros);
    return 0;
  }
  if (rules == SUnicodeRules::kFull && counters.ascii == 0 && walk.SawZeros()) {
    if (Support::Encoding settled = TestPlainUtf16(counters, begin, end)) return settled;
  }
  bool mayBeUtf16 = counters.ascii < 0 || (counters.ascii == 0 && walk.WalkedAny());
  return mayBeUtf16 ? TestUtf16(counters, begin, end) : 0;
}

// --- samples one behind the other ---

const unsigned char* SEndOfPiece(const unsigned char* begin, const unsigned char* end) {
  // No multi-byte page has bytes below 0x30 within a character, and only 16-bit text has zeros.
  constexpr std::ptrdiff_t kReach = 65536;
  const unsigned char* last = end - ((end - begin) & 1);
  for (const unsigned char* at = last; last - at < kReach && at - begin > 2; at -= 2) {
    if (at[-1] < 0x30) return at;
  }
  return last;
}

static constexpr std::int32_t Counters::*kMembers[] = {&Counters::ascii,    &Counters::utf8,        &Counters::active,
                                                       &Counters::utf16,    &Counters::littleZeros, &Counters::bigZeros,
                                                       &Counters::specified};
static constexpr int kAscii = 0;  // its negative values are evidence, not a rejection
static constexpr int kUtf16 = 3, kLittleZeros = 4, kBigZeros = 5;

SAffinitySum::SAffinitySum(const Counters& first, std::int64_t size) : m_size(size) {
  for (int i = 0; i < kCounters; ++i) m_sums[i] = first.*kMembers[i];
}

Counters SAffinitySum::Fresh() const {
  Counters fresh;
  for (int i = 0; i < kCounters; ++i) fresh.*kMembers[i] = i != kAscii && m_sums[i] < 0 ? Counters::kRejected : 0;
  return fresh;
}

void SAffinitySum::Add(const Counters& sample, std::int64_t size) {
  m_size += size;
  for (int i = 0; i < kCounters; ++i) {
    const std::int32_t value = sample.*kMembers[i];
    if (i == kAscii || (m_sums[i] >= 0 && value >= 0)) {
      m_sums[i] += value;
    } else {
      m_sums[i] = Counters::kRejected;
    }
  }
}

Counters SAffinitySum::Total() const {
  std::int64_t sums[kCounters];
  std::copy(std::begin(m_sums), std::end(m_sums), sums);
  // The platform's verdict on the beginning stands, whatever zeros follow.
  if (sums[kUtf16] >= 0 && sums[kUtf16] < Counters::kControls) {
    DropUnclearZeros(sums[kLittleZeros], sums[kBigZeros], m_size);
    sums[kUtf16] = std::max(sums[kLittleZeros], sums[kBigZeros]);
  }
  std::int64_t largest = -sums[kAscii];
  for (std::int64_t sum : sums) largest = std::max(largest, sum);
  int shift = 0;
  while (largest >> shift > INT_MAX) ++shift;
  Counters total;
  for (int i = 0; i < kCounters; ++i) {
    // What was found at all stays found, and rejected stays rejected.
    const std::int64_t sum = sums[i], scaled = (sum < 0 ? -sum : sum) >> shift;
    const std::int64_t kept = sum != 0 && scaled == 0 ? 1 : scaled;
    total.*kMembers[i] = static_cast<std::int32_t>(sum < 0 ? -kept : kept);
  }
  return total;
}
