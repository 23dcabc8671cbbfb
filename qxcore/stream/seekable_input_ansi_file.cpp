#include "qxcore/stream/seekable_input_ansi_file.h"

#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"
#include "qxcore/string/text_conversion.h"

QXCORE_IMPLEMENT_CLASS(SSeekableInputANSIFile, SInputStream, 0)

SAbstractIO::SIOSeekableCharReader::~SIOSeekableCharReader() = default;

SSeekableInputANSIFile::SSeekableInputANSIFile(const SString& path, SProgressIndicatorEx* progress)
    : SFileProgressHelper(path, progress) {}
SSeekableInputANSIFile::~SSeekableInputANSIFile() = default;

int SSeekableInputANSIFile::ReadChar() {
  int lead = ReadByte();
  if (lead < 0x80) return lead;
  char bytes[2] = {static_cast<char>(lead), 0};
  int count = 1;
  if (IsDBCSLeadByteEx(CP_ACP, static_cast<BYTE>(lead))) {
    int trail = ReadByte();
    if (trail >= 0) bytes[count++] = static_cast<char>(trail);
  }
  WCHAR text[4];
  return MultiByteToWideChar(CP_ACP, 0, bytes, count, text, 4) > 0 ? text[0] : 0;
}

SString SSeekableInputANSIFile::ReadLn() {
  // The bytes of the line are gathered first: a double-byte character must be converted whole.
  struct Bytes {
    char* block = nullptr;
    std::size_t size = 0;
    std::size_t room = 0;
    ~Bytes() { SMemFree(block); }
    void Add(char byte) {
      if (size == room) {
        room = room * 2 + 256;
        block = static_cast<char*>(SMemRealloc(block, room));
      }
      block[size++] = byte;
    }
  } line;
  constexpr std::size_t kLongestLine = 0x3FFFFE00;  // what a string can hold
  const std::uint64_t start = Position();
  int byte;
  while ((byte = ReadByteOf(start)) >= 0 && byte != '\n') {
    if (line.size == kLongestLine && GoBackTo(start)) throw SEOutOfMemory();
    line.Add(static_cast<char>(byte));
  }
  if (byte == '\n' && line.size > 0 && line.block[line.size - 1] == '\r') --line.size;
  if (line.size == 0) return SString();
  int size = static_cast<int>(line.size);
  int length = MultiByteToWideChar(CP_ACP, 0, line.block, size, nullptr, 0);
  SString text;
  WCHAR* buffer = text.Lock(length);
  text.Unlock(MultiByteToWideChar(CP_ACP, 0, line.block, size, buffer, length));
  return text;
}
