// RTF to text on any bytes, and what was written anew reads the same.

#include "fuzz/fuzz_input.h"
#include "qxcore/ui/rtf/document.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 20000) return 0;
  FuzzInput input(data, size);
  std::basic_string<WCHAR> characters = WTEXT("{\\rtf1");
  if ((input.Byte() & 1) != 0) {
    characters += ToText(input.Rest());
  } else {
    for (const char byte : input.Rest()) characters += static_cast<unsigned char>(byte);
  }
  SRtfDocument document;
  const SString rtf(characters.c_str());
  SString text, written, again;
  FUZZ_CHECK(document.RtfToText(&text, rtf) == !text.IsEmpty());
  FUZZ_CHECK(text.Length() <= rtf.Length());
  FUZZ_CHECK(document.TextToRtf(&written, rtf) == 1);
  FUZZ_CHECK(document.RtfToText(&again, written) == !text.IsEmpty());
  FUZZ_CHECK(again == text);
  return 0;
}
