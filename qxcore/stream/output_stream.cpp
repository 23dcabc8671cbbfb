#include "qxcore/stream/output_stream.h"

QXCORE_IMPLEMENT_CLASS(SOutputStream, SObject, 0)
QXCORE_IMPLEMENT_CLASS(SOutputFilterStream, SOutputStream, 0)

unsigned long SOutputStream::Write(const void* buffer, unsigned long count) {
  const unsigned char* bytes = static_cast<const unsigned char*>(buffer);
  for (unsigned long i = 0; i < count; ++i) Write(bytes[i]);
  return count;
}

void SOutputStream::Flush() {}
void SOutputStream::Close() {}
