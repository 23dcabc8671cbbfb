// The stateful code pages and those of more than two bytes, through ICU's converters. One converter a
// page is kept and locked while it works; every call converts a text of its own.

#include <unicode/ucnv.h>

#include <map>
#include <mutex>

#include "qxcore/platform/posix/code_page.h"

namespace platform {
namespace {

struct Counter {
  std::size_t replaced = 0;
};

void U_CALLCONV CountingToUnicode(const void* context, UConverterToUnicodeArgs* arguments, const char* units,
                                  std::int32_t length, UConverterCallbackReason reason, UErrorCode* error) {
  if (reason <= UCNV_IRREGULAR) ++static_cast<Counter*>(const_cast<void*>(context))->replaced;
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
      if (U_SUCCESS(error) && page.number != 65000) ucnv_setSubstChars(slot, "?", 1, &error);
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
  bool Replaced() const { return m_counter.replaced != 0; }

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

}  // namespace

Decoded DecodeIcu(const CodePageInfo& page, const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity) {
  SharedConverter converter(page);
  if (converter.Get() == nullptr) return {0, false};
  const char* from = bytes;
  bool failed = false;
  const std::size_t length = Collect(text, capacity, [&](WCHAR*& at, WCHAR* limit) {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_toUnicode(converter.Get(), &at, limit, &from, bytes + count, nullptr, true, &error);
    failed = U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR;
    return error == U_BUFFER_OVERFLOW_ERROR;
  });
  return {length, !failed && !converter.Replaced()};
}

Decoded EncodeIcu(const CodePageInfo& page, const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity) {
  SharedConverter converter(page);
  if (converter.Get() == nullptr) return {0, false};
  const WCHAR* from = text;
  bool failed = false;
  const std::size_t length = Collect(bytes, capacity, [&](char*& at, char* limit) {
    UErrorCode error = U_ZERO_ERROR;
    ucnv_fromUnicode(converter.Get(), &at, limit, &from, text + count, nullptr, true, &error);
    failed = U_FAILURE(error) && error != U_BUFFER_OVERFLOW_ERROR;
    return error == U_BUFFER_OVERFLOW_ERROR;
  });
  return {length, !failed && !converter.Replaced()};
}

}  // namespace platform
