#include "qxcore/stream/input_binary_stream.h"

#include <string_view>
#include <utility>

#include "qxcore/core/internal/working_buffer.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/internal/read_fully.h"
#include "qxcore/string/text_conversion.h"

QXCORE_IMPLEMENT_CLASS(SInputBinaryStream, SObject, 0)

SInputBinaryStream::~SInputBinaryStream() = default;

namespace {

// An unsigned little-endian number; throws SEEOFException where it is cut.
std::uint32_t ReadNumber(SInputStream& in, unsigned long bytes) {
  unsigned char number[4] = {};
  if (SReadFully(in, number, bytes) != bytes) throw SEEOFException();
  return number[0] | std::uint32_t{number[1]} << 8 | std::uint32_t{number[2]} << 16 | std::uint32_t{number[3]} << 24;
}

std::int32_t ReadLength(SInputStream& in) {
  unsigned char first;
  if (in.Read(&first, 1) != 1) throw SEEOFException();
  if (first != 0xFF) return first;
  std::uint32_t n = ReadNumber(in, 2);
  if (n == 0xFFFF) n = ReadNumber(in, 4);
  return static_cast<std::int32_t>(n);
}

bool IsPlausible(SInputStream& in, std::int32_t n) {
  if (n < 0) return false;
  return n <= SInputBinaryStream::kConfirmAbove || in.Available() >= static_cast<unsigned long>(n);
}

// Whether a text of n characters belongs into the buffer that is there: not where it would hold much more.
bool Suits(const SString& buffer, int n) {
  const int room = buffer.GetAllocLength();
  return room >= n && room / 4 <= n;
}

// Fills the text with what n bytes, or as many as came, stand for. Returns whether all of its room was needed: most
// texts are plain, and then have as many characters as bytes but for the zero. Else one in two or three bytes ends it,
// too.
bool Fill(SString& text, std::string_view bytes, int n) {
  WCHAR* characters = text.GetBufferSetLength(n);
  const int length = static_cast<int>(SDecodeUTF8(characters, bytes) - characters);
  const bool isPlain = length == n - 1 && bytes.size() == static_cast<std::size_t>(n) && bytes.back() == 0;
  text.Unlock(isPlain ? length : -1);
  return isPlain;
}

void ReadText(SInputStream& in, int n, SString& text) {
  SWorkingBuffer<char> buffer(static_cast<std::size_t>(n));
  const std::string_view bytes(buffer.Get(), SReadFully(in, buffer.Get(), static_cast<unsigned long>(n)));
  if (Suits(text, n)) {
    Fill(text, bytes, n);
    return;
  }
  SString made;
  const bool isFull = Fill(made, bytes, n);
  text = isFull ? std::move(made) : SString(made.GetSafePointer());  // the room that was too much goes back
}

template <class Map>
SInputBinaryStream& ReadMap(SInputBinaryStream& stream, Map& map) {
  map.Clear();
  for (std::int32_t left = SReadCount(stream); left > 0; --left) {
    SString key, value;
    stream >> key >> value;
    map.Add(key, value);
  }
  return stream;
}

}  // namespace

std::int32_t SReadCount(SInputBinaryStream& stream) {
  return static_cast<std::int32_t>(ReadNumber(SGetStream(stream), 4));
}

SInputBinaryStream& operator>>(SInputBinaryStream& stream, SString& text) {
  SInputStream& in = SGetStream(stream);
  const std::int32_t n = ReadLength(in);
  if (!IsPlausible(in, n)) {
    throw SEIOException(static_cast<HRESULT>(0x80990040), WTEXT("Invalid string in binary stream"));
  }
  if (n == 0) {
    text = SString();
  } else {
    ReadText(in, n, text);
  }
  return stream;
}

SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringTable& table) {
  table.Clear();
  for (std::int32_t left = SReadCount(stream); left > 0; --left) {
    SString text;
    stream >> text;
    table.Add(text);
  }
  return stream;
}

SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringMap& map) { return ReadMap(stream, map); }
SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringMapNoCase& map) { return ReadMap(stream, map); }
SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringUnsortedMap& map) { return ReadMap(stream, map); }
SInputBinaryStream& operator>>(SInputBinaryStream& stream, SStringUnsortedMapNoCase& map) {
  return ReadMap(stream, map);
}
