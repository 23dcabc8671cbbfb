#include "tools/qxtool/json.h"

#include <cstdio>

#include "qxcore/platform/internal/utf.h"

namespace {

void AppendEscape(std::string& json, WCHAR c) {
  char escape[8];
  std::snprintf(escape, sizeof escape, "\\u%04x", static_cast<unsigned>(c));
  json += escape;
}

}  // namespace

std::string JsonString(SStringView text) {
  std::string json = "\"";
  for (const WCHAR *at = text.data(), *end = at + text.size(); at != end;) {
    const WCHAR* start = at;
    const char32_t c = platform::TakeUtf16(at, end);
    if (c == '"' || c == '\\') {
      json += '\\';
      json += static_cast<char>(c);
    } else if (c == '\n') {
      json += "\\n";
    } else if (c == '\r') {
      json += "\\r";
    } else if (c == '\t') {
      json += "\\t";
    } else if (c < 0x20 || c == 0x7F || platform::IsSurrogate(c)) {
      AppendEscape(json, *start);
    } else {
      char sequence[4];
      json.append(sequence, platform::PutUtf8(c, sequence));
    }
  }
  return json + '"';
}

std::string JsonStringOrNull(SStringView text) { return text.empty() ? "null" : JsonString(text); }

std::string JsonValue(unsigned long value) {
  char json[16];
  std::snprintf(json, sizeof json, "\"0x%08lX\"", value);
  return json;
}
