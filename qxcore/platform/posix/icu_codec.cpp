// The stateful code pages and those of more than two bytes, through ICU's converters. One converter a
// page is kept and locked while it works; every call converts a text of its own.

#include <unicode/ucnv.h>

#include <algorithm>
#include <map>
#include <mutex>
#include <utility>

#include "qxcore/platform/posix/code_page.h"

namespace platform {
namespace {

struct Counter {
  std::size_t replaced = 0;
};

void U_CALLCONV CountingToUnicode(const void* context, UConverterToUnicodeArgs* arguments, const char* units,
                                  std::int32_t length, UConverterCallbackReason reason, UErrorCode* error) {
  // Escapes with no text between them, as texts that were put together from pieces have: they stand for nothing.
  if (reason == UCNV_IRREGULAR) {
    *error = U_ZERO_ERROR;
    return;
  }
  if (reason < UCNV_IRREGULAR) ++static_cast<Counter*>(const_cast<void*>(context))->replaced;
  UCNV_TO_U_CALLBACK_SUBSTITUTE(nullptr, arguments, units, length, reason, error);
}

void U_CALLCONV CountingFromUnicode(const void* context, UConverterFromUnicodeArgs* arguments, const WCHAR* units,
                                    std::int32_t length, UChar32 point, UConverterCallbackReason reason,
                                    UErrorCode* error) {
  if (reason <= UCNV_IRREGULAR) ++static_cast<Counter*>(const_cast<void*>(context))->replaced;
  UCNV_FROM_U_CALLBACK_SUBSTITUTE(nullptr, arguments, units, length, point, reason, error);
}

class SharedConverter {
 public:
  explicit SharedConverter(const CodePageInfo& page) : m_lock(s_mutex) {
    static std::map<UINT, UConverter*>& made = *new std::map<UINT, UConverter*>;
    UConverter*& slot = made[page.number];
    if (slot == nullptr) {
      UErrorCode error = U_ZERO_ERROR;
      slot = ucnv_open(page.converter, &error);
      if (U_SUCCESS(error)) ucnv_setSubstChars(slot, "?", 1, &error);
    }
    m_converter = slot;
    if (m_converter == nullptr) return;
    UErrorCode error = U_ZERO_ERROR;
    ucnv_reset(m_converter);
    ucnv_setFallback(m_converter, true);
    ucnv_setToUCallBack(m_converter, CountingToUnicode, &m_counter, nullptr, nullptr, &error);
    error = U_ZERO_ERROR;
    ucnv_setFromUCallBack(m_converter, CountingFromUnicode, &m_counter, nullptr, nullptr, &error);
  }

  UConverter* Get() const { return m_converter; }
  // Whether something was replaced since the last question.
  bool TakeReplaced() { return std::exchange(m_counter.replaced, 0) != 0; }

 private:
  static inline std::mutex s_mutex;

  std::lock_guard<std::mutex> m_lock;
  UConverter* m_converter = nullptr;
  Counter m_counter;
};

// Collects what a step wrote: in the caller's buffer first, then in one that is only counted.
template <class Unit, class Step>
std::size_t Collect(Unit* target, std::size_t capacity, Step step) {
  std::size_t length = 0;
  Unit spare[512];
  for (;;) {
    const bool direct = length < capacity;
    Unit* start = direct ? target + length : spare;
    Unit* limit = direct ? target + capacity : spare + 512;
    Unit* end = start;
    const bool more = step(end, limit);
    length += static_cast<std::size_t>(end - start);
    if (!more) return length;
  }
}

// Converts the pieces between NULs one by one, each from the converter's first state to its last: what is cut by
// a NUL does not swallow it. `convert` writes a piece and returns its length; false for what is invalid.
template <class From, class To, class Convert>
Decoded ConvertPieces(const From* from, std::size_t count, To* to, std::size_t capacity, Convert convert) {
  Decoded whole{0, true};
  const From* const end = from + count;
  for (;;) {
    const From* const nul = std::find(from, end, From{0});
    const std::size_t room = whole.length < capacity ? capacity - whole.length : 0;
    const Decoded piece = convert(from, nul, to + (capacity - room), room);
    whole.length += piece.length;
    whole.valid = whole.valid && piece.valid;
    if (nul == end) return whole;
    if (whole.length < capacity) to[whole.length] = 0;
    ++whole.length;
    from = nul + 1;
  }
}

// One piece; `step` is the converter's function for a direction.
template <class From, class To, class Step>
Decoded ConvertPiece(SharedConverter& converter, const From* from, const From* end, To* to, std::size_t room,
                     Step step) {
  bool failed = false;
  const std::size_t length = Collect(to, room, [&](To*& at, To* limit) {
    UErrorCode error = U_ZERO_ERROR;
    step(converter.Get(), &at, limit, &from, end, nullptr, true, &error);
    failed = U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR;
    return error == U_BUFFER_OVERFLOW_ERROR;
  });
  return {length, !failed && !converter.TakeReplaced()};
}

}  // namespace

Decoded DecodeIcu(const CodePageInfo& page, const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity) {
  SharedConverter converter(page);
  if (converter.Get() == nullptr) return {0, false};
  return ConvertPieces(bytes, count, text, capacity,
                       [&](const char* from, const char* end, WCHAR* to, std::size_t room) {
                         return ConvertPiece(converter, from, end, to, room, ucnv_toUnicode);
                       });
}

Decoded EncodeIcu(const CodePageInfo& page, const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity) {
  SharedConverter converter(page);
  if (converter.Get() == nullptr) return {0, false};
  return ConvertPieces(text, count, bytes, capacity,
                       [&](const WCHAR* from, const WCHAR* end, char* to, std::size_t room) {
                         return ConvertPiece(converter, from, end, to, room, ucnv_fromUnicode);
                       });
}

}  // namespace platform
