#include "qxcore/container/table_dumb.h"

#include <algorithm>
#include <cstring>

#include "qxcore/container/internal/table_storage.h"
#include "qxcore/core/memory.h"

using table_storage::BytesFor;
using table_storage::TransitSlot;

namespace {

std::size_t Bytes(int elements, int elementSize) {
  return static_cast<std::size_t>(elements) * static_cast<std::size_t>(elementSize);
}

}  // namespace

__STableData* __STableDumb::AllocData(int capacity, int elementSize) {
  auto* data = static_cast<__STableData*>(SMemAlloc(BytesFor(capacity, elementSize, sizeof(__STableData))));
  *data = {STableInt{1}, STableInt{capacity}, STableInt{0}, STableInt{elementSize}};
  return data;
}

void __STableDumb::FreeData(__STableData* block) { SMemFree(block); }

__STableDumb::__STableDumb(const __STableDumb& other) : m_data(other.m_data) {
  if (!m_data.IsEmpty()) m_data->AddRefs(1);
}

__STableDumb& __STableDumb::operator=(const __STableDumb& other) {
  if (m_data == other.m_data) return *this;
  Clear();
  m_data = other.m_data;
  if (!m_data.IsEmpty()) m_data->AddRefs(1);
  return *this;
}

void __STableDumb::Clear() {
  if (m_data.IsEmpty()) return;
  __STableData* data = m_data.Data();
  m_data = _STableData(data->ElemSize());
  data->AddRefs(-1);
  if (data->Refs() == 0) FreeData(data);
}

void __STableDumb::GrowTo(int n) {
  if (n == 0) return;
  if (m_data.IsEmpty()) {
    m_data = _STableData(AllocData(n, m_data.ElemSize()));
    return;
  }
  __STableData* old = m_data.Data();
  if (n < old->Count()) return;
  if (old->Refs() == 1) {
    if (n == old->Capacity()) return;
    void* resized = SMemRealloc(old, BytesFor(n, old->ElemSize(), sizeof(__STableData)));
    m_data = _STableData(static_cast<__STableData*>(resized));
    m_data->SetCapacity(n);
    return;
  }
  __STableData* data = AllocData(n, old->ElemSize());
  std::memcpy(data->Elements(), old->Elements(), Bytes(old->Count(), old->ElemSize()));
  data->SetCount(old->Count());
  old->AddRefs(-1);
  m_data = _STableData(data);
}

void* __STableDumb::NewAt(int i) {
  if (m_data.IsEmpty()) {
    GrowTo(table_storage::kFirstCapacity);
  } else if (m_data->Count() == m_data->Capacity()) {
    GrowTo(table_storage::NextCapacity(m_data->Capacity()));
  } else if (m_data->Refs() != 1) {
    DetachBlock();
  }
  char* slot = ElementAt(i);
  std::memmove(slot + m_data->ElemSize(), slot, Bytes(m_data->Count() - i, m_data->ElemSize()));
  m_data->SetCount(m_data->Count() + 1);
  return slot;
}

void __STableDumb::Insert(int i, const void* element) {
  // The own elements move, so one of them is taken along in a safe place.
  TransitSlot transit(ElemSize());
  std::memcpy(transit.Address(), element, static_cast<std::size_t>(ElemSize()));
  std::memcpy(NewAt(i), transit.Address(), static_cast<std::size_t>(ElemSize()));
}

void __STableDumb::Remove(int i) {
  if (m_data->Refs() != 1) DetachBlock();
  char* slot = ElementAt(i);
  m_data->SetCount(m_data->Count() - 1);
  std::memmove(slot, slot + m_data->ElemSize(), Bytes(m_data->Count() - i, m_data->ElemSize()));
}

void __STableDumb::MoveWithin(int from, int to) {
  std::size_t size = static_cast<std::size_t>(m_data->ElemSize());
  TransitSlot transit(m_data->ElemSize());
  std::memcpy(transit.Address(), ElementAt(from), size);
  if (from < to) {
    std::memmove(ElementAt(from), ElementAt(from + 1), size * static_cast<std::size_t>(to - from));
  } else {
    std::memmove(ElementAt(to + 1), ElementAt(to), size * static_cast<std::size_t>(from - to));
  }
  std::memcpy(ElementAt(to), transit.Address(), size);
}

void __STableDumb::MoveTo(int from, int to) {
  if (from == to) return;
  if (m_data->Refs() != 1) DetachBlock();
  MoveWithin(from, to);
}

void __STableDumb::SwapWithin(int i, int j) {
  char* a = ElementAt(i);
  std::swap_ranges(a, a + m_data->ElemSize(), ElementAt(j));
}

void __STableDumb::Swap(int i, int j) {
  if (i == j) return;
  if (m_data->Refs() != 1) DetachBlock();
  SwapWithin(i, j);
}

void __STableDumb::Reverse() {
  if (GetCount() < 2) return;
  if (m_data->Refs() != 1) DetachBlock();
  for (int i = 0, j = m_data->Count() - 1; i < j; ++i, --j) SwapWithin(i, j);
}

void __STableDumb::CopyArray(const void* elements, int n) {
  if (n <= 0) return Clear();
  if (!m_data.IsEmpty() && m_data->Refs() == 1 && m_data->Capacity() >= n) {
    std::memmove(m_data->Elements(), elements, Bytes(n, m_data->ElemSize()));
    m_data->SetCount(n);
    return;
  }
  __STableData* data = AllocData(n, ElemSize());
  std::memcpy(data->Elements(), elements, Bytes(n, data->ElemSize()));
  data->SetCount(n);
  Clear();
  m_data = _STableData(data);
}

void* __STableDumb::Detach() {
  if (m_data.IsEmpty()) return nullptr;
  __STableData* data = m_data.Data();
  m_data = _STableData(data->ElemSize());
  return data;
}

void __STableDumb::Attach(void* block) {
  if (block == GetData() && block != nullptr) {
    m_data->AddRefs(-1);  // the caller's count and the own one are now the same
    return;
  }
  Clear();
  if (block != nullptr) m_data = _STableData(static_cast<__STableData*>(block));
}
