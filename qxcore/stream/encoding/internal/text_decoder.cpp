#include "qxcore/stream/encoding/internal/text_decoder.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/stream/encoding/internal/single_byte_decoder.h"
#include "qxcore/stream/encoding/internal/utf8_decoder.h"

using Support = SAbstractIO::SMultiFormatSupport;
using Run = STextDecoder::Run;

namespace {

constexpr HRESULT kUnexpected = static_cast<HRESULT>(0x80990061);  // the code of text 217

// --- kernels: each decodes as far as all is well and stops where it is not ---

Run DecodeASCII(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  std::size_t plain = SWidenASCII(in, static_cast<std::size_t>(end - in), out);
  return {in + plain, out + plain};
}

Run DecodeSingleByte(const SCodePageTable& table, const unsigned char* in, const unsigned char* end, WCHAR* out) {
  SSingleByteRun run =
      SDecodeSingleByte(table.Singles(), SCodePageTable::kNone, table.IsASCIICompatible(), in, end, out);
  return {run.in, run.out};
}

Run DecodeDoubleByte(const SCodePageTable& table, const unsigned char* in, const unsigned char* end, WCHAR* out) {
  const bool skipsASCII = table.IsASCIICompatible();
  while (in != end) {
    if (skipsASCII && *in < 0x80) {
      std::size_t plain = SWidenASCII(in, static_cast<std::size_t>(end - in), out);
      in += plain;
      out += plain;
      if (in == end) break;
    }
    WCHAR c;
    if (table.IsLead(*in)) {
      if (end - in < 2) break;
      c = table.Trails(*in)[in[1]];
      if (c == SCodePageTable::kNone) break;
      in += 2;
    } else {
      c = table.Single(*in);
      if (c == SCodePageTable::kNone) break;
      ++in;
    }
    *out++ = c;
  }
  return {in, out};
}

Run DecodeLittleEndian(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  static_assert(std::endian::native == std::endian::little);
  std::size_t characters = static_cast<std::size_t>(end - in) / 2;
  std::memcpy(out, in, characters * sizeof(WCHAR));
  return {in + characters * 2, out + characters};
}

Run DecodeBigEndian(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  Run run = DecodeLittleEndian(in, end, out);
  SSwapBytes(out, static_cast<std::size_t>(run.out - out));
  return run;
}

}  // namespace

void STextDecoder::Select(Encoding encoding, bool quick) {
  m_encoding = encoding;
  m_isLossless = (encoding & Support::kLossless) != 0;
  m_table = nullptr;
  switch (Support::KindOf(encoding)) {
    case Support::kASCII:
      m_kernel = Kernel::kASCII;
      break;
    case Support::kUnicode:
      m_kernel = (encoding & Support::kUtf8Form) == 0
                     ? ((encoding & Support::kBigEndian) != 0 ? Kernel::kBigEndian : Kernel::kLittleEndian)
                 : quick                                   ? Kernel::kQuickUTF8
                 : (encoding & Support::kFullUnicode) != 0 ? Kernel::kFullUTF8
                                                           : Kernel::kUTF8;
      break;
    default:
      m_table = SCodePageTable::Get(Support::CodePageOf(encoding));
      m_kernel = m_table == nullptr ? Kernel::kWhole : m_table->HasLeads() ? Kernel::kDoubleByte : Kernel::kSingleByte;
  }
}

Run STextDecoder::RunKernel(const unsigned char* in, const unsigned char* end, WCHAR* out) const {
  switch (m_kernel) {
    case Kernel::kASCII:
      return DecodeASCII(in, end, out);
    case Kernel::kSingleByte:
      return DecodeSingleByte(*m_table, in, end, out);
    case Kernel::kDoubleByte:
      return DecodeDoubleByte(*m_table, in, end, out);
    case Kernel::kUTF8: {
      SUtf8Run run = SDecodeUtf8(in, end, out);
      return {run.in, run.out};
    }
    case Kernel::kFullUTF8: {
      SUtf8Run run = SDecodeFullUtf8(in, end, out);
      return {run.in, run.out};
    }
    case Kernel::kQuickUTF8: {
      SUtf8Run run = SDecodeUtf8Quick(in, end, out);
      return {run.in, run.out};
    }
    case Kernel::kBigEndian:
      return DecodeBigEndian(in, end, out);
    case Kernel::kLittleEndian:
    case Kernel::kWhole:
      break;
  }
  return DecodeLittleEndian(in, end, out);
}

STextDecoder::Obstacle STextDecoder::Look(const unsigned char* in, const unsigned char* end, bool isLast) const {
  const auto surrogates =
      m_kernel == Kernel::kFullUTF8 ? platform::Utf8Surrogates::kRefused : platform::Utf8Surrogates::kTaken;
  switch (m_kernel) {
    case Kernel::kQuickUTF8: {
      // Its continuation bytes are not looked at, only whether they are there.
      const std::ptrdiff_t wanted = *in < 0xC0 || *in >= 0xF0 ? 0 : *in < 0xE0 ? 2 : 3;
      if (wanted > 0 && end - in >= wanted) return {wanted, false, true};
      if (wanted > 0 && !isLast) return {0};
      [[fallthrough]];
    }
    case Kernel::kUTF8:
    case Kernel::kFullUTF8: {
      const platform::Utf8Step step = platform::StepUtf8(in, end, surrogates);
      if (step.isCut && !isLast) return {0};
      const bool isTaken = step.isValid && (step.length < 4 || m_kernel == Kernel::kFullUTF8);
      return {step.length, !step.isValid, isTaken};
    }
    case Kernel::kDoubleByte:
      if (!m_table->IsLead(*in)) return {1, true};
      if (end - in < 2) return {isLast ? 1 : 0, true};
      if (m_table->Trails(*in)[in[1]] != SCodePageTable::kNone) return {2, false, true};
      // An ASCII byte behind a lead byte with which it makes no character stands for itself.
      return in[1] < 0x80 ? Obstacle{1, true} : Obstacle{2};
    case Kernel::kLittleEndian:
    case Kernel::kBigEndian:
      if (end - in >= 2) return {2, false, true};
      return {isLast ? end - in : 0, true};  // half a character
    default:
      return {1, m_kernel != Kernel::kSingleByte};
  }
}

Run STextDecoder::Decode(const unsigned char* in, const unsigned char* end, bool isLast, WCHAR* out, std::size_t room) {
  if (m_kernel == Kernel::kWhole) return isLast ? DecodeWhole(in, end, out) : Run{in, out};
  WCHAR* const outEnd = out + room;
  for (;;) {
    // As no sequence gives more characters than it has bytes, as many bytes as there is room cannot be too many.
    const unsigned char* stop =
        in + std::min<std::size_t>(static_cast<std::size_t>(end - in), static_cast<std::size_t>(outEnd - out));
    Run run = RunKernel(in, stop, out);
    in = run.in;
    out = run.out;
    if (in == end || out == outEnd) return run;
    if (in == stop) continue;
    const Obstacle obstacle = Look(in, end, isLast);
    if (obstacle.length == 0) return run;
    if (obstacle.isNone) {
      const bool isPair = m_kernel == Kernel::kFullUTF8 && obstacle.length == 4;
      if (isPair && outEnd - out < 2) return run;
      run = RunKernel(in, in + obstacle.length, out);
      in = run.in;
      out = run.out;
      continue;
    }
    if (m_isLossless) {
      m_isLossIllegal = obstacle.isIllegal;
      run.isLoss = true;
      return run;
    }
    if (m_replacement != 0) {
      *out++ = m_replacement;
      ++m_losses.replaced;
    } else {
      ++m_losses.dropped;
    }
    in += obstacle.length;
    if (in == end || out == outEnd) return {in, out};
  }
}

const unsigned char* STextDecoder::Locate(const unsigned char* in, const unsigned char* end, bool isLast,
                                          std::size_t count) {
  if (m_kernel == Kernel::kWhole) return LocateInWhole(in, end, count);
  constexpr std::size_t kPiece = 512;
  WCHAR passed[kPiece];
  while (count > 0) {
    // With room for one only, a surrogate pair would not be decoded at all.
    Run run = Decode(in, end, isLast, passed, count == 1 ? 1 : std::min(count, kPiece));
    if (run.in == in) run = Decode(in, end, isLast, passed, 2);
    if (run.in == in) break;
    in = run.in;
    count -= std::min(count, static_cast<std::size_t>(run.out - passed));
  }
  return in;
}

// The platform's conversion puts U+FFFD where it has no character.
Run STextDecoder::DecodeWhole(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  int room = static_cast<int>(end - in);
  unsigned page = Support::CodePageOf(m_encoding);
  SetLastError(0);
  int length = MultiByteToWideChar(page, 0, reinterpret_cast<const char*>(in), room, out, room);
  // Escapes alone are no text; an error is one that must not pass for the end of the data.
  if (length == 0 && GetLastError() != 0) throw SEEncodingException(kUnexpected, 217);
  WCHAR* written = out;
  for (int i = 0; i < length; ++i) {
    if (out[i] != platform::kReplacementCharacter) {
      *written++ = out[i];
    } else if (m_isLossless) {
      m_isLossIllegal = true;
      return {DecodeClean(in, end, out, i), written, true};
    } else if (m_replacement != 0) {
      *written++ = m_replacement;
      ++m_losses.replaced;
    } else {
      ++m_losses.dropped;
    }
  }
  return {end, written};
}

// How many characters the first bytes of a text have by the platform's conversion.
std::size_t STextDecoder::CharactersIn(const unsigned char* in, std::ptrdiff_t bytes) const {
  return static_cast<std::size_t>(MultiByteToWideChar(
      Support::CodePageOf(m_encoding), 0, reinterpret_cast<const char*>(in), static_cast<int>(bytes), nullptr, 0));
}

// The end of the shortest beginning of the bytes that has so many characters: its length is found by halving.
const unsigned char* STextDecoder::ShortestOf(const unsigned char* in, const unsigned char* end,
                                              std::size_t count) const {
  std::ptrdiff_t less = 0, enough = end - in;
  if (count == 0) return in;
  while (enough - less > 1) {
    const std::ptrdiff_t middle = less + (enough - less) / 2;
    (CharactersIn(in, middle) < count ? less : enough) = middle;
  }
  return in + enough;
}

// Decodes the first `count` characters, which can all be mapped, once more; returns the end of their bytes.
const unsigned char* STextDecoder::DecodeClean(const unsigned char* in, const unsigned char* end, WCHAR* out,
                                               int count) const {
  const unsigned char* at = ShortestOf(in, end, static_cast<std::size_t>(count));
  for (; at != end && count > 0; ++at) {  // cut, the last of them would not be itself
    const int length = MultiByteToWideChar(Support::CodePageOf(m_encoding), 0, reinterpret_cast<const char*>(in),
                                           static_cast<int>(at - in), out, static_cast<int>(end - in));
    if (length == count && std::find(out, out + count, platform::kReplacementCharacter) == out + count) break;
  }
  return at;
}

const unsigned char* STextDecoder::LocateInWhole(const unsigned char* in, const unsigned char* end,
                                                 std::size_t count) const {
  const unsigned char* found = ShortestOf(in, end, count);
  if (count == 0) return found;
  // A character that is cut may count as one already: its other bytes add none.
  while (found != end && CharactersIn(in, found + 1 - in) == CharactersIn(in, found - in)) ++found;
  return found;
}

void STextDecoder::ThrowLoss() const {
  const auto code = [](std::uint32_t value) { return static_cast<HRESULT>(value); };
  switch (Support::KindOf(m_encoding)) {
    case Support::kASCII:
      throw SEIONonASCII();
    case Support::kOEM:
      throw SEIOCantMap_OEM_UTF16();
    case Support::kANSI:
      if (m_isLossIllegal) throw SEIOCantMap_MBCS_UTF16(code(0x8099005C), 212);
      throw SEIOCantMap_MBCS_UTF16();
    default:
      if ((m_encoding & Support::kUtf8Form) == 0) throw SEEncodingException(kUnexpected, 217);
      if (m_isLossIllegal) throw SEIOCantMap_UTF8_UTF16(code(0x8099005D), 213);
      throw SEIOCantMap_UTF8_UTF16();
  }
}
