// The growing buffer of a multi-format reader.
//
// Threads: a buffer belongs to one thread at a time, like the reader that has it.
#pragma once

// Bytes lie from start to end, in a block of `capacity` bytes.
struct SRawBuffer {
  unsigned char* block = nullptr;  // the bytes in use and the room around them
  unsigned char* start = nullptr;  // first byte not used yet
  unsigned char* end = nullptr;    // behind the last byte
  unsigned long capacity = 0;      // bytes of the block
  bool isBorrowed = false;         // the block is another's: it is never written, and copied before it grows

  unsigned long Size() const { return static_cast<unsigned long>(end - start); }  // bytes not used yet
};
