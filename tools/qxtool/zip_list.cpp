// qxtool zip list: the entries of an archive, a line each or as JSON.

#include <cstdio>

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/entry_path.h"
#include "tools/qxtool/json.h"
#include "tools/qxtool/zip_archive.h"

namespace {

// "2026-11-21T13:34:52", or empty where the archive has no valid time.
std::string TimeOf(const SZipEntry& entry) {
  SYSTEMTIME time;
  const FILETIME& stamp = entry.GetTime();
  if ((stamp.dwLowDateTime | stamp.dwHighDateTime) == 0 || !FileTimeToSystemTime(&stamp, &time)) return "";
  char text[40];
  std::snprintf(text, sizeof text, "%04u-%02u-%02uT%02u:%02u:%02u", time.wYear, time.wMonth, time.wDay, time.wHour,
                time.wMinute, time.wSecond);
  return text;
}

std::string AsJson(const SZipEntry& entry) {
  std::string json = "{\"name\":" + JsonString(entry.GetName());
  json += ",\"method\":" + std::to_string(entry.GetMethod());
  json += ",\"size\":" + std::to_string(entry.GetSize());
  json += ",\"compressed\":" + std::to_string(entry.GetCompressedSize());
  json += ",\"crc\":" + std::to_string(entry.GetCRC());
  json += ",\"time\":" + JsonStringOrNull(FromUtf8(TimeOf(entry)));
  json += std::string(",\"directory\":") + JsonBool(entry.IsDirectory());
  return json + ",\"comment\":" + JsonStringOrNull(entry.GetComment()) + "}";
}

std::string AsLine(const SZipEntry& entry) {
  char figures[80];
  std::snprintf(figures, sizeof figures, "%10lld %10lld  %-8s  %08lx  %19s  ", static_cast<long long>(entry.GetSize()),
                static_cast<long long>(entry.GetCompressedSize()), entry.GetMethod() == 8 ? "deflated" : "stored",
                static_cast<unsigned long>(entry.GetCRC()), TimeOf(entry).c_str());
  return figures + Shown(entry.GetName()) + "\n";
}

void PrintEntries(const ZipOptions& options) {
  const std::unique_ptr<SZipFile> directory = OpenDirectory(options.archive);
  const char* separator = "\n";
  for (bool found = directory->FindFile(nullptr, 0) != 0; found; found = FindNextEntry(*directory)) {
    if (console::Interrupted()) throw SEIOAbortedException();
    if (!options.json) {
      Print(AsLine(directory->GetEntry()));
      continue;
    }
    Print(separator + AsJson(directory->GetEntry()));
    separator = ",\n";
  }
}

}  // namespace

int ListZip(const ZipOptions& options) {
  std::string error;
  if (options.json) Print("{\"version\":1,\"entries\":[");
  try {
    PrintEntries(options);
  } catch (...) {
    error = ReasonOfCurrentException();
    FlushPrinted();  // so that both streams tell things in their order
    Complain(options.archive + ": " + error);
  }
  if (options.json) Print("\n],\"error\":" + JsonStringOrNull(FromUtf8(error)) + "}\n");
  return error.empty() ? kDone : kFailed;
}
