#include "qxcore/stream/encoding/internal/text_encoder.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/internal/utf.h"

using Support = SAbstractIO::SMultiFormatSupport;

namespace {

constexpr std::size_t kPiece = 1024;
constexpr std::size_t kBytesPerUnit = 12;  // two, behind and before the longest escapes of a page that keeps a state
constexpr std::size_t kUnmappable = static_cast<std::size_t>(-1);

// Units that the first character takes: a whole surrogate pair is one.
std::size_t UnitsOfCharacter(const WCHAR* text, std::size_t count) {
  const WCHAR* at = text;
  platform::TakeUtf16(at, text + count);
  return static_cast<std::size_t>(at - text);
}

// Each encoder returns the number of bytes, or kUnmappable when a character of the piece cannot be mapped.

std::size_t EncodeASCII(const WCHAR* text, std::size_t count, char* bytes) {
  for (std::size_t i = 0; i < count; ++i) {
    if (text[i] >= 0x80) return kUnmappable;
    bytes[i] = static_cast<char>(text[i]);
  }
  return count;
}

std::size_t EncodeUtf8(const WCHAR* text, std::size_t count, char* bytes) {
  char* out = bytes;
  for (const WCHAR *at = text, *end = text + count; at != end;) {
    const char32_t character = platform::TakeUtf16(at, end);
    if (platform::IsSurrogate(character)) return kUnmappable;
    out = platform::PutUtf8(character, out);
  }
  return static_cast<std::size_t>(out - bytes);
}

std::size_t EncodeUtf16(const WCHAR* text, std::size_t count, bool isBigEndian, char* bytes) {
  static_assert(std::endian::native == std::endian::little);
  std::memcpy(bytes, text, count * sizeof(WCHAR));
  if (isBigEndian) {
    for (std::size_t i = 0; i < count; ++i) std::swap(bytes[2 * i], bytes[2 * i + 1]);
  }
  return count * sizeof(WCHAR);
}

std::size_t EncodePage(unsigned page, const WCHAR* text, std::size_t count, char* bytes) {
  const int size = static_cast<int>(count);
  const int room = static_cast<int>(count * kBytesPerUnit);
  BOOL usedDefault = FALSE;
  int written = WideCharToMultiByte(page, WC_NO_BEST_FIT_CHARS, text, size, bytes, room, nullptr, &usedDefault);
  if (written > 0) return usedDefault ? kUnmappable : static_cast<std::size_t>(written);
  // Pages that take no flags do not report losses either: the text must come back from the bytes.
  written = WideCharToMultiByte(page, 0, text, size, bytes, room, nullptr, nullptr);
  WCHAR back[kPiece];
  int length = written > 0 ? MultiByteToWideChar(page, 0, bytes, written, back, static_cast<int>(kPiece)) : 0;
  bool isSame = length == size && std::equal(text, text + count, back);
  return isSame ? static_cast<std::size_t>(written) : kUnmappable;
}

}  // namespace

void STextEncoder::WriteMark(SOutputStream& out) const {
  if (!Support::IsUnicode(m_encoding) || (m_encoding & (Support::kOptionalBOM | Support::kRequiredBOM)) == 0) return;
  constexpr WCHAR kMark = 0xFEFF;
  char bytes[kBytesPerUnit];
  out.Write(bytes, static_cast<unsigned long>(EncodePiece(&kMark, 1, bytes)));
}

std::size_t STextEncoder::EncodePiece(const WCHAR* text, std::size_t count, char* bytes) const {
  switch (Support::KindOf(m_encoding)) {
    case Support::kASCII:
      return EncodeASCII(text, count, bytes);
    case Support::kUnicode:
      if ((m_encoding & Support::kUtf8Form) != 0) return EncodeUtf8(text, count, bytes);
      return EncodeUtf16(text, count, (m_encoding & Support::kBigEndian) != 0, bytes);
    default:
      return EncodePage(Support::CodePageOf(m_encoding), text, count, bytes);
  }
}

bool STextEncoder::IsAsInMemory() const {
  return Support::IsUnicode(m_encoding) && (m_encoding & (Support::kUtf8Form | Support::kBigEndian)) == 0;
}

void STextEncoder::Write(const WCHAR* text, std::size_t count, SOutputStream& out) {
  if (count > 0 && IsAsInMemory()) {
    out.Write(text, static_cast<unsigned long>(count * sizeof(WCHAR)));
    return;
  }
  char bytes[kPiece * kBytesPerUnit];
  while (count > 0) {
    std::size_t piece = std::min(count, kPiece);
    if (piece < count && platform::IsHighSurrogate(text[piece - 1])) --piece;
    std::size_t size = EncodePiece(text, piece, bytes);
    if (size != kUnmappable) {
      out.Write(bytes, static_cast<unsigned long>(size));
    } else {
      WriteCarefully(text, piece, out);
    }
    text += piece;
    count -= piece;
  }
}

// Character by character, because one of them cannot be mapped.
void STextEncoder::WriteCarefully(const WCHAR* text, std::size_t count, SOutputStream& out) {
  while (count > 0) {
    std::size_t units = UnitsOfCharacter(text, count);
    char bytes[2 * kBytesPerUnit];
    std::size_t size = EncodePiece(text, units, bytes);
    if (size != kUnmappable) {
      out.Write(bytes, static_cast<unsigned long>(size));
    } else if ((m_encoding & Support::kLossless) != 0) {
      ThrowLoss();
    } else {
      WriteReplacement(out);
    }
    text += units;
    count -= units;
  }
}

// A replacement that cannot be mapped either gives way to a question mark.
void STextEncoder::WriteReplacement(SOutputStream& out) {
  if (m_replacement == 0) {
    ++m_dropped;
    return;
  }
  char bytes[kBytesPerUnit];
  constexpr WCHAR kLastResort = WTEXT('?');
  std::size_t size = EncodePiece(&m_replacement, 1, bytes);
  if (size == kUnmappable) size = EncodePiece(&kLastResort, 1, bytes);
  if (size != kUnmappable) out.Write(bytes, static_cast<unsigned long>(size));
  ++m_replaced;
}

void STextEncoder::ThrowLoss() const {
  switch (Support::KindOf(m_encoding)) {
    case Support::kASCII:
      throw SEIONonASCII();
    case Support::kUnicode:
      throw SEIOCantMap_UTF16_UTF8();
    default:
      throw SEIOCantMap_UTF16_MBCS();
  }
}
