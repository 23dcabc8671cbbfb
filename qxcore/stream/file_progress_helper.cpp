#include "qxcore/stream/file_progress_helper.h"

#include <algorithm>
#include <cerrno>
#include <limits>

#include "qxcore/core/error_cause.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/wide.h"
#include "qxcore/stream/internal/file_buffer.h"

namespace {

constexpr unsigned long kMost = std::numeric_limits<unsigned long>::max();

unsigned long Clip(std::uint64_t value) { return static_cast<unsigned long>(std::min<std::uint64_t>(value, kMost)); }

}  // namespace

SFileProgressHelper::SFileProgressHelper(const SString& path, SProgressIndicatorEx* progress)
    : m_file(platform::WideFileOpen(path, WTEXT("rb"))), m_progress(progress) {
  if (m_file == nullptr) throw SEWithError<SEIOCantOpenForReading>(errno);
  m_buffer = SGiveBuffer(m_file);
  if (platform::FileSeek(m_file, 0, SEEK_END) == 0)
    m_size = static_cast<std::uint64_t>(std::max<std::int64_t>(platform::FileTell(m_file), 0));
  if (m_size == 0) {
    LookAhead();
  } else {
    platform::FileSeek(m_file, 0, SEEK_SET);
  }
  if (m_progress != nullptr) {
    m_progress->SetRange(0, m_size);
    m_progress->SetPos(0);
    m_step = m_size / 100;
    m_nextReport = m_step;
  }
}

SFileProgressHelper::~SFileProgressHelper() { CloseFile(); }

// Sets the end-of-file flag where the end is, and else takes nothing: some files say that they are empty
// and have content all the same. True when a byte follows.
bool SFileProgressHelper::LookAhead() {
  int byte = std::getc(m_file);
  if (byte == EOF) {
    if (std::ferror(m_file)) m_error = errno;
    return false;
  }
  std::ungetc(byte, m_file);
  return true;
}

// Moves the indicator when it is time; true when the user cancelled.
bool SFileProgressHelper::IsCancelled() {
  if (m_progress == nullptr || m_position < m_nextReport) return false;
  m_progress->SetPos(m_position);
  m_nextReport = m_position + std::max<std::uint64_t>(m_step, 1);
  return m_progress->IsCancelled();
}

int SFileProgressHelper::ReadByte() { return ReadByteOf(m_position); }

int SFileProgressHelper::ReadByteOf(std::uint64_t start) {
  if (m_file == nullptr) return -1;
  if (IsCancelled() && GoBackTo(start)) throw SEIOAbortedException();
  int byte = std::getc(m_file);
  if (byte == EOF) {
    if (std::ferror(m_file)) m_error = errno;
    return -1;
  }
  ++m_position;
  return byte;
}

unsigned long SFileProgressHelper::ReadBlock(void* buffer, unsigned long count) {
  if (m_file == nullptr || count == 0) return 0;
  // With an indicator, no more at a time than one step, so that it moves and can stop a long read.
  const unsigned long most = m_progress != nullptr ? Clip(std::max<std::uint64_t>(m_step, kSFileBuffer)) : kMost;
  const std::uint64_t start = m_position;
  unsigned char* out = static_cast<unsigned char*>(buffer);
  unsigned long done = 0;
  while (done < count) {
    if (IsCancelled() && GoBackTo(start)) throw SEIOAbortedException();
    unsigned long wanted = std::min(count - done, most);
    unsigned long got = static_cast<unsigned long>(std::fread(out + done, 1, wanted, m_file));
    done += got;
    m_position += got;
    if (got < wanted) {
      if (std::ferror(m_file)) m_error = errno;
      break;
    }
  }
  return done;
}

// So that a cancelled read takes nothing. What cannot go back (a pipe) finishes its block instead.
bool SFileProgressHelper::GoBackTo(std::uint64_t position) {
  if (position == m_position) return true;
  if (platform::FileSeek(m_file, static_cast<std::int64_t>(position), SEEK_SET) != 0) return false;
  m_position = position;
  return true;
}

unsigned long SFileProgressHelper::SkipBytes(unsigned long count) {
  unsigned char block[4096];
  unsigned long done = 0;
  while (done < count) {
    unsigned long got = ReadBlock(block, std::min<unsigned long>(count - done, sizeof block));
    if (got == 0) break;
    done += got;
  }
  return done;
}

bool SFileProgressHelper::SeekPos(unsigned long position) {
  if (m_file == nullptr) return true;
  bool failed;
  if (m_progress != nullptr) {
    std::int64_t current = platform::FileTell(m_file);
    if (m_progress->GetPos() < static_cast<std::uint64_t>(current))
      m_progress->SetPos(static_cast<std::uint64_t>(current));
    if (m_progress->IsCancelled()) throw SEIOAbortedException();
    failed = platform::FileSeek(m_file, static_cast<std::int64_t>(position) - current, SEEK_CUR) != 0;
  } else {
    failed = platform::FileSeek(m_file, static_cast<std::int64_t>(position), SEEK_SET) != 0;
  }
  if (!failed) m_position = position;
  return failed;
}

unsigned long SFileProgressHelper::GetPos() const { return Clip(m_position); }

unsigned long SFileProgressHelper::CountAvailable() {
  if (m_file == nullptr || std::feof(m_file)) return 0;
  if (m_position < m_size) return Clip(m_size - m_position);
  return LookAhead() ? 1 : 0;
}

// A file that fails is at its end, too; a loop up to the end must not run for ever.
bool SFileProgressHelper::IsAtEnd() const { return m_file == nullptr || std::feof(m_file) != 0 || m_error != 0; }

// Only what has a size is known to be able to go back; asking a pipe would lose nothing, but a device may lie.
bool SFileProgressHelper::GetFilePlace(std::uint64_t* place) {
  if (m_file == nullptr || m_size == 0 || m_error != 0) return false;
  *place = m_position;
  return true;
}

bool SFileProgressHelper::GoToFilePlace(std::uint64_t place) {
  if (m_file == nullptr || !GoBackTo(place)) return false;
  m_nextReport = std::min(m_nextReport, place);  // the indicator goes the same way again
  return true;
}

void SFileProgressHelper::CloseFile() noexcept {
  if (m_file != nullptr) std::fclose(m_file);
  m_file = nullptr;
  SMemFree(m_buffer);
  m_buffer = nullptr;
}
