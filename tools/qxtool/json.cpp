#include "tools/qxtool/json.h"

#include <cstdio>

#include "tools/common/utf8.h"

namespace {

bool IsSurrogate(WCHAR c) { return (c & 0xF800) == 0xD800; }
bool IsPair(WCHAR first, WCHAR second) { return (first & 0xFC00) == 0xD800 && (second & 0xFC00) == 0xDC00; }

void AppendEscape(std::string& json, WCHAR c) {
  char escape[8];
  std::snprintf(escape, sizeof escape, "\\u%04x", static_cast<unsigned>(c));
  json += escape;
}

}  // namespace

std::string JsonString(SStringView text) {
  std::string json = "\"";
  for (std::size_t i = 0; i < text.size(); ++i) {
    WCHAR c = text[i];
    if (c == '"' || c == '\\') {
      json += '\\';
      json += static_cast<char>(c);
    } else if (c == '\n') {
      json += "\\n";
    } else if (c == '\r') {
      json += "\\r";
    } else if (c == '\t') {
      json += "\\t";
    } else if (c < 0x20 || c == 0x7F) {
      AppendEscape(json, c);
    } else if (!IsSurrogate(c)) {
      json += ToUtf8(text.substr(i, 1));
    } else if (i + 1 < text.size() && IsPair(c, text[i + 1])) {
      json += ToUtf8(text.substr(i++, 2));
    } else {
      AppendEscape(json, c);
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
