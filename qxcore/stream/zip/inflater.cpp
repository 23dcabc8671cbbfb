#include "qxcore/stream/zip/inflater.h"

#include <zlib.h>

#include <limits>

#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"
#include "qxcore/stream/zip/internal/zip_format.h"

namespace {

// The interface that is used; zlib checks the first digit only.
constexpr const char* kZlibVersion = "1.1.3";

voidpf Allocate(voidpf, uInt items, uInt size) {
  if (size != 0 && items > std::numeric_limits<std::size_t>::max() / size) return nullptr;
  return SMemTryAlloc(static_cast<std::size_t>(items) * size);
}

void Free(voidpf, voidpf block) { SMemFree(block); }

[[noreturn]] void Fail(int result) {
  if (result == Z_MEM_ERROR) throw SEOutOfMemory();
  SThrowZip(WTEXT("zlib error!!!"));
}

}  // namespace

SInflater::~SInflater() { End(); }

void SInflater::Init(int raw) {
  auto* stream = static_cast<z_stream*>(SMemAlloc(sizeof(z_stream)));
  *stream = {};
  stream->zalloc = Allocate;
  stream->zfree = Free;
  const int result = inflateInit2_(stream, raw != 0 ? -MAX_WBITS : MAX_WBITS, kZlibVersion, sizeof(z_stream));
  if (result != Z_OK) {
    SMemFree(stream);
    Fail(result);
  }
  m_stream = stream;
  Reset();
}

void SInflater::End() {
  if (m_stream == nullptr) return;
  inflateEnd(m_stream);
  SMemFree(m_stream);
  m_stream = nullptr;
  m_count = 0;
}

void SInflater::Reset() {
  m_finished = m_needsDictionary = false;
  m_input = nullptr;
  m_count = 0;
  m_totalIn = m_totalOut = 0;
  if (m_stream != nullptr) inflateReset(m_stream);
}

void SInflater::SetInput(const void* bytes, int count) {
  m_input = static_cast<const unsigned char*>(bytes);
  m_count = count;
}

int SInflater::Inflate(void* buffer, int length) {
  if (m_stream == nullptr || length <= 0) return 0;
  m_stream->next_in = const_cast<unsigned char*>(m_input);
  m_stream->avail_in = static_cast<uInt>(m_count);
  m_stream->next_out = static_cast<unsigned char*>(buffer);
  m_stream->avail_out = static_cast<uInt>(length);
  const int result = inflate(m_stream, Z_SYNC_FLUSH);
  const int produced = length - static_cast<int>(m_stream->avail_out);
  m_totalIn += static_cast<unsigned>(m_count) - m_stream->avail_in;
  m_totalOut += static_cast<unsigned>(produced);
  m_input = m_stream->next_in;
  m_count = static_cast<int>(m_stream->avail_in);
  switch (result) {
    case Z_STREAM_END:
      m_finished = true;
      return produced;
    case Z_OK:
      return produced;
    case Z_NEED_DICT:
      m_needsDictionary = true;
      return produced;
    case Z_STREAM_ERROR:
    case Z_BUF_ERROR:
      return 0;  // nothing was done: there is no input, or the inflater was not made for this
    default:
      Fail(result);
  }
}

void SInflater::SetDictionary(const void* bytes, int count) {
  if (m_stream == nullptr) Fail(Z_STREAM_ERROR);
  const int result = inflateSetDictionary(m_stream, static_cast<const unsigned char*>(bytes), static_cast<uInt>(count));
  if (result != Z_OK) Fail(result);
  m_needsDictionary = false;
}
