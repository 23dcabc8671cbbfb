// Encodes UTF-16 to the bytes of a chosen encoding, into an output stream.
#pragma once

#include <cstdint>

#include "qxcore/core/memory.h"
#include "qxcore/stream/encoding/multi_format_support.h"
#include "qxcore/stream/output_stream.h"

class STextEncoder {
 public:
  using Encoding = SAbstractIO::SMultiFormatSupport::Encoding;  // see multi_format_support.h

  // Through the library's memory, like everything.
  static void* operator new(std::size_t size) { return SMemAlloc(size); }
  static void operator delete(void* block) { SMemFree(block); }

  // The target, with the lossless policy or without.
  void Select(Encoding encoding) { m_encoding = encoding; }
  Encoding GetEncoding() const { return m_encoding; }
  // What stands for characters that cannot be mapped; 0 drops them.
  void SetReplacement(WCHAR replacement) { m_replacement = replacement; }
  WCHAR GetReplacement() const { return m_replacement; }

  // Writes the byte order mark of the selected encoding, where it has one.
  void WriteMark(SOutputStream& out) const;

  // Encodes `count` characters; surrogate pairs must not be cut at the end. With the lossless policy a
  // character that cannot be mapped throws, what stands before it having been written.
  void Write(const WCHAR* text, std::size_t count, SOutputStream& out);

  // Characters that could not be mapped, by what became of them.
  std::uint64_t GetReplaced() const { return m_replaced; }
  std::uint64_t GetDropped() const { return m_dropped; }

 private:
  // Whether the bytes of the target are those of the text.
  bool IsAsInMemory() const;
  // Encodes one piece, at most kPiece characters, that ends at a character's end.
  std::size_t EncodePiece(const WCHAR* text, std::size_t count, char* bytes) const;
  void WriteCarefully(const WCHAR* text, std::size_t count, SOutputStream& out);
  void WriteReplacement(SOutputStream& out);
  [[noreturn]] void ThrowLoss() const;

  Encoding m_encoding = SAbstractIO::SMultiFormatSupport::kUTF16LE;
  WCHAR m_replacement = WTEXT('?');
  std::uint64_t m_replaced = 0;
  std::uint64_t m_dropped = 0;
};
