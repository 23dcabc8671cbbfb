#include "tools/qxtool/text_pipe.h"

#include <optional>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "tools/qxtool/console.h"
#include "tools/qxtool/encoding_option.h"
#include "tools/qxtool/failure.h"
#include "tools/qxtool/replacement_file.h"
#include "tools/qxtool/standard_streams.h"
#include "tools/qxtool/utf8.h"

namespace {

constexpr const char* kStandard = "-";

Encoding SourceFormat(const TextPipeOptions& options) {
  Encoding from = options.from.empty() ? Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess
                                       : EncodingOf(options.from, "--from");
  return options.lossless ? from | Encodings::kLossless : from;
}

Encoding TargetFormat(const TextPipeOptions& options) {
  // Of the policy only the losses concern a writer.
  Encoding to = EncodingOf(options.to, "--to") & (Encodings::kValueMask | Encodings::kLossless);
  return options.lossless ? to | Encodings::kLossless : to;
}

// The wanted replacement; 0 drops. Nothing when the library's own is fine.
std::optional<WCHAR> ReplacementOf(const TextPipeOptions& options) {
  if (options.replacement.empty()) return std::nullopt;
  if (options.replacement == "drop") return WCHAR{0};
  SString text = FromUtf8(options.replacement);
  if (text.Length() != 1) {
    throw Failure{"--replacement: \"" + options.replacement + "\" is neither one character nor drop", kWrongUsage};
  }
  return text.GetAt(0);
}

// Everything between the two files; the losses in `warnings`.
void Pass(const TextPipeOptions& options, TextSource& source, std::FILE* file, const TextWork& work,
          std::vector<SString>& warnings) {
  FileOutput output(file);
  SOutputStringStream target(output, TargetFormat(options));
  if (std::optional<WCHAR> replacement = ReplacementOf(options)) {
    source.Reader().SetReplacement(*replacement);
    target.SetReplacement(*replacement);
  }
  work(source, target);
  target.Close();
  output.Flush();
  warnings = {source.Reader().GetDetectionWarning(), source.Reader().GetEncodingWarning(), target.GetEncodingWarning()};
}

}  // namespace

unsigned ReadPiece(TextSource& source, const std::string& name, void* buffer, unsigned size,
                   const std::function<unsigned long(void*, unsigned long)>& read) {
  try {
    if (console::Interrupted()) throw SEIOAbortedException();
    const unsigned long bytes = read(buffer, size);
    if (bytes == 0) source.CheckRead();
    return static_cast<unsigned>(bytes);
  } catch (...) {
    FailAt(name);
  }
}

int PipeText(const TextPipeOptions& options, const TextWork& work) {
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
      Pass(options, *source, stdout, work, warnings);
    } else {
      ReplacementFile target(options.out);
      Pass(options, *source, target.File(), work, warnings);
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
