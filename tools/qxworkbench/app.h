// The workbench's application: drives the frame's work and the script from its idle time, and measures how long the
// steps between two messages take.
#pragma once

#include <chrono>
#include <memory>
#include <string>

#include "qxcore/ui/app/application.h"
#include "tools/qxworkbench/dark_colors.h"
#include "tools/qxworkbench/frame.h"
#include "tools/qxworkbench/script.h"

struct WorkbenchOptions {
  std::string folder;   // opened at the start; empty for none
  std::string script;   // its commands run, then the program ends
  std::string picture;  // written when all work is done, then the program ends
  std::string mode;     // show, answer or abort; empty for show
  bool timing = false;  // says at the end how long the longest step was
};

class WorkbenchApp : public SWinApp {
 public:
  explicit WorkbenchApp(const WorkbenchOptions& options) : SWinApp(WTEXT("qxworkbench")), m_options(options) {}

  int InitInstance() override;
  int OnIdle(long count) override;
  int PreTranslateMessage(MSG* message) override;
  int PumpMessage() override;

  // What the process exits with: 1 when something failed that nobody saw.
  int ExitCode() const { return m_exitCode; }
  // Until the program ends.
  void UseDarkColors() { m_darkColors = std::make_unique<DarkColors>(); }
  // The longest step so far, in milliseconds, and what it was.
  double LongestStep() const { return m_longest; }
  const std::string& LongestStepName() const { return m_longestName; }

 private:
  using Clock = std::chrono::steady_clock;

  bool StepFrame();
  bool RunScript();
  void TakePicture();
  void End(int code);
  void Measure(Clock::time_point begin, const std::string& name);

  WorkbenchOptions m_options;
  WorkbenchFrame* m_frame = nullptr;  // ends with its window
  std::unique_ptr<Script> m_script;
  std::unique_ptr<SetInteractiveMode> m_mode;
  std::unique_ptr<DarkColors> m_darkColors;
  int m_exitCode = 0;
  bool m_hasEnded = false;
  Clock::time_point m_messageBegan;
  bool m_isInMessage = false;
  double m_longest = 0;
  std::string m_longestName = "none";
};
