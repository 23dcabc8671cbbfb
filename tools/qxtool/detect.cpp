// qxtool detect: how files are encoded, a line a file or as JSON.

#include <algorithm>

#include "tools/common/encoding_option.h"
#include "tools/common/failure.h"
#include "tools/common/finding.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/json.h"

namespace {

Encoding RequestOf(const DetectOptions& options) {
  Encoding hint = EncodingOf(options.hint, "--hint");
  Encoding level = hint & Encodings::kLevelMask;
  if (options.level == "none") level = 0;
  if (options.level == "quick") level = Encodings::kQuickDetect;
  if (options.level == "fair") level = Encodings::kDetect;
  if (options.level == "full" || (options.level.empty() && level == 0)) level = Encodings::kFullDetect;
  constexpr Encoding kFavors = Encodings::kFavorHint | Encodings::kFavorGuess;
  Encoding favor = hint & kFavors;
  if (options.favor == "none") favor = 0;
  if (options.favor == "hint") favor = Encodings::kFavorHint;
  if (options.favor == "guess" || (options.favor.empty() && favor == 0)) favor = Encodings::kFavorGuess;
  return (hint & ~(Encodings::kLevelMask | kFavors)) | level | favor | UnicodePolicy(options.fullUnicode);
}

std::string AsJson(const Finding& finding) {
  bool failed = !finding.error.empty();
  std::string json = "{\"file\":" + JsonString(finding.file);
  json += ",\"encoding\":" + (failed ? "null" : JsonString(finding.encoding));
  json += ",\"value\":" + (failed ? "null" : JsonValue(finding.value));
  json += std::string(",\"bom\":") + (failed ? "null" : JsonBool(finding.bom));
  json += std::string(",\"xml\":") + (failed ? "null" : JsonBool(finding.xml));
  json += ",\"bytes\":" + (failed ? "null" : std::to_string(finding.bytes));
  json += ",\"warning\":" + JsonStringOrNull(finding.warning);
  return json + ",\"error\":" + JsonStringOrNull(FromUtf8(finding.error)) + "}";
}

std::string Blanks(const SString& text, int width) {
  return std::string(static_cast<std::size_t>(std::max(0, width - DisplayWidth(text))), ' ');
}
std::string Padded(const SString& text, int width) { return ToUtf8(text) + Blanks(text, width); }

// The name stands in it as it was given, so that other programs find the file.
std::string AsLine(const Finding& finding, const std::string& name, int nameWidth) {
  constexpr int kEncodingWidth = 24;
  std::string line = name + Blanks(finding.file, nameWidth) + "  ";
  if (finding.warning.IsEmpty()) return line + ToUtf8(finding.encoding) + "\n";
  return line + Padded(finding.encoding, kEncodingWidth) + "  " + ToUtf8(finding.warning) + "\n";
}

}  // namespace

int Detect(const DetectOptions& options) {
  Encoding request = RequestOf(options);
  int nameWidth = 0;
  for (const std::string& name : options.files) nameWidth = std::max(nameWidth, DisplayWidth(ShownArgument(name)));
  int code = kDone;
  const char* separator = "";
  if (options.json) Print("{\"version\":1,\"files\":[");
  for (const std::string& name : options.files) {
    const Finding finding = LookAt(name, request);
    if (!finding.error.empty()) {
      code = kFailed;
      Complain(name + ": " + finding.error);
    }
    if (options.json) {
      Print(separator + std::string("\n") + AsJson(finding));
      separator = ",";
    } else if (finding.error.empty()) {
      Print(AsLine(finding, name, nameWidth));
    }
    FlushPrinted();  // whoever waits for the next file sees this one
  }
  if (options.json) Print("\n]}\n");
  return code;
}
