#include "qxcore/stream/encoding/internal/utf8_decoder.h"

#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/stream/encoding/internal/utf8_decoder_avx512.h"

namespace {

using platform::IsUtf8Continuation;

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
      if (kChecked && (lead < 0xC2 || !IsUtf8Continuation(in[1]))) break;
      *out++ = static_cast<WCHAR>((lead & 0x1F) << 6 | (in[1] & 0x3F));
      in += 2;
    } else if (lead >= 0xE0 && lead < 0xF0) {
      if (end - in < 3) break;
      if (kChecked && (!IsUtf8Continuation(in[1]) || !IsUtf8Continuation(in[2]) || (lead == 0xE0 && in[1] < 0xA0)))
        break;
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
  const platform::Utf8Step step = platform::StepUtf8(in, end, platform::Utf8Surrogates::kTaken);
  return {step.length, !step.isValid, step.isCut};  // where it is valid, it is of four bytes
}
