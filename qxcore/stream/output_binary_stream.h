// SOutputBinaryStream: objects write themselves to a stream in the library's binary format.
// ```cpp
// SOutputFile file(path);
// SOutputBinaryStream out(file);
// out << title << names << settings;
// ```
// Every class that can be written has an operator<< of its own, which takes the stream first and returns
// it. All numbers are little-endian on every target; docs/binary-format.md has the bytes. The operators
// throw what the wrapped stream throws, and SEOutOfMemory for a working buffer; what was written before stays.
// Threads: a stream and the stream that it writes belong to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/container/string_map.h"
#include "qxcore/container/string_table.h"
#include "qxcore/core/object.h"
#include "qxcore/platform/export.h"
#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/output_stream.h"

class QXCORE_API SOutputBinaryStream : public SObject {
  QXCORE_DECLARE_CLASS(SOutputBinaryStream)

  // Writes to `out`, which must stay alive; the second form deletes it at the end when `owns` is set. Nothing
  // is flushed or closed at the end.
  explicit SOutputBinaryStream(SOutputStream& out) : m_out(out) {}
  SOutputBinaryStream(SOutputStream* out, bool owns) : m_out(out, owns) {}
  SOutputBinaryStream(const SOutputBinaryStream&) = delete;
  SOutputBinaryStream& operator=(const SOutputBinaryStream&) = delete;
  ~SOutputBinaryStream() override;

  // The wrapped stream, for the operators of other classes.
  friend SOutputStream& SGetStream(SOutputBinaryStream& stream) { return *stream.m_out; }

 private:
  SInnerStream<SOutputStream> m_out;
};

static_assert(sizeof(void*) != 4 || sizeof(SOutputBinaryStream) == 12, "the layout is public");

// A count, or any signed 32-bit number: four bytes. No operator, for any integer would find it.
QXCORE_API void SWriteCount(SOutputBinaryStream& stream, std::int32_t count);

// The text up to its first NUL, in the library's form of UTF-8 (see ST2UTF8Helper), with its length before
// and a zero byte behind it. Texts of 2^31 bytes and more throw SEIOException "Invalid string in binary stream"
// before anything is written.
QXCORE_API SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SString& text);
// The number of strings, then the strings in their order.
QXCORE_API SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringTable& table);
// The number of entries, then key and value of each in the map's order: ascending for the first two, that
// of insertion for the others.
QXCORE_API SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringMap& map);
QXCORE_API SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringMapNoCase& map);
QXCORE_API SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringUnsortedMap& map);
QXCORE_API SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringUnsortedMapNoCase& map);
