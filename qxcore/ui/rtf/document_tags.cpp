// The tag reader of SRtfDocument.

#include "qxcore/graphics/rtf/internal/tag.h"
#include "qxcore/platform/wide.h"
#include "qxcore/ui/rtf/document.h"

int SRtfDocument::SkipSpace(WCHAR** cursor) {
  if (cursor == nullptr || *cursor == nullptr) return 0;
  *cursor = const_cast<WCHAR*>(rtf::SkipSpace(static_cast<const WCHAR*>(*cursor), platform::RtfTerminated()));
  return 1;
}

int SRtfDocument::RemoveTag(WCHAR* text, long length) {
  if (text == nullptr || length < 1) return 0;
  const std::size_t all = platform::WideLength(text);
  const std::size_t removed = static_cast<std::size_t>(length) < all ? static_cast<std::size_t>(length) : all;
  std::char_traits<WCHAR>::move(text, text + removed, all - removed + 1);
  return 1;
}

int SRtfDocument::GetNextTag(WCHAR** tagStart, long* tagLength, WCHAR* text, int wholeGroup) {
  if (tagStart == nullptr || tagLength == nullptr || text == nullptr) return 0;
  const platform::RtfTerminated end;
  const WCHAR* start = rtf::SkipSpace(static_cast<const WCHAR*>(text), end);
  *tagStart = const_cast<WCHAR*>(start);
  *tagLength = static_cast<long>(rtf::SkipTag(start, end, wholeGroup != 0) - start);
  return *tagLength > 0;
}
