// Decodes raw bytes of a selected encoding to UTF-16, piece by piece.
//
// A sequence that the end of a piece cuts is left for the next piece, so that how the input is handed
// out never shows in the text. No sequence gives more characters than it has bytes.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/stream/encoding/internal/code_page_table.h"
#include "qxcore/stream/encoding/multi_format_support.h"

class STextDecoder {
 public:
  using Encoding = SAbstractIO::SMultiFormatSupport::Encoding;  // see multi_format_support.h

  // Characters that could not be mapped, by what became of them.
  struct Losses {
    std::uint64_t replaced = 0;
    std::uint64_t dropped = 0;
  };

  // What Decode stopped at.
  struct Run {
    const unsigned char* in;  // first byte not used
    WCHAR* out;               // behind the last character written
    bool isLoss = false;      // at `in` stands something that cannot be mapped
  };

  // Selects the encoding and what becomes of characters that cannot be mapped: with the lossless policy
  // decoding stops at them; else they are replaced, or dropped when the replacement is 0. `quick`: UTF-8 is
  // taken for well-formed; continuation bytes are not checked.
  void Select(Encoding encoding, bool quick);
  void SetReplacement(WCHAR replacement) { m_replacement = replacement; }
  WCHAR GetReplacement() const { return m_replacement; }

  // True for the few code pages that keep a state or have longer characters: they are decoded only when the whole
  // rest of the input is there, and cannot be decoded on from where a lossless one stopped.
  bool NeedsWholeInput() const { return m_kernel == Kernel::kWhole; }

  // Decodes [in, end) to `out`, but no more than `room` characters; a surrogate pair is not cut, so that there must be
  // room for 2. For a decoder that needs the whole input `room` is at least the number of bytes. With `isLast` a
  // sequence that the end cuts cannot be mapped; without, it is left.
  Run Decode(const unsigned char* in, const unsigned char* end, bool isLast, WCHAR* out, std::size_t room);

  // The byte at which the character begins that stands behind the first `count` ones of what Decode makes of
  // [in, end); behind its whole sequence when that stands behind half of a surrogate pair. Counts losses as Decode
  // does.
  const unsigned char* Locate(const unsigned char* in, const unsigned char* end, bool isLast, std::size_t count);

  // Throws the exception for what the last Decode stopped at.
  [[noreturn]] void ThrowLoss() const;

  // The losses since the beginning, or since SetLosses.
  const Losses& GetLosses() const { return m_losses; }
  void SetLosses(const Losses& losses) { m_losses = losses; }

 private:
  enum class Kernel {
    kASCII,
    kSingleByte,
    kDoubleByte,
    kWhole,
    kUTF8,
    kFullUTF8,
    kQuickUTF8,
    kLittleEndian,
    kBigEndian
  };
  // What stands where a kernel stopped.
  struct Obstacle {
    std::ptrdiff_t length;   // 0: cut by the end of the piece
    bool isIllegal = false;  // no sequence of the encoding, rather than one without a character
    bool isNone = false;     // a sequence that decodes: the kernel had too little room
  };

  Run RunKernel(const unsigned char* in, const unsigned char* end, WCHAR* out) const;
  Obstacle Look(const unsigned char* in, const unsigned char* end, bool isLast) const;
  Run DecodeWhole(const unsigned char* in, const unsigned char* end, WCHAR* out);
  std::size_t CharactersIn(const unsigned char* in, std::ptrdiff_t bytes) const;
  const unsigned char* ShortestOf(const unsigned char* in, const unsigned char* end, std::size_t count) const;
  const unsigned char* DecodeClean(const unsigned char* in, const unsigned char* end, WCHAR* out, int count) const;
  const unsigned char* LocateInWhole(const unsigned char* in, const unsigned char* end, std::size_t count) const;

  Encoding m_encoding = 0;
  Kernel m_kernel = Kernel::kASCII;
  const SCodePageTable* m_table = nullptr;
  WCHAR m_replacement = 0xFFFD;
  bool m_isLossless = false;
  bool m_isLossIllegal = false;
  Losses m_losses;
};
