// Initialisation files of any bytes: what is listed can be read, a write changes one line and nothing else.

#include <fcntl.h>
#include <unistd.h>

#include <string>
#include <vector>

#include "fuzz/fuzz_input.h"
#include "qxcore/system/settings/profile.h"

namespace {

using Text = std::basic_string<WCHAR>;

const std::string& NativePath() {
  static const std::string path = "/dev/shm/fuzz_ini." + std::to_string(getpid());
  return path;
}

SString Path() {
  SString path(WTEXT("C:"));
  path += NativePath().c_str();
  path.ReplaceAll(static_cast<WCHAR>('/'), static_cast<WCHAR>('\\'));
  return path;
}

void Write(const std::string& bytes) {
  const int file = open(NativePath().c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
  FUZZ_CHECK(write(file, bytes.data(), bytes.size()) == static_cast<ssize_t>(bytes.size()));
  close(file);
}

std::string Read() {
  std::string bytes(1 << 16, '\0');
  const int file = open(NativePath().c_str(), O_RDONLY);
  const ssize_t count = read(file, bytes.data(), bytes.size());
  close(file);
  bytes.resize(static_cast<std::size_t>(count));
  return bytes;
}

// What is missing reads as the default.
Text Value(const WCHAR* section, const WCHAR* key) {
  WCHAR text[4096];
  GetPrivateProfileStringW(section, key, WTEXT("\xFFFF"), text, 4096, Path());
  return text;
}

std::vector<Text> List(const WCHAR* section) {
  WCHAR text[8192];
  const DWORD length = GetPrivateProfileStringW(section, nullptr, nullptr, text, 8192, Path());
  std::vector<Text> names;
  for (const WCHAR* name = text; name < text + length; name += names.back().size() + 1) names.emplace_back(name);
  return names;
}

// Names that stand for themselves when they are written.
bool IsPlain(const Text& text) {
  for (const WCHAR c : text)
    if (c < ' ' || c > 0x7E || SStringView(WTEXT("[]=;'\"")).find(c) != SStringView::npos) return false;
  return !text.empty() && text.front() != ' ' && text.back() != ' ' && text.size() < 200;
}

// The parts of both that differ lie within one line of each.
void CheckOneLineChanged(const std::string& before, const std::string& after) {
  std::size_t start = 0, end = 0;
  const std::size_t shorter = before.size() < after.size() ? before.size() : after.size();
  while (start < shorter && before[start] == after[start]) ++start;
  while (end < shorter - start && before[before.size() - 1 - end] == after[after.size() - 1 - end]) ++end;
  const std::string gone = before.substr(start, before.size() - start - end);
  std::size_t lineEnds = 0;
  for (std::size_t i = 0; i < gone.size(); ++i) lineEnds += gone[i] == '\n' || (gone[i] == '\r' && gone[i + 1] != '\n');
  FUZZ_CHECK(lineEnds <= 1);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 4000) return 0;
  FuzzInput input(data, size);
  const Text section = ToText(input.Part("\n")), key = ToText(input.Part("\n")), value = ToText(input.Part("\n"));
  const std::string before(input.Rest());
  Write(before);

  const bool isWide = before.rfind("\xFF\xFE", 0) == 0 || before.rfind("\xFE\xFF", 0) == 0;
  bool hasNul = false;  // where a name ends for a caller
  for (std::size_t i = 0; i + isWide < before.size(); i += 1 + isWide)
    hasNul = hasNul || (before[i] == 0 && before[i + isWide] == 0);

  const SString path = Path();
  struct Entry {
    Text section, key, value;
  };
  std::vector<Entry> entries;
  for (const Text& one : List(nullptr)) {
    for (const Text& name : List(one.c_str())) {
      entries.push_back({one, name, Value(one.c_str(), name.c_str())});
      FUZZ_CHECK(hasNul || entries.back().value != WTEXT("\xFFFF"));
    }
  }
  if (!IsPlain(section) || !IsPlain(key) || !IsPlain(value)) return 0;

  SProfile profile(path, section.c_str(), 0);
  FUZZ_CHECK(profile.WriteProfile(key.c_str(), SString(value.c_str())) == S_OK);
  const std::string after = Read();
  FUZZ_CHECK(Value(section.c_str(), key.c_str()) == value);
  if (!isWide) CheckOneLineChanged(before, after);
  for (const Entry& entry : entries) {
    const bool isWritten = SString(entry.section.c_str()).CompareNoCase(section.c_str()) == 0 &&
                           SString(entry.key.c_str()).CompareNoCase(key.c_str()) == 0;
    if (!isWritten && !hasNul) FUZZ_CHECK(Value(entry.section.c_str(), entry.key.c_str()) == entry.value);
  }
  FUZZ_CHECK(profile.WriteProfile(key.c_str(), SString(value.c_str())) == S_OK);
  FUZZ_CHECK(Read() == after);
  FUZZ_CHECK(WritePrivateProfileStringW(section.c_str(), key.c_str(), nullptr, path));
  WritePrivateProfileStringW(section.c_str(), nullptr, nullptr, path);
  return 0;
}
