// Scripts: one command a line, run one after the other without a person. The man page lists the commands.
//
// A command that fails ends the script with its line and reason; behind "-" it only says so, and the script goes on.
#pragma once

#include <string>
#include <vector>

#include "qxcore/core/throw_target.h"
#include "qxcore/ui/app/interaction_mode.h"
#include "tools/qxworkbench/frame.h"

class WorkbenchApp;

// What ends a script, in words for the user.
struct ScriptFailure {
  std::string text;
};

// Announces that aborts of dialogs are caught.
class ScriptTarget : public SThrowTarget {
 public:
  ScriptTarget() : SThrowTarget(WTEXT("Scripting")) { Activate(); }
};

// The mode that show, answer or abort names; an empty text is show. Throws Failure.
InteractiveMode ModeOf(const std::string& name);

class Script {
 public:
  // Reads the file. Throws Failure.
  explicit Script(const std::string& file);

  // Runs the next command, unless it waits for work to end. True while another one can run at once. Throws
  // ScriptFailure.
  bool Step(WorkbenchFrame& frame, WorkbenchApp& app);
  // Whether it waits for work to end.
  bool IsWaiting() const { return m_waits; }

  // The command that runs has failed; called by what it started, too.
  void Fail(const SString& text) { m_failure = text; }

 private:
  struct Line {
    int number;
    bool mayFail;
    std::vector<std::string> words;
  };

  void Run(const Line& line, WorkbenchFrame& frame, WorkbenchApp& app);
  void Settle(const Line& line);
  bool HasComeUp(const Line& line, WorkbenchFrame& frame);

  std::string m_file;
  std::vector<Line> m_lines;
  std::size_t m_next = 0;
  bool m_waits = false;
  SString m_failure;
  ScriptTarget m_target;
};
