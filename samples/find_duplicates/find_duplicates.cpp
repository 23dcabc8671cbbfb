// Finds files of the same content in a folder and all folders below it.
//
// Usage: find_duplicates FOLDER
//
// Only files that share their length with another one are read. Prints each group of equal files, an empty line
// behind it; folders that could not be read are named at the end.

#include <cstdint>

#include "../program.h"
#include "qxcore/container/map.h"
#include "qxcore/container/string_map.h"
#include "qxcore/container/string_table.h"
#include "qxcore/stream/input_file.h"
#include "qxcore/string/md5.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/file/recurse_find.h"

// The files of one length or one digest.
using Groups = SMap<SString, SStringTable>;

static void Add(Groups& groups, const SString& key, const SString& path) {
  if (!groups.Contains(key)) groups.Add(key, SStringTable());
  groups.Retrieve(key)->Add(path);
}

static SString DigestOf(const SString& path) {
  SInputFile file(path);
  SMd5 digest;
  unsigned char block[65536];
  while (unsigned long count = file.Read(block, sizeof block)) digest.Add(block, count);
  unsigned char bytes[16];
  digest.Finish(bytes);
  SString text;
  for (unsigned char byte : bytes) {
    SString digits;
    digits.Format(WTEXT("%02x"), byte);
    text += digits;
  }
  return text;
}

int main(int argc, char** argv) {
  if (argc != 2) {
    std::fprintf(stderr, "usage: find_duplicates FOLDER\n");
    return 2;
  }
  return RunProgram("find_duplicates", [&] {
    Groups byLength;
    SRecurseFindFiles files;
    const SString mask = SFile::FromNative(argv[1]) + WTEXT("\\*");
    for (int found = files.FindFile(mask); found; found = files.FindNextFileW()) {
      SString length;
      length.Format(WTEXT("%I64u"), files.GetLength());
      Add(byLength, length, files.GetFilePath());
    }
    for (const auto& [length, paths] : byLength) {
      if (paths.GetCount() < 2) continue;
      Groups byDigest;
      for (const SString& path : paths) Add(byDigest, DigestOf(path), path);
      for (const auto& [digest, equal] : byDigest) {
        if (equal.GetCount() < 2) continue;
        for (const SString& path : equal) PrintLine(path);
        PrintLine(SString::null);
      }
    }
    const SFindFailures& failures = files.GetFailures();
    if (!failures.IsEmpty()) PrintLine(failures.GetFirstFolder() + WTEXT(": could not be read"), stderr);
    return failures.IsEmpty() ? 0 : 1;
  });
}
