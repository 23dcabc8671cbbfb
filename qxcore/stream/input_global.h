// Input from global memory. Threads: a stream belongs to one thread at a time.
#pragma once

#include "qxcore/stream/input_buffer.h"
#include "qxcore/system/hglobal.h"

class QXCORE_API SInputGlobal : public SInputBuffer {
  QXCORE_DECLARE_CLASS(SInputGlobal)

  // Reads all of the memory, which stays locked meanwhile; with `owns` it is freed at the end.
  explicit SInputGlobal(const SHGlobal& memory, bool owns = false);
  explicit SInputGlobal(HGLOBAL memory, bool owns = false);
  SInputGlobal(const SInputGlobal&) = delete;
  SInputGlobal& operator=(const SInputGlobal&) = delete;
  ~SInputGlobal() override;

  // Unlocks the memory, and frees it when it is owned.
  void Close() override;

 private:
  SHGlobal m_memory;
  bool m_owns;
};
