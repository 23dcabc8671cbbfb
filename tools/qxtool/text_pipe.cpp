#include "tools/qxtool/text_pipe.h"

#include <filesystem>
#include <optional>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "tools/qxtool/console.h"
#include "tools/qxtool/encoding_option.h"
#include "tools/qxtool/failure.h"
#include "tools/qxtool/pipe_plan.h"
#include "tools/qxtool/replacement_file.h"
#include "tools/qxtool/standard_streams.h"
#include "tools/qxtool/utf8.h"

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

// What is to be said of one file.
struct Outcome {
  SString detection, reading, writing;  // warnings
  SString encoding;
  bool IsLossy() const { return !reading.IsEmpty() || !writing.IsEmpty(); }
};

// Everything between two files.
Outcome Pass(const TextPipeOptions& options, const std::string& name, TextSource& source, std::FILE* file,
             const TextWork& work) {
  FileOutput output(file);
  SOutputStringStream stream(output, TargetFormat(options));
  if (std::optional<WCHAR> replacement = ReplacementOf(options)) {
    source.Reader().SetReplacement(*replacement);
    stream.SetReplacement(*replacement);
  }
  TextTarget target(stream, TargetFormat(options));
  PipeSource named{name, source};
  work(named, target);
  stream.Close();
  output.Flush();
  return {source.Reader().GetDetectionWarning(), source.Reader().GetEncodingWarning(), stream.GetEncodingWarning(),
          ShownName(source.Reader().GetFormat())};
}

// Where the text of a source cannot be read on: read once more, character by character.
void FailAtUnreadable(const std::string& name, Encoding format) {
  const std::string reason = ReasonOfCurrentException();
  TextPosition position;
  try {
    TextSource again(name, format);
    again.Select();
    for (WCHAR c; again.Reader().Read(&c, sizeof c) == sizeof c;) position.Pass({&c, 1});
  } catch (const SEEncodingException&) {
    throw Failure{position.Text() + ": " + reason, kFailed, name};
  }
}

Outcome PassBetween(const TextPipeOptions& options, const PipePair& pair, const TextWork& work) {
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
    const Outcome outcome = Pass(options, pair.in, *source, target.File(), work);
    source.reset();  // on some systems an open file cannot be replaced, and IN may be OUT
    target.Commit(options.ifChanged || options.inPlace);
    return outcome;
  } catch (...) {
    FailAt(pair.out);
  }
}

ExitCode PipeOne(const TextPipeOptions& options, const PipePair& pair, const TextWork& work) {
  const Outcome outcome = PassBetween(options, pair, work);
  if (options.verbose) Complain(pair.in + " -> " + pair.out + ": " + ToUtf8(outcome.encoding));
  for (const SString& warning : {outcome.detection, outcome.reading, outcome.writing})
    if (!warning.IsEmpty() && !options.quiet) Complain(pair.in + ": " + ToUtf8(warning));
  return outcome.IsLossy() ? kLossy : kDone;
}

}  // namespace

unsigned ReadPiece(PipeSource& source, void* buffer, unsigned size,
                   const std::function<unsigned long(void*, unsigned long)>& read) {
  try {
    if (console::Interrupted()) throw SEIOAbortedException();
    const unsigned long bytes = read(buffer, size);
    if (bytes == 0) source.text.CheckRead();
    return static_cast<unsigned>(bytes);
  } catch (const SEEncodingException&) {
    if (source.name != kStandard) FailAtUnreadable(source.name, source.text.Reader().GetRequestedFormat());
    FailAt(source.name);
  } catch (...) {
    FailAt(source.name);
  }
}

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
