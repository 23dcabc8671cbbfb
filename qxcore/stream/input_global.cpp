#include "qxcore/stream/input_global.h"

QXCORE_IMPLEMENT_CLASS(SInputGlobal, SInputBuffer, 0)

SInputGlobal::SInputGlobal(const SHGlobal& memory, bool owns) : m_memory(memory), m_owns(owns) {
  Init(m_memory.Lock(), m_memory.Size());
}
SInputGlobal::SInputGlobal(HGLOBAL memory, bool owns) : SInputGlobal(SHGlobal(memory), owns) {}

SInputGlobal::~SInputGlobal() { SInputGlobal::Close(); }

void SInputGlobal::Close() {
  Init(nullptr, 0ul);
  m_memory.Unlock();
  if (m_owns) m_memory.Free();
  m_memory.Detach();
}
