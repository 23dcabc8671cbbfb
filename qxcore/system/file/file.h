// SFile: a named file with an open handle, and operations on names, files and folders.
//
// Names are Windows paths with backslashes on every target (a slash is a character that no name may
// hold). Results are 32-bit status codes: 0 for success, 1 for success with a restriction, else one of
// SFile::Status, whose message GetStatusText returns; the platform's last-error value says more. Nothing is
// thrown but SEOutOfMemory, by the operations that make strings; then nothing was done to files.
// An SFile belongs to one thread at a time; the current directory is the process's.
#pragma once

#include <cstdint>
#include <string>
#include <string_view>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SFile {
 public:
  // The failures: code n goes with message 159 + n of the library's string table.
  enum Status : std::uint32_t {
    kOk = 0,
    kRestricted = 1,  // opened, but for reading only
    kInvalidFilename = 0x80990001,
    kSetDirectoryFailed = 0x80990002,
    kCreateDirectoryFailed = 0x80990003,
    kRemoveDirectoryFailed = 0x80990004,
    kFindNextFailed = 0x80990005,
    kFindCloseFailed = 0x80990006,
    kMoveFailed = 0x80990007,
    kCopyFailed = 0x80990008,
    kDeleteFailed = 0x80990009,
    kOpenFailed = 0x8099000A,
    kCloseFailed = 0x8099000B,
    kCreateFailed = 0x8099000C,
    kWriteFailed = 0x8099000D,
    kReadFailed = 0x8099000E,
    kFlushFailed = 0x8099000F,
    kSeekFailed = 0x80990010,
    kGetAttributesFailed = 0x80990011,
    kSetAttributesFailed = 0x80990012,
    kGetSizeFailed = 0x80990013,
    kMappingFailed = 0x80990014,  // of mapped files
    kGetTimeFailed = 0x80990015,
    kNotFound = 0x80990016,
  };

  static constexpr unsigned long kCurrentAttributes = 0xFFFFFFFF;  // Open, Create: those that the file has

  // --- names ---

  SFile() = default;
  // A second handle to the same open file, if it is open; a search is not taken over.
  SFile(const SFile& other) { Init(other); }
  // Splits the name and checks it; a bad one leaves an object whose CheckFilename is false.
  explicit SFile(const SString& fullName) { Init(fullName); }
  SFile(const SString& drive, const SString& directory, const SString& name, const SString& extension) {
    Init(drive, directory, name, extension);
  }
  SFile& operator=(const SFile& other) {
    Init(other);
    return *this;
  }
  // Closes both handles; a failure of that is lost here: call Done before.
  ~SFile();

  // As the constructors, but return the status. All close the handles first: kCloseFailed, kFindCloseFailed.
  HRESULT Init();
  // E_FAIL when the other file's handle cannot be duplicated; the names are taken all the same.
  HRESULT Init(const SFile& other);
  // kInvalidFilename when the split or the check fails.
  HRESULT Init(const SString& fullName);
  // Makes the full name out of the parts (MakeFilename).
  HRESULT Init(const SString& drive, const SString& directory, const SString& name, const SString& extension);
  // Clears the names and closes the file (kCloseFailed), then the search (kFindCloseFailed).
  HRESULT Done();

  // 0 when the drive or the name is empty, when the name holds one of / : * ? < > | " or a backslash, or the
  // directory one of the eight; else 1.
  int CheckFilename() const;
  // The full name into its parts (see SplitPath). 1 when there is a name.
  int SplitFilename();
  // The parts into the full name. An empty drive becomes the current one, and with it an empty directory the
  // current one; an empty directory on a given drive is the drive's root, so that what SplitFilename took
  // apart is put together again. Drive and directory get their backslashes.
  void MakeFilename();

  const SString& GetDrive() const { return m_drive; }          // "C:\" or "\\server\"
  const SString& GetDirectory() const { return m_directory; }  // "dir\sub\"
  const SString& GetName() const { return m_name; }            // without the extension
  const SString& GetExtension() const { return m_extension; }  // without the dot
  const SString& GetFullName() const { return m_fullName; }

  // --- the open file ---

  // Open the file, or create a missing one, for reading, and for writing unless the attributes hold
  // read-only. `share` are FILE_SHARE flags. A former handle is closed first (kCloseFailed). The two differ
  // in the code of a failure only: kOpenFailed, kCreateFailed. Child processes inherit the handle.
  HRESULT Open(unsigned long attributes = kCurrentAttributes, unsigned long share = FILE_SHARE_READ);
  HRESULT Create(unsigned long attributes = kCurrentAttributes, unsigned long share = FILE_SHARE_READ);
  // Opens a file that exists (else kNotFound): for reading only when others may write or the file is read-only,
  // else for writing, too. Where that fails, once more for reading only with others writing; that returns
  // kRestricted. kOpenFailed otherwise.
  HRESULT OpenExisting(unsigned long share = FILE_SHARE_READ);
  // kCloseFailed when the platform cannot close properly (data may be lost); it is closed all the same. A
  // file that is not open is left alone.
  HRESULT Close();

  int IsOpen() const { return m_file != nullptr; }
  unsigned long GetAccess() const { return m_access; }  // GENERIC_READ, GENERIC_WRITE; 0 when closed
  HANDLE GetHandle() const { return m_file; }           // still owned by the object; null when closed

  // `count`: bytes wanted on entry, done on return. A short write is kWriteFailed; a read that returns less has
  // met the end. kReadFailed leaves what was read in the buffer and `count`.
  HRESULT Write(const void* buffer, unsigned long& count);
  HRESULT Read(void* buffer, unsigned long& count);
  // Until the data is on the device. kFlushFailed.
  HRESULT Flush();
  // `position`: the distance on entry (method FILE_BEGIN, FILE_CURRENT, FILE_END), the position from the start
  // on return. kSeekFailed leaves both as they were.
  HRESULT Seek(std::int64_t& position, unsigned long method);
  // Cuts or lengthens the file to the current position. kWriteFailed.
  HRESULT SetEndOfFile();
  // 1 when the position is at or behind the end, and when the file is not open.
  int IsEOF() const;
  HRESULT SavePosition(std::int64_t& position) const;
  HRESULT RestorePosition(std::int64_t position);

  // --- properties, of the open file or, where it is not open, of the one with the name ---

  HRESULT GetAttributes(unsigned long& attributes) const;
  HRESULT SetAttributes(unsigned long attributes);
  HRESULT GetSize(unsigned long& low, unsigned long& high) const;
  // The time of creation when `creation` is not 0, else that of the last write.
  HRESULT GetDateTime(FILETIME* time, int creation = 0) const;
  // -1, 0 or 1 as the file's time is earlier than, equal to or later than *time; -2 when it cannot be read.
  int CompareDateTime(const FILETIME* time, int creation = 0) const;

  int Exists() const { return Exists(m_fullName); }
  int IsFile() const { return IsFile(m_fullName); }
  int IsDirectory() const { return IsDirectory(m_fullName); }
  int IsReadOnly() const;
  // 1 for a file that exists and can be opened for writing now; tries it, without a change.
  int CanBeWritten() const;
  // What the first 4096 bytes look like. Devices and pipes are kOpenFailed; they are not read.
  enum ContentType : short {
    kEmptyContent = 0,
    kBinaryContent = 1,      // NULs, or control characters that texts do not hold
    kNarrowText = 2,         // no mark, none of those
    kUtf8Text = 3,           // the mark EF BB BF
    kUtf16Text = 4,          // the mark FF FE
    kReversedUtf16Text = 5,  // the mark FE FF
  };
  HRESULT GetContentType(short* type) const;

  // Moves the file. The object takes the new name; kMoveFailed also when that cannot be split.
  HRESULT Rename(const SString& newName);
  // The destination gets attributes and time of the last write, too. An existing one is replaced when
  // `overwrite` is not 0.
  HRESULT Copy(const SString& destination, int overwrite);
  HRESULT Delete();

  // --- a search in one folder ---

  // Looks for the first entry that fits the mask, a path whose last part may hold * and ?. The object then
  // has that entry's name; "." and ".." are passed over. kInvalidFilename for an empty mask, kNotFound when
  // nothing fits. A former search is closed (kFindCloseFailed).
  HRESULT FindFirst(const SString& mask);
  // The next entry; kFindNextFailed at the end or when the folder cannot be read on (GetLastError says:
  // ERROR_NO_MORE_FILES is the end).
  HRESULT FindNext();
  HRESULT FindClose();

  // --- without an object: files ---

  static int Exists(const SString& name);
  static int IsFile(const SString& name);
  static int IsDirectory(const SString& name);
  static HRESULT GetSize(const SString& name, unsigned long& low, unsigned long& high);
  static HRESULT Delete(const SString& name);
  // 1 when Windows keeps the name for a device, whatever folder and extension: CON, AUX, NUL, PRN, COM1 to
  // COM9, LPT1 to LPT9 (superscript 1 to 3 count as digits), in any case, and when the platform says that the
  // name is that of a device (FILE_ATTRIBUTE_DEVICE).
  static int IsReserved(const SString& name);

  // --- folders ---

  // The current directory behind its drive: "\dir\sub", "\" for the root. Empty on failure.
  static SString GetCurrentDirectoryW();
  // "C:\", or "\\server\". Empty on failure.
  static SString GetCurrentDrive();
  static HRESULT SetCurrentDirectoryW(const SString& path);
  static HRESULT SetCurrentDrive(const SString& path) { return SetCurrentDirectoryW(path); }
  static HRESULT CreateDirectoryW(const SString& path);
  static HRESULT RemoveDirectoryW(const SString& path);
  // Creates every folder of `path` that is missing; when `isFile` is not 0 the last part is a file's name and
  // left out. *created (if not null) gets the topmost folder that was made, empty when all were there;
  // also on failure, so that a caller can take back what was done. kCreateDirectoryFailed.
  static HRESULT CreateFilePath(const SString& path, SString* created, int isFile = 1);
  // Without a backslash at the end, but for a root. On Linux "C:\usr\lib" and "C:\usr" stand for them.
  static SString GetSystemDirectoryW();
  static SString GetWindowsDirectoryW();
  // With a backslash at the end.
  static SString GetTempDirectory();
  // A name in `directory` that begins with up to three characters of `prefix`; with `unique` 0 the file is
  // created, empty, and sure to be new. An empty string on failure.
  static SString GetTempFileNameW(const SString& directory, const SString& prefix, unsigned unique = 0);
  // In bytes, of the volume that holds the folder `path`; free for the caller. 0 on failure.
  static std::uint64_t GetFreeDiskSpace(const SString& path);
  static std::uint64_t GetTotalDiskSpace(const SString& path);

  // --- the system's own paths: program arguments, std::filesystem, other libraries ---

  // The name for a path as the system has it. On Windows that is UTF-8 of the same text. On Linux slashes become
  // backslashes and "/" in front "C:\"; a character that Windows allows in no name, and each byte that is no UTF-8,
  // becomes U+F000 plus the byte, as the finders return them. Relative paths stay relative.
  static SString FromNative(std::string_view path);
  // The way back, byte for byte. Empty for a path that the system has no path for (on Linux other drives and
  // servers). May throw std::bad_alloc.
  static std::string ToNative(const SString& path);

  // --- names as texts ---

  // Splits as SplitFilename does. A relative name gets the current drive and directory. In "\\server\share\f"
  // the drive is "\\server\". The last dot begins the extension. 1 when the name is not empty.
  static int SplitPath(const SString& path, SString& drive, SString& directory, SString& name, SString& extension);
  // 1 when the path can be split and passes CheckFilename; *directory then is drive and directory, *name the
  // name with its extension (either may be null). Otherwise 0, and both are empty.
  static int CheckSplitValidPath(const SString& path, SString* directory, SString* name);
  // The absolute form: backslashes, no "." and "..", no backslash at the end but for a root. Empty for an
  // empty path and one of more than 259 characters. The folder need not exist.
  static SString NormalizeDirectoryName(const SString& path);
  // The absolute form of a file's name; with `asOnDisk` each part that exists is spelled as it is on disk, and
  // short names become long.
  static SString NormalizeFileName(const SString& name, int asOnDisk = 0);
  // Each part as it is on disk, or as its short name where the system makes those (not on Linux). A path that
  // does not exist comes back as it is.
  static SString ToLongNames(const SString& path);
  static SString ToShortNames(const SString& path);
  // 1 when the text begins with "file://"; letters in any case count unless `exact` is not 0.
  static int IsFileURL(const SString& text, int exact = 0);
  // "file:///C|/a b/x.txt" to "C:\a b\x.txt"; what is no file URL comes back as it is. Nothing is decoded.
  static SString URLToPath(const SString& url);
  // The other way. The path is made absolute first, unless it begins with "." or "%"; empty when that fails.
  // Nothing is encoded.
  static SString PathToURL(const SString& path);

  // The message of a status code; empty for success and for codes of others.
  static SString GetStatusText(HRESULT status);

 private:
  HRESULT OpenAlways(unsigned long attributes, unsigned long share, Status failure);
  HRESULT TakeFound(const WCHAR* entryName);

  SString m_drive;
  SString m_directory;
  SString m_name;
  SString m_extension;
  SString m_fullName;
  std::uint32_t m_access = 0;  // rights of the open handle
  HANDLE m_file = nullptr;     // null when closed
  HANDLE m_find = nullptr;     // null when no search runs
};

static_assert(sizeof(void*) != 4 || sizeof(SFile) == 32, "five strings, the access, two handles");
