#include "qxcore/string/text_search.h"

#include "qxcore/string/internal/text_search.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include "qxcore/platform/internal/case_classes.h"
#include "qxcore/platform/wide.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace {

// --- blocks of eight characters ---

#ifdef __SSE2__
constexpr std::size_t kBlock = 8;

// Two bits a character, set where the character equals `wanted`.
unsigned EqualMask(const WCHAR* text, __m128i wanted) {
  __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(text));
  return static_cast<unsigned>(_mm_movemask_epi8(_mm_cmpeq_epi16(block, wanted)));
}
__m128i Spread(WCHAR c) { return _mm_set1_epi16(static_cast<short>(c)); }
std::size_t FirstOf(unsigned mask) { return static_cast<std::size_t>(std::countr_zero(mask)) / 2; }
#endif

// Two texts as long as the second one; the orders in which characters count as equal.
struct Exact {
  static bool Equal(const WCHAR* a, const WCHAR* b, std::size_t n) { return std::memcmp(a, b, n * sizeof(WCHAR)) == 0; }
};
struct NoCase {
  static bool Equal(const WCHAR* a, const WCHAR* b, std::size_t n) {
    for (std::size_t i = 0; i < n; ++i) {
      if (a[i] != b[i] && platform::ToLowerBmp(a[i]) != platform::ToLowerBmp(b[i])) return false;
    }
    return true;
  }
};

template <class Order>
const WCHAR* FindLast(SStringView text, SStringView wanted) {
  if (wanted.size() > text.size()) return nullptr;
  for (const WCHAR* at = text.data() + (text.size() - wanted.size());; --at) {
    if (Order::Equal(at, wanted.data(), wanted.size())) return at;
    if (at == text.data()) return nullptr;
  }
}

template <class Order>
const WCHAR* FindPlain(SStringView text, SStringView wanted) {
  for (std::size_t at = 0; at + wanted.size() <= text.size(); ++at) {
    if (Order::Equal(text.data() + at, wanted.data(), wanted.size())) return text.data() + at;
  }
  return nullptr;
}

#ifdef __SSE2__

// All characters that are equal to one another in lower case: rarely more than two.
struct Variants {
  static constexpr int kMost = 4;
  __m128i spread[kMost];
  int count = 0;  // above kMost: too many, search plainly

  explicit Variants(WCHAR c) {
    WCHAR lower = platform::ToLowerBmp(c);
    Add(lower);
    for (const platform::CaseVariant& variant : platform::CaseVariantsOf(lower)) Add(variant.other);
  }
  void Add(WCHAR c) {
    if (count < kMost) spread[count] = Spread(c);
    ++count;
  }
  bool TooMany() const { return count > kMost; }
  unsigned Mask(const WCHAR* text) const {
    unsigned mask = EqualMask(text, spread[0]);
    for (int i = 1; i < count; ++i) mask |= EqualMask(text, spread[i]);
    return mask;
  }
};

struct OneCharacter {
  __m128i spread;
  explicit OneCharacter(WCHAR c) : spread(Spread(c)) {}
  unsigned Mask(const WCHAR* text) const { return EqualMask(text, spread); }
};

// Candidates are the places where both the first and the last character of the wanted text fit.
template <class Order, class Ends>
const WCHAR* FindByEnds(SStringView text, SStringView wanted, const Ends& first, const Ends& last) {
  const WCHAR* at = text.data();
  const WCHAR* end = at + (text.size() - wanted.size()) + 1;
  const std::size_t toLast = wanted.size() - 1;
  for (; end - at >= static_cast<std::ptrdiff_t>(kBlock); at += kBlock) {
    unsigned mask = first.Mask(at);
    if (mask == 0) continue;
    mask &= last.Mask(at + toLast);
    while (mask != 0) {
      std::size_t offset = FirstOf(mask);
      if (Order::Equal(at + offset, wanted.data(), wanted.size())) return at + offset;
      mask &= ~(3u << (offset * 2));
    }
  }
  std::size_t rest = static_cast<std::size_t>(text.data() + text.size() - at);
  return FindPlain<Order>(SStringView(at, rest), wanted);
}

#endif

}  // namespace

const WCHAR* SFindCharacter(const WCHAR* text, std::size_t length, WCHAR character) {
  const WCHAR* end = text + length;
#ifdef __SSE2__
  const __m128i wanted = Spread(character);
  for (; end - text >= static_cast<std::ptrdiff_t>(kBlock); text += kBlock) {
    if (unsigned mask = EqualMask(text, wanted)) return text + FirstOf(mask);
  }
#endif
  for (; text != end; ++text) {
    if (*text == character) return text;
  }
  return nullptr;
}

const WCHAR* SFindText(SStringView text, SStringView wanted) {
  if (wanted.empty()) return text.data();
  if (wanted.size() > text.size()) return nullptr;
#ifdef __SSE2__
  return FindByEnds<Exact>(text, wanted, OneCharacter(wanted.front()), OneCharacter(wanted.back()));
#else
  return FindPlain<Exact>(text, wanted);
#endif
}

const WCHAR* SFindTextNoCase(SStringView text, SStringView wanted) {
  if (wanted.empty()) return text.data();
  if (wanted.size() > text.size()) return nullptr;
#ifdef __SSE2__
  constexpr std::size_t kWorthPreparing = 64;
  if (text.size() >= kWorthPreparing) {
    Variants first(wanted.front());
    Variants last(wanted.back());
    if (!first.TooMany() && !last.TooMany()) return FindByEnds<NoCase>(text, wanted, first, last);
  }
#endif
  return FindPlain<NoCase>(text, wanted);
}

const WCHAR* SFindLastText(SStringView text, SStringView wanted) { return FindLast<Exact>(text, wanted); }

const WCHAR* SFindLastTextNoCase(SStringView text, SStringView wanted) { return FindLast<NoCase>(text, wanted); }

const WCHAR* _tcsistr(const WCHAR* haystack, const WCHAR* needle) {
  if (haystack == nullptr) return nullptr;
  return SFindTextNoCase(haystack, needle != nullptr ? SStringView(needle) : SStringView());
}

const WCHAR* _tcsistr(const WCHAR* haystack, const WCHAR* needle, int count) {
  if (haystack == nullptr) return nullptr;
  SStringView wanted = needle != nullptr ? SStringView(needle) : SStringView();
  return SFindTextNoCase(haystack, wanted.substr(0, static_cast<std::size_t>(std::max(count, 0))));
}
