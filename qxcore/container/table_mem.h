// __STableMem: a growable array with a shared block whose elements may be moved, but not copied,
// bitwise; and its typed shell STableMem<T>.
//
// For elements that hold a pointer to something counted, above all SString. Inside one table they move
// as bytes; the virtual CopyTo runs only when a shared block is detached or an element is put in.
// Copies of a table share one block (O(1)).
//
// The counts of shared blocks are plain integers: tables that share a block belong to one thread.
// Growth and checking are those of STable. Failures throw and change nothing.
#pragma once

#include "qxcore/container/table_dumb.h"

class QXCORE_API __STableMem {
 public:
  int GetCount() const { return m_table.GetCount(); }
  int GetCapacity() const { return m_table.GetCapacity(); }
  int ElemSize() const { return m_table.ElemSize(); }  // bytes of one element
  // Whether another table has the same block.
  bool IsShared() const { return m_table.IsShared(); }

 protected:
  // Empty; the size is that of one element, in bytes.
  explicit __STableMem(int elementSize) : m_table(elementSize) {}
  __STableMem(const __STableMem& other) : m_table(other.m_table) {}
  __STableMem& operator=(const __STableMem& other);

  // Frees the block with the operations of this class: a derived class that has its own calls Clear itself.
  virtual ~__STableMem();
  virtual void Destroy(void* element);                         // ends an element's life; nothing to do here
  virtual void CopyTo(void* destination, const void* source);  // constructs a copy; here of the bytes
  virtual void* Allocate(int n);                               // a block for n elements; throws SEOutOfMemory
  virtual void Free(void* block);                              // frees a block of Allocate

  // Writable access detaches.
  void* GetAt(int i) { return static_cast<char*>(GetArray()) + std::ptrdiff_t{i} * ElemSize(); }
  const void* GetAt(int i) const { return m_table.GetAt(i); }
  void* GetArray() {
    if (IsShared()) [[unlikely]]
      DetachBlock();
    return const_cast<void*>(Const().GetArray());
  }
  const void* GetArray() const { return m_table.GetArray(); }

  // Sets the capacity to n, which must not be below the count.
  void GrowTo(int n);
  // Opens a slot in front of element i and returns its address; the caller constructs an element there.
  void* NewAt(int i);
  void CloseSlot(int i);  // undoes NewAt when the element could not be constructed
  // Inserts a copy of the element, which may lie in this table.
  void Insert(int i, const void* element);
  void Remove(int i);
  void MoveTo(int from, int to);
  void Swap(int i, int j);
  void Reverse();
  void Clear();
  // Replaces the content by copies of n elements, which may lie in this table.
  void CopyArray(const void* elements, int n);
  // As for __STableDumb. The caller of Detach also takes over the elements.
  void* Detach() { return m_table.Detach(); }
  void Attach(void* block);

  // Exchanges the contents; both must be of one type.
  void SwapWith(__STableMem& other) noexcept { m_table.SwapWith(other.m_table); }

  // For the typed shell: whether one more fits without growing; the elements; their number.
  bool HasRoom() const { return m_table.HasRoom(); }
  void* Elements() { return m_table.Elements(); }
  void SetCount(int n) { m_table.SetCount(n); }

  __STableDumb m_table;  // holds the block

 private:
  const __STableDumb& Const() const { return m_table; }
  void DetachBlock() { GrowTo(GetCapacity()); }
  __STableData* CopyBlock(const void* elements, int n, int capacity);
};

static_assert(sizeof(void*) != 4 || sizeof(__STableMem) == 8, "the layout is public");

// A growable array of T, which needs to be copyable, and movable as bytes: no pointer leads from
// outside or from itself into it. See STableShell for the other members.
template <class T>
class STableMem : public STableShell<T, __STableMem> {
  using Shell = STableShell<T, __STableMem>;

 public:
  STableMem() : Shell(static_cast<int>(sizeof(T))) {}
  STableMem(std::initializer_list<T> values) : STableMem() {
    CopyArray(values.begin(), static_cast<int>(values.size()));
  }
  STableMem(const STableMem& other) = default;
  STableMem(STableMem&& other) noexcept : STableMem() { this->SwapWith(other); }
  ~STableMem() override { __STableMem::Clear(); }
  STableMem& operator=(const STableMem& other) { return __STableMem::operator=(other), *this; }
  STableMem& operator=(STableMem&& other) noexcept { return this->SwapWith(other), *this; }

  // Replaces the content by copies of n elements.
  void CopyArray(const T* elements, int n) { __STableMem::CopyArray(elements, n); }
  void* Detach() { return __STableMem::Detach(); }
  void Attach(void* block) { __STableMem::Attach(block); }

 protected:
  // What the base asks of an element: its end, and a copy.
  void Destroy(void* element) override { static_cast<T*>(element)->~T(); }
  void CopyTo(void* destination, const void* source) override { new (destination) T(*static_cast<const T*>(source)); }
};
