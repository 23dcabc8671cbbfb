// qxtool encodings: every encoding with its names, by value.

#include <map>
#include <vector>

#include "tools/common/encoding_option.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/json.h"

namespace {

struct Row {
  SString name;
  std::vector<SString> aliases;  // sorted without regard to case
};

std::map<Encoding, Row> CollectRows(bool installed) {
  std::map<Encoding, Row> rows;
  Encodings::EncodingMap names;
  Encodings::ListAvailableEncodings(names, installed, 0);
  for (const auto& [name, value] : names) rows[value].name = name;
  names.Clear();
  Encodings::ListAvailableEncodings(names, installed, 1);
  for (const auto& [name, value] : names) {
    if (name != rows[value].name) rows[value].aliases.push_back(name);
  }
  return rows;
}

std::string AsJson(Encoding value, const Row& row) {
  std::string json = "{\"value\":" + JsonValue(value) + ",\"name\":" + JsonString(row.name) + ",\"aliases\":[";
  const char* separator = "";
  for (const SString& alias : row.aliases) {
    json += separator + JsonString(alias);
    separator = ",";
  }
  return json + "],\"installed\":" + JsonBool(Encodings::MachineSupports(value)) + "}";
}

std::string AsLine(Encoding value, const Row& row) {
  std::string number = JsonValue(value);
  std::string line = number.substr(1, number.size() - 2) + "  " + ToUtf8(row.name);
  for (const SString& alias : row.aliases) line += " | " + ToUtf8(alias);
  if (!Encodings::MachineSupports(value)) line += "  (not installed)";
  return line + "\n";
}

}  // namespace

int ListEncodings(const EncodingsOptions& options) {
  std::map<Encoding, Row> rows = CollectRows(options.installed);
  const char* separator = "";
  if (options.json) Print("{\"version\":1,\"encodings\":[");
  for (const auto& [value, row] : rows) {
    if (options.json) {
      Print(separator + std::string("\n") + AsJson(value, row));
      separator = ",";
    } else {
      Print(AsLine(value, row));
    }
  }
  if (options.json) Print("\n]}\n");
  return kDone;
}
