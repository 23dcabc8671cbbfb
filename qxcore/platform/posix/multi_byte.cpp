// MultiByteToWideChar and WideCharToMultiByte: the checks, and the choice of the codec.

#include <unicode/unorm2.h>

#include <algorithm>
#include <cstring>
#include <string>

#include "qxcore/platform/posix/code_page.h"
#include "qxcore/platform/posix/failure.h"
#include "qxcore/platform/posix/table_codec.h"

namespace {

using namespace platform;

// The pages whose conversions take no flags.
bool TakesNoFlags(UINT page) {
  switch (page) {
    case 42:
    case 50220:
    case 50221:
    case 50222:
    case 50225:
    case 50227:
    case 50229:
    case 52936:
    case 54936:
    case 65000:
      return true;
    default:
      return page >= 57002 && page <= 57011;
  }
}

bool DecodeFlagsAllowed(UINT page, DWORD flags) {
  if (TakesNoFlags(page)) return flags == 0;
  if (page == CP_UTF8) return (flags & ~MB_ERR_INVALID_CHARS) == 0;
  // Decomposed output and glyphs for control characters are not offered.
  return (flags & ~(MB_PRECOMPOSED | MB_ERR_INVALID_CHARS)) == 0;
}

bool EncodeFlagsAllowed(UINT page, DWORD flags) {
  if (TakesNoFlags(page)) return page == 54936 ? (flags & ~WC_ERR_INVALID_CHARS) == 0 : flags == 0;
  if (page == CP_UTF8) return (flags & ~WC_ERR_INVALID_CHARS) == 0;
  return (flags & ~(WC_COMPOSITECHECK | WC_DISCARDNS | WC_SEPCHARS | WC_DEFAULTCHAR | WC_NO_BEST_FIT_CHARS)) == 0;
}

// The end of both directions: query, too small, or the length.
int Finish(const Decoded& result, std::size_t capacity) {
  if (result.length > 0x7FFFFFFF) return FailWith<int>(ERROR_INVALID_PARAMETER);
  if (capacity != 0 && result.length > capacity) return FailWith<int>(ERROR_INSUFFICIENT_BUFFER);
  return static_cast<int>(result.length);
}

Decoded DecodeSymbol(const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity) {
  for (std::size_t i = 0; i < count && i < capacity; ++i) {
    const std::uint8_t byte = static_cast<std::uint8_t>(bytes[i]);
    text[i] = static_cast<WCHAR>(byte < 0x20 ? byte : 0xF000 + byte);
  }
  return {count, true};
}

Decoded EncodeSymbol(const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity) {
  bool valid = true;
  for (std::size_t i = 0; i < count; ++i) {
    const bool known = text[i] < 0x20 || (text[i] >= 0xF020 && text[i] <= 0xF0FF);
    valid = valid && known;
    if (i < capacity) bytes[i] = static_cast<char>(text[i]);
  }
  return {count, valid};
}

int Decode(const CodePageInfo& page, DWORD flags, const char* bytes, std::size_t count, WCHAR* text,
           std::size_t capacity) {
  const bool strict = (flags & MB_ERR_INVALID_CHARS) != 0;
  Decoded result{0, true};
  switch (page.kind) {
    case CodePageKind::kTable: {
      const DecodeTable& table = GetDecodeTable(page);
      if (capacity != 0) {
        result = DecodeTableText(table, bytes, count, text, capacity);
      } else if (table.doubles != nullptr || strict) {
        result = MeasureTable(table, bytes, count);
      } else {
        result.length = count;
      }
      break;
    }
    case CodePageKind::kUtf7:
      result = DecodeUtf7(bytes, count, text, capacity);
      break;
    case CodePageKind::kUtf8:
      result = DecodeUtf8(bytes, count, text, capacity, strict);
      break;
    case CodePageKind::kIcu:
      result = DecodeIcu(page, bytes, count, text, capacity);
      break;
    case CodePageKind::kSymbol:
      result = DecodeSymbol(bytes, count, text, capacity);
      break;
  }
  if (strict && !result.valid) return FailWith<int>(ERROR_NO_UNICODE_TRANSLATION);
  return Finish(result, capacity);
}

// Base letters with their accents joined, where Unicode has the joint letter.
std::u16string Compose(const WCHAR* text, std::size_t count) {
  UErrorCode error = U_ZERO_ERROR;
  const UNormalizer2* composer = unorm2_getNFCInstance(&error);
  std::u16string composed(count * 3, u'\0');
  const std::int32_t length = unorm2_normalize(composer, text, static_cast<std::int32_t>(count), composed.data(),
                                               static_cast<std::int32_t>(composed.size()), &error);
  if (U_FAILURE(error)) return std::u16string(text, count);
  composed.resize(static_cast<std::size_t>(length));
  return composed;
}

// The default's code on the page; what the caller named, else the page's.
std::uint16_t DefaultCode(const CodePageInfo& page, const char* named) {
  if (named == nullptr || *named == 0) return page.defaultByte;
  const std::uint8_t first = static_cast<std::uint8_t>(named[0]);
  return page.maxBytes == 2 && page.IsLead(first) && named[1] != 0
             ? static_cast<std::uint16_t>(first << 8 | static_cast<std::uint8_t>(named[1]))
             : first;
}

int Encode(const CodePageInfo& page, DWORD flags, const WCHAR* text, std::size_t count, char* bytes,
           std::size_t capacity, const char* defaultChar, BOOL* usedDefault) {
  Decoded result{0, true};
  switch (page.kind) {
    case CodePageKind::kTable: {
      std::u16string composed;
      const bool marks =
          (flags & WC_COMPOSITECHECK) != 0 && std::any_of(text, text + count, [](WCHAR c) { return c >= 0x300; });
      if (marks) {
        composed = Compose(text, count);
        text = composed.data();
        count = composed.size();
      }
      const EncodeOptions options{(flags & WC_NO_BEST_FIT_CHARS) == 0, DefaultCode(page, defaultChar)};
      result = EncodeTableText(GetEncodeTable(page), options, text, count, bytes, capacity);
      if (usedDefault != nullptr) *usedDefault = !result.valid;
      break;
    }
    case CodePageKind::kUtf7:
      result = EncodeUtf7(text, count, bytes, capacity);
      break;
    case CodePageKind::kUtf8:
      result = EncodeUtf8(text, count, bytes, capacity);
      if ((flags & WC_ERR_INVALID_CHARS) != 0 && !result.valid) return FailWith<int>(ERROR_NO_UNICODE_TRANSLATION);
      break;
    case CodePageKind::kIcu:
      result = EncodeIcu(page, text, count, bytes, capacity);
      if ((flags & WC_ERR_INVALID_CHARS) != 0 && !result.valid) return FailWith<int>(ERROR_NO_UNICODE_TRANSLATION);
      if (usedDefault != nullptr) *usedDefault = !result.valid;
      break;
    case CodePageKind::kSymbol:
      result = EncodeSymbol(text, count, bytes, capacity);
      if (!result.valid) return FailWith<int>(ERROR_NO_UNICODE_TRANSLATION);
      break;
  }
  return Finish(result, capacity);
}

}  // namespace

int MultiByteToWideChar(UINT number, DWORD flags, LPCSTR bytes, int count, LPWSTR text, int capacity) {
  if (bytes == nullptr || count == 0 || capacity < 0 || (capacity > 0 && text == nullptr) ||
      static_cast<const void*>(bytes) == text)
    return FailWith<int>(ERROR_INVALID_PARAMETER);
  const CodePageInfo* page = FindCodePage(ResolveCodePage(number));
  if (page == nullptr) return FailWith<int>(ERROR_INVALID_PARAMETER);
  if (!DecodeFlagsAllowed(page->number, flags)) return FailWith<int>(ERROR_INVALID_FLAGS);
  const std::size_t length = count < 0 ? std::strlen(bytes) + 1 : static_cast<std::size_t>(count);
  return Guarded(0, [&] { return Decode(*page, flags, bytes, length, text, static_cast<std::size_t>(capacity)); });
}

int WideCharToMultiByte(UINT number, DWORD flags, LPCWSTR text, int count, LPSTR bytes, int capacity,
                        LPCSTR defaultChar, LPBOOL usedDefault) {
  if (text == nullptr || count == 0 || capacity < 0 || (capacity > 0 && bytes == nullptr) ||
      static_cast<const void*>(bytes) == text)
    return FailWith<int>(ERROR_INVALID_PARAMETER);
  const CodePageInfo* page = FindCodePage(ResolveCodePage(number));
  if (page == nullptr) return FailWith<int>(ERROR_INVALID_PARAMETER);
  if (!EncodeFlagsAllowed(page->number, flags)) return FailWith<int>(ERROR_INVALID_FLAGS);
  const bool noDefaults = page->number == CP_UTF8 || page->number == CP_UTF7 || page->kind == CodePageKind::kSymbol;
  if (noDefaults && (defaultChar != nullptr || usedDefault != nullptr)) return FailWith<int>(ERROR_INVALID_PARAMETER);
  const std::size_t length = count < 0 ? std::char_traits<WCHAR>::length(text) + 1 : static_cast<std::size_t>(count);
  return Guarded(0, [&] {
    return Encode(*page, flags, text, length, bytes, static_cast<std::size_t>(capacity), defaultChar, usedDefault);
  });
}
