#include "qxcore/stream/encoding/internal/utf8_decoder.h"

#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/stream/encoding/internal/utf8_decoder_avx512.h"

namespace {

using platform::IsUtf8Continuation;

enum class Rules { kQuick, kBasic, kFull };

// Decodes until something stands in the way, or until `limit` is reached or passed.
template <Rules kRules>
SUtf8Run DecodeSequences(const unsigned char* in, const unsigned char* limit, const unsigned char* end, WCHAR* out) {
  while (in < limit) {
    const unsigned lead = *in;
    if (lead < 0x80) {
      std::size_t plain = SWidenASCII(in, static_cast<std::size_t>(limit - in), out);
      in += plain;
      out += plain;
    } else if (lead >= 0xC0 && lead < 0xE0) {
      if (end - in < 2) break;
      if (kRules != Rules::kQuick && (lead < 0xC2 || !IsUtf8Continuation(in[1]))) break;
      *out++ = static_cast<WCHAR>((lead & 0x1F) << 6 | (in[1] & 0x3F));
      in += 2;
    } else if (lead >= 0xE0 && lead < 0xF0) {
      if (end - in < 3) break;
      if (kRules != Rules::kQuick &&
          (!IsUtf8Continuation(in[1]) || !IsUtf8Continuation(in[2]) || (lead == 0xE0 && in[1] < 0xA0))) {
        break;
      }
      if (kRules == Rules::kFull && lead == 0xED && in[1] >= 0xA0) break;
      *out++ = static_cast<WCHAR>((lead & 0x0F) << 12 | (in[1] & 0x3F) << 6 | (in[2] & 0x3F));
      in += 3;
    } else {
      if (kRules != Rules::kFull) break;
      const platform::Utf8Step step = platform::StepUtf8(in, end);
      if (!step.isValid) break;
      out = platform::PutUtf16(step.character, out);
      in += step.length;
    }
  }
  return {in, out};
}

// Long stretches many bytes at a time, and what these cannot take, one by one.
template <Rules kRules>
SUtf8Run Decode(const unsigned char* in, const unsigned char* end, WCHAR* out) {
#if QXCORE_HAS_AVX512_DECODER
  static const bool hasAvx512 = SCanDecodeUtf8Avx512();
  constexpr std::ptrdiff_t kStretch = 128;  // behind which the block decoder is tried again
  while (hasAvx512 && end - in > kStretch) {
    SUtf8Run run = SDecodeUtf8Avx512(in, end, out, kRules == Rules::kFull);
    const unsigned char* limit = end - run.in > kStretch ? run.in + kStretch : end;
    run = DecodeSequences<kRules>(run.in, limit, end, run.out);
    in = run.in;
    out = run.out;
    if (in < limit) return run;
  }
#endif
  return DecodeSequences<kRules>(in, end, end, out);
}

}  // namespace

SUtf8Run SDecodeUtf8(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  return Decode<Rules::kBasic>(in, end, out);
}

SUtf8Run SDecodeFullUtf8(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  return Decode<Rules::kFull>(in, end, out);
}

SUtf8Run SDecodeUtf8Quick(const unsigned char* in, const unsigned char* end, WCHAR* out) {
  return DecodeSequences<Rules::kQuick>(in, end, end, out);
}
