#include "qxcore/stream/input_stream.h"

#include "qxcore/core/io_exceptions.h"

QXCORE_IMPLEMENT_CLASS(SInputStream, SObject, 0)

unsigned long SInputStream::Read(void* buffer, unsigned long count) {
  unsigned char* out = static_cast<unsigned char*>(buffer);
  unsigned long done = 0;
  for (; done < count; ++done) {
    int byte = Read();
    if (byte < 0) break;
    out[done] = static_cast<unsigned char>(byte);
  }
  return done;
}

unsigned long SInputStream::Skip(unsigned long count) {
  unsigned long done = 0;
  while (done < count && Read() >= 0) ++done;
  return done;
}

unsigned long SInputStream::Available() { return 0; }
void SInputStream::Mark(unsigned long) {}
void SInputStream::Reset() { throw SEIOResetInvalid(); }
void SInputStream::Close() {}
const void* SInputStream::TakeRest(unsigned long*) { return nullptr; }
int SInputStream::GetError() const { return 0; }

bool SInputStream::GetPlace(std::uint64_t*) { return false; }
bool SInputStream::GoToPlace(std::uint64_t) { return false; }

unsigned long SInputStream::ReadCharacters(WCHAR* buffer, unsigned long) {
  const int character = Read();
  if (character < 0) return 0;
  *buffer = static_cast<WCHAR>(character);
  return 1;
}
