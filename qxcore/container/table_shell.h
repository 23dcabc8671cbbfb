// The typed members that STable<T>, STableDumb<T> and STableMem<T> have in common.
//
// Iterators are plain pointers, so range-for and all standard algorithms work. An iterator or a
// reference is valid until the table grows, is assigned to, or (shared tables) is detached.
// Writable access detaches a shared table; read through a const table, GetConst or cbegin to keep the
// block shared. Threads: one table belongs to one thread at a time.
#pragma once

#include <cstddef>
#include <initializer_list>
#include <iterator>
#include <new>
#include <type_traits>
#include <utility>

#include "qxcore/platform/export.h"

// Throws SECOMException with the code 0x8000000B (E_BOUNDS).
[[noreturn]] QXCORE_API void SThrowIndexOutOfRange(int index, int count);

// The typed side of a table: elements of T over the untyped Base.
template <class T, class Base>
class STableShell : public Base {
  static_assert(alignof(T) <= alignof(std::max_align_t), "tables do not align beyond that");

 public:
  using value_type = T;
  using reference = T&;
  using const_reference = const T&;
  using iterator = T*;
  using const_iterator = const T*;
  using size_type = std::size_t;
  using difference_type = std::ptrdiff_t;

  bool IsEmpty() const { return this->GetCount() == 0; }
  bool empty() const { return IsEmpty(); }
  std::size_t size() const { return static_cast<std::size_t>(this->GetCount()); }

  // --- access; 0 <= i < GetCount(), checked by At only, which throws SECOMException ---
  T& operator[](int i) { return GetArray()[i]; }
  const T& operator[](int i) const { return GetArray()[i]; }
  T& GetAt(int i) { return (*this)[i]; }
  const T& GetAt(int i) const { return (*this)[i]; }
  const T& GetConst(int i) const { return (*this)[i]; }
  T& At(int i) { return CheckIndex(i), (*this)[i]; }
  const T& At(int i) const { return CheckIndex(i), (*this)[i]; }
  // The elements in one piece; may be null for an empty table.
  T* GetArray() { return static_cast<T*>(Base::GetArray()); }
  const T* GetArray() const { return static_cast<const T*>(Base::GetArray()); }

  T* begin() { return GetArray(); }
  T* end() { return GetArray() + this->GetCount(); }
  const T* begin() const { return GetArray(); }
  const T* end() const { return GetArray() + this->GetCount(); }
  const T* cbegin() const { return begin(); }
  const T* cend() const { return end(); }
  auto rbegin() { return std::reverse_iterator(end()); }
  auto rend() { return std::reverse_iterator(begin()); }
  auto rbegin() const { return std::reverse_iterator(end()); }
  auto rend() const { return std::reverse_iterator(begin()); }

  // --- modification. `value` may be an element of this table. Failures leave the table as it was
  // (inserting in front of elements of an STable: see NewAt) ---
  // Appends a copy and returns its index.
  int Add(const T& value) {
    int index = this->GetCount();
    if (this->HasRoom()) [[likely]] {
      new (static_cast<T*>(this->Elements()) + index) T(value);
      this->SetCount(index + 1);
    } else if constexpr (std::is_trivially_copyable_v<T> && sizeof(T) <= 2 * sizeof(void*)) {
      T copy(value);  // its address goes away, so that the caller's variable may stay in a register
      Base::Insert(index, &copy);
    } else {
      Base::Insert(index, &value);
    }
    return index;
  }
  void push_back(const T& value) { Add(value); }                   // for std::back_inserter
  void Insert(int i, const T& value) { Base::Insert(i, &value); }  // in front of element i <= GetCount()
  void Remove(int i) { Base::Remove(i); }
  void MoveTo(int from, int to) { Base::MoveTo(from, to); }  // `to` is the element's index afterwards
  void Swap(int i, int j) { Base::Swap(i, j); }
  void Reverse() { Base::Reverse(); }
  void Clear() { Base::Clear(); }          // frees the memory, too
  void GrowTo(int n) { Base::GrowTo(n); }  // room for exactly n >= GetCount() elements; 0 does nothing

 protected:
  using Base::Base;
  STableShell(const STableShell&) = default;
  STableShell& operator=(const STableShell&) = default;
  ~STableShell() = default;

  template <class Iterator>
  void AddAll(Iterator first, Iterator last) {
    try {
      for (; first != last; ++first) Add(*first);
    } catch (...) {
      Base::Clear();  // for constructors, whose destructor does not run
      throw;
    }
  }

 private:
  void CheckIndex(int i) const {
    if (i < 0 || i >= this->GetCount()) SThrowIndexOutOfRange(i, this->GetCount());
  }
};
