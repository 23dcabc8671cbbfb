// The parts of any text: each lies in it, and what is cut is exactly what was handed out.

#include "fuzz/fuzz_input.h"
#include "qxcore/ui/rtf/document.h"

namespace {

using Extract = int (*)(SString&, SString&, int);

void CheckGroup(const SString& text, Extract extract, bool mayDiffer) {
  SString whole(text), rest(text), part, cut;
  const int found = extract(whole, part, 0);
  FUZZ_CHECK(found == !part.IsEmpty() && whole == text);
  FUZZ_CHECK(extract(rest, cut, 1) == found && cut == part);
  if (found == 0) {
    FUZZ_CHECK(rest == text);
    return;
  }
  FUZZ_CHECK(part[0] == '{');
  if (!mayDiffer) {
    FUZZ_CHECK(rest.Length() + part.Length() == text.Length());
    FUZZ_CHECK(text.Find(part) != nullptr);
  }
  SString again;
  FUZZ_CHECK(extract(part, again, 0) == 1);
  FUZZ_CHECK(again == part);
}

void CheckHeader(const SString& text) {
  SString whole(text), rest(text), header, cut;
  const int found = SRtfDocument::ExtractHeader(whole, header, 0);
  FUZZ_CHECK(found == !header.IsEmpty() && whole == text && text.Left(header.Length()) == header);
  FUZZ_CHECK(SRtfDocument::ExtractHeader(rest, cut, 1) == found && cut == header);
  const SString body = text.Mid(header.Length());
  FUZZ_CHECK(rest == body || (rest.Length() > body.Length() && rest.Right(body.Length()) == body));
  SString again;
  if (found != 0) FUZZ_CHECK(SRtfDocument::ExtractHeader(header, again, 0) == 1 && again == header);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 8000) return 0;
  FuzzInput input(data, size);
  const std::basic_string<WCHAR> characters = ToText(input.Rest());
  const SString text(characters.c_str());
  CheckHeader(text);
  CheckGroup(text, SRtfDocument::ExtractFontTable, true);
  CheckGroup(text, SRtfDocument::ExtractColorTable, false);
  CheckGroup(text, SRtfDocument::ExtractStyleTable, false);
  return 0;
}
