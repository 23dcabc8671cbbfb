#include "qxcore/system/file/current_directory.h"

#include "qxcore/core/internal/quietly.h"
#include "qxcore/system/file/file.h"

// Where memory is out, the directory stays where it is.
SCurrentDirectory::~SCurrentDirectory() {
  SQuietly([this] { Restore(); });
}

SString SCurrentDirectory::Get() {
  const SString behindDrive = SFile::GetCurrentDirectoryW();
  return behindDrive.IsEmpty() ? behindDrive : SFile::GetCurrentDrive() + behindDrive.Mid(1);
}

int SCurrentDirectory::Set(const SString& path) { return ::SetCurrentDirectoryW(path); }

SString SCurrentDirectory::GetDefaultTemporaryDirectory() {
  return SFile::NormalizeDirectoryName(SFile::GetTempDirectory());
}

int SCurrentDirectory::Assign(const SString& path, int unconditional) {
  const SString target = path.IsEmpty() ? GetDefaultTemporaryDirectory() : SFile::NormalizeDirectoryName(path);
  const SString before = Get();
  m_returnTo = before;
  m_assigned = target;
  m_unconditional = unconditional;
  if (before.CompareNoCase(target) == 0) return 0;
  const int changed = Set(target);
  // Behind a link the system names the folder that it leads to.
  if (changed) m_assigned = Get();
  return changed;
}

int SCurrentDirectory::Restore(int keep) {
  int result = 0;
  if (!m_returnTo.IsEmpty() && !m_assigned.IsEmpty()) {
    const SString now = Get();
    const bool ours = m_unconditional != 0 || now.CompareNoCase(m_assigned) == 0;
    if (ours && now.CompareNoCase(m_returnTo) != 0) result = Set(m_returnTo);
  }
  if (keep == 0) CancelRestore();
  return result;
}

void SCurrentDirectory::CancelRestore() {
  m_returnTo.Release();
  m_assigned.Release();
  m_unconditional = 0;
}
