// __STableDumb: a growable array of plain data with a shared block, and its typed shell STableDumb<T>.
//
// Copies of a table share one block (O(1)); a write detaches, that is, copies the block's bytes. The
// elements are numbers, pointers or structures without resources of their own; no code runs for them.
//
// The counts of shared blocks are plain integers: tables that share a block belong to one thread.
// Growth and checking are those of STable. Failures throw SEOutOfMemory and change nothing.
#pragma once

#include <cstdint>
#include <type_traits>

#include "qxcore/container/table_shell.h"
#include "qxcore/platform/export.h"

// A 32-bit integer under a type of its own: writing an element that is an int does not touch it, so the
// compiler may keep the header's values in registers while elements are appended.
enum class STableInt : std::int32_t {};

// The header of a shared block; the elements follow it.
struct __STableData {
  STableInt m_refs;         // tables that share the block
  STableInt m_capacity;     // elements that fit
  STableInt m_count;        // elements
  STableInt m_elementSize;  // bytes

  // The fields as integers.
  int Refs() const { return static_cast<int>(m_refs); }
  int Capacity() const { return static_cast<int>(m_capacity); }
  int Count() const { return static_cast<int>(m_count); }
  int ElemSize() const { return static_cast<int>(m_elementSize); }
  void AddRefs(int n) { m_refs = static_cast<STableInt>(Refs() + n); }
  void SetCapacity(int n) { m_capacity = static_cast<STableInt>(n); }
  void SetCount(int n) { m_count = static_cast<STableInt>(n); }

  // The first element.
  char* Elements() { return reinterpret_cast<char*>(this + 1); }
  const char* Elements() const { return reinterpret_cast<const char*>(this + 1); }
};

static_assert(sizeof(__STableData) == 16, "the layout is public");

// Either a block, or, with its lowest bit set, the element size of a table without one.
class _STableData {
 public:
  // An element size, or a block, which is not null.
  explicit _STableData(int elementSize) : m_word((static_cast<std::uintptr_t>(elementSize) << 1) | 1) {}
  explicit _STableData(__STableData* data) : m_word(reinterpret_cast<std::uintptr_t>(data)) {}

  bool IsEmpty() const { return (m_word & 1) != 0; }
  // Bytes of one element.
  int ElemSize() const { return IsEmpty() ? static_cast<int>(m_word >> 1) : Data()->ElemSize(); }
  // Only when not IsEmpty(); never null then.
  __STableData* Data() const { return reinterpret_cast<__STableData*>(m_word); }
  __STableData* operator->() const { return Data(); }
  friend bool operator==(_STableData a, _STableData b) { return a.m_word == b.m_word; }

 private:
  std::uintptr_t m_word;
};

static_assert(sizeof(_STableData) == sizeof(void*));

class QXCORE_API __STableDumb {
 public:
  int GetCount() const { return m_data.IsEmpty() ? 0 : m_data->Count(); }
  int GetCapacity() const { return m_data.IsEmpty() ? 0 : m_data->Capacity(); }
  int ElemSize() const { return m_data.ElemSize(); }  // bytes of one element
  // Whether another table has the same block.
  bool IsShared() const { return !m_data.IsEmpty() && m_data->Refs() != 1; }

 protected:
  friend class __STableMem;

  // Empty; the size is that of one element, in bytes.
  explicit __STableDumb(int elementSize) : m_data(elementSize) {}
  __STableDumb(const __STableDumb& other);
  __STableDumb& operator=(const __STableDumb& other);
  ~__STableDumb() { Clear(); }

  // Writable access detaches.
  void* GetAt(int i) { return static_cast<char*>(GetArray()) + std::ptrdiff_t{i} * ElemSize(); }
  const void* GetAt(int i) const { return static_cast<const char*>(GetArray()) + std::ptrdiff_t{i} * ElemSize(); }
  void* GetArray() {
    if (m_data.IsEmpty()) return nullptr;
    if (m_data->Refs() != 1) [[unlikely]]
      DetachBlock();
    return m_data->Elements();
  }
  const void* GetArray() const { return m_data.IsEmpty() ? nullptr : m_data->Elements(); }

  // Sets the capacity to n, which must not be below the count, in a block that is not shared; 0 does
  // nothing.
  void GrowTo(int n);
  // Opens a slot in front of element i and returns its address; its content is undefined.
  void* NewAt(int i);
  // Inserts a copy of the element, which may lie in this table.
  void Insert(int i, const void* element);
  void Remove(int i);
  void MoveTo(int from, int to);  // `to` is the element's index afterwards
  void Swap(int i, int j);
  void Reverse();
  void Clear();
  // Replaces the content by n elements, which may lie in this table.
  void CopyArray(const void* elements, int n);

  // Gives up the block, or null when there is none; the table is empty then. The block counts one holder
  // (shared: one of several), which is now the caller's to Attach or to FreeData.
  void* Detach();
  // Adopts a block that Detach or AllocData gave, with its one count, and lets go of the own one. Null
  // leaves the table empty.
  void Attach(void* block);

  // The block, null while there is none; it stays the table's.
  __STableData* GetData() const { return m_data.IsEmpty() ? nullptr : m_data.Data(); }
  // A new block: one holder, no elements. Throws SEOutOfMemory.
  static __STableData* AllocData(int capacity, int elementSize);
  static void FreeData(__STableData* block);

  // Exchanges the contents; both must be of one type.
  void SwapWith(__STableDumb& other) noexcept { std::swap(m_data, other.m_data); }

  // For the typed shell: whether one more fits without growing or detaching; the elements; their number.
  bool HasRoom() const {
    if (m_data.IsEmpty()) [[unlikely]]
      return false;
    if (m_data->Refs() != 1) [[unlikely]]
      return false;
    return m_data->Count() < m_data->Capacity();
  }
  void* Elements() { return m_data->Elements(); }
  void SetCount(int n) { m_data->SetCount(n); }

 private:
  void DetachBlock() { GrowTo(m_data->Capacity()); }
  char* ElementAt(int i) { return m_data->Elements() + std::ptrdiff_t{i} * m_data->ElemSize(); }
  void MoveWithin(int from, int to);
  void SwapWithin(int i, int j);

  _STableData m_data;
};

static_assert(sizeof(__STableDumb) == sizeof(void*));

// A growable array of plain data. See STableShell for the other members.
template <class T>
class STableDumb : public STableShell<T, __STableDumb> {
  static_assert(std::is_trivially_copyable_v<T>, "take STableMem or STable for elements with resources");
  using Shell = STableShell<T, __STableDumb>;

 public:
  STableDumb() : Shell(static_cast<int>(sizeof(T))) {}
  STableDumb(std::initializer_list<T> values) : STableDumb() {
    CopyArray(values.begin(), static_cast<int>(values.size()));
  }
  STableDumb(const STableDumb& other) = default;
  STableDumb(STableDumb&& other) noexcept : STableDumb() { this->SwapWith(other); }
  STableDumb& operator=(const STableDumb& other) = default;
  STableDumb& operator=(STableDumb&& other) noexcept { return this->SwapWith(other), *this; }

  // Replaces the content by n elements.
  void CopyArray(const T* elements, int n) { __STableDumb::CopyArray(elements, n); }
  void* Detach() { return __STableDumb::Detach(); }
  void Attach(void* block) { __STableDumb::Attach(block); }
};
