// The byte output of the whole library: files, memory, filters.
//
// Write failures throw (SEIODiskFullException, SEIOWriteFailed). Destructors never throw: call Close, or Flush,
// before, to know that everything arrived. A stream is used by one thread at a time.
#pragma once

#include "qxcore/core/object.h"
#include "qxcore/platform/export.h"

class QXCORE_API SOutputStream : public SObject {
  QXCORE_DECLARE_CLASS(SOutputStream)

  // Writes one byte, the low eight bits.
  virtual void Write(int byte) = 0;
  // Writes a block; returns the number of bytes written, which is `count` unless it throws. The base
  // version goes byte by byte.
  virtual unsigned long Write(const void* buffer, unsigned long count);
  // Hands everything that waits to the target. In the base version nothing waits.
  virtual void Flush();
  // Flushes and ends the stream. The base version does nothing.
  virtual void Close();

 protected:
  SOutputStream() = default;
};

// The common base of output filters: class information only.
class QXCORE_API SOutputFilterStream : public SOutputStream {
  QXCORE_DECLARE_CLASS(SOutputFilterStream)

 protected:
  SOutputFilterStream() = default;
};
