// What the samples share: arguments, printing and failing.
#pragma once

#include <cstdio>
#include <exception>

#include "qxcore/core/exception.h"
#include "qxcore/string/string.h"

// Prints the text in UTF-8 and ends the line.
inline void PrintLine(const SString& text, std::FILE* to = stdout) { std::fprintf(to, "%s\n", text.ToUtf8().c_str()); }

// Runs the program and returns its exit code. The library's exceptions are not derived from std::exception, so a
// program that catches everything names both.
template <class Program>
int RunProgram(const char* name, Program program) {
  try {
    return program();
  } catch (const SException& e) {
    PrintLine(SString(name) + WTEXT(": ") + e.GetText(), stderr);
  } catch (const std::exception& e) {
    std::fprintf(stderr, "%s: %s\n", name, e.what());
  }
  return 1;
}
