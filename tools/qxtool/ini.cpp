// qxtool ini: keys of initialisation files, as the platform's functions read and write them.

#include <algorithm>
#include <string>
#include <vector>

#include "qxcore/stream/input_file.h"
#include "qxcore/stream/output_file.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/settings/profile.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/json.h"

namespace {

using Text = std::basic_string<WCHAR>;

// The whole path; a name without a folder would be looked for elsewhere.
SString PathOf(const IniOptions& options) {
  const SString path = SFile::NormalizeFileName(console::NameOf(options.file), 1);
  if (path.IsEmpty())
    throw Failure{ToUtf8(SFile::GetStatusText(static_cast<HRESULT>(SFile::kInvalidFilename))), kFailed, options.file};
  return path;
}

SString ExistingPath(const IniOptions& options) {
  const SString path = PathOf(options);
  if (!SFile::IsFile(path))
    throw Failure{ToUtf8(SFile::GetStatusText(static_cast<HRESULT>(SFile::kNotFound))), kFailed, options.file};
  return path;
}

// Whatever its length. Null names ask for lists, whose items end with NUL.
Text Read(const SString& path, const WCHAR* section, const WCHAR* key, const WCHAR* standard) {
  const DWORD cut = key == nullptr || section == nullptr ? 2 : 1;
  for (DWORD room = 1024;; room *= 4) {
    Text text(room, 0);
    const DWORD length = GetPrivateProfileStringW(section, key, standard, text.data(), room, path);
    text.resize(length);
    if (length < room - cut) return text;
  }
}

std::vector<SString> ReadList(const SString& path, const WCHAR* section) {
  std::vector<SString> names;
  const Text list = Read(path, section, nullptr, WTEXT(""));
  for (std::size_t start = 0; start < list.size();) {
    const std::size_t end = std::min(list.find(WCHAR{0}, start), list.size());
    names.emplace_back(SStringView(list).substr(start, end - start));
    start = end + 1;
  }
  return names;
}

// False when there is no such key, which only shows in whatever stands in for its value.
bool Find(const SString& path, const SString& section, const SString& key, SString& value) {
  const Text one = Read(path, section, key, WTEXT("1")), two = Read(path, section, key, WTEXT("2"));
  value = SStringView(one);
  return one == two;
}

// --- what a file can hold ---

bool IsAscii(const std::string& text) {
  return std::all_of(text.begin(), text.end(), [](char c) { return static_cast<signed char>(c) >= 0; });
}

bool StartsWith(const std::string& bytes, std::string_view mark) { return bytes.compare(0, mark.size(), mark) == 0; }

// A mark of Unicode at the start says that a file holds every text.
bool HasMark(const std::string& bytes) {
  return StartsWith(bytes, "\xFF\xFE") || StartsWith(bytes, "\xFE\xFF") || StartsWith(bytes, "\xEF\xBB\xBF");
}

bool IsOfAnsiPage(const SString& text) {
  BOOL isReplaced = FALSE;
  const int size = WideCharToMultiByte(CP_ACP, WC_NO_BEST_FIT_CHARS, text, text.Length(), nullptr, 0, nullptr,
                                       GetACP() == CP_UTF8 ? nullptr : &isReplaced);
  return text.IsEmpty() || (size > 0 && !isReplaced);
}

std::string ContentOf(const SString& path) {
  std::string content;
  if (!SFile::IsFile(path)) return content;
  SInputFile file(path);
  char piece[4096];
  while (const unsigned long count = file.Read(piece, sizeof piece)) content.append(piece, count);
  return content;
}

// Sees to it that the file can hold the texts. What has no mark is read and written in the ANSI code page, where other
// characters would become question marks; and in UTF-8 without a mark what is added would be wrong bytes.
void MakeRoomFor(const SString& path, const IniOptions& options) {
  if (IsAscii(options.section) && IsAscii(options.key) && IsAscii(options.value)) return;
  const std::string content = ContentOf(path);
  if (HasMark(content)) return;
  if (GetACP() != CP_UTF8 && !IsAscii(content) && ToUtf8(FromUtf8(content)) == content)
    throw Failure{"the file is UTF-8 without a mark at its start, and would be read in another encoding", kFailed,
                  options.file};
  bool isOfPage = true;
  for (const std::string* text : {&options.section, &options.key, &options.value})
    isOfPage = isOfPage && IsOfAnsiPage(FromUtf8(*text));
  if (isOfPage) return;
  if (!content.empty())
    throw Failure{"some characters are not in the code page of the file; convert it to UTF-16 with a mark", kFailed,
                  options.file};
  SOutputFile file(path);
  file.Write("\xFF\xFE", 2);
  file.Close();
}

}  // namespace

int GetIni(const IniOptions& options) {
  SString value;
  if (!Find(ExistingPath(options), FromUtf8(options.section), FromUtf8(options.key), value))
    throw Failure{"there is no such key", kFailed, options.file};
  Print(options.json ? "{\"version\":1,\"value\":" + JsonString(value) + "}\n" : ToUtf8(value) + "\n");
  return kDone;
}

int SetIni(const IniOptions& options) {
  for (const std::string* text : {&options.section, &options.key, &options.value})
    if (text->find_first_of("\r\n") != std::string::npos) throw Failure{"a line end cannot be kept", kWrongUsage};
  const SString path = PathOf(options);
  MakeRoomFor(path, options);
  SProfile profile(path, FromUtf8(options.section), 0);
  if (profile.WriteProfile(FromUtf8(options.key), FromUtf8(options.value)) != S_OK)
    throw Failure{SystemText(GetLastError()), kFailed, options.file};
  return kDone;
}

int ListIni(const IniOptions& options) {
  const SString path = ExistingPath(options);
  const SString section = FromUtf8(options.section);
  const bool isOfKeys = !options.section.empty();
  std::string json = isOfKeys ? "{\"version\":1,\"entries\":[" : "{\"version\":1,\"sections\":[";
  const char* separator = "\n";
  for (const SString& name : ReadList(path, isOfKeys ? section.GetSafePointer() : nullptr)) {
    SString value;
    if (isOfKeys) Find(path, section, name, value);
    if (!options.json) Print(ToUtf8(name) + (isOfKeys ? "=" + ToUtf8(value) : "") + "\n");
    json += separator +
            (isOfKeys ? "{\"key\":" + JsonString(name) + ",\"value\":" + JsonString(value) + "}" : JsonString(name));
    separator = ",\n";
  }
  if (options.json) Print(json + "\n]}\n");
  return kDone;
}
