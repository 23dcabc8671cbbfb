#include "qxcore/system/file/find_failures.h"

namespace {

// The folder that a mask looks into: "C:\dir" for "C:\dir\*.*", "C:\" for "C:\*.*".
SString FolderOf(const SString& mask) {
  const SStringView view = mask.View();
  const std::size_t last = view.find_last_of(WTEXT("\\/"));
  if (last == SStringView::npos) return SString(WTEXT("."));
  const bool isRoot = last == 0 || view[last - 1] == ':';
  return mask.Left(static_cast<int>(isRoot ? last + 1 : last));
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
