// Walks of a tree of 200,000 files and of one folder of 50,000, reading size and time of each, beside the
// standard library's. Names and times are in the system's cache.

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <string>

#include "bench/bench.h"
#include "qxcore/system/file/recurse_find.h"
#include "qxcore/system/time/time.h"

namespace {

namespace fs = std::filesystem;

constexpr int kFolders = 40;  // at each of two levels
constexpr int kFilesInFolder = 125;
constexpr int kFlatFiles = 50'000;

void MakeFiles(const fs::path& folder, int count) {
  fs::create_directories(folder);
  for (int i = 0; i < count; ++i) std::ofstream(folder / ("document-" + std::to_string(i) + ".txt")) << "some content";
}

// Both, for as long as the program runs.
class Files {
 public:
  Files() : m_root(fs::temp_directory_path() / "qxbench-files") {
    fs::remove_all(m_root);
    for (int i = 0; i < kFolders * kFolders; ++i)
      MakeFiles(Tree() / ("part-" + std::to_string(i / kFolders)) / ("chapter-" + std::to_string(i % kFolders)),
                kFilesInFolder);
    MakeFiles(Flat(), kFlatFiles);
  }
  ~Files() {
    std::error_code ignored;
    fs::remove_all(m_root, ignored);
  }
  static const Files& The() {
    static Files files;
    return files;
  }
  fs::path Tree() const { return m_root / "tree"; }
  fs::path Flat() const { return m_root / "flat"; }

 private:
  fs::path m_root;
};

static_assert(kFolders * kFolders * kFilesInFolder == 200'000);

SString MaskOf(const fs::path& folder) { return SString((folder / "*.*").string().c_str()); }

// Ends the run when a walk did not see what is there.
void Check(int count, int expected, std::uint64_t bytes) {
  if (count == expected && bytes == 12u * static_cast<unsigned>(expected)) return;
  std::fprintf(stderr, "%d files instead of %d\n", count, expected);
  std::abort();
}

void Walk(benchmark::State& state, SFinder& finder, const SString& mask, int expected) {
  for (auto _ : state) {
    int count = 0;
    std::uint64_t bytes = 0;
    STime time;
    for (int found = finder.FindFile(mask); found; found = finder.FindNextFileW()) {
      if (finder.IsDirectory()) continue;
      bytes += finder.GetLength();
      finder.GetLastWriteTime(&time);
      benchmark::DoNotOptimize(time);
      ++count;
    }
    Check(count, expected, bytes);
  }
}

BENCH("walk 200,000 files of a tree/ours") {
  SRecurseFindFiles files;
  SString mask = MaskOf(Files::The().Tree());
  mask.ReplaceAll(WCHAR('/'), WCHAR('\\'));
  Walk(state, files, mask, kFolders * kFolders * kFilesInFolder);
}

BENCH("walk one level of 50,000 files/ours") {
  SFileFind find;
  Walk(state, find, MaskOf(Files::The().Flat()), kFlatFiles);
}

#if BENCH_PEERS

template <class Iterator>
void WalkStandard(benchmark::State& state, const fs::path& root, int expected) {
  for (auto _ : state) {
    int count = 0;
    std::uint64_t bytes = 0;
    for (const fs::directory_entry& entry : Iterator(root)) {
      if (entry.is_directory()) continue;
      bytes += entry.file_size();
      benchmark::DoNotOptimize(entry.last_write_time());
      ++count;
    }
    Check(count, expected, bytes);
  }
}

BENCH("walk 200,000 files of a tree/std::filesystem") {
  WalkStandard<fs::recursive_directory_iterator>(state, Files::The().Tree(), kFolders * kFolders * kFilesInFolder);
}

BENCH("walk one level of 50,000 files/std::filesystem") {
  WalkStandard<fs::recursive_directory_iterator>(state, Files::The().Flat(), kFlatFiles);
}

#endif

}  // namespace
