// SMappedView: owns a view of a mapping, memory at an address.
//
// The view refers to a mapping handle, which stays its owner's: it may be closed while the view lives. Results are
// codes as those of SMappedMemory. What a view of a file shows changes with the file. A file that another program
// cuts has no pages behind its new end: on Linux, who touches one through the pointer is sent SIGBUS, which ends
// the process; SMappedFile::Read and Write do not. Windows lets nobody cut a file that is mapped.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/system/file/mapped_memory.h"

class QXCORE_API SMappedView {
 public:
  SMappedView() = default;
  // Nothing is mapped yet.
  explicit SMappedView(const SMappedMemory& mapping) { Set(mapping); }
  // Copies take the other's view over, on purpose: see Set.
  SMappedView(const SMappedView& other) { Set(other, true); }
  SMappedView& operator=(const SMappedView& other) {
    Set(other, true);
    return *this;
  }
  SMappedView& operator=(const SMappedMemory& mapping) {
    Set(mapping);
    return *this;
  }
  // Unmaps the view; a failure of that is lost here: call Done before.
  virtual ~SMappedView();

  // CloseView, and forgets the mapping.
  virtual HRESULT Done();

  // Maps `size` bytes of the mapping, all behind the offset for 0, for reading and writing; a former view is
  // closed first (0x8099000B). The offset must be a multiple of the system's allocation granularity (65536).
  // E_INVALIDARG without a mapping; E_FAIL when it cannot be mapped, e.g. one of a file for reading only.
  HRESULT CreateView(unsigned long size, unsigned long offsetLow, unsigned long offsetHigh);
  HRESULT CreateView(unsigned long size, std::uint64_t offset = 0);
  // The same, but for reading only where writing is not allowed.
  HRESULT OpenView(unsigned long size, unsigned long offsetLow, unsigned long offsetHigh);
  HRESULT OpenView(unsigned long size, std::uint64_t offset = 0);
  // 1 without a view; 0x8099000B when it cannot be unmapped, and then it stays.
  HRESULT CloseView();
  // Writes what was changed to the file. 1 without a view. The other results are inverted, on purpose,
  // as callers rely on it: E_FAIL (0x80004005) when all went well, 0x8099000F when it did not.
  HRESULT FlushView();

  unsigned char* GetPointer() const { return static_cast<unsigned char*>(m_view); }  // null without a view
  // 1 or 0.
  int HasView() const { return m_view != nullptr; }
  // As GetPointer.
  operator unsigned char*() const { return GetPointer(); }
  // The same without a type.
  operator void*() const { return m_view; }

  void* GetMapping() const { return m_mapping; }  // not owned; null for none
  // As they were asked for; 0 without a view.
  unsigned long GetSize() const { return m_size; }
  std::uint64_t GetOffset() const { return static_cast<std::uint64_t>(m_offsetHigh) << 32 | m_offsetLow; }
  // Bytes that can be addressed from the pointer on, up to the end of a page; 0 without a view.
  std::size_t GetLength() const;

  // From now on views are of this mapping; the present one is closed (0x8099000B), unless it is of the same.
  HRESULT Set(void* mapping);
  HRESULT Set(const SMappedMemory& mapping) { return Set(mapping.GetSafeMapping()); }
  // With `takeOver` this object's view is closed, and mapping, pointer, offset and size move here: the other is empty
  // then. Without, it gets a view of its own of the same part, opened as OpenView does.
  HRESULT Set(const SMappedView& other, bool takeOver);

 private:
  HRESULT MapView(unsigned long size, std::uint64_t offset, bool orReadOnly);

  mutable void* m_mapping = nullptr;
  mutable void* m_view = nullptr;
  mutable std::uint32_t m_offsetLow = 0;
  mutable std::uint32_t m_offsetHigh = 0;
  mutable unsigned long m_size = 0;
};

static_assert(sizeof(void*) != 4 || sizeof(SMappedView) == 24, "handle, pointer, offset in halves, size");
