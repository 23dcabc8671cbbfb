// Imports settings from old text files of any encoding into the user's settings.
//
// Usage: import_settings KEY FILE...
//
// Each line "name = value" of a file becomes a text value below the application's settings, in the key KEY; lines
// without "=" are passed over. Says for each file which encoding was found, and warns where that was a guess.

#include "../program.h"
#include "qxcore/stream/encoding/multi_format_reader_unicode.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/settings/registry.h"

using Encodings = SAbstractIO::SMultiFormatSupport;

// Writes the settings of one file and returns their number.
static int Import(const SString& path, SRegistry& key) {
  SInputFile file(path);
  SMultiFormatReaderUnicode reader(file, Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess);
  int count = 0;
  while (!reader.IsEOF()) {
    SString name, value;
    if (!reader.ReadLn().Split(&name, &value, WTEXT('='))) continue;
    name.Trim();
    value.Trim();
    if (key.WriteProfile(name, value) == SRegistry::kOk) ++count;
  }
  if (SString warning = reader.GetDetectionWarning(); !warning.IsEmpty())
    PrintLine(path + WTEXT(": ") + warning, stderr);
  SString report;
  report.Format(WTEXT("%s: %d settings, read as %s"), path.GetSafePointer(), count,
                Encodings::GetEncodingName(reader.GetFormat()).GetSafePointer());
  PrintLine(report);
  return count;
}

int main(int argc, char** argv) {
  if (argc < 3) {
    std::fprintf(stderr, "usage: import_settings KEY FILE...\n");
    return 2;
  }
  return RunProgram("import_settings", [&] {
    SRegistry key(HKEY_CURRENT_USER, SRegistry::GetApplicationPath(SString::FromUtf8(argv[1])), 1);
    if (!key.IsOpen()) {
      std::fprintf(stderr, "import_settings: %s: the key cannot be opened\n", argv[1]);
      return 1;
    }
    for (int i = 2; i < argc; ++i) Import(SFile::FromNative(argv[i]), key);
    // Read back what the next program will find there.
    SString name, value;
    for (long index = 0; key.GetEnumValue(index, &name, &value) == 0; ++index) PrintLine(name + WTEXT(" = ") + value);
    return 0;
  });
}
