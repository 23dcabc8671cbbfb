// The streams of rich-edit controls.

#include <algorithm>
#include <cstring>
#include <string>

#include "qxcore/platform/posix/controls/document_edit.h"
#include "qxcore/platform/posix/controls/rich_edit_control.h"
#include "qxcore/platform/posix/controls/rtf_reader.h"
#include "qxcore/platform/posix/controls/rtf_writer.h"

namespace platform::rich {
namespace {

constexpr LONG kPiece = 1 << 16;  // bytes that a stream's callback is asked for at a time

// All that the callback gives; an error of it is kept in the stream.
std::string Collect(EDITSTREAM& stream) {
  std::string bytes;
  for (;;) {
    const std::size_t length = bytes.size();
    bytes.resize(length + kPiece);
    LONG moved = 0;
    stream.dwError =
        stream.pfnCallback(stream.dwCookie, reinterpret_cast<BYTE*>(bytes.data() + length), kPiece, &moved);
    bytes.resize(length + static_cast<std::size_t>(std::clamp<LONG>(moved, 0, kPiece)));
    if (stream.dwError != 0 || moved <= 0) return bytes;
  }
}

void GiveAll(EDITSTREAM& stream, std::string_view bytes) {
  while (!bytes.empty()) {
    const LONG size = static_cast<LONG>(std::min<std::size_t>(bytes.size(), kPiece));
    LONG moved = 0;
    stream.dwError =
        stream.pfnCallback(stream.dwCookie, reinterpret_cast<BYTE*>(const_cast<char*>(bytes.data())), size, &moved);
    if (stream.dwError != 0 || moved <= 0) return;
    bytes.remove_prefix(static_cast<std::size_t>(std::min(moved, size)));
  }
}

std::u16string Decode(const std::string& bytes, bool isUnicode) {
  std::u16string text(bytes.size() / (isUnicode ? sizeof(WCHAR) : 1), u'\0');
  if (isUnicode) {
    std::memcpy(text.data(), bytes.data(), text.size() * sizeof(WCHAR));
  } else {
    const int length = MultiByteToWideChar(CP_ACP, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                           static_cast<int>(text.size()));
    text.resize(static_cast<std::size_t>(std::max(length, 0)));
  }
  return text;
}

std::string Encode(std::u16string_view text, bool isUnicode) {
  if (isUnicode) return std::string(reinterpret_cast<const char*>(text.data()), text.size() * sizeof(WCHAR));
  std::string bytes(text.size() * 4, '\0');
  const int length = WideCharToMultiByte(CP_ACP, 0, text.data(), static_cast<int>(text.size()), bytes.data(),
                                         static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(std::max(length, 0)));
  return bytes;
}

// What the bytes say, without formats where they are plain text. False when they are not of that form.
bool Read(const Control& control, WPARAM format, const std::string& bytes, Document& document) {
  if ((format & SF_RTF) == 0) {
    const std::u16string text = Decode(bytes, (format & SF_UNICODE) != 0);
    ReadText(std::u16string_view(text).substr(0, control.limit), document);
    return true;
  }
  if (control.mode != TM_RICHTEXT || !IsRtf(bytes)) return false;
  ReadRtf(bytes, document);
  return true;
}

}  // namespace

LRESULT StreamIn(Control& control, WPARAM format, EDITSTREAM& stream) {
  const std::string bytes = Collect(stream);
  Document read;
  if (!Read(control, format, bytes, read)) {
    if (stream.dwError == 0) stream.dwError = ERROR_INVALID_DATA;  // the callback's error comes first
    return 0;
  }
  const auto count = static_cast<LRESULT>(read.text.Length());
  if ((format & SFF_SELECTION) == 0) {
    SetDocument(control, std::move(read));
  } else {
    TakeLists(control.document, read);
    ReplaceSelection(control, read);
  }
  return count;
}

LRESULT StreamOut(const Control& control, WPARAM format, EDITSTREAM& stream) {
  Document selected;
  if ((format & SFF_SELECTION) != 0) {
    const Span span = SelectedSpan(control);
    CopyPart(control.document, span.start, span.end, selected);
  }
  const Document& document = (format & SFF_SELECTION) != 0 ? selected : control.document;
  std::string bytes;
  if ((format & SF_RTF) != 0) {
    WriteRtf(document, bytes);
  } else {
    bytes = Encode(document.text.View(), (format & SF_UNICODE) != 0);
  }
  GiveAll(stream, bytes);
  return static_cast<LRESULT>(bytes.size());
}

}  // namespace platform::rich
