#include "qxcore/stream/encoding/internal/text_decoder.h"

#include <algorithm>
#include <bit>
#include <cstring>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/stream/encoding/internal/single_byte_decoder.h"
#include "qxcore/stream/encoding/internal/utf8_decoder.h"

using Support = SAbstractIO::SMultiFormatSupport;
using Run = STextDecoder::Run;

namespace {

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
      m_kernel = (encoding & Support::kUtf8Form) != 0    ? (quick ? Kernel::kQuickUTF8 : Kernel::kUTF8)
                 : (encoding & Support::kBigEndian) != 0 ? Kernel::kBigEndian
                                                         : Kernel::kLittleEndian;
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
  switch (m_kernel) {
    case Kernel::kQuickUTF8:
      // As its continuation bytes are not looked at, a sequence stops the kernel only when some are missing.
      if (*in >= 0xC0 && *in < 0xF0 && !isLast) return {0, false};
      [[fallthrough]];
    case Kernel::kUTF8: {
      SUtf8Obstacle obstacle = SLookAtUtf8(in, end);
      if (obstacle.isCut && !isLast) return {0, false};
      return {obstacle.length, obstacle.isIllegal};
    }
    case Kernel::kDoubleByte:
      if (!m_table->IsLead(*in)) return {1, true};
      if (end - in < 2) return {isLast ? 1 : 0, true};
      // An ASCII byte behind a lead byte with which it makes no character stands for itself.
      return in[1] < 0x80 ? Obstacle{1, true} : Obstacle{2, false};
    case Kernel::kLittleEndian:
    case Kernel::kBigEndian:
      return {isLast ? end - in : 0, true};  // half a character
    default:
      return {1, m_kernel != Kernel::kSingleByte};
  }
}

Run STextDecoder::Decode(const unsigned char* in, const unsigned char* end, bool isLast, WCHAR* out) {
  if (m_kernel == Kernel::kWhole) return isLast ? DecodeWhole(in, end, out) : Run{in, out};
  for (;;) {
    Run run = RunKernel(in, end, out);
    if (run.in == end) return run;
    Obstacle obstacle = Look(run.in, end, isLast);
    if (obstacle.length == 0) return run;
    if (m_isLossless) {
      m_isLossIllegal = obstacle.isIllegal;
      run.isLoss = true;
      return run;
    }
    if (m_replacement != 0) {
      *run.out++ = m_replacement;
      ++m_replaced;
    } else {
      ++m_dropped;
    }
    in = run.in + obstacle.length;
    out = run.out;
  }
}

// The platform's conversion puts U+FFFD where it has no character.
Run STextDecoder::DecodeWhole(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  constexpr WCHAR kPlatformReplacement = 0xFFFD;
  int room = static_cast<int>(end - in);
  unsigned page = Support::CodePageOf(m_encoding);
  SetLastError(0);
  int length = MultiByteToWideChar(page, 0, reinterpret_cast<const char*>(in), room, out, room);
  // Escapes alone are no text; an error is one that must not pass for the end of the data.
  if (length == 0 && GetLastError() != 0) throw SEEncodingException(static_cast<HRESULT>(0x80990067), 217);
  WCHAR* written = out;
  for (int i = 0; i < length; ++i) {
    if (out[i] != kPlatformReplacement) {
      *written++ = out[i];
    } else if (m_isLossless) {
      m_isLossIllegal = true;
      return {in, out, true};
    } else if (m_replacement != 0) {
      *written++ = m_replacement;
      ++m_replaced;
    } else {
      ++m_dropped;
    }
  }
  return {end, written};
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
      if ((m_encoding & Support::kUtf8Form) == 0) throw SEEncodingException(code(0x80990067), 217);
      if (m_isLossIllegal) throw SEIOCantMap_UTF8_UTF16(code(0x8099005D), 213);
      throw SEIOCantMap_UTF8_UTF16();
  }
}
