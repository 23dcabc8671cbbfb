// RTF into a rich-edit control and out of it. The control reads and writes bytes, so characters beyond ASCII go in
// as Unicode control words.

#include <cstdio>
#include <cstring>

#include "qxcore/core/exception.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/ui/control/rich_edit.h"

namespace {

constexpr LONG kLongest = 20;  // bytes of one character as RTF

// A character beyond ASCII, in a group of its own, so that it has no substitute.
LONG WriteCharacter(WCHAR c, BYTE* buffer) {
  char text[kLongest];
  const int length = std::snprintf(text, sizeof text, "{\\uc0\\u%d }", static_cast<int>(static_cast<std::int16_t>(c)));
  std::memcpy(buffer, text, static_cast<std::size_t>(length));
  return length;
}

// Gives the characters of an RTF text as ASCII.
DWORD CALLBACK GiveRtf(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved) {
  auto& rest = *reinterpret_cast<SStringView*>(cookie);
  LONG written = 0;
  std::size_t read = 0;
  for (; read < rest.size() && size - written >= kLongest; ++read) {
    const WCHAR c = rest[read];
    if (c < 0x80) {
      buffer[written++] = static_cast<BYTE>(c);
    } else {
      written += WriteCharacter(c, buffer + written);
    }
  }
  rest.remove_prefix(read);
  *moved = written;
  return 0;
}

DWORD CALLBACK TakeRtf(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved) {
  constexpr LONG kPiece = 1024;
  auto& text = *reinterpret_cast<SStringBuffer*>(cookie);
  try {
    for (LONG at = 0; at < size; at += kPiece) {
      WCHAR wide[kPiece];
      const LONG count = size - at < kPiece ? size - at : kPiece;
      for (LONG i = 0; i < count; ++i) wide[i] = buffer[at + i];
      text.Concat(wide, wide + count);
    }
  } catch (...) {
    return ERROR_NOT_ENOUGH_MEMORY;
  }
  *moved = size;
  return 0;
}

template <class Source>
EDITSTREAM StreamOf(Source& source, EDITSTREAMCALLBACK callback) {
  EDITSTREAM stream = {};
  stream.dwCookie = reinterpret_cast<DWORD_PTR>(&source);
  stream.pfnCallback = callback;
  return stream;
}

}  // namespace

int SRichEditCtrl::SetRtf(const SString& rtf) {
  SStringView rest(rtf.GetSafePointer());
  EDITSTREAM stream = StreamOf(rest, GiveRtf);
  StreamIn(SF_RTF, stream);
  return stream.dwError == 0;
}

SString SRichEditCtrl::GetRtf() const {
  SStringBuffer text;
  EDITSTREAM stream = StreamOf(text, TakeRtf);
  StreamOut(SF_RTF, stream);
  if (stream.dwError != 0) throw SEOutOfMemory();
  return text.Detach();
}
