#include "qxcore/system/file/file_find.h"

#include <algorithm>

#include "qxcore/platform/internal/path_parts.h"
#include "qxcore/platform/wide.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/file/internal/links.h"
#include "qxcore/system/time/time.h"

namespace {

// "folder\name", in one allocation.
SString JoinPath(const SString& folder, const SString& name) {
  SString path;
  WCHAR* at = path.GetBufferSetLength(folder.Length() + 1 + name.Length());
  at = std::copy(folder.begin(), folder.end(), at);
  *at++ = '\\';
  std::copy(name.begin(), name.end(), at);
  return path;
}

}  // namespace

SString SBaseFind::GetFilePath() const {
  const SString name = GetFileName();
  return name.IsEmpty() ? name : JoinPath(GetRoot(), name);
}

SString SBaseFind::GetFileTitleW() const {
  const SString name = GetFileName();
  const int dot = name.ReverseFindPos('.', name.Length() - 1);
  return dot <= 0 || platform::IsDotName<WCHAR>(name) ? name : name.Left(dot);
}

SString SBaseFind::GetFileURL() const { return SFile::PathToURL(GetFilePath()); }

int SBaseFind::IsDots() const {
  return MatchesMask(FILE_ATTRIBUTE_DIRECTORY) && platform::IsDotName<WCHAR>(GetFileName());
}

SFileFind::~SFileFind() { SFileFind::Close(); }

int SFileFind::Close() {
  m_data.cFileName[0] = 0;
  m_data.dwFileAttributes = 0;
  m_root.Release();
  if (m_search == nullptr) return 1;
  const HANDLE search = m_search;
  m_search = nullptr;
  const DWORD error = ::GetLastError();
  if (!::FindClose(search)) return 0;
  ::SetLastError(error);
  return 1;
}

int SFileFind::FindFile(const WCHAR* mask, unsigned long) { return Search(mask, false); }
int SFileFind::FindFolders(const WCHAR* mask) { return Search(mask, true); }

int SFileFind::Search(const WCHAR* mask, bool foldersOnly) {
  const SString wanted(mask != nullptr ? mask : WTEXT("*.*"));  // it may be this object's own
  // Only this search: a derived class calls this for one folder after the other.
  SFileFind::Close();
  m_mask = wanted;
  const HANDLE search =
      ::FindFirstFileExW(m_mask, FindExInfoStandard, &m_data,
                         foldersOnly ? FindExSearchLimitToDirectories : FindExSearchNameMatch, nullptr, 0);
  if (search == INVALID_HANDLE_VALUE) {
    m_data.cFileName[0] = 0;
    m_data.dwFileAttributes = 0;
    return 0;
  }
  m_search = search;
  KeepLinkMark(m_data);
  WCHAR full[MAX_PATH];
  if (platform::WideFullPath(full, m_mask, MAX_PATH) == nullptr) {
    SFileFind::Close();
    ::SetLastError(ERROR_INVALID_NAME);
    return 0;
  }
  const SStringView path(full);
  try {
    m_root = path.substr(0, platform::FolderLength(path) - 1);  // without the backslash, which a full path has
  } catch (...) {
    SFileFind::Close();
    throw;
  }
  return 1;
}

int SFileFind::FindNextFileW() {
  if (m_search != nullptr && ::FindNextFileW(m_search, &m_data)) {
    KeepLinkMark(m_data);
    return 1;
  }
  if (m_search == nullptr) ::SetLastError(ERROR_NO_MORE_FILES);
  m_data.cFileName[0] = 0;
  m_data.dwFileAttributes = 0;
  return 0;
}

SString SFileFind::GetFileName() const { return SString(m_data.cFileName); }

std::uint64_t SFileFind::GetLength() const {
  if (m_data.cFileName[0] == 0) return 0;
  return static_cast<std::uint64_t>(m_data.nFileSizeHigh) << 32 | m_data.nFileSizeLow;
}

int SFileFind::GiveTime(const FILETIME& from, STime* time) const {
  if (m_data.cFileName[0] == 0) return 0;
  *time = STime(from);
  return 1;
}

int SFileFind::GetCreationTime(STime* time) const { return GiveTime(m_data.ftCreationTime, time); }
int SFileFind::GetLastAccessTime(STime* time) const { return GiveTime(m_data.ftLastAccessTime, time); }
int SFileFind::GetLastWriteTime(STime* time) const { return GiveTime(m_data.ftLastWriteTime, time); }

int SFileFind::MatchesMask(unsigned long mask) const { return (m_data.dwFileAttributes & mask) != 0; }
