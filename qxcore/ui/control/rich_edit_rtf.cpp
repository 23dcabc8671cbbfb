// RTF into a rich-edit control and out of it. The control reads and writes bytes, so characters beyond ASCII go in
// as Unicode control words.

#include <cstdio>
#include <cstring>

#include "qxcore/core/exception.h"
#include "qxcore/string/string_buffer.h"
#include "qxcore/ui/control/rich_edit.h"

namespace {

constexpr std::size_t kLongest = 20;  // bytes of one character as RTF

// A character beyond ASCII, in a group of its own, so that it has no substitute.
std::size_t WriteCharacter(WCHAR c, BYTE* buffer) {
  char text[kLongest];
  const int length = std::snprintf(text, sizeof text, "{\\uc0\\u%d }", static_cast<int>(static_cast<std::int16_t>(c)));
  std::memcpy(buffer, text, static_cast<std::size_t>(length));
  return static_cast<std::size_t>(length);
}

// Copies blocks of ASCII up to the first with another character; returns how many characters it copied.
std::size_t CopyAscii(SStringView text, BYTE* bytes) {
  constexpr std::size_t kBlock = 32;  // a few instructions of a vector unit
  std::size_t at = 0;
  for (; at + kBlock <= text.size(); at += kBlock) {
    const WCHAR* from = text.data() + at;
    unsigned all = 0;
    for (std::size_t i = 0; i < kBlock; ++i) all |= from[i];
    if (all >= 0x80) break;
    for (std::size_t i = 0; i < kBlock; ++i) bytes[at + i] = static_cast<BYTE>(from[i]);
  }
  return at;
}

// Gives the characters of an RTF text as ASCII.
DWORD CALLBACK GiveRtf(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved) {
  auto& rest = *reinterpret_cast<SStringView*>(cookie);
  const auto room = static_cast<std::size_t>(size);
  std::size_t read = 0, written = 0;
  while (read < rest.size() && room - written >= kLongest) {
    if (const std::size_t copied = CopyAscii(rest.substr(read, room - written), buffer + written)) {
      read += copied;
      written += copied;
    } else if (const WCHAR c = rest[read++]; c < 0x80) {
      buffer[written++] = static_cast<BYTE>(c);
    } else {
      written += WriteCharacter(c, buffer + written);
    }
  }
  rest.remove_prefix(read);
  *moved = static_cast<LONG>(written);
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
