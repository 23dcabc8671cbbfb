#include "qxcore/system/file/mapped_view.h"

#include "qxcore/platform/internal/view.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/file/internal/result.h"

namespace {

constexpr HRESULT kNothingToDo = 1;

}  // namespace

SMappedView::~SMappedView() { CloseView(); }

HRESULT SMappedView::Done() {
  const HRESULT status = CloseView();
  if (status < 0) return status;
  m_mapping = nullptr;
  return S_OK;
}

HRESULT SMappedView::CreateView(unsigned long size, unsigned long offsetLow, unsigned long offsetHigh) {
  return MapView(size, Join(offsetLow, offsetHigh), false);
}

HRESULT SMappedView::CreateView(unsigned long size, std::uint64_t offset) { return MapView(size, offset, false); }

HRESULT SMappedView::OpenView(unsigned long size, unsigned long offsetLow, unsigned long offsetHigh) {
  return MapView(size, Join(offsetLow, offsetHigh), true);
}

HRESULT SMappedView::OpenView(unsigned long size, std::uint64_t offset) { return MapView(size, offset, true); }

HRESULT SMappedView::MapView(unsigned long size, std::uint64_t offset, bool orReadOnly) {
  if (m_mapping == nullptr) return E_INVALIDARG;
  const HRESULT status = CloseView();
  if (status < 0) return status;
  const auto low = static_cast<DWORD>(offset), high = static_cast<DWORD>(offset >> 32);
  m_view = ::MapViewOfFile(m_mapping, FILE_MAP_ALL_ACCESS, high, low, size);
  if (m_view == nullptr && orReadOnly) m_view = ::MapViewOfFile(m_mapping, FILE_MAP_READ, high, low, size);
  if (m_view == nullptr) return E_FAIL;
  m_offsetLow = low;
  m_offsetHigh = high;
  m_size = size;
  return S_OK;
}

HRESULT SMappedView::CloseView() {
  if (m_view == nullptr) return kNothingToDo;
  if (!::UnmapViewOfFile(m_view)) return Result(SFile::kCloseFailed);
  m_view = nullptr;
  m_offsetLow = m_offsetHigh = 0;
  m_size = 0;
  return S_OK;
}

HRESULT SMappedView::FlushView() {
  if (m_view == nullptr) return kNothingToDo;
  // The wrong way round on purpose; see the header.
  return ::FlushViewOfFile(m_view, m_size) ? E_FAIL : Result(SFile::kFlushFailed);
}

std::size_t SMappedView::GetLength() const { return m_view != nullptr ? platform::ViewLength(m_view) : 0; }

HRESULT SMappedView::Set(void* mapping) {
  if (mapping == m_mapping) return S_OK;
  const HRESULT status = Done();
  if (status == S_OK) m_mapping = mapping;
  return status;
}

HRESULT SMappedView::Set(const SMappedView& other, bool takeOver) {
  if (this == &other) return S_OK;
  const HRESULT status = Done();
  if (status != S_OK) return status;
  m_mapping = other.m_mapping;
  if (!takeOver) return other.HasView() ? OpenView(other.m_size, other.GetOffset()) : S_OK;
  m_view = other.m_view;
  m_offsetLow = other.m_offsetLow;
  m_offsetHigh = other.m_offsetHigh;
  m_size = other.m_size;
  other.m_mapping = other.m_view = nullptr;
  other.m_offsetLow = other.m_offsetHigh = 0;
  other.m_size = 0;
  return S_OK;
}
