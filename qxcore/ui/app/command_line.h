// SCommandLine: the words of a command line, told apart as program, switches and files.
//
// Words are split by the rules of the platform's runtime: blanks and tabs separate; quotation marks hold blanks
// together; 2n backslashes before a quotation mark stand for n and the mark counts, 2n + 1 for n and the mark is a
// character of the word; two marks inside a quotation are one. The program's name ends at its closing mark, and
// backslashes in it are ordinary.
//
// A word that begins with "-" or "/" is a switch, unless a "--" came before; "-" alone is a file. A switch is kept
// without its mark; a value may follow behind ":" or "=". Names are compared without regard to case.
// Threads: a value belongs to one thread at a time; the functions serve any thread.
#pragma once

#include "qxcore/container/string_table.h"
#include "qxcore/platform/export.h"
#include "qxcore/string/string.h"

class QXCORE_API SCommandLine {
 public:
  SCommandLine() = default;
  // Reads a command line that begins with the program, as GetCommandLineW returns it.
  explicit SCommandLine(const SString& commandLine) { Parse(commandLine); }

  // Replaces the content. Throws SEOutOfMemory.
  void Parse(const SString& commandLine);

  const SString& GetProgram() const { return m_program; }         // the first word
  const SStringTable& GetSwitches() const { return m_switches; }  // without marks, in their order
  const SStringTable& GetFiles() const { return m_files; }        // all other words, in their order
  const SStringTable& GetWords() const { return m_words; }        // everything behind the program as it stood
  const SString& GetText() const { return m_text; }               // the whole line

  // True when the switch is there, with or without a value.
  bool HasSwitch(LPCWSTR name) const;
  // The value of the switch's last occurrence; empty when the switch is missing or has no value.
  SString GetSwitchValue(LPCWSTR name) const;

 private:
  void Add(const SString& word, bool* onlyFiles);

  SString m_text;
  SString m_program;
  SStringTable m_words;
  SStringTable m_switches;
  SStringTable m_files;
};
