#include "qxcore/system/file/find_failures.h"

#include "qxcore/platform/internal/path_parts.h"

namespace {

// The folder that a mask looks into: "C:\dir" for "C:\dir\*.*", "C:\" for "C:\*.*".
SString FolderOf(const SString& mask) {
  const auto length = static_cast<int>(platform::FolderLength(mask.View()));
  if (length == 0) return SString(WTEXT("."));
  const bool isRoot = length == 1 || mask[length - 1] == ':' || mask[length - 2] == ':';
  return mask.Left(isRoot ? length : length - 1);
}

}  // namespace

void SFindFailures::Add(const SString& folder, unsigned long error) {
  if (m_count > 0 && m_lastFolder == folder) return;
  m_lastFolder = folder;
  if (m_count++ == 0) {
    m_firstFolder = folder;
    m_firstError = error;
  }
  if (m_sink != nullptr) m_sink->OnFolderNotRead(folder, error);
}

void SFindFailures::AddSearch(const SString& mask, unsigned long error) {
  if (error == ERROR_SUCCESS || error == ERROR_FILE_NOT_FOUND || error == ERROR_NO_MORE_FILES) return;
  // The platforms call a path that is too long by different names.
  const bool isTooLong = mask.Length() >= MAX_PATH;
  Add(FolderOf(mask), isTooLong ? ERROR_INVALID_NAME : error);
}

void SFindFailures::Clear() {
  m_count = 0;
  m_firstError = 0;
  m_firstFolder.Release();
  m_lastFolder.Release();
}
