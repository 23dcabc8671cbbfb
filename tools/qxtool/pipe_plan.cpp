#include "tools/qxtool/pipe_plan.h"

#include <filesystem>
#include <set>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/recurse_find.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/unread_folder.h"
#include "tools/common/utf8.h"

namespace fs = std::filesystem;

namespace {

class Plan {
 public:
  explicit Plan(const TextPipeOptions& options) : m_options(options) {}

  std::vector<PipePair> Make() {
    for (const std::string& file : m_options.files) {
      const SString name = console::NameOf(file);
      if (file != "-" && SFile::IsDirectory(name)) {
        AddFolder(file, FolderToSearch(name));
      } else {
        Add(file, fs::path(console::PathOf(console::NativeOf(file))).filename());
      }
    }
    return std::move(m_pairs);
  }

 private:
  // `below` is where the file goes within the output folder.
  void Add(const std::string& file, const fs::path& below) {
    if (file == "-") throw Failure{"-: standard input has no name to write to", kWrongUsage};
    std::string out =
        m_options.inPlace ? file : Native(console::PathOf(console::NativeOf(m_options.outputDir)) / below);
    if (!m_targets.insert(out).second) throw Failure{"two of the files would become this one", kFailed, out};
    m_pairs.push_back({file, std::move(out)});
  }

  void AddFolder(const std::string& folder, const SString& name) {
    if (!m_options.recursive) throw Failure{"it is a folder; --recursive takes the files in it", kFailed, folder};
    const bool isRoot = name[name.Length() - 1] == '\\';
    SRecurseFindFiles finder;
    for (int found = finder.FindFile(name + (isRoot ? WTEXT("*") : WTEXT("\\*"))); found;
         found = finder.FindNextFileW()) {
      const std::string path = SFile::ToNative(finder.GetFilePath());
      const fs::path top = console::PathOf(SFile::ToNative(name));
      Add(path, console::PathOf(path).lexically_relative(top));
    }
    const SFindFailures& failures = finder.GetFailures();
    if (failures.GetCount() > 0) {
      const SString& unread = failures.GetFirstFolder();
      throw Failure{WhyNotSearched(unread, failures.GetFirstError()), kFailed, ShortenedPath(unread)};
    }
  }

  static std::string Native(const fs::path& path) {
    const std::u8string text = path.u8string();
    return std::string(text.begin(), text.end());
  }

  const TextPipeOptions& m_options;
  std::vector<PipePair> m_pairs;
  std::set<std::string> m_targets;
};

}  // namespace

std::vector<PipePair> PlanPipes(const TextPipeOptions& options) {
  if (options.inPlace && !options.outputDir.empty())
    throw Failure{"--in-place and --output-dir exclude each other", kWrongUsage};
  if (options.inPlace || !options.outputDir.empty()) return Plan(options).Make();
  if (options.recursive) throw Failure{"--recursive needs --in-place or --output-dir", kWrongUsage};
  if (options.files.size() != 2)
    throw Failure{"IN and OUT are needed, or --in-place or --output-dir for any number of files", kWrongUsage};
  return {{options.files[0], options.files[1]}};
}
