// qxtool zip test: all of an archive is read and compared with its central directory.

#include <vector>

#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/zip_archive.h"

namespace {

struct Findings {
  unsigned long long bytes = 0;
  int wrong = 0;  // entries that can be read, but are not what they ought to be
};

Findings ReadEntries(ZipArchive& archive, const std::string& name) {
  Findings findings;
  std::vector<unsigned char> data(65536);
  while (archive.Next() != nullptr) {
    while (const unsigned long count = archive.Read(data.data(), static_cast<unsigned long>(data.size())))
      findings.bytes += count;
    try {
      archive.CheckRead();
    } catch (const Failure& failure) {
      Complain(name + ": " + failure.text);
      ++findings.wrong;
    }
  }
  return findings;
}

}  // namespace

int TestZip(const ZipOptions& options) try {
  ZipArchive archive(options.archive);
  const Findings findings = ReadEntries(archive, options.archive);
  if (findings.wrong > 0) return kFailed;
  Print(options.archive + ": " + std::to_string(archive.Entries().size()) + " entries, " +
        std::to_string(findings.bytes) + " bytes, all as they ought to be\n");
  return kDone;
} catch (...) {
  FailAt(options.archive);
}
