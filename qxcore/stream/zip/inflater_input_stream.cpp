#include "qxcore/stream/zip/inflater_input_stream.h"

#include <algorithm>
#include <limits>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/memory.h"
#include "qxcore/stream/internal/read_fully.h"
#include "qxcore/stream/zip/internal/zip_format.h"

QXCORE_IMPLEMENT_CLASS(SInflaterInputStream, SInputStream, 0)

namespace {

constexpr unsigned long kLargestPiece = std::numeric_limits<int>::max();  // the inflater counts in int

}  // namespace

SInflaterInputStream::SInflaterInputStream(unsigned long size) : SInflaterInputStream(nullptr, size, false) {}

SInflaterInputStream::SInflaterInputStream(SInputStream& in, unsigned long size)
    : SInflaterInputStream(&in, size, false) {}

SInflaterInputStream::SInflaterInputStream(SInputStream* in, unsigned long size, bool owns)
    : m_in(in, owns), m_size(std::clamp(size, 1ul, kLargestPiece)) {
  m_buffer = static_cast<unsigned char*>(SMemAlloc(m_size));
}

SInflaterInputStream::~SInflaterInputStream() { SMemFree(m_buffer); }

void SInflaterInputStream::Fill() {
  const unsigned long got = SReadSome(*m_in, m_buffer, m_size);
  if (got == 0) throw SEEOFException();
  m_inflater.SetInput(m_buffer, static_cast<int>(got));
}

int SInflaterInputStream::Read() {
  unsigned char one;
  return Read(&one, 1) == 1 ? one : -1;
}

unsigned long SInflaterInputStream::Read(void* buffer, unsigned long count) {
  if (count == 0) return 0;
  const int length = static_cast<int>(std::min(count, kLargestPiece));
  try {
    for (;;) {
      const int before = m_inflater.GetRemaining();
      const int produced = m_inflater.IsFinished() ? 0 : m_inflater.Inflate(buffer, length);
      if (produced > 0) return static_cast<unsigned long>(produced);
      if (m_inflater.IsFinished() || m_inflater.NeedsDictionary()) return 0;
      if (m_inflater.GetRemaining() == 0) {
        Fill();
      } else if (m_inflater.GetRemaining() == before) {
        throw SEEOFException();  // it would look at the same input for ever
      }
    }
  } catch (const SEOutOfMemory&) {
    throw;
  } catch (...) {
    SThrowZip(WTEXT("Invalid ZLIB data format"));
  }
}

unsigned long SInflaterInputStream::Skip(unsigned long count) {
  unsigned char skipped[4096];
  unsigned long done = 0;
  while (done < count) {
    const unsigned long got = Read(skipped, std::min<unsigned long>(count - done, sizeof skipped));
    if (got == 0) break;
    done += got;
  }
  return done;
}
