#include "qxcore/stream/output_file_on_change.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/error_cause.h"
#include "qxcore/core/internal/quietly.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/platform/internal/error_number.h"
#include "qxcore/platform/win32.h"
#include "qxcore/stream/output_file.h"
#include "qxcore/stream/output_global.h"
#include "qxcore/system/file/file.h"

QXCORE_IMPLEMENT_CLASS(SOutputFileOnChange, SOutputStream, 0)

namespace {

constexpr HRESULT kSucceeded = SFile::kOk;

// The exception for what the system refused just now, with its reason.
template <class Exception>
[[noreturn]] void ThrowLastError() {
  throw SEWithError<Exception>(platform::ErrnoOf(::GetLastError()));
}

}  // namespace

SOutputFileOnChange::SOutputFileOnChange(const SString& path) : m_path(path), m_content(nullptr) {
  m_target = OpenTarget();
}

SOutputStream* SOutputFileOnChange::OpenTarget() {
  if (GetFileAttributesW(m_path) == INVALID_FILE_ATTRIBUTES) return new SOutputFile(m_path);
  return m_content = new SOutputGlobal;
}

SOutputFileOnChange::~SOutputFileOnChange() {
  SQuietly([this] {
    if (!m_hasFailed) Close(nullptr);
  });
  delete m_target;
}

void SOutputFileOnChange::Write(int byte) {
  if (m_target == nullptr) throw SEIOWriteFailed();
  m_target->Write(byte);
}

unsigned long SOutputFileOnChange::Write(const void* buffer, unsigned long count) {
  if (m_target == nullptr) throw SEIOWriteFailed();
  return m_target->Write(buffer, count);
}

void SOutputFileOnChange::Flush() {
  if (m_target != nullptr) m_target->Flush();
}

void SOutputFileOnChange::Close(int* changed) {
  if (m_target != nullptr) {
    m_hasFailed = true;
    if (m_content == nullptr) {
      m_target->Close();
    } else if (HasChanged()) {
      Replace();
    } else {
      m_changed = 0;
    }
    delete m_target;
    m_target = nullptr;
    m_content = nullptr;
    m_hasFailed = false;
  }
  if (changed != nullptr) *changed = m_changed;
}

// A file that cannot be read through counts as changed.
bool SOutputFileOnChange::HasChanged() const {
  const auto* content = static_cast<const char*>(m_content->GetData());
  const unsigned long used = m_content->UsedSize();
  SFile file(m_path);
  unsigned long low = 0, high = 0;
  if (file.OpenExisting(FILE_SHARE_READ | FILE_SHARE_WRITE) != kSucceeded) return true;
  if (file.GetSize(low, high) != kSucceeded) return true;
  if ((static_cast<unsigned long long>(high) << 32 | low) != used) return true;
  char block[16384];
  for (unsigned long at = 0; at < used;) {
    unsigned long count = std::min<unsigned long>(sizeof block, used - at);
    const unsigned long wanted = count;
    if (file.Read(block, count) != kSucceeded || count != wanted) return true;
    if (std::memcmp(block, content + at, count) != 0) return true;
    at += count;
  }
  return false;
}

void SOutputFileOnChange::Replace() const {
  SFile file(m_path);
  if (file.Create() != kSucceeded) ThrowLastError<SEIOCantOpenForWriting>();
  unsigned long count = m_content->UsedSize();
  if (count != 0 && file.Write(m_content->GetData(), count) != kSucceeded) ThrowLastError<SEIOWriteFailed>();
  if (file.SetEndOfFile() != kSucceeded) ThrowLastError<SEIOCouldNotTrunc>();
  if (file.Close() != kSucceeded) ThrowLastError<SEIOWriteFailed>();
}
