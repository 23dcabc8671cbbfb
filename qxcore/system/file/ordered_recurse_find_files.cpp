#include "qxcore/system/file/ordered_recurse_find_files.h"

#include "qxcore/system/file/file_recurse_find.h"
#include "qxcore/system/file/find_filters.h"

namespace {

// What the walk reports goes to the failures of the object that outlives it.
class Forward final : public SFindFailureSink {
 public:
  explicit Forward(SFindFailures& failures) : m_failures(failures) {}
  void OnFolderNotRead(const SString& folder, unsigned long error) override { m_failures.Add(folder, error); }

 private:
  SFindFailures& m_failures;
};

}  // namespace

int SOrderedRecurseFindFiles::FindFile(const WCHAR* mask) {
  Clear();
  m_failures.Clear();
  SFileRecurseFind walk;
  Forward forward(m_failures);
  walk.SetFailureSink(&forward);
  SAttrRejectFindFilter files(walk);
  try {
    int found = files.FindFile(mask, FILE_ATTRIBUTE_DIRECTORY);
    for (; found; found = files.FindNextFileW()) m_paths.Add(files.GetFilePath());
  } catch (...) {
    Clear();
    throw;
  }
  if (m_paths.GetCount() == 0) {
    ::SetLastError(m_failures.IsEmpty() ? ERROR_FILE_NOT_FOUND : static_cast<DWORD>(m_failures.GetFirstError()));
    return 0;
  }
  m_paths.Sort(SStringTable::kAscending);
  return 1;
}

int SOrderedRecurseFindFiles::FindNextFileW() {
  if (m_index >= m_paths.GetCount() - 1) {
    ::SetLastError(ERROR_NO_MORE_FILES);
    return 0;
  }
  ++m_index;
  return 1;
}

SString SOrderedRecurseFindFiles::GetFilePath() const {
  return m_index < m_paths.GetCount() ? m_paths[m_index] : SString();
}

void SOrderedRecurseFindFiles::Clear() {
  m_paths.Clear();
  m_index = 0;
}
