#include "qxcore/container/table_mem.h"

#include <cstring>

#include "qxcore/container/internal/table_storage.h"
#include "qxcore/core/memory.h"

__STableMem::~__STableMem() { __STableMem::Clear(); }

void __STableMem::Destroy(void*) {}

void __STableMem::CopyTo(void* destination, const void* source) {
  std::memcpy(destination, source, static_cast<std::size_t>(ElemSize()));
}

void* __STableMem::Allocate(int n) { return __STableDumb::AllocData(n, ElemSize()); }

void __STableMem::Free(void* block) { __STableDumb::FreeData(static_cast<__STableData*>(block)); }

__STableMem& __STableMem::operator=(const __STableMem& other) {
  if (m_table.m_data == other.m_table.m_data) return *this;
  Clear();
  m_table = other.m_table;
  return *this;
}

void __STableMem::Clear() {
  __STableData* data = m_table.GetData();
  if (data == nullptr) return;
  m_table.Detach();
  data->AddRefs(-1);
  if (data->Refs() != 0) return;
  for (int i = data->Count(); i > 0; --i) Destroy(data->Elements() + std::ptrdiff_t{i - 1} * data->ElemSize());
  Free(data);
}

// A new block with copies of n elements.
__STableData* __STableMem::CopyBlock(const void* elements, int n, int capacity) {
  auto* data = static_cast<__STableData*>(Allocate(capacity));
  auto at = [data](int i) { return data->Elements() + std::ptrdiff_t{i} * data->ElemSize(); };
  try {
    for (; data->Count() < n; data->SetCount(data->Count() + 1)) {
      CopyTo(at(data->Count()), static_cast<const char*>(elements) + std::ptrdiff_t{data->Count()} * data->ElemSize());
    }
  } catch (...) {
    for (int i = data->Count(); i > 0; --i) Destroy(at(i - 1));
    Free(data);
    throw;
  }
  return data;
}

void __STableMem::GrowTo(int n) {
  if (n == 0) return;
  __STableData* old = m_table.GetData();
  if (old == nullptr) {
    m_table.Attach(Allocate(n));
  } else if (old->Refs() == 1) {
    if (n == old->Capacity() || n < old->Count()) return;
    // Not by the library's own realloc: a derived class may have memory of its own.
    auto* data = static_cast<__STableData*>(Allocate(n));
    std::memcpy(data->Elements(), old->Elements(),
                static_cast<std::size_t>(old->Count()) * static_cast<std::size_t>(old->ElemSize()));
    data->SetCount(old->Count());
    m_table.Detach();
    m_table.Attach(data);
    Free(old);
  } else if (n >= old->Count()) {
    __STableData* data = CopyBlock(old->Elements(), old->Count(), n);
    m_table.Attach(data);  // lets go of the shared block
  }
}

void* __STableMem::NewAt(int i) {
  if (m_table.m_data.IsEmpty()) {
    GrowTo(table_storage::kFirstCapacity);
  } else if (GetCount() == GetCapacity()) {
    GrowTo(table_storage::NextCapacity(GetCapacity()));
  } else if (IsShared()) {
    DetachBlock();
  }
  return m_table.NewAt(i);
}

void __STableMem::CloseSlot(int i) { m_table.Remove(i); }

void __STableMem::Insert(int i, const void* element) {
  // Copied before anything moves: the element may be one of this table's own.
  table_storage::TransitSlot copy(ElemSize());
  CopyTo(copy.Address(), element);
  void* slot;
  try {
    slot = NewAt(i);
  } catch (...) {
    Destroy(copy.Address());
    throw;
  }
  std::memcpy(slot, copy.Address(), static_cast<std::size_t>(ElemSize()));
}

void __STableMem::Remove(int i) {
  if (IsShared()) DetachBlock();
  Destroy(m_table.GetAt(i));
  m_table.Remove(i);
}

void __STableMem::MoveTo(int from, int to) {
  if (from == to) return;
  if (IsShared()) DetachBlock();
  m_table.MoveTo(from, to);
}

void __STableMem::Swap(int i, int j) {
  if (i == j) return;
  if (IsShared()) DetachBlock();
  m_table.Swap(i, j);
}

void __STableMem::Reverse() {
  if (IsShared()) DetachBlock();
  m_table.Reverse();
}

void __STableMem::CopyArray(const void* elements, int n) {
  if (n <= 0) return Clear();
  Attach(CopyBlock(elements, n, n));
}

void __STableMem::Attach(void* block) {
  if (block == m_table.GetData()) return m_table.Attach(block);
  Clear();
  m_table.Attach(block);
}
