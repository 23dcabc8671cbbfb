// SFile's operations on names: splitting, making, normal forms and URLs.

#include "qxcore/platform/internal/path_parts.h"
#include "qxcore/platform/wide.h"
#include "qxcore/system/file/file.h"

namespace {

constexpr WCHAR kForbidden[] = WTEXT("/:*?<>|\"");

bool HoldsForbidden(const SString& text) {
  return text.View().find_first_of(SStringView(kForbidden)) != SStringView::npos;
}

void DropLeadingBackslash(SString& text) {
  if (!text.IsEmpty() && text[0] == '\\') text.Delete(0);
}

SString FullPath(const SString& path) {
  WCHAR buffer[MAX_PATH];
  return !path.IsEmpty() && platform::WideFullPath(buffer, path, MAX_PATH) != nullptr ? SString(buffer) : SString();
}

// Where the first part behind the root begins: "C:\", "\\server\share\".
std::size_t RootLength(SStringView full) {
  if (full.size() >= 2 && full[0] == '\\' && full[1] == '\\') {
    const std::size_t server = full.find(WCHAR('\\'), 2);
    const std::size_t share = server == SStringView::npos ? server : full.find(WCHAR('\\'), server + 1);
    return share == SStringView::npos ? full.size() : share + 1;
  }
  return 3;
}

using Renamer = DWORD(WINAPI*)(LPCWSTR, LPWSTR, DWORD);

// Through one of the two platform calls for long and short names; the path itself where that fails.
SString Spell(const SString& path, Renamer rename) {
  WCHAR buffer[2 * MAX_PATH];
  const DWORD length = rename(path, buffer, 2 * MAX_PATH);
  return length > 0 && length < 2 * MAX_PATH ? SString(buffer) : path;
}

}  // namespace

int SFile::CheckFilename() const {
  return !m_drive.IsEmpty() && !m_name.IsEmpty() && !HoldsForbidden(m_name) && m_name.FindPos('\\') < 0 &&
         !HoldsForbidden(m_directory);
}

int SFile::SplitFilename() { return SplitPath(m_fullName, m_drive, m_directory, m_name, m_extension); }

int SFile::SplitPath(const SString& path, SString& drive, SString& directory, SString& name, SString& extension) {
  const SString full = path;  // an output may be the same string
  const SStringView view = full.View();
  for (SString* part : {&directory, &name, &extension}) *part = SString();
  drive = GetCurrentDrive();
  std::size_t at = platform::DriveLength(view);
  if (at > 0) {
    drive = full.Left(static_cast<int>(at));
    if (view[1] == ':' || at < view.size()) drive += WCHAR('\\');
  }
  if (at < view.size() && view[at] == '\\') {
    ++at;
  } else {
    directory = GetCurrentDirectoryW();
    DropLeadingBackslash(directory);
  }
  const std::size_t last = view.find_last_of(WCHAR('\\'));
  if (last != SStringView::npos && last >= at) {
    if (!directory.IsEmpty()) directory += WCHAR('\\');
    directory += view.substr(at, last + 1 - at);
    at = last + 1;
  }
  const SStringView rest = view.substr(at);
  const std::size_t dot = rest.find_last_of(WCHAR('.'));
  if (dot == SStringView::npos) {
    name = rest;
  } else {
    name = rest.substr(0, dot);
    extension = rest.substr(dot + 1);
  }
  return !name.IsEmpty();
}

void SFile::MakeFilename() {
  // Without a drive only: an empty directory on a given drive is its root, as SplitFilename has it.
  if (m_drive.IsEmpty()) {
    m_drive = GetCurrentDrive();
    if (m_directory.IsEmpty()) m_directory = GetCurrentDirectoryW();
  }
  // Without a current drive the name stays relative, and leads nowhere.
  if (!m_drive.IsEmpty() && m_drive[m_drive.Length() - 1] != '\\') m_drive += WCHAR('\\');
  // The drive has the backslash between them.
  DropLeadingBackslash(m_directory);
  if (!m_directory.IsEmpty() && m_directory[m_directory.Length() - 1] != '\\') m_directory += WCHAR('\\');
  SString full = m_drive + m_directory + m_name;
  if (!m_extension.IsEmpty()) full += SString(WTEXT(".")) + m_extension;
  m_fullName = full;
}

int SFile::CheckSplitValidPath(const SString& path, SString* directory, SString* name) {
  SFile file;
  file.m_fullName = path;
  const int valid = file.SplitFilename() && file.CheckFilename() && !HoldsForbidden(file.m_extension);
  if (valid) file.MakeFilename();
  const int folderLength = file.m_drive.Length() + file.m_directory.Length();
  if (directory != nullptr) *directory = valid ? file.m_fullName.Left(folderLength) : SString();
  if (name != nullptr) *name = valid ? file.m_fullName.Mid(folderLength) : SString();
  return valid;
}

SString SFile::NormalizeDirectoryName(const SString& path) {
  SString full = FullPath(path);
  const std::size_t length = static_cast<std::size_t>(full.Length());
  if (length > RootLength(full.View()) && full[full.Length() - 1] == '\\') full.Delete(full.Length() - 1);
  return full;
}

SString SFile::NormalizeFileName(const SString& name, int asOnDisk) {
  const SString full = FullPath(name);
  if (asOnDisk == 0 || full.IsEmpty()) return full;
  if (Exists(full)) return ToLongNames(full);
  // The folder of a file to come can be spelled.
  const std::size_t last = full.View().find_last_of(WCHAR('\\'));
  if (last == SStringView::npos || last < RootLength(full.View())) return full;
  return ToLongNames(full.Left(static_cast<int>(last))) + full.Mid(static_cast<int>(last));
}

SString SFile::ToLongNames(const SString& path) { return Spell(path, ::GetLongPathNameW); }
SString SFile::ToShortNames(const SString& path) { return Spell(path, ::GetShortPathNameW); }

int SFile::IsFileURL(const SString& text, int exact) {
  const WCHAR* prefix = WTEXT("file://");
  return exact != 0 ? text.Compare(prefix, 7) == 0 : text.CompareNoCase(prefix, 7) == 0;
}

SString SFile::URLToPath(const SString& url) {
  if (!IsFileURL(url)) return url;
  // "file:///C|/x" names a drive, "file://server/x" a server, whose slashes stay.
  const bool local = url.Length() > 7 && url[7] == '/';
  SString path = url.Mid(local ? 8 : 5);
  path.ReplaceAll(WCHAR('/'), WCHAR('\\'));
  path.ReplaceAll(WCHAR('|'), WCHAR(':'));
  return path;
}

SString SFile::PathToURL(const SString& path) {
  if (path.IsEmpty()) return path;
  SString url = path[0] == '.' || path[0] == '%' ? path : FullPath(path);
  if (url.IsEmpty()) return url;
  if (url.Compare(WTEXT("\\\\"), 2) != 0) url = SString(WTEXT("///")) + url;
  url.ReplaceAll(WCHAR('\\'), WCHAR('/'));
  url.ReplaceAll(WCHAR(':'), WCHAR('|'));
  return SString(WTEXT("file:")) + url;
}

int SFile::IsReserved(const SString& name) {
  // The platform knows devices that are there; the others are known by their names alone.
  WIN32_FILE_ATTRIBUTE_DATA data;
  if (!name.IsEmpty() && ::GetFileAttributesExW(name, GetFileExInfoStandard, &data) &&
      (data.dwFileAttributes & FILE_ATTRIBUTE_DEVICE) != 0)
    return 1;
  const SStringView view = name.View();
  const std::size_t start = view.find_last_of(WTEXT("\\/:"));
  SStringView base = view.substr(start == SStringView::npos ? 0 : start + 1);
  base = base.substr(0, base.find(WCHAR('.')));
  while (!base.empty() && base.back() == ' ') base.remove_suffix(1);
  const SString word(base);
  for (const WCHAR* device : {WTEXT("CON"), WTEXT("AUX"), WTEXT("NUL"), WTEXT("PRN")})
    if (word.CompareNoCase(device) == 0) return 1;
  if (word.Length() != 4 || (word.CompareNoCase(WTEXT("COM"), 3) != 0 && word.CompareNoCase(WTEXT("LPT"), 3) != 0))
    return 0;
  const WCHAR number = word[3];
  return (number >= '1' && number <= '9') || number == 0xB9 || number == 0xB2 || number == 0xB3;
}
