#include "tools/qxtool/entry_path.h"

#include <algorithm>
#include <filesystem>
#include <string_view>
#include <system_error>

#include "qxcore/system/file/file.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

namespace fs = std::filesystem;

namespace {

[[noreturn]] void Refuse(const SString& name, const char* why) {
  throw Failure{"entry \"" + Shown(name) + "\" cannot be extracted: " + why};
}

bool IsSeparator(WCHAR c) { return c == '/' || c == '\\'; }

bool IsLink(const std::string& path) {
  std::error_code error;
  if (fs::is_symlink(fs::symlink_status(console::PathOf(path), error))) return true;
  // What the standard library does not know: Windows has more kinds of links.
  unsigned long attributes = 0;
  return SFile(SFile::FromNative(path)).GetAttributes(attributes) == S_OK &&
         (attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0;
}

std::string CheckedPart(const SString& name, SStringView part) {
  if (part.find_first_not_of(WTEXT(". ")) == SStringView::npos) Refuse(name, "its name leads out of the folder");
  if (part.find(':') != SStringView::npos) Refuse(name, "its name holds a colon");
  if (SFile::IsReserved(SString(part))) Refuse(name, "its name is that of a device");
  return ToUtf8(part);
}

}  // namespace

std::string Shown(const SString& name) {
  SString shown = name;
  for (int i = 0; i < shown.Length(); ++i) {
    const WCHAR c = shown[i];
    if (c < 0x20 || (c >= 0x7F && c < 0xA0)) shown.SetAt(i, '?');
  }
  return ToUtf8(shown);
}

std::vector<std::string> PartsOfEntry(const SString& name) {
  std::vector<std::string> parts;
  SStringView rest = name.View();
  if (!rest.empty() && IsSeparator(rest[0])) Refuse(name, "its name is absolute");
  while (!rest.empty()) {
    const auto end = std::find_if(rest.begin(), rest.end(), IsSeparator);
    const SStringView part = rest.substr(0, static_cast<std::size_t>(end - rest.begin()));
    if (!part.empty() && part != WTEXT(".")) parts.push_back(CheckedPart(name, part));
    rest.remove_prefix(std::min(rest.size(), part.size() + 1));
  }
  return parts;
}

std::string FolderForParts(const std::string& root, const std::vector<std::string>& parts, std::size_t count) {
  std::string folder = root;
  for (std::size_t i = 0; i < count; ++i) {
    folder += "/" + parts[i];
    if (IsLink(folder)) throw Failure{"a link is in the way", kFailed, folder};
    const fs::path path = console::PathOf(folder);
    std::error_code error;
    fs::create_directory(path, error);
    if (fs::is_directory(path)) continue;
    const bool isTaken = fs::exists(path);
    throw Failure{isTaken ? "a file is in the way" : "the folder cannot be made: " + error.message(), kFailed, folder};
  }
  return folder;
}

void RequireFileCanBeAt(const std::string& path, bool mayReplace) {
  if (IsLink(path)) throw Failure{"a link is in the way", kFailed, path};
  std::error_code error;
  const fs::file_status status = fs::status(console::PathOf(path), error);
  if (!fs::exists(status)) return;
  if (!mayReplace) throw Failure{"exists already; --force replaces it", kFailed, path};
  if (!fs::is_regular_file(status)) throw Failure{"something that is no file is in the way", kFailed, path};
}
