// Output into global memory that grows in steps of 8192 bytes. Threads: a stream belongs to one thread at a time.
#pragma once

#include "qxcore/stream/output_stream.h"
#include "qxcore/string/string.h"
#include "qxcore/system/hglobal.h"

class QXCORE_API SOutputGlobal : public SOutputStream {
  QXCORE_DECLARE_CREATABLE_CLASS(SOutputGlobal)

  enum : unsigned long { kStep = 8192 };

  SOutputGlobal();
  SOutputGlobal(const SOutputGlobal&) = delete;
  SOutputGlobal& operator=(const SOutputGlobal&) = delete;
  ~SOutputGlobal() override;

  // Throw SEOutOfMemory when the memory cannot grow, and keep what was written.
  void Write(int byte) override;
  unsigned long Write(const void* buffer, unsigned long count) override;
  // Unlocks and frees the memory.
  void Close() override;

  // Closes, then takes over a handle whose first `used` bytes (at most its size) count as written. The
  // second form sets *memory to null, so that the caller cannot free it, too.
  void Attach(void* memory, unsigned long used);
  void Attach(void** memory, unsigned long used);
  // Hands the memory, unlocked, to the caller, who then owns it; null when nothing was written.
  HGLOBAL Detach();
  // The same into *memory; returns 1, or 0 when nothing was written.
  int GetHGlobal(SHGlobal* memory);
  // What was written as 16-bit text; returns 1, or 0 when nothing was written.
  int GetString(SString* text) const;
  unsigned long UsedSize() const { return static_cast<unsigned long>(m_write - m_base); }
  const void* GetData() const { return m_base; }  // valid until the next write
  // Starts writing anew at the beginning; the memory stays.
  void Reset() { m_write = m_base; }

 protected:
  // Makes room for `size` bytes, of which the first `used` count as written.
  void Resize(unsigned long size, unsigned long used);

 private:
  void Grow(unsigned long size);

  SHGlobal m_memory;
  unsigned char* m_base = nullptr;  // locked
  unsigned char* m_end = nullptr;   // of the room; the memory may be larger
  unsigned char* m_write = nullptr;
};
