// SInputBinaryStream: objects read themselves from a stream in the library's binary format.
// ```cpp
// SInputFile file(path);
// SInputBinaryStream in(file);
// in >> title >> names >> settings;
// ```
// The counterpart of SOutputBinaryStream; docs/binary-format.md has the bytes. Data from outside may be wrong
// or cut: no operator takes memory beyond 3 MB for a string that the stream cannot confirm, and none recurses.
// The operators throw SEEOFException where a length or a count is cut, SEIOException ("Invalid string in binary
// stream", code 0x80990040) for an impossible length, and what the wrapped stream throws. A text keeps its
// value then; a collection has what was read so far.
// Threads: a stream and the stream that it reads belong to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/container/string_map.h"
#include "qxcore/container/string_table.h"
#include "qxcore/core/object.h"
#include "qxcore/platform/export.h"
#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"

class QXCORE_API SInputBinaryStream : public SObject {
  QXCORE_DECLARE_CLASS(SInputBinaryStream)

  // Bytes of a string that are read without asking the stream whether it has as many.
  enum : std::int32_t { kConfirmAbove = 0x300000 };

  // Reads from `in`, which must stay alive; the second form deletes it at the end when `owns` is set.
  explicit SInputBinaryStream(SInputStream& in) : m_in(in) {}
  SInputBinaryStream(SInputStream* in, bool owns) : m_in(in, owns) {}
  SInputBinaryStream(const SInputBinaryStream&) = delete;
  SInputBinaryStream& operator=(const SInputBinaryStream&) = delete;
  ~SInputBinaryStream() override;

  // The wrapped stream, for the operators of other classes.
  friend SInputStream& SGetStream(SInputBinaryStream& stream) { return *stream.m_in; }

 private:
  SInnerStream<SInputStream> m_in;
};

static_assert(sizeof(void*) != 4 || sizeof(SInputBinaryStream) == 12, "the layout is public");

// A count, or any signed 32-bit number, as SWriteCount wrote it.
QXCORE_API std::int32_t SReadCount(SInputBinaryStream& stream);

// A text, up to its first zero byte. Bytes that are missing at the end of the stream cut the text silently, which
// is on purpose: the next read fails.
QXCORE_API SInputBinaryStream& operator>>(SInputBinaryStream& stream, SString& text);
// Empty the collection, then read as many items as the count says; none for a count of zero or less. A key that
// comes twice has its last value.
QXCORE_API SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringTable& table);
QXCORE_API SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringMap& map);
QXCORE_API SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringMapNoCase& map);
QXCORE_API SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringUnsortedMap& map);
QXCORE_API SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringUnsortedMapNoCase& map);
