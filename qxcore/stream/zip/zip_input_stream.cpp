#include "qxcore/stream/zip/zip_input_stream.h"

#include <algorithm>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/stream/internal/read_fully.h"
#include "qxcore/stream/zip/internal/zip_format.h"

QXCORE_IMPLEMENT_CLASS(SZipInputStream, SInflaterInputStream, 0)

namespace {

constexpr unsigned long kInputSize = 512;
constexpr unsigned long kPushbackSize = 1025;  // the inflater's unused input, twice, and one

}  // namespace

SZipInputStream::SZipInputStream(SInputStream& in) : SZipInputStream(&in, false) {}

SZipInputStream::SZipInputStream(SInputStream* in, bool owns)
    : SInflaterInputStream(kInputSize), m_source(in, kPushbackSize, owns) {
  m_in.Set(m_source);
}

SZipEntry* SZipInputStream::GetNextEntry() {
  CloseEntry();
  m_inflater.Reset();
  m_crc.Reset();
  if (!ReadLOC()) return nullptr;
  m_remaining = m_entry.GetMethod() == kSZipStored ? static_cast<std::uint64_t>(m_entry.GetSize()) : 0;
  // A stored entry of no bytes has nothing to read and is at its end already.
  m_isOpen = m_entry.GetMethod() != kSZipStored || m_remaining > 0;
  return &m_entry;
}

void SZipInputStream::CloseEntry() {
  unsigned char drained[512];
  while (m_isOpen) Read(drained, sizeof drained);
}

void SZipInputStream::ReadFully(void* buffer, unsigned long count) {
  if (SReadFully(m_source, buffer, count) != count) throw SEEOFException();
}

bool SZipInputStream::ReadLOC() {
  unsigned char header[SZipLOC::kRecordSize];
  ReadFully(header, 4);
  if (SZipGet32(header) != SZipLOC::kSignature) {
    m_source.Unread(header, 4);
    return false;
  }
  ReadFully(header + 4, sizeof header - 4);
  m_entry.Reset();
  m_entry.m_offset = m_position;
  m_entry.m_flags = SZipGet16(header + SZipLOC::kFlags);
  if ((m_entry.m_flags & kSZipEncrypted) != 0) SThrowZip(WTEXT("encrypted ZIP entry not supported"));
  m_entry.SetMethod(SZipGet16(header + SZipLOC::kMethod));
  const bool hasDescriptor = (m_entry.m_flags & kSZipHasDescriptor) != 0;
  if (hasDescriptor && m_entry.m_method != kSZipDeflated)
    SThrowZip(WTEXT("only DEFLATED entries can have EXT descriptor"));
  m_entry.SetTime(SZipGet16(header + SZipLOC::kDate), SZipGet16(header + SZipLOC::kTime));
  if (!hasDescriptor) {
    m_entry.m_crc = SZipGet32(header + SZipLOC::kCRC);
    m_entry.m_compressedSize = SZipGet32(header + SZipLOC::kCompressedSize);
    m_entry.m_size = SZipGet32(header + SZipLOC::kSize);
  }
  const unsigned nameLength = SZipGet16(header + SZipLOC::kNameLength);
  if (nameLength == 0) SThrowZip(WTEXT("missing entry name"));
  ReadName(nameLength);
  // A size of all ones stands in the extra field, in 64 bits.
  constexpr std::int64_t kInExtraField = 0xFFFFFFFF;
  if (m_entry.m_size == kInExtraField || m_entry.m_compressedSize == kInExtraField)
    SThrowZip(WTEXT("ZIP64 entry not supported"));
  if (m_entry.m_method == kSZipStored && m_entry.m_size != m_entry.m_compressedSize)
    SThrowZip(WTEXT("invalid entry compressed size"));
  const unsigned extraLength = SZipGet16(header + SZipLOC::kExtraLength);
  if (m_source.Skip(extraLength) != extraLength) throw SEEOFException();
  m_position += SZipLOC::kRecordSize + nameLength + extraLength;
  return true;
}

void SZipInputStream::ReadName(unsigned length) {
  char name[65535];
  ReadFully(name, length);
  m_entry.SetName(name, static_cast<int>(length));
}

int SZipInputStream::Read() {
  unsigned char one;
  return Read(&one, 1) == 1 ? one : -1;
}

unsigned long SZipInputStream::Read(void* buffer, unsigned long count) {
  if (!m_isOpen || count == 0) return 0;
  auto* out = static_cast<unsigned char*>(buffer);
  switch (m_entry.GetMethod()) {
    case kSZipStored:
      return ReadStored(out, count);
    case kSZipDeflated:
      return ReadDeflated(out, count);
    default:
      SThrowZip(WTEXT("invalid compression method"));
  }
}

unsigned long SZipInputStream::ReadStored(unsigned char* buffer, unsigned long count) {
  const auto wanted = static_cast<unsigned long>(std::min<std::uint64_t>(count, m_remaining));
  unsigned long done = 0;
  while (done < wanted) {
    const unsigned long piece = wanted - done;
    const unsigned long got = m_source.Read(buffer + done, piece);
    if (got == 0 || got > piece) SThrowZip(WTEXT("unexpected EOF"));
    m_crc.Update(buffer + done, got);
    done += got;
    m_remaining -= got;
  }
  if (m_remaining == 0) {
    m_position += m_entry.m_size;
    m_isOpen = false;
  }
  return done;
}

unsigned long SZipInputStream::ReadDeflated(unsigned char* buffer, unsigned long count) {
  unsigned long done = 0;
  while (done < count && m_isOpen) {
    const unsigned long got = SInflaterInputStream::Read(buffer + done, count - done);
    m_crc.Update(buffer + done, got);
    done += got;
    CheckNotBeyond();
    if (m_inflater.IsFinished()) {
      ReadEnd();
      m_isOpen = false;
    } else if (got == 0) {
      SThrowZip(WTEXT("Invalid ZLIB data format"));
    }
  }
  return done;
}

// What is longer than its header says ends here, not when all of it was read.
void SZipInputStream::CheckNotBeyond() const {
  const auto isBeyond = [](std::uint64_t count, std::int64_t told) {
    return told != SZipEntry::kUnknown && count > static_cast<std::uint64_t>(told);
  };
  if (isBeyond(m_inflater.GetTotalOut(), m_entry.m_size)) SThrowZip(WTEXT("invalid entry size"));
  if (isBeyond(m_inflater.GetTotalIn(), m_entry.m_compressedSize)) SThrowZip(WTEXT("invalid entry compressed size"));
}

void SZipInputStream::ReadEnd() {
  m_source.Unread(m_inflater.GetRest(), static_cast<unsigned long>(m_inflater.GetRemaining()));
  m_position += static_cast<std::int64_t>(m_inflater.GetTotalIn());
  if ((m_entry.m_flags & kSZipHasDescriptor) != 0) {
    unsigned char descriptor[SZipEXT::kRecordSize];
    ReadFully(descriptor, sizeof descriptor);
    if (SZipGet32(descriptor) != SZipEXT::kSignature) SThrowZip(WTEXT("invalid EXT descriptor signature"));
    m_position += SZipEXT::kRecordSize;
    m_entry.m_crc = SZipGet32(descriptor + SZipEXT::kCRC);
    m_entry.m_compressedSize = SZipGet32(descriptor + SZipEXT::kCompressedSize);
    m_entry.m_size = SZipGet32(descriptor + SZipEXT::kSize);
  }
  if (m_inflater.GetTotalOut() != static_cast<std::uint64_t>(m_entry.m_size)) SThrowZip(WTEXT("invalid entry size"));
  if (m_inflater.GetTotalIn() != static_cast<std::uint64_t>(m_entry.m_compressedSize))
    SThrowZip(WTEXT("invalid entry compressed size"));
}

unsigned long SZipInputStream::Available() {
  if (!m_isOpen || m_entry.GetMethod() != kSZipStored) return 0;
  return static_cast<unsigned long>(std::min<std::uint64_t>(m_source.Available(), m_remaining));
}
