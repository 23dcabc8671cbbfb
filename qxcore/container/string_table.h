// SStringTable: the library's array of strings, with five sort orders, joining, and a flat list form.
//
// Indices are int and not checked. Elements are strings that share their buffers with those they
// were copied from. Appending is amortised constant; moving elements within the table copies no string.
//
// Iterators are a table and an index: they survive changes of the table, and then stand for whatever
// element has that index. A failed allocation throws SEOutOfMemory and leaves the table as it was.
// Not for several threads at once.
#pragma once

#include <compare>
#include <cstddef>
#include <initializer_list>
#include <iterator>
#include <type_traits>
#include <utility>

#include "qxcore/container/table.h"
#include "qxcore/platform/export.h"
#include "qxcore/string/string.h"

class SStringTable;

// The iterators of SStringTable. `Element` is SString or const SString; kStep is 1 (first to last) or
// -1 (last to first). They are random-access iterators, and know whether they are inside.
template <class Element, int kStep>
class SStringTableIterator {
 public:
  // What it walks over.
  using Table = std::conditional_t<std::is_const_v<Element>, const SStringTable, SStringTable>;
  // For the standard algorithms.
  using iterator_category = std::random_access_iterator_tag;
  using value_type = SString;
  using difference_type = std::ptrdiff_t;
  using pointer = Element*;
  using reference = Element&;

  SStringTableIterator() = default;
  // At element `index` of the table; -1 and GetCount() are the places before and behind the elements.
  SStringTableIterator(Table& table, int index) : m_table(&table), m_index(index) {}
  // The reading form of a writing iterator.
  operator SStringTableIterator<const SString, kStep>() const {
    if (m_table == nullptr) return {};
    return SStringTableIterator<const SString, kStep>(*m_table, m_index);
  }

  // True while there is an element at the iterator's index.
  explicit operator bool() const { return m_table != nullptr && m_index >= 0 && m_index < m_table->GetCount(); }
  // The element's index in the table, whatever the direction.
  int GetIndex() const { return m_index; }
  Table* GetTable() const { return m_table; }

  // The element, the one that is n steps away, and steps in the iterator's direction.
  Element& operator*() const { return (*m_table)[m_index]; }
  Element* operator->() const { return &**this; }
  Element& operator[](std::ptrdiff_t n) const { return *(*this + n); }
  SStringTableIterator& operator++() { return *this += 1; }
  SStringTableIterator& operator--() { return *this += -1; }
  SStringTableIterator operator++(int) { return std::exchange(*this, *this + 1); }
  SStringTableIterator operator--(int) { return std::exchange(*this, *this - 1); }
  // By n steps on.
  SStringTableIterator& operator+=(std::ptrdiff_t n) {
    m_index += static_cast<int>(n) * kStep;
    return *this;
  }
  // By n steps back; n steps from an iterator; the number of steps between two.
  SStringTableIterator& operator-=(std::ptrdiff_t n) { return *this += -n; }
  friend SStringTableIterator operator+(SStringTableIterator at, std::ptrdiff_t n) { return at += n; }
  friend SStringTableIterator operator+(std::ptrdiff_t n, SStringTableIterator at) { return at += n; }
  friend SStringTableIterator operator-(SStringTableIterator at, std::ptrdiff_t n) { return at -= n; }
  friend std::ptrdiff_t operator-(SStringTableIterator a, SStringTableIterator b) {
    return std::ptrdiff_t{a.m_index - b.m_index} * kStep;
  }
  // Within one table; by the direction of the iterators.
  friend bool operator==(SStringTableIterator a, SStringTableIterator b) { return a.m_index == b.m_index; }
  friend std::strong_ordering operator<=>(SStringTableIterator a, SStringTableIterator b) {
    return std::ptrdiff_t{a.m_index} * kStep <=> std::ptrdiff_t{b.m_index} * kStep;
  }

 private:
  Table* m_table = nullptr;
  int m_index = 0;
};

class QXCORE_API SStringTable : public __STable {
 public:
  using value_type = SString;
  using reference = SString&;
  using const_reference = const SString&;
  using size_type = std::size_t;
  using difference_type = std::ptrdiff_t;
  using iterator = SStringTableIterator<SString, 1>;
  using const_iterator = SStringTableIterator<const SString, 1>;
  using reverse_iterator = SStringTableIterator<SString, -1>;
  using const_reverse_iterator = SStringTableIterator<const SString, -1>;

  // The directions of the sorts.
  enum Direction : int { kDescending = 0, kAscending = 1 };

  static const SStringTable null;  // always empty

  SStringTable() : __STable(static_cast<int>(sizeof(SString))) {}
  SStringTable(const SStringTable& other);
  SStringTable(SStringTable&& other) noexcept : SStringTable() { SwapWith(other); }
  SStringTable(std::initializer_list<SString> texts);
  explicit SStringTable(const SString& text);        // one element
  explicit SStringTable(const WCHAR* const* texts);  // pointers to texts, up to a null pointer; null: empty
  ~SStringTable() override { SStringTable::Clear(); }

  // Instead of the former elements; the right side may be an element of this table.
  SStringTable& operator=(const SStringTable& other);
  SStringTable& operator=(SStringTable&& other) noexcept { return SwapWith(other), *this; }
  SStringTable& operator=(const SString& text);
  SStringTable& operator=(const WCHAR* const* texts);
  // Append; the right side may be this table or an element of it.
  SStringTable& operator+=(const SStringTable& other);
  SStringTable& operator+=(const SString& text) { return Add(text), *this; }
  SStringTable& operator+=(const WCHAR* const* texts);

  // --- access ---
  bool IsEmpty() const { return GetCount() == 0; }
  bool empty() const { return IsEmpty(); }
  std::size_t size() const { return static_cast<std::size_t>(GetCount()); }
  SString& operator[](int i) { return GetArray()[i]; }
  const SString& operator[](int i) const { return GetArray()[i]; }
  SString& GetAt(int i) { return GetArray()[i]; }
  const SString& GetAt(int i) const { return GetArray()[i]; }
  // The elements in one piece, valid until the table grows; null while there is no storage.
  SString* GetArray() { return static_cast<SString*>(Elements()); }
  const SString* GetArray() const { return static_cast<const SString*>(__STable::GetArray()); }

  iterator begin() { return iterator(*this, 0); }
  iterator end() { return iterator(*this, GetCount()); }
  const_iterator begin() const { return const_iterator(*this, 0); }
  const_iterator end() const { return const_iterator(*this, GetCount()); }
  const_iterator cbegin() const { return begin(); }
  const_iterator cend() const { return end(); }
  reverse_iterator rbegin() { return reverse_iterator(*this, GetCount() - 1); }
  reverse_iterator rend() { return reverse_iterator(*this, -1); }
  const_reverse_iterator rbegin() const { return const_reverse_iterator(*this, GetCount() - 1); }
  const_reverse_iterator rend() const { return const_reverse_iterator(*this, -1); }
  const_reverse_iterator crbegin() const { return rbegin(); }
  const_reverse_iterator crend() const { return rend(); }

  // --- modification ---
  // Appends and returns the new element's index.
  int Add(SString text) {
    int index = GetCount();
    if (!HasRoom()) [[unlikely]]
      MakeRoom(1);
    new (GetArray() + index) SString(std::move(text));
    SetCount(index + 1);
    return index;
  }
  void push_back(const SString& text) { Add(text); }  // for std::back_inserter
  void Insert(int i, SString text);                   // in front of element i, 0 <= i <= GetCount()
  void Remove(int i);
  // Return an iterator to the element that comes next in the iterator's direction.
  iterator Remove(const_iterator at);
  reverse_iterator Remove(const_reverse_iterator at);
  // Moves one element; `to` is its index afterwards.
  void MoveTo(int from, int to);
  void MoveTo(const_iterator from, int to) { MoveTo(from.GetIndex(), to); }
  void Swap(int i, int j) { GetArray()[i].Swap(GetArray()[j]); }
  void Reverse();
  void Clear() { __STable::Clear(); }  // frees the memory, too
  void Reserve(int n);                 // room for n elements in all, at least

  // --- comparison ---
  // 1 when both are the same object, which on purpose makes a table greater than itself; else the
  // difference of the counts; where they are equal, the first difference of two elements at the same
  // index, by code unit up to their first NUL: negative or positive; else 0.
  int Compare(const SStringTable& other) const;
  // All by Compare, so that a table does not equal itself.
  bool operator==(const SStringTable& other) const { return Compare(other) == 0; }
  bool operator!=(const SStringTable& other) const { return Compare(other) != 0; }
  bool operator<(const SStringTable& other) const { return Compare(other) < 0; }
  bool operator<=(const SStringTable& other) const { return Compare(other) <= 0; }
  bool operator>(const SStringTable& other) const { return Compare(other) > 0; }
  bool operator>=(const SStringTable& other) const { return Compare(other) >= 0; }

  // --- sorting: ascending unless the direction is 0. In place, n log n comparisons at most, no memory
  // taken, nothing thrown. Elements that compare equal end in no particular order. Texts are compared
  // up to their first NUL ---
  void Sort(int direction = kAscending);                // by code unit
  void SortNoCase(int direction = kAscending);          // after mapping to lower case, one to one
  void SortNumbered(int direction = kAscending);        // natural order, see natural_compare.h
  void SortNumberedNoCase(int direction = kAscending);  // the same without case
  void SortOnLength(int direction = kAscending);        // by the number of code units

  // --- joining ---
  // Prefix, the elements with the separator between them, suffix. An empty table yields an empty text,
  // without prefix and suffix.
  SString Format(const SString& prefix, const SString& separator, const SString& suffix) const;
  // Every element followed by the separator, the last one, too.
  SString Format(const SString& separator) const { return Format(SString::null, separator, separator); }
  SString Format() const { return Format(SString::CrLf); }  // lines

  // --- the list form ---
  // The elements with the separator between them; in the elements an escape character stands before
  // each separator and each escape character. The two characters have to differ; escape 0 means no escape. No
  // element and one empty element both yield an empty text.
  SString GetAsList(WCHAR separator, WCHAR escape) const;
  operator SString() const { return GetAsList(WTEXT('\n'), WTEXT('\\')); }

  // Appends the parts of a list, and returns their number. A part ends at any character of `separators` (null:
  // none). Behind it further separators are skipped as long as each differs from the one before it:
  // carriage return and line feed are one break (two such pairs, too), and two equal separators have an
  // empty part between them. An escape character makes the next character literal; alone at the end it
  // stands for itself; 0 means no escape. A separator at the very end has an empty last part behind it; an empty
  // list has no parts. So AddFromList takes back what GetAsList gave, but for a table of one empty element.
  int AddFromList(const SString& list, const WCHAR* separators, WCHAR escape);
  // The list is text `id` of the library's string table; one that is not there is empty.
  int AddFromList(unsigned int id, const WCHAR* separators, WCHAR escape);
  int AddFromList(const SStringTable& other);  // appends the elements of another table
  // The same instead of the former elements.
  int SetFromList(const SString& list, const WCHAR* separators, WCHAR escape);
  int SetFromList(unsigned int id, const WCHAR* separators, WCHAR escape);
  int SetFromList(const SStringTable& other);

 protected:
  void Destroy(void* element) override;
  void CopyTo(void* destination, const void* source) override;  // shares the buffer
  void* Allocate(int n) override;                               // by operator new
  void Free(void* block) override;                              // by operator delete

 private:
  // A string is one pointer, so elements move as bytes: the copying of the base class is not needed.
  void MakeRoom(int n);
  void Relocate(int capacity);
  void CutTo(int count);
};

static_assert(sizeof(void*) != 4 || sizeof(SStringTable) == 20, "the layout is public");
