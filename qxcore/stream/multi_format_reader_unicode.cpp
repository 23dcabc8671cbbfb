#include "qxcore/stream/multi_format_reader_unicode.h"

#include <algorithm>
#include <cstring>

#include "qxcore/string/string_buffer.h"
#include "qxcore/string/text_search.h"

QXCORE_IMPLEMENT_CLASS(SMultiFormatReaderUnicode, SMultiFormatReaderBase, 0)

using Reader = SMultiFormatReaderUnicode;

Reader::SMultiFormatReaderUnicode(SInputStream& in, Encoding requested) : SMultiFormatReaderBase(in, requested) {}
Reader::SMultiFormatReaderUnicode(SInputStream* in, Encoding requested, bool owns)
    : SMultiFormatReaderBase(in, requested, owns) {}
Reader::~SMultiFormatReaderUnicode() = default;

unsigned long Reader::Read(void* buffer, unsigned long count) {
  WCHAR* out = static_cast<WCHAR*>(buffer);
  const unsigned long wanted = count / sizeof(WCHAR);
  unsigned long done = std::min(wanted, TextLength());
  if (done > 0) {
    std::memcpy(out, TextStart(), done * sizeof(WCHAR));
    Deliver(done);
  }
  while (done < wanted) {
    unsigned long got = DecodeInto(out + done, wanted - done);
    if (got == 0) break;
    done += got;
  }
  return done * static_cast<unsigned long>(sizeof(WCHAR));
}

unsigned long Reader::Skip(unsigned long count) {
  unsigned long done = 0;
  while (done < count && (TextLength() > 0 || fetch())) {
    unsigned long passed = std::min(count - done, TextLength());
    Deliver(passed);
    done += passed;
  }
  return done;
}

bool Reader::SeekPos(unsigned long position) {
  if (position < m_delivered) return true;
  return Skip(position - m_delivered) < position - m_delivered;
}

SString Reader::ReadLn() {
  constexpr unsigned kFirstRoom = 256;
  SStringBuffer line(kFirstRoom);
  while (TextLength() > 0 || fetch()) {
    const WCHAR* start = TextStart();
    const WCHAR* lineFeed = SFindCharacter(start, TextLength(), WTEXT('\n'));
    const WCHAR* end = lineFeed != nullptr ? lineFeed : start + TextLength();
    line.Concat(start, end);
    Deliver(static_cast<unsigned long>(end - start) + (lineFeed != nullptr ? 1 : 0));
    if (lineFeed == nullptr) continue;
    SString text = line.Detach();
    if (!text.IsEmpty() && text.GetAt(text.Length() - 1) == WTEXT('\r')) text.Unlock(text.Length() - 1);
    return text;
  }
  return line.Detach();
}

SString Reader::ReadAll() {
  SStringBuffer text(8192, 2, 1);
  while (TextLength() > 0 || fetch()) {
    text.Concat(TextStart(), TextStart() + TextLength());
    Deliver(TextLength());
  }
  return text.Detach();
}

WCHAR Reader::SetReplacement(WCHAR replacement) {
  WCHAR former = m_decoder.GetReplacement();
  m_decoder.SetReplacement(replacement);
  return former;
}
