#include "qxcore/container/table.h"

#include <cstring>
#include <utility>

#include "qxcore/container/internal/table_storage.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"

using table_storage::BytesFor;
using table_storage::TransitSlot;

void SThrowIndexOutOfRange(int index, int count) {
  constexpr HRESULT kOutOfBounds = static_cast<HRESULT>(0x8000000B);  // E_BOUNDS
  SString text;
  text.Format(WTEXT("Index %d is out of range: there are %d elements."), index, count);
  throw SECOMException(kOutOfBounds, text);
}

__STable::__STable(const __STable& other) : m_elementSize(other.m_elementSize) { *this = other; }

__STable::~__STable() { __STable::Clear(); }

void __STable::Destroy(void*) {}

void __STable::CopyTo(void* destination, const void* source) {
  std::memcpy(destination, source, static_cast<std::size_t>(m_elementSize));
}

void* __STable::Allocate(int n) { return SMemAlloc(BytesFor(n, m_elementSize)); }

void __STable::Free(void* block) { SMemFree(block); }

__STable& __STable::operator=(const __STable& other) {
  if (this == &other) return *this;
  Clear();
  m_elementSize = other.m_elementSize;
  GrowTo(other.m_count);
  for (int i = 0; i < other.m_count; ++i) {
    CopyTo(GetAt(i), other.GetAt(i));
    ++m_count;
  }
  return *this;
}

void __STable::MoveElement(void* destination, void* source) {
  CopyTo(destination, source);
  Destroy(source);
}

void __STable::GrowTo(int n) {
  if (n == 0 || n < m_count) return;
  char* block = static_cast<char*>(Allocate(n));
  int copied = 0;
  try {
    for (; copied < m_count; ++copied) CopyTo(block + std::ptrdiff_t{copied} * m_elementSize, GetAt(copied));
  } catch (...) {
    while (copied > 0) Destroy(block + std::ptrdiff_t{--copied} * m_elementSize);
    Free(block);
    throw;
  }
  if (m_data != nullptr) {
    for (int i = 0; i < m_count; ++i) Destroy(GetAt(i));
    Free(m_data);
  }
  m_data = block;
  m_capacity = n;
}

void* __STable::NewAt(int i) {
  if (m_count == m_capacity) {
    GrowTo(m_capacity == 0 ? table_storage::kFirstCapacity : table_storage::NextCapacity(m_capacity));
  }
  int from = m_count;
  try {
    for (; from > i; --from) MoveElement(GetAt(from), GetAt(from - 1));
  } catch (...) {
    // Slot `from` is a hole: what lies behind it cannot stay.
    for (int behind = m_count; behind > from; --behind) Destroy(GetAt(behind));
    m_count = from;
    throw;
  }
  ++m_count;
  return GetAt(i);
}

void __STable::CloseSlot(int i) {
  --m_count;
  int hole = i;
  try {
    for (; hole < m_count; ++hole) MoveElement(GetAt(hole), GetAt(hole + 1));
  } catch (...) {
    for (int behind = m_count; behind > hole; --behind) Destroy(GetAt(behind));
    m_count = hole;
    throw;
  }
}

void __STable::Insert(int i, const void* element) {
  // An element of this table moves with its table.
  std::ptrdiff_t own = -1;
  auto* bytes = static_cast<const char*>(element);
  if (m_data != nullptr && bytes >= m_data && bytes < GetAt(m_count)) own = (bytes - m_data) / m_elementSize;
  void* slot = NewAt(i);
  if (own >= 0) element = GetAt(static_cast<int>(own >= i ? own + 1 : own));
  try {
    CopyTo(slot, element);
  } catch (...) {
    CloseSlot(i);
    throw;
  }
}

void __STable::Remove(int i) {
  Destroy(GetAt(i));
  CloseSlot(i);
}

void __STable::MoveTo(int from, int to) {
  if (from == to) return;
  TransitSlot slot(m_elementSize);
  CopyTo(slot.Address(), GetAt(from));
  try {
    Remove(from);
    void* place = NewAt(to);
    try {
      CopyTo(place, slot.Address());
    } catch (...) {
      CloseSlot(to);
      throw;
    }
  } catch (...) {
    Destroy(slot.Address());
    throw;
  }
  Destroy(slot.Address());
}

void __STable::Swap(int i, int j) {
  if (i == j) return;
  TransitSlot slot(m_elementSize);
  MoveElement(slot.Address(), GetAt(i));
  MoveElement(GetAt(i), GetAt(j));
  MoveElement(GetAt(j), slot.Address());
}

void __STable::Reverse() {
  for (int i = 0, j = m_count - 1; i < j; ++i, --j) __STable::Swap(i, j);
}

void __STable::Clear() {
  for (int i = m_count; i > 0; --i) Destroy(GetAt(i - 1));
  if (m_data != nullptr) Free(m_data);
  m_data = nullptr;
  m_capacity = 0;
  m_count = 0;
}

void __STable::SwapWith(__STable& other) noexcept {
  std::swap(m_data, other.m_data);
  std::swap(m_capacity, other.m_capacity);
  std::swap(m_count, other.m_count);
  std::swap(m_elementSize, other.m_elementSize);
}
