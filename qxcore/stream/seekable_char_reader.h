// Characters with positions: what SSeekableStringInputStream reads from.
// Threads: a reader belongs to one thread at a time.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/stream/abstract_io.h"
#include "qxcore/string/string.h"

class QXCORE_API SAbstractIO::SIOSeekableCharReader {
 public:
  virtual ~SIOSeekableCharReader();

  // The next 16-bit character, or -1 at the end.
  virtual int ReadChar() = 0;
  // The next line, without its line feed and a carriage return before that.
  virtual SString ReadLn() = 0;
  // Moves to a position; true on failure. Positions are the reader's own: only what GetPos returned is one.
  virtual bool SeekPos(unsigned long position) = 0;
  virtual unsigned long GetPos() const = 0;
  // Whether SeekPos can go back.
  virtual bool SeekSupported() const = 0;
  virtual unsigned long Available() = 0;
  virtual int IsEOF() = 0;

 protected:
  SIOSeekableCharReader() = default;
};
