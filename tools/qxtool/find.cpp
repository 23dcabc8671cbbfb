// qxtool find: the files or the folders of a tree, a line a path or as JSON.

#include <algorithm>
#include <vector>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/file/recurse_find.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/progress_bar.h"
#include "tools/common/standard_streams.h"
#include "tools/common/unread_folder.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/attributes.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/file_time.h"
#include "tools/qxtool/json.h"

namespace {

constexpr const WCHAR* kEverything = WTEXT("*.*");
constexpr unsigned long kBits[] = {FILE_ATTRIBUTE_READONLY,     FILE_ATTRIBUTE_HIDDEN,  FILE_ATTRIBUTE_SYSTEM,
                                   FILE_ATTRIBUTE_DIRECTORY,    FILE_ATTRIBUTE_ARCHIVE, FILE_ATTRIBUTE_DEVICE,
                                   FILE_ATTRIBUTE_REPARSE_POINT};

struct Entry {
  SString path;
  std::string json;  // what is printed instead of the path; empty without --json
};

struct Unread {
  SString folder;
  unsigned long error;
};

// Keeps what could not be read until it can be said.
class UnreadFolders final : public SFindFailureSink {
 public:
  void OnFolderNotRead(const SString& folder, unsigned long error) override {
    try {
      m_all.push_back({folder, error});
    } catch (...) {
      m_isComplete = false;
    }
  }
  // Says on standard error what came since the last time.
  void Tell() {
    for (; m_told < m_all.size(); ++m_told) {
      FlushPrinted();  // so that both streams say things in the same order
      Complain(ShortenedPath(m_all[m_told].folder) + ": " + Why(m_all[m_told]));
    }
    if (!m_isComplete) throw Failure{"memory is out"};
  }
  const std::vector<Unread>& All() const { return m_all; }
  static std::string Why(const Unread& unread) { return WhyNotSearched(unread.folder, unread.error); }

 private:
  std::vector<Unread> m_all;
  std::size_t m_told = 0;
  bool m_isComplete = true;
};

unsigned long AttributesOf(const SFinder& finder) {
  unsigned long attributes = 0;
  for (const unsigned long bit : kBits)
    if (finder.MatchesMask(bit)) attributes |= bit;
  return attributes;
}

std::string AsJson(const SFinder& finder) {
  const SFile file(finder.GetFilePath());
  FILETIME time;
  const TimeTexts written = file.GetDateTime(&time) == SFile::kOk ? TimeTexts(time) : TimeTexts();
  return "{\"path\":" + JsonString(file.GetFullName()) + ",\"bytes\":" + std::to_string(finder.GetLength()) +
         ",\"written\":" + JsonStringOrNull(written.utc) + ",\"attributes\":" + JsonValue(AttributesOf(finder)) + "}";
}

// Prints entries, at once or, to be sorted, at the end.
class Output {
 public:
  explicit Output(const FindOptions& options) : m_options(options), m_separator(options.json ? "\n" : "") {}

  void Add(const SFinder& finder) {
    Entry entry{finder.GetFilePath(), m_options.json ? AsJson(finder) : std::string()};
    if (m_options.sorted) {
      m_entries.push_back(std::move(entry));
    } else {
      Put(entry);
    }
  }
  void Finish() {
    std::sort(m_entries.begin(), m_entries.end(), [](const Entry& a, const Entry& b) { return a.path < b.path; });
    for (const Entry& entry : m_entries) Put(entry);
  }

 private:
  void Put(const Entry& entry) {
    if (!m_options.json) {
      Print(m_options.native ? SFile::ToNative(entry.path) : ToUtf8(entry.path));
      return Print(std::string_view(m_options.nulls ? "\0" : "\n", 1));
    }
    Print(m_separator + entry.json);
    m_separator = ",\n";
  }

  const FindOptions& m_options;
  std::string m_separator;
  std::vector<Entry> m_entries;
};

// A mask with its characters as names have them; * and ? stand for any.
SString MaskOf(const std::string& mask) {
  SString text;
  for (std::size_t at = 0; at <= mask.size();) {
    const std::size_t end = std::min(mask.find_first_of("*?", at), mask.size());
    text += SFile::FromNative(std::string_view(mask).substr(at, end - at));
    if (end < mask.size()) text += static_cast<WCHAR>(mask[end]);
    at = end + 1;
  }
  return text;
}

// What a name must be like to be listed, as far as the finders leave that to their caller.
class Wanted {
 public:
  explicit Wanted(const FindOptions& options)
      : m_match(AttributesOf(options.match, "--match")),
        m_reject(AttributesOf(options.reject, "--reject")),
        m_mask(IsFoundByFinder(options) ? SString(kEverything) : MaskOf(options.mask)) {
    if (options.mask.find_first_of("\\/") != std::string::npos)
      throw Failure{"MASK: \"" + options.mask + "\" is a path; names are looked for in every folder", kWrongUsage};
  }
  // The finder of folders asks the mask in the first folder only, and for the finder of files a mask without
  // wildcards may be a folder.
  static bool IsFoundByFinder(const FindOptions& options) {
    return !options.folders && options.mask.find('*') != std::string::npos;
  }
  unsigned long Rejected() const { return m_reject; }
  bool Fits(const SFinder& finder) const {
    if (m_match != 0 && !finder.MatchesMask(m_match)) return false;
    if (finder.MatchesMask(m_reject)) return false;
    return m_mask == kEverything || finder.GetFileName().MatchNoCase(m_mask);
  }

 private:
  static unsigned long AttributesOf(const std::string& text, const char* option) {
    return text.empty() ? 0 : ::AttributesOf(text, option);
  }

  unsigned long m_match, m_reject;
  SString m_mask;
};

template <class Finder>
void Walk(const SString& mask, const FindOptions& options, const Wanted& wanted, Output& output,
          UnreadFolders& unread) {
  // Entries that are printed on a terminal show by themselves how far it is.
  const bool showsProgress = options.sorted || !console::IsTerminal(stdout);
  ProgressBar progress(options.folder, options.folders ? "folders" : "files");
  Finder finder;
  finder.SetFailureSink(&unread);
  std::uint64_t count = 0;
  for (int found = finder.FindFile(mask, wanted.Rejected()); found; found = finder.FindNextFileW()) {
    if (console::Interrupted()) throw SEIOAbortedException();
    if (wanted.Fits(finder)) output.Add(finder);
    if (unread.All().size() > 0) {
      progress.Clear();
      unread.Tell();
    }
    if (showsProgress) progress.SetPos(++count);
  }
}

void PrintErrors(const std::vector<Unread>& unread) {
  const char* separator = "";
  for (const Unread& one : unread) {
    Print(separator + std::string("\n{\"folder\":") + JsonString(one.folder) +
          ",\"error\":" + JsonString(FromUtf8(UnreadFolders::Why(one))) + "}");
    separator = ",";
  }
}

}  // namespace

int Find(const FindOptions& options) {
  const Wanted wanted(options);
  const SString folder = FolderToSearch(console::NameOf(options.folder));
  const bool isRoot = folder[folder.Length() - 1] == '\\';
  const SString mask = folder + (isRoot ? WTEXT("") : WTEXT("\\")) +
                       (Wanted::IsFoundByFinder(options) ? MaskOf(options.mask) : SString(kEverything));
  Output output(options);
  UnreadFolders unread;
  if (options.json) Print("{\"version\":1,\"entries\":[");
  if (options.folders) {
    Walk<SRecurseFindFolders>(mask, options, wanted, output, unread);
  } else {
    Walk<SRecurseFindFiles>(mask, options, wanted, output, unread);
  }
  unread.Tell();
  output.Finish();
  if (options.json) {
    Print("\n],\"errors\":[");
    PrintErrors(unread.All());
    Print("\n]}\n");
  }
  return unread.All().empty() ? kDone : kFailed;
}
