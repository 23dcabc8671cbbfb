// SZipFile: lists the entries of a zip archive through its central directory, as a finder lists files.
// ```cpp
// SZipFile archive(path);
// for (int found = archive.FindFile(WTEXT("*"), ~0ul); found; found = archive.FindNextFile()) {
//   Show(archive.GetEntry());
// }
// if (archive.HasFailed()) Show("the directory is damaged");
// ```
// Only archives that are whole are opened: what stands in front of the first entry's place or behind the
// archive's end, several parts, and sizes in 64 bits are refused. Failures throw SEZipException with kSZipFailed;
// its text is empty when the file does not open or is too short. The file stays open, for reading, as long as
// the object; others may write it meanwhile, which can damage what is read but nothing else.
// Threads: an archive belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/stream/zip/zip_entry.h"
#include "qxcore/system/file/file.h"

class SOutputStream;
class STime;

class QXCORE_API SZipFile {
 public:
  // Opens the archive and finds its directory. Throws SEZipException: with an empty text when the file cannot
  // be opened or read, "END header not found" (no archive, one whose comment is longer than 65513 bytes, or one
  // with data behind it), "invalid END header signature", "invalid END header format" (data in front, a
  // directory that is not where the archive says, more than 65535 entries), "cannot have more than one drive".
  explicit SZipFile(const SString& path);
  SZipFile(const SZipFile&) = delete;
  SZipFile& operator=(const SZipFile&) = delete;
  virtual ~SZipFile();

  // Goes to the first entry; 0 when the archive is empty. Pattern and mask are ignored, on purpose: they
  // are there to make the call that of a finder, and the caller compares with MatchesMask and SString::Match.
  // Throws SEZipException: an empty text when the directory ends too early, "invalid CEN header signature",
  // "invalid compression method" (neither stored nor deflated), "invalid CEN entry size" (the data would reach
  // into the directory), "invalid CEN header format" (the entry reaches out of it).
  virtual int FindFile(const WCHAR* pattern, unsigned long mask);
  // Goes to the next entry; 0 behind the last one, and on any failure, after which it stays 0. Never throws.
  virtual int FindNextFileW();
  // 1 when the entry's attributes and the mask have a bit in common.
  virtual int MatchesMask(unsigned long mask) const;
  // The entry's time; 0 when `time` is null.
  virtual int GetCreationTime(STime* time) const;

  // What FindNextFileW could not throw: 1 when it was a failure that ended the search, and its text. Also 1,
  // without a text, after FindFile threw.
  int HasFailed() const { return m_hasFailed; }
  const SString& GetFailure() const { return m_failure; }

  // The entry that the search has found. The reference stays valid; the content changes with the search.
  const SZipEntry& GetEntry() const { return m_entry; }
  // The archive's path, a backslash, and the entry's name as it is.
  SString GetDisplayName() const;
  const SString& GetPath() const { return m_path; }
  // How many entries the archive says that it has.
  unsigned long GetCount() const { return m_count; }

  // Writes the data of the first entry with this name, case included, to `out`, which stays open. Throws
  // SEZipException as the constructor, FindFile and SZipInputStream do; "entry not found"; "invalid LOC header
  // signature"; and, when the data is not what the directory says, "invalid entry size" or "invalid entry CRC".
  // An archive that ends too early throws SEEOFException; exceptions of `out` pass through.
  static void ExtractTo(const SString& archive, const SString& entry, SOutputStream& out);
  // The same into the file `target`, which is created or replaced once the entry was found; what was begun
  // and failed is deleted (behind a link: emptied).
  static void ExtractFile(const SString& archive, const SString& entry, const SString& target);

 private:
  void FindEnd();
  bool IsEnd(std::int64_t position);
  void ReadEnd();
  int ReadNext();
  void ReadEntry();
  void FindEntry(const SString& name);
  bool ReadAt(std::int64_t position, void* buffer, unsigned long count);
  bool TakeBytes(void* buffer, unsigned long count);
  bool PassBytes(unsigned long count);
  bool FillWindow();
  void ReadNames(unsigned nameLength, unsigned extraLength, unsigned commentLength);

  SString m_path;
  SFile m_file;
  std::int64_t m_length = 0;  // of the file
  std::int64_t m_endPosition = 0;
  std::int64_t m_endLength = 0;
  std::int64_t m_directoryOffset = 0;
  std::int64_t m_directoryLength = 0;
  unsigned long m_count = 0;
  unsigned long m_next = 0;  // index of the entry that is read next
  SZipEntry m_entry;
  bool m_hasFailed = false;
  SString m_failure;
  // The directory is read through a window, as a call of the system for each field would cost much.
  unsigned char* m_window = nullptr;
  unsigned long m_windowCount = 0;     // valid bytes
  unsigned long m_windowPosition = 0;  // the next one
  std::int64_t m_nextByte = 0;         // where the window's next byte stands in the file
};
