// qxtool convert: one file from one encoding to another.

#include <optional>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/output_string_stream.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/console.h"
#include "tools/qxtool/encoding_option.h"
#include "tools/qxtool/failure.h"
#include "tools/qxtool/replacement_file.h"
#include "tools/qxtool/standard_streams.h"
#include "tools/qxtool/text_source.h"
#include "tools/qxtool/utf8.h"

namespace {

constexpr const char* kStandard = "-";

Encoding SourceFormat(const ConvertOptions& options) {
  Encoding from = options.from.empty() ? Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess
                                       : EncodingOf(options.from, "--from");
  return options.lossless ? from | Encodings::kLossless : from;
}

Encoding TargetFormat(const ConvertOptions& options) {
  // Of the policy only the losses concern a writer.
  Encoding to = EncodingOf(options.to, "--to") & (Encodings::kValueMask | Encodings::kLossless);
  return options.lossless ? to | Encodings::kLossless : to;
}

// The wanted replacement; 0 drops. Nothing when the library's own is fine.
std::optional<WCHAR> ReplacementOf(const ConvertOptions& options) {
  if (options.replacement.empty()) return std::nullopt;
  if (options.replacement == "drop") return WCHAR{0};
  SString text = FromUtf8(options.replacement);
  if (text.Length() != 1) {
    throw Failure{"--replacement: \"" + options.replacement + "\" is neither one character nor drop", kWrongUsage};
  }
  return text.GetAt(0);
}

// The next characters of the source, their count; 0 at its end.
unsigned ReadText(TextSource& source, std::vector<WCHAR>& text, const std::string& name) {
  try {
    if (console::Interrupted()) throw SEIOAbortedException();
    unsigned long bytes = source.Reader().Read(text.data(), static_cast<unsigned long>(text.size() * sizeof(WCHAR)));
    if (bytes == 0) source.CheckRead();
    return static_cast<unsigned>(bytes / sizeof(WCHAR));
  } catch (...) {
    FailAt(name);
  }
}

void CopyText(TextSource& source, SOutputStringStream& target, const std::string& sourceName) {
  std::vector<WCHAR> text(32768);
  while (unsigned count = ReadText(source, text, sourceName)) target.Write(text.data(), count);
}

// Everything between the two files; the losses in `warnings`.
void ConvertStream(const ConvertOptions& options, TextSource& source, std::FILE* file, std::vector<SString>& warnings) {
  FileOutput output(file);
  SOutputStringStream target(output, TargetFormat(options));
  if (std::optional<WCHAR> replacement = ReplacementOf(options)) {
    source.Reader().SetReplacement(*replacement);
    target.SetReplacement(*replacement);
  }
  CopyText(source, target, options.in);
  target.Close();
  output.Flush();
  warnings = {source.Reader().GetDetectionWarning(), source.Reader().GetEncodingWarning(), target.GetEncodingWarning()};
}

}  // namespace

int Convert(const ConvertOptions& options) {
  Encoding from = SourceFormat(options);
  RequireOnThisMachine(TargetFormat(options));
  ReplacementOf(options);  // wrong usage is told before any file is touched
  std::vector<SString> warnings;
  std::optional<TextSource> source;
  try {
    source.emplace(options.in, from);
    source->Select();
  } catch (...) {
    FailAt(options.in);
  }
  try {
    if (options.out == kStandard) {
      ConvertStream(options, *source, stdout, warnings);
    } else {
      ReplacementFile target(options.out);
      ConvertStream(options, *source, target.File(), warnings);
      source.reset();  // on some systems an open file cannot be replaced, and IN may be OUT
      target.Commit(options.ifChanged);
    }
  } catch (...) {
    FailAt(options.out);
  }
  for (const SString& warning : warnings) {
    if (!warning.IsEmpty()) Complain(options.in + ": " + ToUtf8(warning));
  }
  return kDone;
}
