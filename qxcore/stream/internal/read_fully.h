// Reading and skipping until there is no more: a source may give less than it was asked for without being at its end.
#pragma once

#include "qxcore/stream/input_stream.h"

// One read of up to `count` bytes; 0 at the end, and where the source reports failure as all ones.
inline unsigned long SReadSome(SInputStream& in, void* buffer, unsigned long count) {
  const unsigned long got = in.Read(buffer, count);
  return got <= count ? got : 0;
}

// Reads until `count` bytes are there or a read returns 0; adds them to `done`, also when a read throws.
inline void SReadFully(SInputStream& in, void* buffer, unsigned long count, unsigned long& done) {
  unsigned char* out = static_cast<unsigned char*>(buffer);
  for (unsigned long left = count; left > 0;) {
    const unsigned long got = SReadSome(in, out, left);
    if (got == 0) break;
    out += got;
    left -= got;
    done += got;
  }
}

// The same; returns how many there are.
inline unsigned long SReadFully(SInputStream& in, void* buffer, unsigned long count) {
  unsigned long done = 0;
  SReadFully(in, buffer, count, done);
  return done;
}
