#include "qxcore/system/file/folder_recurse.h"

SFolderRecurse::SFolderFinderNode* SFolderRecurse::SFolderFinderNode::SelfDestroy() {
  SFolderFinderNode* parent = m_parent;
  const DWORD error = ::GetLastError();
  delete this;
  ::SetLastError(error);
  return parent;
}

int SFolderRecurse::SFolderFinderNode::SkipDots() {
  while (IsDots())
    if (!FindNextFileW()) return 0;
  return 1;
}

SFolderRecurse::~SFolderRecurse() { SFolderRecurse::Close(); }

int SFolderRecurse::Close() {
  int closed = 1;
  while (m_current != nullptr) {
    closed &= m_current->Close();
    m_current = m_current->SelfDestroy();
  }
  return closed;
}

int SFolderRecurse::FindFile(const WCHAR* mask, unsigned long) {
  const SString wanted(mask != nullptr ? mask : WTEXT("*.*"));
  Close();
  m_failures.Clear();
  try {
    return Enter(wanted);
  } catch (...) {
    Close();
    throw;
  }
}

int SFolderRecurse::Enter(const SString& mask) {
  m_current = new SFolderFinderNode(m_current);
  const int found = m_foldersOnly ? m_current->FindFolders(mask) : m_current->FindFile(mask, 0);
  if (found && m_current->SkipDots()) return 1;
  const DWORD error = ::GetLastError();
  m_current = m_current->SelfDestroy();
  m_failures.AddSearch(mask, error);
  ::SetLastError(error);
  return 0;
}

int SFolderRecurse::GoDown() {
  if (!m_current->IsDirectory() || m_current->IsLink()) return 0;
  return Enter(m_current->GetFilePath() + WTEXT("\\*.*"));
}

// The next entry beside the current one; without one the failure, if it was one, is noted.
int SFolderRecurse::GoOn() {
  if (m_current->FindNextFileW() && m_current->SkipDots()) return 1;
  const DWORD error = ::GetLastError();
  m_failures.AddSearch(m_current->GetMask(), error);
  return 0;
}

int SFolderRecurse::FindNextFileW() {
  try {
    if (m_current != nullptr && GoDown()) return 1;
    while (m_current != nullptr) {
      if (GoOn()) return 1;
      m_current = m_current->SelfDestroy();
    }
  } catch (...) {
    Close();
    throw;
  }
  ::SetLastError(m_failures.IsEmpty() ? ERROR_NO_MORE_FILES : static_cast<DWORD>(m_failures.GetFirstError()));
  return 0;
}

SString SFolderRecurse::GetFileName() const { return m_current != nullptr ? m_current->GetFileName() : SString(); }
SString SFolderRecurse::GetRoot() const { return m_current != nullptr ? m_current->GetRoot() : SString(); }
std::uint64_t SFolderRecurse::GetLength() const { return m_current != nullptr ? m_current->GetLength() : 0; }

int SFolderRecurse::GetCreationTime(STime* time) const {
  return m_current != nullptr ? m_current->GetCreationTime(time) : 0;
}

int SFolderRecurse::GetLastAccessTime(STime* time) const {
  return m_current != nullptr ? m_current->GetLastAccessTime(time) : 0;
}

int SFolderRecurse::GetLastWriteTime(STime* time) const {
  return m_current != nullptr ? m_current->GetLastWriteTime(time) : 0;
}

int SFolderRecurse::MatchesMask(unsigned long mask) const {
  return m_current != nullptr ? m_current->MatchesMask(mask) : 0;
}
