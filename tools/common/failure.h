// How the tool ends, and how it says what went wrong.
#pragma once

#include <string>
#include <string_view>

enum ExitCode { kDone = 0, kFailed = 1, kWrongUsage = 2, kLossy = 3 };

// Something that ends a command, in words for the user. `place` is the file that it happened to, where
// that is known already.
struct Failure {
  std::string text;
  ExitCode code = kFailed;
  std::string place = {};
};

// The reader of our standard output has gone; no error, there is just nobody left to write for.
struct BrokenPipe {};

// The name of the program, which begins each complaint; "qxtool" until it is set. The text must live as long as the
// process.
void SetProgramName(const char* name);

// Writes "NAME: ..." in one line to standard error.
void Complain(std::string_view text);

// The failure that is being handled, in words. Only within a catch block. Cancelling and a broken pipe
// are thrown on; everything else is a reason that belongs to one file.
std::string ReasonOfCurrentException();

// Throws the failure that is being handled as one that happened to `place`, unless it has a place already
// or is none that belongs to a file. Only within a catch block.
[[noreturn]] void FailAt(const std::string& place);

// What the system says about one of its last-error values.
std::string SystemText(unsigned long error);
