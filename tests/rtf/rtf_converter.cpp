// Converts documents for corpus_test.py: a process of its own, because a control of the system may hang.
//
// usage: rtf_converter text|rtf FILE    the plain text in UTF-8, or the document written anew
//        Exit code 3: the conversion returned 0.

#include <cstdio>
#include <cstring>
#include <string>
#ifdef _WIN32
#include <fcntl.h>
#include <io.h>
#endif

#include "qxcore/ui/rtf/document.h"
#include "tests/rtf/rtf_file.h"

static void Write(const SString& text) {
  std::string bytes(static_cast<std::size_t>(text.Length()) * 3 + 1, '\0');
  const int length = WideCharToMultiByte(CP_UTF8, 0, text, text.Length(), bytes.data(), static_cast<int>(bytes.size()),
                                         nullptr, nullptr);
  std::fwrite(bytes.data(), 1, static_cast<std::size_t>(length), stdout);
}

int main(int argc, char** argv) {
  if (argc != 3) return 2;
#ifdef _WIN32
  _setmode(_fileno(stdout), _O_BINARY);
#endif
  const SString text = ReadRtfFile(argv[2]);
  SRtfDocument document;
  SString result;
  if ((std::strcmp(argv[1], "rtf") == 0 ? document.TextToRtf(&result, text) : document.RtfToText(&result, text)) == 0)
    return 3;
  Write(result);
  return 0;
}
