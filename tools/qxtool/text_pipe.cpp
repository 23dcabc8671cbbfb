#include "tools/qxtool/text_pipe.h"

#include <filesystem>
#include <optional>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/encoding_option.h"
#include "tools/common/failure.h"
#include "tools/common/replacement_file.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/pipe_plan.h"

namespace {

constexpr const char* kStandard = "-";

// What was there before is gone when a file is written in its place: only who names a replacement may lose something.
bool IsLossless(const TextPipeOptions& options) {
  return options.lossless || (options.inPlace && options.replacement.empty());
}

Encoding Policy(const TextPipeOptions& options) {
  return (IsLossless(options) ? Encodings::kLossless : Encoding{0}) | UnicodePolicy(options.fullUnicode);
}

Encoding SourceFormat(const TextPipeOptions& options) {
  const Encoding from = options.from.empty() ? Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess
                                             : EncodingOf(options.from, "--from");
  return from | Policy(options);
}

Encoding TargetFormat(const TextPipeOptions& options) {
  // Of the policy only the losses and the standard concern a writer.
  const Encoding kept = Encodings::kValueMask | Encodings::kLossless | Encodings::kFullUnicode;
  return (EncodingOf(options.to, "--to") & kept) | Policy(options);
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

// Everything between two files.
TextOutcome Pass(const TextPipeOptions& options, const std::string& name, TextSource& source, std::FILE* file,
                 const TextWork& work) {
  FileOutput output(file);
  TextPass pass(name, source, output, TargetFormat(options), ReplacementOf(options));
  work(pass);
  const TextOutcome outcome = pass.Finish();
  output.Flush();
  return outcome;
}

TextOutcome PassBetween(const TextPipeOptions& options, const PipePair& pair, const TextWork& work) {
  std::optional<TextSource> source;
  try {
    source.emplace(pair.in, SourceFormat(options));
    source->Select();
  } catch (...) {
    FailAt(pair.in);
  }
  try {
    if (pair.out == kStandard) return Pass(options, pair.in, *source, stdout, work);
    const std::string native = console::NativeOf(pair.out);
    if (!options.outputDir.empty()) std::filesystem::create_directories(console::PathOf(native).parent_path());
    ReplacementFile target(native);
    const TextOutcome outcome = Pass(options, pair.in, *source, target.File(), work);
    source.reset();  // on some systems an open file cannot be replaced, and IN may be OUT
    target.Commit(options.ifChanged || options.inPlace);
    return outcome;
  } catch (...) {
    FailAt(pair.out);
  }
}

ExitCode PipeOne(const TextPipeOptions& options, const PipePair& pair, const TextWork& work) {
  const TextOutcome outcome = PassBetween(options, pair, work);
  if (options.verbose) Complain(pair.in + " -> " + pair.out + ": " + ToUtf8(outcome.encoding));
  for (const SString& warning : {outcome.detection, outcome.reading, outcome.writing})
    if (!warning.IsEmpty() && !options.quiet) Complain(pair.in + ": " + ToUtf8(warning));
  return outcome.IsLossy() ? kLossy : kDone;
}

}  // namespace

int PipeText(const TextPipeOptions& options, const TextWork& work) {
  SourceFormat(options);
  RequireOnThisMachine(TargetFormat(options));
  ReplacementOf(options);  // wrong usage is reported before any file is touched
  const std::vector<PipePair> pairs = PlanPipes(options);
  if (pairs.size() == 1) return PipeOne(options, pairs.front(), work);
  ExitCode code = kDone;
  for (const PipePair& pair : pairs) {
    try {
      const ExitCode one = PipeOne(options, pair, work);
      if (code == kDone) code = one;
    } catch (const Failure& failure) {
      Complain(failure.place.empty() ? failure.text : failure.place + ": " + failure.text);
      code = kFailed;
    }
  }
  return code;
}
