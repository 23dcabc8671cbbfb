#include "qxcore/ui/app/command_line.h"

#include "qxcore/string/string_buffer.h"

namespace {

bool IsBlank(WCHAR c) { return c == ' ' || c == '\t'; }

// Takes words off the front of a line.
class WordReader {
 public:
  explicit WordReader(SStringView line) : m_rest(line) {}

  SString Program() {
    SStringBuffer word;
    bool isQuoted = false;
    while (!m_rest.empty() && (isQuoted || !IsBlank(m_rest.front()))) {
      const WCHAR c = Take();
      if (c == '"') {
        isQuoted = !isQuoted;
      } else {
        word += c;
      }
    }
    return SString(word);
  }

  bool SkipToWord() {
    while (!m_rest.empty() && IsBlank(m_rest.front())) m_rest.remove_prefix(1);
    return !m_rest.empty();
  }

  SString Word() {
    SStringBuffer word;
    bool isQuoted = false;
    while (!m_rest.empty() && (isQuoted || !IsBlank(m_rest.front()))) {
      const std::size_t backslashes = TakeBackslashes();
      const bool beforeMark = !m_rest.empty() && m_rest.front() == '"';
      for (std::size_t i = beforeMark ? backslashes / 2 : backslashes; i > 0; --i) word += WCHAR('\\');
      if (!beforeMark) {
        if (!m_rest.empty() && (isQuoted || !IsBlank(m_rest.front()))) word += Take();
      } else if (Take(); backslashes % 2 != 0) {
        word += WCHAR('"');
      } else if (isQuoted && !m_rest.empty() && m_rest.front() == '"') {
        word += Take();
      } else {
        isQuoted = !isQuoted;
      }
    }
    return SString(word);
  }

 private:
  WCHAR Take() {
    const WCHAR c = m_rest.front();
    m_rest.remove_prefix(1);
    return c;
  }
  std::size_t TakeBackslashes() {
    std::size_t count = 0;
    for (; !m_rest.empty() && m_rest.front() == '\\'; ++count) m_rest.remove_prefix(1);
    return count;
  }

  SStringView m_rest;
};

// A switch as name and value.
struct Switch {
  explicit Switch(SStringView text) {
    const std::size_t end = text.find_first_of(WTEXT(":="));
    name = SString(text.substr(0, end));
    if (end != SStringView::npos) value = SString(text.substr(end + 1));
  }
  SString name;
  SString value;
};

}  // namespace

void SCommandLine::Parse(const SString& commandLine) {
  SCommandLine parsed;
  parsed.m_text = commandLine;
  WordReader reader(parsed.m_text);
  parsed.m_program = reader.Program();
  bool onlyFiles = false;
  while (reader.SkipToWord()) parsed.Add(reader.Word(), &onlyFiles);
  *this = parsed;
}

void SCommandLine::Add(const SString& word, bool* onlyFiles) {
  m_words.Add(word);
  if (!*onlyFiles && word == WTEXT("--")) {
    *onlyFiles = true;
  } else if (!*onlyFiles && word.Length() > 1 && (word[0] == '-' || word[0] == '/')) {
    m_switches.Add(SString(word.View().substr(word.View().starts_with(WTEXT("--")) ? 2 : 1)));
  } else {
    m_files.Add(word);
  }
}

bool SCommandLine::HasSwitch(LPCWSTR name) const {
  for (int i = 0; i < m_switches.GetCount(); ++i) {
    if (Switch(m_switches[i].View()).name.CompareNoCase(name) == 0) return true;
  }
  return false;
}

SString SCommandLine::GetSwitchValue(LPCWSTR name) const {
  for (int i = m_switches.GetCount() - 1; i >= 0; --i) {
    const Switch found(m_switches[i].View());
    if (found.name.CompareNoCase(name) == 0) return found.value;
  }
  return SString();
}
