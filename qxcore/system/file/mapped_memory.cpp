#include "qxcore/system/file/mapped_memory.h"

#include <limits>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/internal/result.h"

SMappedMemory::~SMappedMemory() { CloseMapping(); }

HRESULT SMappedMemory::Done() { return CloseMapping(); }

void* SMappedMemory::GetFileHandle(int* readOnly, unsigned long* sizeLow, unsigned long* sizeHigh) {
  *readOnly = 0;
  *sizeLow = *sizeHigh = 0;
  return nullptr;
}

HRESULT SMappedMemory::CreateMapping(unsigned long sizeLow, unsigned long sizeHigh, const WCHAR* name) {
  return CreateMapping(Join(sizeLow, sizeHigh), name);
}

HRESULT SMappedMemory::CreateMapping(std::uint64_t size, const WCHAR* name) {
  return MakeMapping(size, SizeIs::kTotal, name);
}

HRESULT SMappedMemory::OpenMapping(unsigned long sizeLow, unsigned long sizeHigh, const WCHAR* name) {
  return OpenMapping(Join(sizeLow, sizeHigh), name);
}

HRESULT SMappedMemory::OpenMapping(std::uint64_t size, const WCHAR* name) {
  return MakeMapping(size, SizeIs::kBeyondFile, name);
}

HRESULT SMappedMemory::MakeMapping(std::uint64_t size, SizeIs meaning, const WCHAR* name) {
  if (const HRESULT status = CloseMapping()) return status;
  int readOnly = 0;
  unsigned long low = 0, high = 0;
  void* const file = GetFileHandle(&readOnly, &low, &high);
  if (file == INVALID_HANDLE_VALUE) return Result(false, SFile::kMappingFailed);
  if (meaning == SizeIs::kTotal || file == nullptr) {
    if (size == 0) size = kDefaultSize;
  } else if (size != 0) {
    const std::uint64_t fileSize = Join(low, high);
    if (size > std::numeric_limits<std::uint64_t>::max() - fileSize) {
      ::SetLastError(ERROR_INVALID_PARAMETER);
      return Result(false, SFile::kMappingFailed);
    }
    size += fileSize;
  }
  SECURITY_ATTRIBUTES security = {sizeof(SECURITY_ATTRIBUTES), nullptr, TRUE};
  // The platform's sign for the paging file is no null handle.
  m_mapping = ::CreateFileMappingW(file != nullptr ? file : INVALID_HANDLE_VALUE, &security,
                                   readOnly != 0 ? PAGE_READONLY : PAGE_READWRITE, static_cast<DWORD>(size >> 32),
                                   static_cast<DWORD>(size), name);
  return Result(m_mapping != nullptr, SFile::kMappingFailed);
}

HRESULT SMappedMemory::CloseMapping() {
  void* const mapping = DetachMapping();
  return Result(mapping == nullptr || ::CloseHandle(mapping) != FALSE, SFile::kCloseFailed);
}

void* SMappedMemory::DetachMapping() {
  void* const mapping = m_mapping;
  m_mapping = nullptr;
  return mapping;
}

HRESULT SMappedMemory::Set(void* mapping, bool duplicate) {
  if (mapping == m_mapping) return Result(true, SFile::kCloseFailed);
  const HRESULT status = Done();
  m_mapping = mapping;
  if (!duplicate || mapping == nullptr) return status;
  const HANDLE process = ::GetCurrentProcess();
  HANDLE copy = nullptr;
  const BOOL done = ::DuplicateHandle(process, mapping, process, &copy, 0, TRUE, DUPLICATE_SAME_ACCESS);
  m_mapping = done ? copy : nullptr;
  return done ? status : E_FAIL;
}

HRESULT SMappedMemory::Set(const SMappedMemory& other, bool duplicate) {
  if (this == &other) return Result(true, SFile::kCloseFailed);
  void* const mapping = other.m_mapping;
  if (!duplicate) other.m_mapping = nullptr;
  return Set(mapping, duplicate);
}
