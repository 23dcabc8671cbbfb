// qxtool zip extract-all: all entries of an archive, below one folder and nowhere else.

#include <chrono>
#include <filesystem>
#include <vector>

#include "qxcore/system/time/time.h"
#include "tools/common/console.h"
#include "tools/common/failure.h"
#include "tools/common/replacement_file.h"
#include "tools/common/standard_streams.h"
#include "tools/qxtool/commands.h"
#include "tools/qxtool/entry_path.h"
#include "tools/qxtool/zip_archive.h"

namespace {

namespace fs = std::filesystem;

class Extraction {
 public:
  Extraction(const ZipOptions& options, ZipArchive& archive)
      : m_options(options), m_folder(console::NativeOf(options.out)), m_archive(archive), m_data(65536) {}

  // What can be seen before anything is written: names that lead elsewhere, too much data.
  void CheckBefore() const {
    std::uint64_t total = 0;
    for (const SZipEntry& entry : m_archive.Entries()) {
      PartsOfEntry(entry.GetName());
      total += static_cast<std::uint64_t>(entry.GetSize());
    }
    if (total > m_options.maxBytes) FailOfSize();
  }

  void Run() {
    fs::create_directories(console::PathOf(m_folder));
    while (const SZipEntry* entry = m_archive.Next()) Extract(*entry);
  }

 private:
  [[noreturn]] void FailOfSize() const {
    throw Failure{"it holds more than " + std::to_string(m_options.maxBytes) + " bytes", kFailed, m_options.archive};
  }

  void Extract(const SZipEntry& entry) {
    const std::vector<std::string> parts = PartsOfEntry(entry.GetName());
    if (entry.IsDirectory() || parts.empty()) {
      FolderForParts(m_folder, parts, parts.size());
      CopyTo(nullptr);
      return;
    }
    ExtractFile(entry, FolderForParts(m_folder, parts, parts.size() - 1) + "/" + parts.back());
  }

  void ExtractFile(const SZipEntry& entry, const std::string& path) try {
    RequireFileCanBeAt(path, m_options.force);
    ReplacementFile target(path, ReplacementFile::Durability::kLater);
    FileOutput output(target.File());
    CopyTo(&output);
    output.Flush();
    target.Commit(false);
    SetProperties(entry, console::PathOf(path));
  } catch (...) {
    FailAt(path);
  }

  // The time, and the right to execute for who may read. What the file system does not take is left as it is.
  static void SetProperties(const SZipEntry& entry, const fs::path& path) {
    std::error_code error;
    const fs::perms former = fs::status(path, error).permissions(), execute = fs::perms(entry.GetUnixMode() & 0111);
    const fs::perms readers = fs::perms((static_cast<unsigned>(former) & 0444) >> 2);
    if ((execute & readers) != fs::perms::none) fs::permissions(path, former | (execute & readers), error);
    SYSTEMTIME fields;
    STime time;
    // The archive has the maker's local time; ours is taken for it.
    if (!FileTimeToSystemTime(&entry.GetTime(), &fields) || fields.wYear < 1980) return;
    time = STime(fields.wYear, fields.wMonth, fields.wDay, fields.wHour, fields.wMinute, fields.wSecond);
    const auto moment = std::chrono::system_clock::from_time_t(time.GetTime());
    fs::last_write_time(path, std::chrono::file_clock::from_sys(moment), error);
  }

  // The entry's data, checked; to nowhere for null.
  void CopyTo(FileOutput* output) {
    while (const unsigned long count = m_archive.Read(m_data.data(), static_cast<unsigned long>(m_data.size()))) {
      // The directory may have told less than there is.
      if (count > m_options.maxBytes - m_written) FailOfSize();
      m_written += count;
      if (output != nullptr) output->Write(m_data.data(), count);
    }
    m_archive.CheckRead();
  }

  const ZipOptions& m_options;
  std::string m_folder;  // a path of the system
  ZipArchive& m_archive;
  std::vector<unsigned char> m_data;
  std::uint64_t m_written = 0;
};

}  // namespace

int ExtractZip(const ZipOptions& options) try {
  ZipArchive archive(options.archive);
  Extraction extraction(options, archive);
  extraction.CheckBefore();
  extraction.Run();
  return kDone;
} catch (...) {
  FailAt(options.archive);
}
