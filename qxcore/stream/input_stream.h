// The byte input of the whole library: files, memory, filters.
//
// Conventions of all input streams: a single-byte Read returns 0 to 255, or -1 at the end of the data; a
// block Read returns the number of bytes delivered, and fewer than asked for means that the end was
// reached. Reads throw for what a caller cannot expect (a file that does not open, the user's
// cancelling, misuse of marks), never for the end. A stream is used by one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/core/object.h"
#include "qxcore/platform/export.h"

class QXCORE_API SInputStream : public SObject {
  QXCORE_DECLARE_CLASS(SInputStream)

  // The next byte, or -1 at the end.
  virtual int Read() = 0;
  // Up to `count` bytes into `buffer`; returns how many. 0 for a count of 0, without touching the source.
  // The base version goes byte by byte.
  virtual unsigned long Read(void* buffer, unsigned long count);
  // Passes over up to `count` bytes; returns how many. The base version goes byte by byte.
  virtual unsigned long Skip(unsigned long count);
  // How many bytes can be read at least; 0 at the end, and where a stream does not know.
  virtual unsigned long Available();
  // 1 when the end was reached, else 0.
  virtual int IsEOF() = 0;
  // Remembers the position for Reset, for as long as no more than `limit` bytes are read. The base
  // version remembers nothing.
  virtual void Mark(unsigned long limit);
  // Goes back to the mark. Throws SEIOResetInvalid where no mark is set, which is always so here.
  virtual void Reset();
  // Ends the stream. The base version does nothing.
  virtual void Close();
  // For streams that have all their data in memory: the rest of it where it lies, valid as long as the
  // stream, which then stands at its end. Sets *size. Null where data comes from elsewhere, as in the base version.
  virtual const void* TakeRest(unsigned long* size);

  // The error of the source that ended or cut the data, as errno has it; 0 while there is none. A read
  // that fails in the middle looks like the end of the data: if nothing may be lost, check this after the end.
  virtual int GetError() const;

  // Up to `count` characters, which is not 0, as the single Read returns them one by one: 16-bit characters of a
  // reader of text, else bytes. Returns how many, 0 only at the end. The base version reads one, so that
  // nothing is lost when Read() throws.
  virtual unsigned long ReadCharacters(WCHAR* buffer, unsigned long count);

  // For streams that can go back, such as files: sets *place to where they stand and returns true, and goes to such a
  // place again. Neither marks nor limits come into it. GoToPlace returns false where that fails, and the stream then
  // stands where it did. The base versions return false.
  virtual bool GetPlace(std::uint64_t* place);
  virtual bool GoToPlace(std::uint64_t place);

 protected:
  SInputStream() = default;
};
