// SMappedMemory: owns a mapping object, memory that views make visible (SMappedView), backed by the paging file or,
// in SMappedFile, by a file.
//
// Results are 32-bit codes: 0 for success, 1 for nothing to do, negative ones of SFile::Status or of the system for
// failures; the platform's last-error value says more. An object belongs to one thread at a time. A mapping
// with a name is shared by all who open one of that name: see docs/mapped-files.md.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class QXCORE_API SMappedMemory {
 public:
  enum : std::uint64_t { kDefaultSize = 0xA00000 };  // 10 MiB, for a size of 0

  SMappedMemory() = default;
  // A duplicate of the other's handle; none where it cannot be duplicated.
  SMappedMemory(const SMappedMemory& other) { Set(other, true); }
  SMappedMemory& operator=(const SMappedMemory& other) {
    Set(other, true);
    return *this;
  }
  // Closes the handle; a failure of that is lost here: call Done before.
  virtual ~SMappedMemory();

  // Releases what the object holds: here CloseMapping.
  virtual HRESULT Done();

  // Makes a mapping of `size` bytes, the default size for 0, and closes a former one first (0x8099000B). A mapped
  // file grows to that size. 0x80990014 (SFile::kMappingFailed) when it cannot be made: the file does not open,
  // is for reading only and smaller, there is no room. `name` may be null.
  HRESULT CreateMapping(unsigned long sizeLow, unsigned long sizeHigh, const WCHAR* name);
  HRESULT CreateMapping(std::uint64_t size, const WCHAR* name = nullptr);
  // The same, but the size is relative to a file's: `size` bytes more than it has, and for 0 just the file. Without a
  // file 0 means the default size.
  HRESULT OpenMapping(unsigned long sizeLow, unsigned long sizeHigh, const WCHAR* name);
  HRESULT OpenMapping(std::uint64_t size, const WCHAR* name = nullptr);
  // 0x8099000B when the handle cannot be closed; the object has let go of it all the same. Views stay.
  HRESULT CloseMapping();

  // Takes over a handle as it is; one that the object has is not closed. Null for none.
  void AttachMapping(void* mapping) { m_mapping = mapping; }
  // Hands the handle to the caller, who then owns it; null without a mapping.
  void* DetachMapping();
  void* GetSafeMapping() const { return m_mapping; }  // still the object's; null for none
  int IsMapped() const { return m_mapping != nullptr; }

  // Replaces the handle: releases the former one (Done), then takes over `mapping` as it is, or, with `duplicate`, an
  // inheritable duplicate of the same access. The handle that is held already changes nothing. E_FAIL when it cannot
  // be duplicated.
  HRESULT Set(void* mapping, bool duplicate);
  // The same with the other's handle; without `duplicate` it moves, so that it is not closed twice: the other
  // has none then.
  HRESULT Set(const SMappedMemory& other, bool duplicate);

 protected:
  // The file to map, its size, and whether it is for reading only: null for the paging file, as in this class,
  // INVALID_HANDLE_VALUE for a file that does not open.
  virtual void* GetFileHandle(int* readOnly, unsigned long* sizeLow, unsigned long* sizeHigh);

 private:
  enum class SizeIs { kTotal, kBeyondFile };
  HRESULT MakeMapping(std::uint64_t size, SizeIs meaning, const WCHAR* name);

  mutable void* m_mapping = nullptr;
};

static_assert(sizeof(void*) != 4 || sizeof(SMappedMemory) == 8, "the handle alone");
