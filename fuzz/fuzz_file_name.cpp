// File names taken apart and put together, beside a plain reading of the rules; normal forms are fixed points.

#include <algorithm>

#include "fuzz/fuzz_input.h"
#include "qxcore/system/file/file.h"

namespace {

using Text = std::basic_string<WCHAR>;

struct Parts {
  Text drive, directory, name, extension;
  friend bool operator==(const Parts&, const Parts&) = default;
};

Text Of(const SString& text) { return Text(text.View()); }

Parts Split(const SString& path) {
  SString drive, directory, name, extension;
  const int good = SFile::SplitPath(path, drive, directory, name, extension);
  FUZZ_CHECK((good != 0) == !name.IsEmpty());
  return {Of(drive), Of(directory), Of(name), Of(extension)};
}

// The parts of a path that begins with a drive or a server and a backslash behind it.
Parts SplitAbsolute(const Text& path) {
  const std::size_t end = path[1] == ':' ? 2 : path.find(WTEXT('\\'), 2);
  const std::size_t last = path.find_last_of(WTEXT('\\'));
  Parts parts{path.substr(0, end) + WTEXT("\\"), path.substr(end + 1, last - end), path.substr(last + 1), {}};
  const std::size_t dot = parts.name.find_last_of(WTEXT('.'));
  if (dot != Text::npos) {
    parts.extension = parts.name.substr(dot + 1);
    parts.name.resize(dot);
  }
  return parts;
}

bool IsAbsolute(const Text& path) {
  if (path.size() < 3) return false;
  if (path[0] == '\\' && path[1] == '\\') return path.find(WTEXT('\\'), 2) != Text::npos;
  return path[1] == ':' && path[2] == '\\';
}

bool HoldsAny(const Text& text, const WCHAR* set) { return text.find_first_of(set) != Text::npos; }

void CheckNormal(const SString& full, SString (*normalize)(const SString&)) {
  if (full.IsEmpty()) return;
  FUZZ_CHECK(full.Length() < MAX_PATH);
  FUZZ_CHECK(!HoldsAny(Of(full), WTEXT("/")));
  if (full.Compare(WTEXT("\\\\?\\"), 4) == 0) return;  // means nothing in front of a drive, else it is a server's name
  FUZZ_CHECK(normalize(full) == full);
  if (full[0] == '\\') return;  // a server may have any name
  const Text inside = Of(full) + WTEXT("\\");
  FUZZ_CHECK(inside.find(WTEXT("\\.\\")) == Text::npos && inside.find(WTEXT("\\..\\")) == Text::npos);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 600) return 0;
  const Text text = ToText(FuzzInput(data, size).Rest());
  const SString path(text.c_str());
  const Parts parts = Split(path);
  if (IsAbsolute(text)) FUZZ_CHECK(parts == SplitAbsolute(text));
  FUZZ_CHECK(!HoldsAny(parts.name, WTEXT("\\")));

  SFile file;
  const bool isValid = file.Init(path) == SFile::kOk;
  const WCHAR* forbidden = WTEXT("/:*?<>|\"");
  FUZZ_CHECK(isValid ==
             (!parts.name.empty() && !HoldsAny(parts.name, forbidden) && !HoldsAny(parts.directory, forbidden)));
  FUZZ_CHECK(file.GetFullName() == path);

  // What was taken apart is made whole again, but for a dot without an extension and doubled backslashes.
  file.MakeFilename();
  const bool isDoubled = !parts.directory.empty() && parts.directory[0] == '\\';
  if (IsAbsolute(text) && !isDoubled && text.back() != '.') FUZZ_CHECK(file.GetFullName() == path);
  const SString made = file.GetFullName();
  file.MakeFilename();
  if (!isDoubled) FUZZ_CHECK(file.GetFullName() == made);

  SString directory, name;
  if (SFile::CheckSplitValidPath(path, &directory, &name)) {
    FUZZ_CHECK(isValid);
    FUZZ_CHECK(directory + name == made);
    FUZZ_CHECK(!HoldsAny(Of(name), WTEXT("\\")));
  } else {
    FUZZ_CHECK(directory.IsEmpty() && name.IsEmpty());
  }
  CheckNormal(SFile::NormalizeDirectoryName(path), SFile::NormalizeDirectoryName);
  CheckNormal(SFile::NormalizeFileName(path), [](const SString& name) { return SFile::NormalizeFileName(name); });
  return 0;
}
