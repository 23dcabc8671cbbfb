#include "qxcore/stream/output_binary_stream.h"

#include <cstring>
#include <limits>

#include "qxcore/core/internal/working_buffer.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/string/text_conversion.h"

QXCORE_IMPLEMENT_CLASS(SOutputBinaryStream, SObject, 0)

SOutputBinaryStream::~SOutputBinaryStream() = default;

namespace {

constexpr std::size_t kLongestPrefix = 7;

// Little-endian, whatever the machine.
void Put(unsigned char* at, std::uint32_t value, int bytes) {
  for (int i = 0; i < bytes; ++i) at[i] = static_cast<unsigned char>(value >> 8 * i);
}

// Puts the length in front of the text at `text`, where there is room for the longest prefix; returns where it begins.
unsigned char* PutPrefix(unsigned char* text, std::uint32_t n) {
  if (n < 0xFF) {
    Put(text - 1, n, 1);
    return text - 1;
  }
  if (n < 0xFFFF) {
    Put(text - 3, 0xFF, 1);
    Put(text - 2, n, 2);
    return text - 3;
  }
  Put(text - 7, 0xFFFFFF, 3);
  Put(text - 4, n, 4);
  return text - 7;
}

template <class Map>
SOutputBinaryStream& WriteMap(SOutputBinaryStream& stream, const Map& map) {
  SWriteCount(stream, map.GetCount());
  for (const auto& [key, value] : map) stream << key << value;
  return stream;
}

}  // namespace

void SWriteCount(SOutputBinaryStream& stream, std::int32_t count) {
  unsigned char bytes[4];
  Put(bytes, static_cast<std::uint32_t>(count), 4);
  SGetStream(stream).Write(bytes, sizeof bytes);
}

SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SString& text) {
  const int length = text.Length();
  // Prefix and text lie in one buffer and go out in one write.
  SWorkingBuffer<unsigned char> buffer(kLongestPrefix + 3 * static_cast<std::size_t>(length) + 1);
  unsigned char* utf8 = buffer.Get() + kLongestPrefix;
  char* const first = reinterpret_cast<char*>(utf8);
  const std::size_t n = static_cast<std::size_t>(SEncodeUTF8(first, text.View()) + 1 - first);
  if (n > static_cast<std::size_t>((std::numeric_limits<std::int32_t>::max)())) {
    throw SEIOException(static_cast<HRESULT>(0x80990040), WTEXT("Invalid string in binary stream"));
  }
  unsigned char* start = PutPrefix(utf8, static_cast<std::uint32_t>(n));
  SGetStream(stream).Write(start, static_cast<unsigned long>(utf8 + n - start));
  return stream;
}

SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringTable& table) {
  SWriteCount(stream, table.GetCount());
  for (const SString& text : table) stream << text;
  return stream;
}

SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringMap& map) { return WriteMap(stream, map); }
SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringMapNoCase& map) {
  return WriteMap(stream, map);
}
SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringUnsortedMap& map) {
  return WriteMap(stream, map);
}
SOutputBinaryStream& operator<<(SOutputBinaryStream& stream, const SStringUnsortedMapNoCase& map) {
  return WriteMap(stream, map);
}
