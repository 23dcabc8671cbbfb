#include "qxcore/stream/output_global.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "qxcore/core/exception.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SOutputGlobal, SOutputStream, 0)

SOutputGlobal::SOutputGlobal() = default;
SOutputGlobal::~SOutputGlobal() { SOutputGlobal::Close(); }

// What grows once will grow again, and the system copies all of it each time: more is taken than was asked for, as long
// as there is enough. Detach gives the rest back.
void SOutputGlobal::Grow(unsigned long size) {
  constexpr unsigned int kFlags = GMEM_MOVEABLE | GMEM_ZEROINIT;
  const unsigned long held = m_memory.Size(), generous = held + held / 4;
  if (generous > size) {
    try {
      return m_memory.ReAlloc(generous, kFlags);
    } catch (const SEOutOfMemory&) {
    }
  }
  m_memory.ReAlloc(size, kFlags);
}

void SOutputGlobal::Resize(unsigned long size, unsigned long used) {
  if (m_memory == nullptr) {
    m_memory.Alloc(GMEM_ZEROINIT, size);
    m_base = static_cast<unsigned char*>(m_memory.Lock());
  } else if (size > m_memory.Size()) {
    m_memory.Unlock();
    try {
      Grow(size);
    } catch (...) {
      m_memory.Lock();  // as it was, at the same place: nobody could move it meanwhile
      throw;
    }
    m_base = static_cast<unsigned char*>(m_memory.Lock());
  }
  m_end = m_base + size;
  m_write = m_base + std::min(used, size);
}

void SOutputGlobal::Write(int byte) {
  if (m_write == m_end) Resize(UsedSize() + kStep, UsedSize());
  *m_write++ = static_cast<unsigned char>(byte);
}

unsigned long SOutputGlobal::Write(const void* buffer, unsigned long count) {
  if (count == 0) return 0;
  if (count > static_cast<unsigned long>(m_end - m_write)) {
    constexpr unsigned long kMost = std::numeric_limits<unsigned long>::max() - kStep;
    if (count > kMost - UsedSize()) throw SEOutOfMemory();
    Resize((UsedSize() + count + kStep - 1) / kStep * kStep, UsedSize());
  }
  std::memcpy(m_write, buffer, count);
  m_write += count;
  return count;
}

void SOutputGlobal::Close() {
  m_memory.Unlock();
  m_memory.Free();
  m_base = m_end = m_write = nullptr;
}

void SOutputGlobal::Attach(void* memory, unsigned long used) {
  Close();
  m_memory.Attach(memory);
  m_base = static_cast<unsigned char*>(m_memory.Lock());
  m_end = m_base + m_memory.Size();
  m_write = m_base + std::min(used, m_memory.Size());
}

void SOutputGlobal::Attach(void** memory, unsigned long used) {
  void* taken = *memory;
  *memory = nullptr;
  Attach(taken, used);
}

HGLOBAL SOutputGlobal::Detach() {
  const unsigned long size = static_cast<unsigned long>(m_end - m_base);
  m_memory.Unlock();
  m_base = m_end = m_write = nullptr;
  if (size < m_memory.Size()) {
    try {
      m_memory.ReAlloc(size, GMEM_MOVEABLE);
    } catch (const SEOutOfMemory&) {  // it is larger than it need be, and whole
    }
  }
  return m_memory.Detach();
}

int SOutputGlobal::GetHGlobal(SHGlobal* memory) {
  memory->Attach(Detach());
  return *memory != nullptr;
}

int SOutputGlobal::GetString(SString* text) const {
  *text = SStringView(reinterpret_cast<const WCHAR*>(m_base), UsedSize() / sizeof(WCHAR));
  return m_base != nullptr;
}
