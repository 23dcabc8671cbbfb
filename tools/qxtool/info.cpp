// qxtool info: what the system and the library know of a file, as lines or as JSON.

#include <vector>

#include "qxcore/system/file/file.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/attributes.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/file_time.h"
#include "tools/qxtool/json.h"

namespace {

struct Facts {
  SString path;
  bool isFolder = false;
  std::uint64_t bytes = 0;
  TimeTexts created, written;
  unsigned long attributes = 0;
  SString drive, directory, name, extension;
  SString url, urlPath;
};

void Require(HRESULT status) {
  if (status != SFile::kOk) throw Failure{ToUtf8(SFile::GetStatusText(status))};
}

TimeTexts TimeOf(const SFile& file, int creation) {
  FILETIME time;
  Require(file.GetDateTime(&time, creation));
  return TimeTexts(time);
}

Facts Look(const std::string& name) {
  Facts facts;
  facts.path = SFile::NormalizeFileName(console::NameOf(name), 1);
  if (facts.path.IsEmpty()) Require(static_cast<HRESULT>(SFile::kInvalidFilename));
  if (!SFile::Exists(facts.path)) throw Failure{SystemText(GetLastError())};
  SFile file(facts.path);
  Require(file.GetAttributes(facts.attributes));
  facts.isFolder = (facts.attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
  if (!facts.isFolder) {
    unsigned long low = 0, high = 0;
    Require(file.GetSize(low, high));
    facts.bytes = static_cast<std::uint64_t>(high) << 32 | low;
  }
  facts.created = TimeOf(file, 1);
  facts.written = TimeOf(file, 0);
  facts.drive = file.GetDrive();
  facts.directory = file.GetDirectory();
  facts.name = file.GetName();
  facts.extension = file.GetExtension();
  facts.url = SFile::PathToURL(facts.path);
  facts.urlPath = SFile::URLToPath(facts.url);
  return facts;
}

std::string JsonTime(const TimeTexts& time) {
  return "{\"local\":" + JsonStringOrNull(time.local) + ",\"utc\":" + JsonStringOrNull(time.utc) + "}";
}

std::string AsJson(const std::string& given, const Facts& facts) {
  std::string json = "{\"file\":" + JsonString(ShownArgument(given)) + ",\"path\":" + JsonString(facts.path);
  json += ",\"bytes\":" + (facts.isFolder ? "null" : std::to_string(facts.bytes));
  json += ",\"created\":" + JsonTime(facts.created) + ",\"written\":" + JsonTime(facts.written);
  json += ",\"attributes\":" + JsonValue(facts.attributes) + ",\"attributeNames\":[";
  const char* separator = "";
  for (const std::string& name : AttributeNames(facts.attributes)) {
    json += separator + ("\"" + name + "\"");
    separator = ",";
  }
  json += "],\"drive\":" + JsonString(facts.drive) + ",\"directory\":" + JsonString(facts.directory);
  json += ",\"name\":" + JsonString(facts.name) + ",\"extension\":" + JsonString(facts.extension);
  json += ",\"url\":" + JsonString(facts.url) + ",\"urlPath\":" + JsonString(facts.urlPath);
  return json + ",\"error\":null}";
}

std::string Shown(const TimeTexts& time) {
  return time.utc.IsEmpty() ? "out of range" : ToUtf8(time.local) + " local, " + ToUtf8(time.utc);
}

std::string AsLines(const Facts& facts) {
  std::string attributes = "none";
  const char* separator = "";
  for (const std::string& name : AttributeNames(facts.attributes)) {
    attributes = (*separator != 0 ? attributes : "") + separator + name;
    separator = ", ";
  }
  const std::pair<const char*, std::string> lines[] = {{"size", facts.isFolder ? "-" : std::to_string(facts.bytes)},
                                                       {"created", Shown(facts.created)},
                                                       {"written", Shown(facts.written)},
                                                       {"attributes", attributes},
                                                       {"drive", ToUtf8(facts.drive)},
                                                       {"directory", ToUtf8(facts.directory)},
                                                       {"name", ToUtf8(facts.name)},
                                                       {"extension", ToUtf8(facts.extension)},
                                                       {"URL", ToUtf8(facts.url)},
                                                       {"URL's path", ToUtf8(facts.urlPath)}};
  std::string text = ToUtf8(facts.path) + "\n";
  for (const auto& [label, value] : lines) {
    constexpr std::size_t kWidth = 12;
    std::string line = "  " + std::string(label);
    if (!value.empty()) line += std::string(2 + kWidth - line.size(), ' ') + value;
    text += line + "\n";
  }
  return text;
}

}  // namespace

int Info(const InfoOptions& options) {
  int code = kDone;
  const char* separator = "";
  if (options.json) Print("{\"version\":1,\"files\":[");
  for (const std::string& name : options.files) {
    std::string text;
    try {
      const Facts facts = Look(name);
      text = options.json ? AsJson(name, facts) : AsLines(facts);
    } catch (...) {
      const std::string reason = ReasonOfCurrentException();
      code = kFailed;
      FlushPrinted();  // so that both streams name the files in the same order
      Complain(name + ": " + reason);
      if (options.json)
        text = "{\"file\":" + JsonString(ShownArgument(name)) + ",\"error\":" + JsonString(FromUtf8(reason)) + "}";
    }
    if (options.json) {
      Print(separator + ("\n" + text));
      separator = ",";
    } else {
      Print(text);
    }
  }
  if (options.json) Print("\n]}\n");
  return code;
}
