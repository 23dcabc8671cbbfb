// What the tools need of the system around a process and what the library does not offer: arguments
// and paths, binary standard streams, terminals, interruption. The only part of the tools
// that knows which system it runs on.
#pragma once

#include <cstdio>
#include <filesystem>
#include <string>
#include <string_view>
#include <vector>

#include "qxcore/string/string.h"

namespace console {

// Binary standard streams, UTF-8 on the screen, and no death by a broken pipe. Call it once, first.
void SetUpStreams();
// The same, and an interruption (Ctrl-C, termination, a terminal that is closed) that is remembered.
void SetUp();

// The arguments behind the program's name: UTF-8 on Windows, elsewhere the bytes as they are.
std::vector<std::string> Arguments(int argc, char** argv);

// True once the user asked for an end. A second request ends the process at once.
bool Interrupted();
// What the tool then exits with: 130 after Ctrl-C, 143 after termination, 129 after the terminal was closed.
int InterruptedCode();

// Calls `wake` on another thread whenever the user asks for an end, for a program that waits for something else. Call
// it once, behind SetUp.
void WakeWhenInterrupted(void (*wake)());

// A file that is removed when a second interruption ends the process at once; null for none.
void RemoveWhenKilled(const std::filesystem::path* path);

bool IsTerminal(std::FILE* stream);

// Asks for a screen that a person sees, where none is the usual; QXCORE_DISPLAY in the environment comes before. Call
// it before the first window.
void WantScreen();

// True when the last failed write of the C library says that the reader of a pipe has gone.
bool IsBrokenPipe(int error);

// The file that an argument names, as the library spells it. An argument is a path of the system; what the library
// itself writes ("C:\..." on every system) is understood, too, unless a file of just this name exists.
SString NameOf(const std::string& argument);
// The same as a path of the system.
std::string NativeOf(const std::string& argument);
std::filesystem::path PathOf(const std::string& native);

// Opens a file that is written from its start, in binary; null and errno on failure.
std::FILE* OpenForWriting(const std::filesystem::path& path);
// Makes a file that must not be there yet, readable for its user alone if it is to be private.
std::FILE* OpenNew(const std::filesystem::path& path, bool isPrivate);

// Hands everything written so far to the disk; false and errno on failure.
bool Synchronise(std::FILE* file);

}  // namespace console
