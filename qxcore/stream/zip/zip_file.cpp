#include "qxcore/stream/zip/zip_file.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"
#include "qxcore/stream/zip/internal/zip_format.h"
#include "qxcore/system/time/time.h"

namespace {

constexpr unsigned long kWindowSize = 16384;
constexpr std::int64_t kSearchRange = 65535;
constexpr int kSearchStep = 64;

// The exception's text, or none where there is no memory for it.
void KeepText(SString& text, const SException& e) noexcept {
  try {
    text = e.GetText();
  } catch (const SEOutOfMemory&) {
    text.Release();
  }
}

}  // namespace

SZipFile::SZipFile(const SString& path) : m_path(path), m_file(path) {
  // Sharing with writers, the file is opened for reading only.
  if (m_file.OpenExisting(FILE_SHARE_READ | FILE_SHARE_WRITE) != S_OK) SThrowZip(nullptr);
  unsigned long low = 0, high = 0;
  if (m_file.GetSize(low, high) != S_OK) SThrowZip(nullptr);
  m_length = static_cast<std::int64_t>(static_cast<std::uint64_t>(high) << 32 | low);
  FindEnd();
  ReadEnd();
}

SZipFile::~SZipFile() { SMemFree(m_window); }

bool SZipFile::ReadAt(std::int64_t position, void* buffer, unsigned long count) {
  unsigned long done = count;
  return m_file.Seek(position, FILE_BEGIN) == S_OK && m_file.Read(buffer, done) == S_OK && done == count;
}

// From the file's end backwards, in small steps: most archives have no comment.
void SZipFile::FindEnd() {
  constexpr int kOverlap = 3;  // a signature may lie across two steps
  unsigned char bytes[kSearchStep + kOverlap] = {};
  const std::int64_t bound = std::max<std::int64_t>(m_length - kSearchRange, 0);
  for (std::int64_t start = m_length; start > bound;) {
    const int count = static_cast<int>(std::min<std::int64_t>(kSearchStep, start - bound));
    std::memmove(bytes + count, bytes, kOverlap);
    start -= count;
    if (!ReadAt(start, bytes, static_cast<unsigned long>(count))) SThrowZip(nullptr);
    for (int i = count - 1; i >= 0; --i) {
      if (SZipGet32(bytes + i) != SZipEND::kSignature || !IsEnd(start + i)) continue;
      m_endPosition = start + i;
      m_endLength = m_length - m_endPosition;
      return;
    }
  }
  SThrowZip(WTEXT("END header not found"));
}

// Whether the record that begins here would end with the file.
bool SZipFile::IsEnd(std::int64_t position) {
  if (m_length - position < SZipEND::kRecordSize) return false;
  unsigned char length[2];
  if (!ReadAt(position + SZipEND::kCommentLength, length, sizeof length)) SThrowZip(nullptr);
  return position + SZipEND::kRecordSize + SZipGet16(length) == m_length;
}

void SZipFile::ReadEnd() {
  unsigned char end[SZipEND::kRecordSize];
  if (!ReadAt(m_endPosition, end, sizeof end)) SThrowZip(nullptr);
  // The file may have been changed since it was searched.
  if (SZipGet32(end) != SZipEND::kSignature) SThrowZip(WTEXT("invalid END header signature"));
  m_directoryLength = SZipGet32(end + SZipEND::kDirectoryLength);
  m_directoryOffset = SZipGet32(end + SZipEND::kDirectoryOffset);
  m_count = SZipGet16(end + SZipEND::kEntries);
  if (m_directoryOffset + m_directoryLength != m_endPosition) SThrowZip(WTEXT("invalid END header format"));
  if (static_cast<std::int64_t>(m_count) * SZipCEN::kRecordSize > m_directoryLength)
    SThrowZip(WTEXT("invalid END header format"));
  if (SZipGet16(end + SZipEND::kEntriesOnDisk) != m_count) SThrowZip(WTEXT("cannot have more than one drive"));
}

int SZipFile::FindFile(const WCHAR*, unsigned long) {
  m_next = 0;
  m_hasFailed = true;  // until the first entry was read
  m_failure.Release();
  m_windowCount = m_windowPosition = 0;
  m_nextByte = m_directoryOffset;
  std::int64_t position = m_directoryOffset;
  if (m_file.Seek(position, FILE_BEGIN) != S_OK) SThrowZip(nullptr);
  const int found = ReadNext();
  m_hasFailed = false;
  return found;
}

int SZipFile::FindNextFileW() {
  if (m_hasFailed) return 0;
  m_hasFailed = true;
  try {
    const int found = ReadNext();
    m_hasFailed = false;
    return found;
  } catch (const SException& e) {
    KeepText(m_failure, e);
  } catch (...) {
    // There is no text.
  }
  return 0;
}

int SZipFile::ReadNext() {
  if (m_next == m_count) return 0;
  ++m_next;
  ReadEntry();
  return 1;
}

int SZipFile::MatchesMask(unsigned long mask) const { return (m_entry.GetAttributes() & mask) != 0; }

int SZipFile::GetCreationTime(STime* time) const {
  if (time == nullptr) return 0;
  *time = STime(m_entry.GetTime());
  return 1;
}

SString SZipFile::GetDisplayName() const { return m_path + WTEXT("\\") + m_entry.GetName(); }

bool SZipFile::FillWindow() {
  if (m_window == nullptr) m_window = static_cast<unsigned char*>(SMemAlloc(kWindowSize));
  m_windowPosition = 0;
  m_windowCount = kWindowSize;
  if (m_file.Read(m_window, m_windowCount) == S_OK && m_windowCount > 0) return true;
  m_windowCount = 0;
  return false;
}

bool SZipFile::TakeBytes(void* buffer, unsigned long count) {
  auto* out = static_cast<unsigned char*>(buffer);
  m_nextByte += count;
  while (count > 0) {
    if (m_windowPosition == m_windowCount && !FillWindow()) return false;
    const unsigned long piece = std::min(count, m_windowCount - m_windowPosition);
    std::memcpy(out, m_window + m_windowPosition, piece);
    m_windowPosition += piece;
    out += piece;
    count -= piece;
  }
  return true;
}

bool SZipFile::PassBytes(unsigned long count) {
  m_nextByte += count;
  while (count > 0) {
    if (m_windowPosition == m_windowCount && !FillWindow()) return false;
    const unsigned long piece = std::min(count, m_windowCount - m_windowPosition);
    m_windowPosition += piece;
    count -= piece;
  }
  return true;
}

void SZipFile::ReadEntry() {
  unsigned char header[SZipCEN::kRecordSize];
  if (!TakeBytes(header, sizeof header)) SThrowZip(nullptr);
  if (SZipGet32(header) != SZipCEN::kSignature) SThrowZip(WTEXT("invalid CEN header signature"));
  const unsigned method = SZipGet16(header + SZipCEN::kMethod);
  if (method != kSZipStored && method != kSZipDeflated) SThrowZip(WTEXT("invalid compression method"));
  m_entry.Reset();
  m_entry.m_flags = SZipGet16(header + SZipCEN::kFlags);
  m_entry.SetMethod(method);
  m_entry.SetTime(SZipGet16(header + SZipCEN::kDate), SZipGet16(header + SZipCEN::kTime));
  m_entry.m_crc = SZipGet32(header + SZipCEN::kCRC);
  m_entry.m_compressedSize = SZipGet32(header + SZipCEN::kCompressedSize);
  m_entry.m_size = SZipGet32(header + SZipCEN::kSize);
  m_entry.m_offset = SZipGet32(header + SZipCEN::kLocalOffset);
  constexpr unsigned kUnix = 3;
  const bool isFromUnix = SZipGet16(header + SZipCEN::kMadeBy) >> 8 == kUnix;
  m_entry.m_unixMode = isFromUnix ? SZipGet32(header + SZipCEN::kExternalAttributes) >> 16 : 0;
  if (m_entry.m_offset + m_entry.m_compressedSize > m_directoryOffset) SThrowZip(WTEXT("invalid CEN entry size"));
  ReadNames(SZipGet16(header + SZipCEN::kNameLength), SZipGet16(header + SZipCEN::kExtraLength),
            SZipGet16(header + SZipCEN::kCommentLength));
}

void SZipFile::ReadNames(unsigned nameLength, unsigned extraLength, unsigned commentLength) {
  char text[65535];
  if (m_nextByte + nameLength + extraLength + commentLength > m_endPosition)
    SThrowZip(WTEXT("invalid CEN header format"));
  if (!TakeBytes(text, nameLength)) SThrowZip(nullptr);
  m_entry.SetName(text, static_cast<int>(nameLength));
  if (!PassBytes(extraLength)) SThrowZip(nullptr);
  if (commentLength == 0) return;
  if (!TakeBytes(text, commentLength)) SThrowZip(nullptr);
  m_entry.SetComment(text, static_cast<int>(commentLength));
}
