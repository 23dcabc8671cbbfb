// qxworkbench: old texts listed with their encodings, looked at and converted.

#include <CLI/CLI.hpp>

#include "qxcore/core/exception.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/qxworkbench/app.h"

namespace {

int Start(const WorkbenchOptions& options) {
  WorkbenchApp app(options);
  if (!app.Init(nullptr, nullptr, nullptr, SW_SHOWNORMAL) || !app.InitInstance()) return kFailed;
  app.Run();
  FlushPrinted();
  if (!console::Interrupted()) return app.ExitCode();
  Complain("cancelled");
  return console::InterruptedCode();
}

int ReadAndStart(std::vector<std::string> arguments) {
  WorkbenchOptions options;
  CLI::App parser("Lists old texts with their encodings, shows and converts them.", "qxworkbench");
  parser.set_version_flag("--version", std::string("qxworkbench ") + QXWORKBENCH_VERSION);
  parser.add_option("FOLDER", options.folder, "the folder to open");
  parser.add_option("--script", options.script, "run the commands of a file, then end");
  parser.add_option("--picture", options.picture, "when all work is done, write a picture of the window, then end");
  parser.add_option("--mode", options.mode, "what happens to questions: show, answer or abort")
      ->check(CLI::IsMember({"show", "answer", "abort"}));
  parser.add_flag("--timing", options.timing, "say how long the longest step between two messages took");
  std::reverse(arguments.begin(), arguments.end());  // as the parser takes them
  try {
    parser.parse(arguments);
  } catch (const CLI::ParseError& error) {
    return parser.exit(error) == 0 ? kDone : kWrongUsage;
  }
  if (options.script.empty() && options.picture.empty()) console::WantScreen();
  return Start(options);
}

}  // namespace

int main(int argc, char** argv) {
  console::SetUp();
  SetProgramName("qxworkbench");
  try {
    return ReadAndStart(console::Arguments(argc, argv));
  } catch (const BrokenPipe&) {
    return kDone;
  } catch (const Failure& failure) {
    Complain(failure.place.empty() ? failure.text : failure.place + ": " + failure.text);
    return failure.code;
  } catch (...) {
    Complain(ReasonOfCurrentException());
    return kFailed;
  }
}
