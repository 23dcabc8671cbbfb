#include "qxcore/container/table.h"

#include <cstring>
#include <utility>

#include "qxcore/container/internal/table_storage.h"
#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"

using table_storage::BytesFor;
using table_storage::TransitSlot;

// A copy of an element, out of the table for a while.
class __STable::Transit {
 public:
  Transit(__STable& table, int i) : m_table(table), m_slot(table.m_elementSize) {
    m_table.CopyTo(m_slot.Address(), m_table.GetAt(i));
  }
  Transit(const Transit&) = delete;
  Transit& operator=(const Transit&) = delete;
  ~Transit() { m_table.Destroy(m_slot.Address()); }
  void* Address() { return m_slot.Address(); }

 private:
  __STable& m_table;
  TransitSlot m_slot;
};

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
    ++m_count;  // the last one stands one slot further
    GiveUpFrom(from);
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
    ++m_count;  // the last one is still there
    GiveUpFrom(hole);
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

// Slot `hole` is dead, and its element cannot be made again: what lies behind it cannot stay.
void __STable::GiveUpFrom(int hole) {
  for (int behind = m_count - 1; behind > hole; --behind) Destroy(GetAt(behind));
  m_count = hole;
}

// Makes the element of a dead slot anew; if that fails, too, the slot is given up.
void __STable::Refill(int hole, const void* element) {
  try {
    CopyTo(GetAt(hole), element);
  } catch (...) {
    GiveUpFrom(hole);
    throw;
  }
}

// The slot that is free wanders from one index to the other.
void __STable::MoveTo(int from, int to) {
  if (from == to) return;
  Transit moved(*this, from);
  Destroy(GetAt(from));
  const int step = from < to ? 1 : -1;
  int hole = from;
  try {
    for (; hole != to; hole += step) MoveElement(GetAt(hole), GetAt(hole + step));
    CopyTo(GetAt(to), moved.Address());
  } catch (...) {
    Refill(hole, moved.Address());
    throw;
  }
}

void __STable::Swap(int i, int j) {
  if (i == j) return;
  Transit first(*this, i), second(*this, j);
  Destroy(GetAt(i));
  try {
    CopyTo(GetAt(i), second.Address());
  } catch (...) {
    Refill(i, first.Address());
    throw;
  }
  Destroy(GetAt(j));
  try {
    CopyTo(GetAt(j), first.Address());
  } catch (...) {
    Refill(j, second.Address());  // element j stands twice then, and none is missing but i
    throw;
  }
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
