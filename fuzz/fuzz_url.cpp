// Paths to file URLs and back: nothing is lost but what the form cannot hold.

#include "fuzz/fuzz_input.h"
#include "qxcore/system/file/file.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 600) return 0;
  const std::basic_string<WCHAR> text = ToText(FuzzInput(data, size).Rest());
  const SString given(text.c_str());

  // As a URL: what is none comes back as it is; the path of one has neither slashes nor bars.
  const SString path = SFile::URLToPath(given);
  if (SFile::IsFileURL(given)) {
    FUZZ_CHECK(path.FindPos('/') < 0 && path.FindPos('|') < 0);
  } else {
    FUZZ_CHECK(path == given);
  }
  FUZZ_CHECK(!SFile::IsFileURL(given, 1) || SFile::IsFileURL(given));

  // As a path: by way of the URL it becomes its absolute form, or, when it begins with "." or "%", itself.
  const SString url = SFile::PathToURL(given);
  if (url.IsEmpty()) return 0;
  FUZZ_CHECK(SFile::IsFileURL(url, 1));
  FUZZ_CHECK(url.FindPos('\\') < 0);
  const bool isTaken = text[0] == '.' || text[0] == '%';
  SString expected = isTaken ? given : SFile::NormalizeFileName(given);
  expected.ReplaceAll(WCHAR('/'), WCHAR('\\'));
  expected.ReplaceAll(WCHAR('|'), WCHAR(':'));
  // A server without a name has no URL of its own.
  const bool isNameless = expected.Compare(WTEXT("\\\\"), 2) == 0 && (expected.Length() == 2 || expected[2] == '\\');
  if (!isNameless) FUZZ_CHECK(SFile::URLToPath(url) == expected);
  return 0;
}
