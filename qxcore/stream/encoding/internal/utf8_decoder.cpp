#include "qxcore/stream/encoding/internal/utf8_decoder.h"

#include "qxcore/stream/encoding/internal/utf8_decoder_avx512.h"
#include "qxcore/string/internal/widen.h"

namespace {

bool IsContinuation(unsigned char byte) { return (byte & 0xC0) == 0x80; }

template <bool kChecked>
SUtf8Run DecodeSequences(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  while (in != end) {
    unsigned lead = *in;
    if (lead < 0x80) {
      std::size_t plain = SWidenASCII(in, static_cast<std::size_t>(end - in), out);
      in += plain;
      out += plain;
    } else if (lead >= 0xC0 && lead < 0xE0) {
      if (end - in < 2) break;
      if (kChecked && (lead < 0xC2 || !IsContinuation(in[1]))) break;
      *out++ = static_cast<WCHAR>((lead & 0x1F) << 6 | (in[1] & 0x3F));
      in += 2;
    } else if (lead >= 0xE0 && lead < 0xF0) {
      if (end - in < 3) break;
      if (kChecked && (!IsContinuation(in[1]) || !IsContinuation(in[2]) || (lead == 0xE0 && in[1] < 0xA0))) break;
      *out++ = static_cast<WCHAR>((lead & 0x0F) << 12 | (in[1] & 0x3F) << 6 | (in[2] & 0x3F));
      in += 3;
    } else {
      break;
    }
  }
  return {in, out};
}

}  // namespace

SUtf8Run SDecodeUtf8(const unsigned char* in, const unsigned char* end, WCHAR* out) {
#if QXCORE_HAS_AVX512_DECODER
  static const bool hasAvx512 = SCanDecodeUtf8Avx512();
  if (hasAvx512) {
    SUtf8Run run = SDecodeUtf8Avx512(in, end, out);
    in = run.in;
    out = run.out;
  }
#endif
  return DecodeSequences<true>(in, end, out);
}

SUtf8Run SDecodeUtf8Quick(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  return DecodeSequences<false>(in, end, out);
}

SUtf8Obstacle SLookAtUtf8(const unsigned char* in, const unsigned char* end) {
  // The range of the second byte is what rules out overlong forms and values above U+10FFFF.
  struct Form {
    int length;
    unsigned char secondFrom, secondTo;
  };
  const unsigned char lead = *in;
  const Form form = lead >= 0xC2 && lead < 0xE0  ? Form{2, 0x80, 0xBF}
                    : lead == 0xE0               ? Form{3, 0xA0, 0xBF}
                    : lead > 0xE0 && lead < 0xF0 ? Form{3, 0x80, 0xBF}
                    : lead == 0xF0               ? Form{4, 0x90, 0xBF}
                    : lead > 0xF0 && lead < 0xF4 ? Form{4, 0x80, 0xBF}
                    : lead == 0xF4               ? Form{4, 0x80, 0x8F}
                                                 : Form{1, 0, 0};
  if (form.length == 1) return {1, true, false};
  std::ptrdiff_t length = 1;
  for (; length < form.length; ++length) {
    if (in + length == end) return {length, true, true};
    bool fits = length == 1 ? in[1] >= form.secondFrom && in[1] <= form.secondTo : IsContinuation(in[length]);
    if (!fits) return {length, true, false};
  }
  return {length, false, false};  // well-formed, but of four bytes
}
