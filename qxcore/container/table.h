// __STable: a growable array of elements that may not be moved bitwise, and its typed shell STable<T>.
//
// One private block; a copy of the table copies every element. Elements are only ever copied and
// destroyed, through virtual operations. For plain data take STableDumb, for elements that may be
// moved but not copied bitwise (SString) STableMem: both are faster and share their block.
//
// Appending is amortised constant: capacities go 4, 7, 11, 17, 26, ... and only Clear gives memory
// back. Indices are not checked, except by At. Not for several threads at once.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/container/table_shell.h"
#include "qxcore/platform/export.h"

class QXCORE_API __STable {
 public:
  int GetCount() const { return m_count; }
  int GetCapacity() const { return m_capacity; }

 protected:
  // Empty; the size is that of one element, in bytes.
  explicit __STable(int elementSize) : m_elementSize(elementSize) {}
  // Copies the elements with the operations of this class: a derived class that has its own assigns instead.
  __STable(const __STable& other);
  // Clears, then copies the elements one by one. A failed allocation leaves the table empty.
  __STable& operator=(const __STable& other);

  // Clears with the operations of this class: a derived class that has its own calls Clear itself.
  virtual ~__STable();
  virtual void Destroy(void* element);                         // ends an element's life; nothing to do here
  virtual void CopyTo(void* destination, const void* source);  // constructs a copy; here of the bytes
  virtual void* Allocate(int n);                               // raw storage; throws SEOutOfMemory
  virtual void Free(void* block);                              // frees a block of Allocate

  // The address of element i, which is not checked.
  void* GetAt(int i) { return m_data + std::ptrdiff_t{i} * m_elementSize; }
  const void* GetAt(int i) const { return m_data + std::ptrdiff_t{i} * m_elementSize; }  // bytes
  // The address of the first element; null while there is no storage.
  void* GetArray() { return m_data; }
  const void* GetArray() const { return m_data; }

  // Sets the capacity to n, which must not be below the count; 0 does nothing. A failure leaves the table as it was.
  void GrowTo(int n);
  // Opens a slot in front of element i and returns its address; the caller constructs an element there.
  // When copying an element fails on the way, the elements behind it are given up.
  void* NewAt(int i);
  void CloseSlot(int i);  // undoes NewAt when the element could not be constructed
  // Inserts a copy of the element, which may lie in this table.
  void Insert(int i, const void* element);
  // When copying an element fails on the way: Remove has removed its element, and gives up those that cannot be moved
  // up; MoveTo keeps all elements, the moved one somewhere between the two places; Swap keeps both in their places, or
  // has the second one twice; Reverse stops. Only when the copy that mends this fails, too, are the elements from that
  // place on given up. Every element that is gone was destroyed once.
  void Remove(int i);
  void MoveTo(int from, int to);  // `to` is the element's index afterwards
  void Swap(int i, int j);
  void Reverse();
  void Clear();
  void SwapWith(__STable& other) noexcept;

  // For appending without a call: whether there is room behind the last element.
  bool HasRoom() const { return m_count < m_capacity; }
  void* Elements() { return m_data; }
  void SetCount(int n) { m_count = n; }

  char* m_data = nullptr;       // null while nothing is allocated
  std::int32_t m_capacity = 0;  // elements that fit
  std::int32_t m_count = 0;     // elements
  std::int32_t m_elementSize;   // bytes

 private:
  class Transit;
  void MoveElement(void* destination, void* source);
  void GiveUpFrom(int hole);
  void Refill(int hole, const void* element);
};

static_assert(sizeof(void*) != 4 || sizeof(__STable) == 20, "the layout is public");

// A growable array of T, which needs to be copyable. See STableShell for the members.
template <class T>
class STable : public STableShell<T, __STable> {
  using Shell = STableShell<T, __STable>;

 public:
  STable() : Shell(static_cast<int>(sizeof(T))) {}
  STable(std::initializer_list<T> values) : STable() { this->AddAll(values.begin(), values.end()); }
  STable(const STable& other) : STable() { __STable::operator=(other); }
  STable(STable&& other) noexcept : STable() { this->SwapWith(other); }
  ~STable() override { __STable::Clear(); }
  STable& operator=(const STable& other) { return __STable::operator=(other), *this; }
  STable& operator=(STable&& other) noexcept { return this->SwapWith(other), *this; }

 protected:
  void Destroy(void* element) override { static_cast<T*>(element)->~T(); }
  void CopyTo(void* destination, const void* source) override { new (destination) T(*static_cast<const T*>(source)); }
};
