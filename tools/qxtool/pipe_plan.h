// Which files convert, escape and unescape read and write.
#pragma once

#include <string>
#include <vector>

#include "tools/qxtool/commands.h"

// Both are arguments (console::NameOf); "-" is a standard stream.
struct PipePair {
  std::string in, out;
};

// From the files and the options for where to write. Throws Failure for wrong usage, folders without --recursive or
// that cannot be read, and two files that would become one.
std::vector<PipePair> PlanPipes(const TextPipeOptions& options);
