#include "qxcore/stream/encoding/internal/data_affinity.h"

#include <algorithm>
#include <climits>

#include "qxcore/platform/win32.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

using Support = SAbstractIO::SMultiFormatSupport;

namespace {

constexpr std::ptrdiff_t kPatience = 4096;  // bytes after which a rejection ends the walk

void Add(std::int32_t& counter, std::int64_t amount) {
  counter = static_cast<std::int32_t>(std::clamp<std::int64_t>(counter + amount, INT_MIN, INT_MAX));
}

bool IsContinuation(unsigned char byte) { return (byte & 0xC0) == 0x80; }

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

#ifdef __SSE2__

// 64 bytes, one bit each.
struct Block {
  static constexpr std::ptrdiff_t kSize = 64;

  std::uint64_t zeros = 0;
  std::uint64_t above = 0;         // 0x80 and more
  std::uint64_t continuation = 0;  // 0x80 to 0xBF
  std::uint64_t fromE0 = 0;
  std::uint64_t fromF0 = 0;

  explicit Block(const unsigned char* at) {
    const __m128i zero = _mm_setzero_si128();
    const __m128i c0 = _mm_set1_epi8(static_cast<char>(0xC0));
    const __m128i e0 = _mm_set1_epi8(static_cast<char>(0xE0));
    const __m128i f0 = _mm_set1_epi8(static_cast<char>(0xF0));
    for (int part = 0; part < 4; ++part) {
      const __m128i bytes = _mm_loadu_si128(reinterpret_cast<const __m128i*>(at) + part);
      const auto put = [part](std::uint64_t& mask, __m128i found) {
        mask |= static_cast<std::uint64_t>(static_cast<unsigned>(_mm_movemask_epi8(found))) << (part * 16);
      };
      put(above, bytes);
      put(zeros, _mm_cmpeq_epi8(bytes, zero));
      put(continuation, _mm_cmplt_epi8(bytes, c0));  // as signed numbers those below 0xC0
      put(fromE0, _mm_cmpeq_epi8(_mm_max_epu8(bytes, e0), bytes));
      put(fromF0, _mm_cmpeq_epi8(_mm_max_epu8(bytes, f0), bytes));
    }
  }
};

// Without the processor's own instruction, which not every one has.
int CountBits(std::uint64_t bits) {
  bits -= bits >> 1 & 0x5555555555555555u;
  bits = (bits & 0x3333333333333333u) + (bits >> 2 & 0x3333333333333333u);
  bits = (bits + (bits >> 4)) & 0x0F0F0F0F0F0F0F0Fu;
  return static_cast<int>(bits * 0x0101010101010101u >> 56);
}

#endif

// The walk over the bytes; counts into plain locals, which the loop keeps in registers.
class Walk {
 public:
  Walk(const unsigned char* begin, const unsigned char* end, const SDataAffinity& before)
      : m_begin(begin), m_end(end), m_countsZeros(before.utf16 >= 0), m_utf8Rejected(before.utf8 < 0) {}

  void Run() {
    const unsigned char* at = m_begin;
    while ((at = SkipPlain(at, m_end)) != m_end) {
      const unsigned char* next = WalkBlocks(at);
      at = next != at ? next : WalkByte(at);
      if (m_mayStop && at - m_begin > kPatience) break;
      m_mayStop = false;
    }
    m_walked = at - m_begin;
  }

  void AddTo(SDataAffinity& affinity) const {
    Add(affinity.ascii, -m_nonAscii);
    if (m_utf8Rejected) {
      affinity.utf8 = SDataAffinity::kRejected;
    } else {
      Add(affinity.utf8, m_continuations);
    }
    std::int64_t little = m_zeros[1];
    std::int64_t big = m_zeros[0];
    if (little > 0 && big > 0) {
      bool isClear = std::max(little, big) >= m_walked >> 2 && std::min(little, big) <= m_walked >> 5;
      if (!isClear) little = big = 0;
    }
    Add(affinity.littleZeros, little);
    Add(affinity.bigZeros, big);
  }

  bool SawZeros() const { return m_zeros[0] + m_zeros[1] > 0; }
  bool WalkedAny() const { return m_walked > 0; }

 private:
  const unsigned char* WalkByte(const unsigned char* at) {
    const unsigned char byte = *at++;
    switch (byte >> 4) {
      case 0x0:
        if (m_countsZeros && at != m_end) ++m_zeros[(at - 1 - m_begin) & 1];
        return at;
      case 0xC:
      case 0xD:
        ++m_nonAscii;
        return TakeContinuations(at, 1);
      case 0xE:
        ++m_nonAscii;
        return TakeContinuations(at, 2);
      case 0xF:
        // Neither evidence nor a rejection by itself; its continuation bytes count as stray ones. That is
        // meant: readers do not support sequences of four bytes.
        ++m_nonAscii;
        m_mayStop = true;
        return at;
      default:
        ++m_nonAscii;
        Reject();
        return at;
    }
  }

  // Walks whole blocks of well-formed sequences up to three bytes, and zeros; gives where that ends, which is
  // between two sequences.
  const unsigned char* WalkBlocks(const unsigned char* at) {
#ifdef __SSE2__
    std::uint64_t expected = 0;  // continuation bytes that belong to the block before
    for (; m_end - at > Block::kSize; at += Block::kSize) {
      const Block block(at);
      const std::uint64_t leads = block.above & ~block.continuation;
      const std::uint64_t due = expected | leads << 1 | block.fromE0 << 2;
      if (block.fromF0 != 0 || due != block.continuation) break;
      m_nonAscii += CountBits(leads);
      m_continuations += CountBits(block.continuation);
      if (m_countsZeros && block.zeros != 0) {
        const int first = static_cast<int>((at - m_begin) & 1);
        m_zeros[first] += CountBits(block.zeros & 0x5555555555555555u);
        m_zeros[first ^ 1] += CountBits(block.zeros & 0xAAAAAAAAAAAAAAAAu);
      }
      expected = leads >> 63 | block.fromE0 >> 62;
    }
    if (expected != 0) at = TakeContinuations(at, expected == 1 ? 1 : 2);
#endif
    return at;
  }

  // A sequence that the end of the sample cuts is no rejection.
  const unsigned char* TakeContinuations(const unsigned char* at, int count) {
    for (; count > 0 && at != m_end; --count, ++at) {
      if (!IsContinuation(*at)) {
        Reject();
        return at;
      }
      ++m_continuations;
    }
    return at;
  }

  void Reject() {
    m_utf8Rejected = true;
    m_mayStop = true;
  }

  const unsigned char* m_begin;
  const unsigned char* m_end;
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

// The end of the sample may cut a double-byte character: then the test is repeated without its lead byte.
bool ConvertsSample(unsigned page, const unsigned char* begin, const unsigned char* end) {
  std::ptrdiff_t size = end - begin;
  return Converts(page, begin, size) || (IsDBCSLeadByteEx(page, end[-1]) && Converts(page, begin, size - 1));
}

void TestPage(std::int32_t& counter, unsigned page, const SDataAffinity& affinity, const unsigned char* begin,
              const unsigned char* end) {
  if (counter < 0) return;
  if (ConvertsSample(page, begin, end)) {
    Add(counter, -static_cast<std::int64_t>(affinity.ascii));
  } else {
    counter = SDataAffinity::kRejected;
  }
}

// The platform's own opinion on 16-bit text.
Support::Encoding TestUtf16(SDataAffinity& affinity, const unsigned char* begin, const unsigned char* end) {
  int verdict = IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_CONTROLS |
                IS_TEXT_UNICODE_REVERSE_ASCII16 | IS_TEXT_UNICODE_REVERSE_STATISTICS |
                IS_TEXT_UNICODE_REVERSE_CONTROLS | IS_TEXT_UNICODE_ILLEGAL_CHARS | IS_TEXT_UNICODE_NULL_BYTES;
  IsTextUnicode(begin, static_cast<int>(end - begin), &verdict);

  affinity.utf16 = std::max(affinity.littleZeros, affinity.bigZeros);
  struct Order {
    int ascii16, statistics, controls;
    std::int32_t SDataAffinity::*zeros;
    Support::Encoding encoding;
  };
  static constexpr Order kOrders[] = {
      {IS_TEXT_UNICODE_ASCII16, IS_TEXT_UNICODE_STATISTICS, IS_TEXT_UNICODE_CONTROLS, &SDataAffinity::littleZeros,
       Support::kUTF16LE | Support::kOptionalBOM},
      {IS_TEXT_UNICODE_REVERSE_ASCII16, IS_TEXT_UNICODE_REVERSE_STATISTICS, IS_TEXT_UNICODE_REVERSE_CONTROLS,
       &SDataAffinity::bigZeros, Support::kUTF16BE | Support::kOptionalBOM}};
  for (const Order& order : kOrders) {
    if (verdict & order.ascii16) {
      affinity.utf16 = affinity.*order.zeros = SDataAffinity::kCertain;
      return order.encoding;
    }
    if (verdict & order.statistics) affinity.utf16 = affinity.*order.zeros = SDataAffinity::kLikely;
    if (verdict & order.controls) {
      Add(affinity.utf16, SDataAffinity::kControls);
      Add(affinity.*order.zeros, SDataAffinity::kControls);
    }
  }
  return 0;
}

}  // namespace

Support::Encoding SDataAffinity::Scan(const unsigned char* begin, const unsigned char* end, unsigned int codePage) {
  if (begin == end) return 0;
  Walk walk(begin, end, *this);
  walk.Run();
  walk.AddTo(*this);

  if (ascii < 0 && !walk.SawZeros()) {
    if (codePage != 0) TestPage(specified, ResolvePage(codePage), *this, begin, end);
    TestPage(active, GetACP(), *this, begin, end);
    // Without flags the platform converts any bytes as UTF-8, so its test only adds.
    if (utf8 >= 0) Add(utf8, -static_cast<std::int64_t>(ascii));
  }
  bool mayBeUtf16 = ascii < 0 || (ascii == 0 && walk.WalkedAny());
  return mayBeUtf16 && utf16 >= 0 ? TestUtf16(*this, begin, end) : 0;
}
