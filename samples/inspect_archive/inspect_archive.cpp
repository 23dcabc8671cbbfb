// Lists the texts in a zip archive with the encoding that each of them has.
//
// Usage: inspect_archive ARCHIVE
//
// The archive is read in sequence, and every entry is decoded as it is inflated: nothing is unpacked to the disk.

#include "../program.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/stream/zip/zip_input_stream.h"
#include "qxcore/system/file/file.h"

using Encodings = SAbstractIO::SMultiFormatSupport;

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: inspect_archive ARCHIVE\n");
    return 2;
  }
  return RunProgram("inspect_archive", [&] {
    SInputFile file(SFile::FromNative(argv[1]));
    SZipInputStream archive(file);
    while (const SZipEntry* entry = archive.GetNextEntry()) {
      if (entry->IsDirectory()) continue;
      SMultiFormatReaderUnicode text(archive, Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess);
      unsigned long long characters = 0;
      for (; !text.IsEOF(); ++characters) text.Read();
      SString line;
      line.Format(WTEXT("%s: %I64u characters, %s"), entry->GetName().GetSafePointer(), characters,
                  Encodings::GetEncodingName(text.GetFormat()).GetSafePointer());
      PrintLine(line);
    }
    return 0;
  });
}
