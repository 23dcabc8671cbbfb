#include "qxcore/system/file/file_recurse_find.h"

#include "qxcore/system/file/file.h"

int SFileRecurseFind::Close() {
  m_walks = 0;
  const int closed = SFileFind::Close();
  return m_folders.Close() & closed;
}

int SFileRecurseFind::FindFile(const WCHAR* mask, unsigned long) {
  const SString wanted(mask != nullptr ? mask : WTEXT("*.*"));
  Close();
  m_folders.m_failures.Clear();
  TakeApart(wanted);
  try {
    return FindIn(m_base) || FindInNextFolder() ? 1 : EndWith(ERROR_FILE_NOT_FOUND);
  } catch (...) {
    Close();
    throw;
  }
}

void SFileRecurseFind::TakeApart(const SString& mask) {
  const int last = mask.ReverseFindPos('\\', mask.Length() - 1);
  const int end = last >= 0 ? last : mask.ReverseFindPos(':', mask.Length() - 1);
  if (mask.FindPos('*') < 0 && SFile::IsDirectory(mask)) {
    m_base = mask;
    m_fileMask = WTEXT("*.*");
  } else {
    m_base = end >= 0 ? mask.Left(end + 1) : SString(WTEXT("."));
    m_fileMask = mask.Mid(end + 1);
  }
  if (m_base[m_base.Length() - 1] != '\\') m_base += WCHAR('\\');
}

int SFileRecurseFind::FindNextFileW() {
  if (SFileFind::FindNextFileW()) return 1;
  try {
    m_folders.m_failures.AddSearch(GetMask(), ::GetLastError());
    return FindInNextFolder() ? 1 : EndWith(ERROR_NO_MORE_FILES);
  } catch (...) {
    Close();
    throw;
  }
}

int SFileRecurseFind::FindIn(const SString& folder) {
  if (SFileFind::FindFile(folder + m_fileMask)) return 1;
  m_folders.m_failures.AddSearch(GetMask(), ::GetLastError());
  return 0;
}

int SFileRecurseFind::FindInNextFolder() {
  for (;;) {
    const int found = m_walks == 0 ? m_folders.Enter(m_base + WTEXT("*.*")) : m_folders.FindNextFileW();
    m_walks = 1;
    if (!found) return 0;
    const bool isFolder = m_folders.IsDirectory() && !m_folders.IsLink();
    if (isFolder && FindIn(m_folders.GetFilePath() + WTEXT("\\"))) return 1;
  }
}

int SFileRecurseFind::EndWith(DWORD error) {
  const SFindFailures& failures = GetFailures();
  ::SetLastError(failures.IsEmpty() ? error : static_cast<DWORD>(failures.GetFirstError()));
  return 0;
}
