// The commands with their options, as a user types them.
#pragma once

#include <string>
#include <vector>

// Runs the command that the arguments (without the program's name) ask for, or prints help or version, and returns
// the exit code. Throws Failure for wrong usage, and what commands throw (see commands.h).
int RunCommandLine(std::vector<std::string> arguments);
