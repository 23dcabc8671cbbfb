// A zip archive read in sequence and compared with its central directory.
//
// The two readers of the library see different halves of an archive: the directory says what ought to be
// there, the local headers what is. An archive is sound when both agree on the places, names, sizes
// and checksums of all entries.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qxcore/stream/input_file.h"
#include "qxcore/stream/zip/zip_file.h"
#include "qxcore/stream/zip/zip_input_stream.h"
#include "tools/common/progress_bar.h"

// Opens an archive's directory. Throws Failure, with a text for what the library leaves without one.
std::unique_ptr<SZipFile> OpenDirectory(const std::string& path);
// The next entry; false at the end of the directory. Throws Failure for what ended it before.
bool FindNextEntry(SZipFile& directory);

class ZipArchive {
 public:
  // Reads the whole directory. Throws Failure.
  explicit ZipArchive(const std::string& path);

  // The entries of the directory, by their places in the archive.
  const std::vector<SZipEntry>& Entries() const { return m_entries; }

  // Goes to the next entry of the archive, and returns its directory entry; null at the end. Throws Failure when the
  // directory has no entry at this place, one of another name, or more entries than were met.
  const SZipEntry* Next();
  // The present entry's data; 0 at its end. Throws Failure, and SEIOAbortedException when the user wants to end.
  unsigned long Read(void* buffer, unsigned long count);
  // After all of the data was read: throws Failure when it is not what the directory says.
  void CheckRead() const;

 private:
  const SZipEntry* Match(const SZipEntry& met);
  [[noreturn]] void Fail(const std::string& text) const;
  [[noreturn]] void FailAtEntry(const SZipEntry* entry) const;

  std::string m_path;
  ProgressBar m_progress;
  std::unique_ptr<SInputFile> m_file;
  std::unique_ptr<SZipInputStream> m_stream;
  std::vector<SZipEntry> m_entries;
  std::size_t m_next = 0;              // the directory's next entry
  const SZipEntry* m_entry = nullptr;  // the present one, as the directory has it
  const SZipEntry* m_met = nullptr;    // and as its own headers have it
  std::int64_t m_size = 0;             // of its data, as far as it was read
};
