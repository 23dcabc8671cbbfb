// Reads a text file of unknown encoding and prints what it found, in UTF-8: the name of the encoding,
// then the text. Usage: hello FILE

#include <cstdio>
#include <vector>

#include "qxcore/core/exception.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/string/text_conversion.h"

using Encodings = SAbstractIO::SMultiFormatSupport;

static void Print(const SString& text) {
  std::vector<char> utf8(3 * static_cast<std::size_t>(text.Length()) + 1);
  ST2UTF8Helper(utf8.data(), text, text.Length());
  std::printf("%s\n", utf8.data());
}

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: hello FILE\n");
    return 2;
  }
  try {
    SString path(argv[1]);
    SInputFile file(path);
    SMultiFormatReaderUnicode reader(file, Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess);
    SString line = reader.ReadLn();
    Print(Encodings::GetEncodingName(reader.GetFormat()));
    Print(line);
    while (!reader.IsEOF()) Print(reader.ReadLn());
  } catch (const SException& e) {
    std::fprintf(stderr, "hello: %s: ", argv[1]);
    Print(SString(e.GetText()));
    return 1;
  }
  return 0;
}
