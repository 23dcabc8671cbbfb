// Reads a text file of unknown encoding and prints what it found, in UTF-8: the name of the encoding,
// then the text. Usage: hello FILE

#include "../program.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/system/file/file.h"

using Encodings = SAbstractIO::SMultiFormatSupport;

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: hello FILE\n");
    return 2;
  }
  return RunProgram("hello", [&] {
    SInputFile file(SFile::FromNative(argv[1]));
    SMultiFormatReaderUnicode reader(file, Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess);
    SString line = reader.ReadLn();
    PrintLine(Encodings::GetEncodingName(reader.GetFormat()));
    PrintLine(line);
    while (!reader.IsEOF()) PrintLine(reader.ReadLn());
    return 0;
  });
}
