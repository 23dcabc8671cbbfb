#include "qxcore/stream/seekable_string_input_stream.h"

#include <cstring>

#include "qxcore/core/io_exceptions.h"

QXCORE_IMPLEMENT_CLASS(SSeekableStringInputStream, SInputStream, 0)

SSeekableStringInputStream::SSeekableStringInputStream(Reader& reader) : m_reader(reader) {}
SSeekableStringInputStream::SSeekableStringInputStream(Reader* reader, bool owns) : m_reader(reader, owns) {}
SSeekableStringInputStream::~SSeekableStringInputStream() = default;

unsigned long SSeekableStringInputStream::Read(void* buffer, unsigned long count) {
  unsigned char* out = static_cast<unsigned char*>(buffer);
  unsigned long done = 0;
  for (; done + sizeof(WCHAR) <= count; done += sizeof(WCHAR)) {
    int character = m_reader->ReadChar();
    if (character < 0) break;
    WCHAR c = static_cast<WCHAR>(character);
    std::memcpy(out + done, &c, sizeof c);
  }
  return done;
}

void SSeekableStringInputStream::Mark(unsigned long) {
  m_mark = m_reader->GetPos();
  m_hasMark = true;
}

void SSeekableStringInputStream::Reset() {
  if (!m_hasMark || m_reader->SeekPos(m_mark)) throw SEIOResetInvalid();
}
