// The tag reader on any text: every tag is of one of the stated kinds, and nothing but blanks lies between tags.

#include "fuzz/fuzz_input.h"
#include "qxcore/ui/rtf/document.h"

namespace {

using Text = std::basic_string<WCHAR>;

bool IsSpace(WCHAR c) { return c == ' ' || c == '\t' || c == '\r' || c == '\n'; }
bool IsBrace(WCHAR c) { return c == '{' || c == '}'; }

void CheckText(const Text& tag, const WCHAR* behind) {
  for (std::size_t i = 0; i < tag.size(); ++i) {
    FUZZ_CHECK(!IsBrace(tag[i]));
    const WCHAR next = i + 1 < tag.size() ? tag[i + 1] : *behind;
    FUZZ_CHECK(tag[i] != '\\' || next == '\'');
  }
  FUZZ_CHECK(*behind == 0 || IsBrace(*behind) || *behind == '\\');
}

void CheckWord(const Text& tag, const WCHAR* behind) {
  for (std::size_t i = 1; i + 1 < tag.size(); ++i) FUZZ_CHECK(!IsSpace(tag[i]) && tag[i] != '\\' && !IsBrace(tag[i]));
  const bool hasBlank = tag.size() > 1 && (tag.back() == ' ' || tag.back() == '\t');
  FUZZ_CHECK(hasBlank || *behind == 0 || *behind == '\\' || IsBrace(*behind) || *behind == '\r' || *behind == '\n');
}

void CheckTag(const Text& tag, const WCHAR* behind, bool wholeGroup) {
  const bool isEscape = tag.size() == 2 && tag[0] == '\\' && (tag[1] == '\\' || IsBrace(tag[1]));
  if (tag[0] == '{' && wholeGroup) {
    FUZZ_CHECK(tag.back() == '}' || *behind == 0);
  } else if (IsBrace(tag[0])) {
    FUZZ_CHECK(tag.size() == 1);
  } else if (tag[0] != '\\' || (tag.size() > 1 && tag[1] == '\'')) {
    CheckText(tag, behind);
  } else if (!isEscape) {
    CheckWord(tag, behind);
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  FuzzInput input(data, size);
  const int wholeGroup = input.Byte() & 1;
  Text text = ToText(input.Rest());
  WCHAR* at = text.data();
  WCHAR* start;
  long length;
  while (SRtfDocument::GetNextTag(&start, &length, at, wholeGroup) != 0) {
    FUZZ_CHECK(length > 0 && start >= at && start + length <= text.data() + text.size());
    for (; at < start; ++at) FUZZ_CHECK(IsSpace(*at));
    at = start + length;
    CheckTag(Text(start, at), at, wholeGroup != 0);
  }
  FUZZ_CHECK(length == 0 && *start == 0 && start == text.data() + text.size());

  const long removed = static_cast<long>(size % 64 + 1);
  const Text rest = text.substr(std::min(text.size(), static_cast<std::size_t>(removed)));
  FUZZ_CHECK(SRtfDocument::RemoveTag(text.data(), removed) == 1);
  FUZZ_CHECK(rest == text.c_str());
  return 0;
}
