#include "qxcore/stream/encoding/multi_format_reader_unicode.h"

#include <algorithm>
#include <cstring>

#include "qxcore/stream/encoding/internal/reader_state.h"
#include "qxcore/string/internal/text_search.h"
#include "qxcore/string/string_buffer.h"

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
  try {
    if (done < wanted) m_failure.Throw();
    while (done < wanted) {
      unsigned long got = DecodeInto(out + done, wanted - done);
      if (got == 0) break;
      done += got;
    }
  } catch (...) {
    if (done == 0) throw;
    m_failure.Keep();
  }
  return done * static_cast<unsigned long>(sizeof(WCHAR));
}

// True when characters are there. A failure after `hasSome` is kept for the next read.
bool Reader::FetchMore(bool hasSome) {
  if (TextLength() > 0) return true;
  try {
    return fetch();
  } catch (...) {
    if (!hasSome) throw;
    m_failure.Keep();
    return false;
  }
}

void Reader::SetFormat(Encoding requested) {
  m_failure.Forget();
  SMultiFormatReaderBase::SetFormat(requested);
}

void Reader::Reset() {
  SMultiFormatReaderBase::Reset();
  m_failure.Forget();
}

unsigned long Reader::Skip(unsigned long count) {
  unsigned long done = 0;
  while (done < count && FetchMore(done > 0)) {
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
  bool hasSome = false;
  while (FetchMore(hasSome)) {
    hasSome = true;
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
  while (FetchMore(!text.IsEmpty())) {
    text.Concat(TextStart(), TextStart() + TextLength());
    Deliver(TextLength());
  }
  return text.Detach();
}

WCHAR Reader::SetReplacement(WCHAR replacement) {
  WCHAR former = GetReplacement();
  m_state->decoder.SetReplacement(replacement);
  return former;
}

WCHAR Reader::GetReplacement() const { return m_state->decoder.GetReplacement(); }
