#include "qxcore/system/file/file.h"

#include <algorithm>

#include "qxcore/core/module_state.h"
#include "qxcore/platform/internal/path_parts.h"
#include "qxcore/system/file/internal/result.h"

namespace {

constexpr DWORD kNormal = FILE_ATTRIBUTE_NORMAL;
constexpr DWORD kShareAll = FILE_SHARE_READ | FILE_SHARE_WRITE | FILE_SHARE_DELETE;

// The platform counts in 32 bits.
constexpr unsigned long kLargestPiece = 0x40000000;

// A handle, or null.
HANDLE OpenPlatformFile(const SString& name, DWORD access, DWORD share, DWORD disposition, DWORD attributes,
                        bool inherit) {
  SECURITY_ATTRIBUTES security = {sizeof(SECURITY_ATTRIBUTES), nullptr, inherit};
  const HANDLE file = ::CreateFileW(name, access, share, &security, disposition, attributes, nullptr);
  return file != INVALID_HANDLE_VALUE ? file : nullptr;
}

// A handle for a moment's question.
class Probe {
 public:
  Probe(const SString& name, DWORD access)
      : m_file(OpenPlatformFile(name, access, kShareAll, OPEN_EXISTING, kNormal, false)) {}
  Probe(const Probe&) = delete;
  Probe& operator=(const Probe&) = delete;
  ~Probe() {
    const DWORD error = ::GetLastError();
    if (m_file != nullptr) ::CloseHandle(m_file);
    ::SetLastError(error);
  }
  HANDLE Get() const { return m_file; }

 private:
  HANDLE m_file;
};

bool GetProperties(const SString& name, WIN32_FILE_ATTRIBUTE_DATA& data) {
  return ::GetFileAttributesExW(name, GetFileExInfoStandard, &data) != FALSE;
}

bool MoveTo(HANDLE file, std::int64_t distance, DWORD method, std::int64_t& position) {
  LARGE_INTEGER from, to;
  from.QuadPart = distance;
  if (!::SetFilePointerEx(file, from, &to, method)) return false;
  position = to.QuadPart;
  return true;
}

// What no text holds: NUL and the control characters but those for lines, tabs and pages, and escape.
bool IsBinaryByte(unsigned char byte) {
  return byte < 0x20 && (byte < 0x07 || byte > 0x0D) && byte != 0x1A && byte != 0x1B;
}

SFile::ContentType Classify(const unsigned char* bytes, DWORD count) {
  if (count == 0) return SFile::kEmptyContent;
  if (count >= 3 && bytes[0] == 0xEF && bytes[1] == 0xBB && bytes[2] == 0xBF) return SFile::kUtf8Text;
  if (count >= 2 && bytes[0] == 0xFF && bytes[1] == 0xFE) return SFile::kUtf16Text;
  if (count >= 2 && bytes[0] == 0xFE && bytes[1] == 0xFF) return SFile::kReversedUtf16Text;
  return std::any_of(bytes, bytes + count, IsBinaryByte) ? SFile::kBinaryContent : SFile::kNarrowText;
}

}  // namespace

SFile::~SFile() {
  Close();
  FindClose();
}

HRESULT SFile::Init() { return Done(); }

HRESULT SFile::Init(const SFile& other) {
  if (this == &other) return Result(kOk);
  HRESULT status = Done();
  m_drive = other.m_drive;
  m_directory = other.m_directory;
  m_name = other.m_name;
  m_extension = other.m_extension;
  m_fullName = other.m_fullName;
  if (other.m_file == nullptr) return status;
  const HANDLE process = ::GetCurrentProcess();
  if (!::DuplicateHandle(process, other.m_file, process, &m_file, 0, TRUE, DUPLICATE_SAME_ACCESS)) {
    m_file = nullptr;
    return E_FAIL;
  }
  m_access = other.m_access;
  return status;
}

HRESULT SFile::Init(const SString& fullName) {
  const SString wanted = fullName;  // it may be a part of this object
  const HRESULT status = Done();
  m_fullName = wanted;
  if (!SplitFilename() || !CheckFilename()) return Result(kInvalidFilename);
  return status;
}

HRESULT SFile::Init(const SString& drive, const SString& directory, const SString& name, const SString& extension) {
  const SString parts[] = {drive, directory, name, extension};
  const HRESULT status = Done();
  m_drive = parts[0];
  m_directory = parts[1];
  m_name = parts[2];
  m_extension = parts[3];
  MakeFilename();
  return status;
}

HRESULT SFile::Done() {
  for (SString* part : {&m_drive, &m_directory, &m_name, &m_extension, &m_fullName}) part->Release();
  const HRESULT closed = Close(), findClosed = FindClose();
  return closed != Result(kOk) ? closed : findClosed;
}

HRESULT SFile::OpenAlways(unsigned long attributes, unsigned long share, Status failure) {
  if (const HRESULT status = Close()) return status;
  DWORD wanted = static_cast<DWORD>(attributes);
  if (wanted == kCurrentAttributes) {
    wanted = ::GetFileAttributesW(m_fullName);
    if (wanted == INVALID_FILE_ATTRIBUTES) wanted = kNormal;
  }
  const DWORD access = (wanted & FILE_ATTRIBUTE_READONLY) != 0 ? GENERIC_READ : GENERIC_READ | GENERIC_WRITE;
  m_file = OpenPlatformFile(m_fullName, access, static_cast<DWORD>(share), OPEN_ALWAYS, wanted, true);
  if (m_file == nullptr) return Result(failure);
  m_access = access;
  return Result(kOk);
}

HRESULT SFile::Open(unsigned long attributes, unsigned long share) {
  return OpenAlways(attributes, share, kOpenFailed);
}

HRESULT SFile::Create(unsigned long attributes, unsigned long share) {
  return OpenAlways(attributes, share, kCreateFailed);
}

HRESULT SFile::OpenExisting(unsigned long share) {
  if (const HRESULT status = Close()) return status;
  const DWORD attributes = ::GetFileAttributesW(m_fullName);
  if (attributes == INVALID_FILE_ATTRIBUTES) return Result(kNotFound);
  const bool othersWrite = (share & FILE_SHARE_WRITE) != 0;
  const bool readsOnly = othersWrite || (attributes & FILE_ATTRIBUTE_READONLY) != 0;
  const DWORD mode = static_cast<DWORD>(share);
  m_access = readsOnly ? GENERIC_READ : GENERIC_READ | GENERIC_WRITE;
  m_file = OpenPlatformFile(m_fullName, m_access, mode, OPEN_EXISTING, kNormal, true);
  if (m_file != nullptr) return Result(kOk);
  m_access = GENERIC_READ;
  if (!othersWrite)
    m_file = OpenPlatformFile(m_fullName, m_access, mode | FILE_SHARE_WRITE, OPEN_EXISTING, kNormal, true);
  if (m_file != nullptr) return Result(kRestricted);
  m_access = 0;
  return Result(kOpenFailed);
}

HRESULT SFile::Close() {
  if (m_file == nullptr) return Result(kOk);
  const HANDLE file = m_file;
  m_file = nullptr;
  m_access = 0;
  return Result(::CloseHandle(file) != FALSE, kCloseFailed);
}

HRESULT SFile::Write(const void* buffer, unsigned long& count) {
  const auto* bytes = static_cast<const char*>(buffer);
  const unsigned long wanted = count;
  count = 0;
  do {
    const DWORD piece = static_cast<DWORD>(std::min(wanted - count, kLargestPiece));
    DWORD done = 0;
    const BOOL written = ::WriteFile(m_file, bytes + count, piece, &done, nullptr);
    count += done;
    if (!written || done < piece) return Result(kWriteFailed);
  } while (count < wanted);
  return Result(kOk);
}

HRESULT SFile::Read(void* buffer, unsigned long& count) {
  auto* bytes = static_cast<char*>(buffer);
  const unsigned long wanted = count;
  count = 0;
  do {
    const DWORD piece = static_cast<DWORD>(std::min(wanted - count, kLargestPiece));
    DWORD done = 0;
    const BOOL read = ::ReadFile(m_file, bytes + count, piece, &done, nullptr);
    count += done;
    if (!read) return Result(kReadFailed);
    if (done < piece) break;
  } while (count < wanted);
  return Result(kOk);
}

HRESULT SFile::Flush() { return Result(::FlushFileBuffers(m_file) != FALSE, kFlushFailed); }

HRESULT SFile::Seek(std::int64_t& position, unsigned long method) {
  return Result(MoveTo(m_file, position, static_cast<DWORD>(method), position), kSeekFailed);
}

HRESULT SFile::SetEndOfFile() { return Result(::SetEndOfFile(m_file) != FALSE, kWriteFailed); }

int SFile::IsEOF() const {
  std::int64_t position = 0;
  LARGE_INTEGER size;
  return !MoveTo(m_file, 0, FILE_CURRENT, position) || !::GetFileSizeEx(m_file, &size) || position >= size.QuadPart;
}

HRESULT SFile::SavePosition(std::int64_t& position) const {
  return Result(MoveTo(m_file, 0, FILE_CURRENT, position), kSeekFailed);
}

HRESULT SFile::RestorePosition(std::int64_t position) {
  return Result(MoveTo(m_file, position, FILE_BEGIN, position), kSeekFailed);
}

HRESULT SFile::GetAttributes(unsigned long& attributes) const {
  const DWORD found = ::GetFileAttributesW(m_fullName);
  if (found == INVALID_FILE_ATTRIBUTES) return Result(kGetAttributesFailed);
  attributes = found;
  return Result(kOk);
}

HRESULT SFile::SetAttributes(unsigned long attributes) {
  return Result(::SetFileAttributesW(m_fullName, static_cast<DWORD>(attributes)) != FALSE, kSetAttributesFailed);
}

HRESULT SFile::GetSize(unsigned long& low, unsigned long& high) const {
  if (m_file == nullptr) return GetSize(m_fullName, low, high);
  LARGE_INTEGER size;
  if (!::GetFileSizeEx(m_file, &size)) return Result(kGetSizeFailed);
  low = static_cast<DWORD>(size.QuadPart);
  high = static_cast<DWORD>(size.QuadPart >> 32);
  return Result(kOk);
}

HRESULT SFile::GetDateTime(FILETIME* time, int creation) const {
  if (m_file != nullptr) {
    const BOOL got =
        creation != 0 ? ::GetFileTime(m_file, time, nullptr, nullptr) : ::GetFileTime(m_file, nullptr, nullptr, time);
    return Result(got != FALSE, kGetTimeFailed);
  }
  WIN32_FILE_ATTRIBUTE_DATA data;
  if (!GetProperties(m_fullName, data)) return Result(kGetTimeFailed);
  *time = creation != 0 ? data.ftCreationTime : data.ftLastWriteTime;
  return Result(kOk);
}

int SFile::CompareDateTime(const FILETIME* time, int creation) const {
  FILETIME own;
  return GetDateTime(&own, creation) == Result(kOk) ? static_cast<int>(::CompareFileTime(&own, time)) : -2;
}

int SFile::IsReadOnly() const {
  const DWORD attributes = ::GetFileAttributesW(m_fullName);
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_READONLY) != 0;
}

int SFile::CanBeWritten() const {
  if (!IsFile() || IsReadOnly()) return 0;
  if ((m_access & GENERIC_WRITE) != 0) return 1;
  return Probe(m_fullName, GENERIC_WRITE).Get() != nullptr;
}

HRESULT SFile::GetContentType(short* type) const {
  // A pipe would be waited for, and a device has no content of its own.
  const DWORD attributes = ::GetFileAttributesW(m_fullName);
  if (attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DEVICE) != 0) {
    ::SetLastError(ERROR_INVALID_FUNCTION);
    return Result(kOpenFailed);
  }
  const Probe file(m_fullName, GENERIC_READ);
  if (file.Get() == nullptr) return Result(kOpenFailed);
  unsigned char bytes[4096];
  DWORD count = 0;
  if (!::ReadFile(file.Get(), bytes, sizeof bytes, &count, nullptr)) return Result(kReadFailed);
  *type = Classify(bytes, count);
  return Result(kOk);
}

HRESULT SFile::Rename(const SString& newName) {
  const SString wanted = newName;
  if (!::MoveFileW(m_fullName, wanted)) return Result(kMoveFailed);
  m_fullName = wanted;
  return Result(SplitFilename() != 0, kMoveFailed);
}

HRESULT SFile::Copy(const SString& destination, int overwrite) {
  return Result(::CopyFileW(m_fullName, destination, overwrite == 0) != FALSE, kCopyFailed);
}

HRESULT SFile::Delete() { return Delete(m_fullName); }

HRESULT SFile::FindFirst(const SString& mask) {
  if (const HRESULT status = FindClose()) return status;
  if (mask.IsEmpty()) return Result(kInvalidFilename);
  WIN32_FIND_DATAW data;
  const SString wanted = mask;
  const HANDLE search = ::FindFirstFileW(wanted, &data);
  if (search == INVALID_HANDLE_VALUE) return Result(kNotFound);
  m_find = search;
  // The folder of the search, in front of every name that it finds.
  m_fullName = wanted.Left(static_cast<int>(platform::FolderLength(wanted.View())));
  SplitFilename();
  if (TakeFound(data.cFileName) == Result(kOk) || FindNext() == Result(kOk)) return Result(kOk);
  const DWORD error = ::GetLastError();
  FindClose();
  ::SetLastError(error);
  return Result(kNotFound);
}

// Makes the entry's name the object's; kNotFound for "." and "..".
HRESULT SFile::TakeFound(const WCHAR* entryName) {
  if (platform::IsDotName(entryName)) return Result(kNotFound);
  SString name = m_fullName.Left(static_cast<int>(platform::FolderLength(m_fullName.View())));
  name += entryName;
  m_fullName = name;
  SplitFilename();
  return Result(kOk);
}

HRESULT SFile::FindNext() {
  WIN32_FIND_DATAW data;
  do {
    if (m_find == nullptr || !::FindNextFileW(m_find, &data)) return Result(kFindNextFailed);
  } while (TakeFound(data.cFileName) != Result(kOk));
  return Result(kOk);
}

HRESULT SFile::FindClose() {
  if (m_find == nullptr) return Result(kOk);
  const HANDLE search = m_find;
  m_find = nullptr;
  return Result(::FindClose(search) != FALSE, kFindCloseFailed);
}

SString SFile::GetStatusText(HRESULT status) {
  const std::uint32_t code = static_cast<std::uint32_t>(status);
  if (code < kInvalidFilename || code > kNotFound) return SString();
  return SCoreGetModuleState()->LoadStringW(159 + (code & 0xFF));
}
