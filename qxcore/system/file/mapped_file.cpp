#include "qxcore/system/file/mapped_file.h"

#include <algorithm>
#include <limits>

#include "qxcore/platform/internal/view.h"
#include "qxcore/system/file/internal/result.h"

namespace {

constexpr HRESULT kNothingToDo = 1;

}  // namespace

SMappedFile::~SMappedFile() {
  // The parts close themselves, but the mapping, which is the base's, would be closed after the file.
  m_view.CloseView();
  CloseMapping();
}

HRESULT SMappedFile::Done() {
  const HRESULT view = m_view.Done(), mapping = CloseMapping(), file = m_file.Done();
  m_position = 0;
  return view < 0 ? view : mapping < 0 ? mapping : file;
}

void* SMappedFile::GetFileHandle(int* readOnly, unsigned long* sizeLow, unsigned long* sizeHigh) {
  *readOnly = 0;
  *sizeLow = *sizeHigh = 0;
  if (m_file.GetFullName().IsEmpty()) return nullptr;
  if (!m_file.IsOpen()) {
    HRESULT status = m_file.OpenExisting();
    if (status == Result(SFile::kNotFound)) status = m_file.Open();
    if (status < 0) return INVALID_HANDLE_VALUE;
  }
  *readOnly = (m_file.GetAccess() & GENERIC_WRITE) == 0;
  if (m_file.GetSize(*sizeLow, *sizeHigh) != S_OK) return INVALID_HANDLE_VALUE;
  return m_file.GetHandle();
}

HRESULT SMappedFile::NeedView() {
  if (m_view.HasView()) return S_OK;
  if (!IsMapped()) {
    if (const HRESULT status = OpenMapping(std::uint64_t{0})) return status;
  }
  if (const HRESULT status = m_view.Set(*this)) return status;
  return m_view.OpenView(0);
}

// Bytes between the cursor and the end: of the view's size, or, where that is up to the mapping's end, of its pages
// as far as the file goes.
std::size_t SMappedFile::CountLeft() const {
  std::uint64_t end = m_view.GetSize();
  if (end == 0) {
    end = m_view.GetLength();
    unsigned long low = 0, high = 0;
    if (m_file.IsOpen() && m_file.GetSize(low, high) == S_OK) {
      const std::uint64_t size = static_cast<std::uint64_t>(high) << 32 | low, offset = m_view.GetOffset();
      end = std::min(end, size > offset ? size - offset : 0);
    }
  }
  return static_cast<std::size_t>(end > m_position ? end - m_position : 0);
}

HRESULT SMappedFile::Read(void* buffer, unsigned long* count) {
  if (count == nullptr || buffer == nullptr) return E_POINTER;
  const unsigned long wanted = *count;
  *count = 0;
  if (const HRESULT status = NeedView()) return status;
  const std::size_t piece = std::min<std::size_t>(wanted, CountLeft());
  // Behind the end the cursor may lie where no address is.
  const std::size_t done = piece == 0 ? 0 : platform::CopyFromView(buffer, m_view.GetPointer() + m_position, piece);
  *count = static_cast<unsigned long>(done);
  m_position += *count;
  return Result(done == piece ? SFile::kOk : SFile::kReadFailed);
}

HRESULT SMappedFile::Write(const void* buffer, unsigned long* count) {
  if (count == nullptr || buffer == nullptr) return E_POINTER;
  const unsigned long wanted = *count;
  *count = 0;
  if (const HRESULT status = NeedView()) return status;
  const std::size_t piece = std::min<std::size_t>(wanted, CountLeft());
  const std::size_t done = piece == 0 ? 0 : platform::CopyToView(m_view.GetPointer() + m_position, buffer, piece);
  *count = static_cast<unsigned long>(done);
  m_position += *count;
  return Result(done == wanted ? SFile::kOk : SFile::kWriteFailed);
}

HRESULT SMappedFile::Seek(unsigned long* position, unsigned long origin) {
  if (position == nullptr) return E_POINTER;
  if (origin > FILE_CURRENT) return E_INVALIDARG;
  if (origin == FILE_CURRENT) {
    const long distance = static_cast<long>(*position);
    const unsigned long back = distance < 0 ? 0ul - *position : 0;
    if (back > m_position) {
      ::SetLastError(ERROR_NEGATIVE_SEEK);
      return Result(SFile::kSeekFailed);
    }
    if (distance > 0 && *position > std::numeric_limits<unsigned long>::max() - m_position) {
      ::SetLastError(ERROR_INVALID_PARAMETER);
      return Result(SFile::kSeekFailed);
    }
    *position = m_position + *position;  // modulo the range of the type
  }
  m_position = *position;
  return S_OK;
}

HRESULT SMappedFile::Flush() {
  if (m_view.HasView()) return m_view.FlushView();
  return m_file.IsOpen() ? m_file.Flush() : kNothingToDo;
}

HRESULT SMappedFile::Set(const SMappedFile& other, bool duplicate) {
  if (this == &other) return S_OK;
  HRESULT status = Done();
  if (status < 0) return status;
  // The mapping first, for taking one releases all that is held.
  status = SMappedMemory::Set(other, duplicate);
  if (status < 0) return status;
  status = m_file.Init(other.m_file);
  if (status < 0) return status;
  m_position = other.m_position;
  if (duplicate) {
    m_view.Set(*this);
    return other.m_view.HasView() ? m_view.OpenView(other.m_view.GetSize(), other.m_view.GetOffset()) : S_OK;
  }
  other.m_position = 0;
  status = m_view.Set(other.m_view, true);
  const HRESULT closed = other.m_file.Done();
  return status < 0 ? status : closed;
}
