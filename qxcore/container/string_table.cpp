#include "qxcore/container/string_table.h"

#include <algorithm>
#include <cstring>
#include <new>

#include "qxcore/container/internal/table_storage.h"
#include "qxcore/core/internal/memory_failures.h"
#include "qxcore/string/string_buffer.h"

const SStringTable SStringTable::null;

// --- elements ---

void SStringTable::Destroy(void* element) { static_cast<SString*>(element)->~SString(); }

void SStringTable::CopyTo(void* destination, const void* source) {
  new (destination) SString(*static_cast<const SString*>(source));
}

void* SStringTable::Allocate(int n) {
  void* block = SMemMustFail() ? nullptr : ::operator new(table_storage::BytesFor(n, m_elementSize), std::nothrow);
  if (block == nullptr) throw SEOutOfMemory();
  return block;
}

void SStringTable::Free(void* block) { ::operator delete(block); }

// --- room ---

void SStringTable::Relocate(int capacity) {
  void* block = Allocate(capacity);
  if (m_data != nullptr) {
    std::memcpy(block, m_data, size() * sizeof(SString));
    Free(m_data);
  }
  m_data = static_cast<char*>(block);
  m_capacity = capacity;
}

void SStringTable::Reserve(int n) {
  if (n > m_capacity) Relocate(n);
}

void SStringTable::MakeRoom(int n) {
  if (n <= m_capacity - m_count) return;
  if (n > (std::numeric_limits<std::int32_t>::max)() - m_count) throw SEOutOfMemory();
  int next = m_capacity == 0 ? table_storage::kFirstCapacity : table_storage::NextCapacity(m_capacity);
  Relocate((std::max)(next, m_count + n));
}

void SStringTable::CutTo(int count) {
  while (m_count > count) Destroy(&GetArray()[--m_count]);
}

// --- construction and assignment ---

SStringTable::SStringTable(const SStringTable& other) : SStringTable() { *this += other; }
SStringTable::SStringTable(const SString& text) : SStringTable() { *this += text; }
SStringTable::SStringTable(const WCHAR* const* texts) : SStringTable() { *this += texts; }

SStringTable::SStringTable(std::initializer_list<SString> texts) : SStringTable() {
  Reserve(static_cast<int>(texts.size()));
  for (const SString& text : texts) Add(text);
}

SStringTable& SStringTable::operator=(const SStringTable& other) {
  if (this != &other) *this = SStringTable(other);
  return *this;
}

SStringTable& SStringTable::operator=(const SString& text) { return *this = SStringTable(text); }
SStringTable& SStringTable::operator=(const WCHAR* const* texts) { return *this = SStringTable(texts); }

SStringTable& SStringTable::operator+=(const SStringTable& other) {
  int count = other.GetCount();  // of this table, too, if it is the same
  MakeRoom(count);
  int before = m_count;
  try {
    for (int i = 0; i < count; ++i) Add(other[i]);  // a string that is lent out is copied, which can fail
  } catch (...) {
    CutTo(before);
    throw;
  }
  return *this;
}

SStringTable& SStringTable::operator+=(const WCHAR* const* texts) {
  int before = m_count;
  try {
    for (; texts != nullptr && *texts != nullptr; ++texts) Add(*texts);
  } catch (...) {
    CutTo(before);
    throw;
  }
  return *this;
}

// --- modification ---

void SStringTable::Insert(int i, SString text) {
  MakeRoom(1);
  SString* place = GetArray() + i;
  std::memmove(static_cast<void*>(place + 1), place, static_cast<std::size_t>(m_count - i) * sizeof(SString));
  new (place) SString(std::move(text));
  ++m_count;
}

void SStringTable::Remove(int i) {
  SString* place = GetArray() + i;
  Destroy(place);
  --m_count;
  std::memmove(static_cast<void*>(place), place + 1, static_cast<std::size_t>(m_count - i) * sizeof(SString));
}

SStringTable::iterator SStringTable::Remove(const_iterator at) {
  Remove(at.GetIndex());
  return iterator(*this, at.GetIndex());
}

SStringTable::reverse_iterator SStringTable::Remove(const_reverse_iterator at) {
  Remove(at.GetIndex());
  return reverse_iterator(*this, at.GetIndex() - 1);
}

void SStringTable::MoveTo(int from, int to) {
  SString* texts = GetArray();
  if (from < to) {
    std::rotate(texts + from, texts + from + 1, texts + to + 1);
  } else {
    std::rotate(texts + to, texts + from, texts + from + 1);
  }
}

void SStringTable::Reverse() {
  for (int i = 0, j = m_count - 1; i < j; ++i, --j) Swap(i, j);
}

// --- comparison ---

int SStringTable::Compare(const SStringTable& other) const {
  if (this == &other) return 1;
  if (m_count != other.m_count) return m_count - other.m_count;
  for (int i = 0; i < m_count; ++i) {
    if (int order = (*this)[i].Compare(other[i])) return order;
  }
  return 0;
}

// --- joining ---

namespace {

// Elements lie anywhere in memory; asked for this many ahead, they are there when their turn comes.
constexpr int kAhead = 16;

void Prefetch(const SStringTable& table, int i) {
  if (i < table.GetCount()) __builtin_prefetch(table[i].GetSafePointer());
}

// Room for the joined text, if all elements are about as long as the first ones.
unsigned LikelyLength(const SStringTable& table, int separatorLength) {
  const int sample = (std::min)(table.GetCount(), 64);
  double length = 0;
  for (int i = 0; i < sample; ++i) length += table[i].Length() + separatorLength;
  length *= 1.05 * table.GetCount() / sample;
  return static_cast<unsigned>((std::clamp)(length, 256.0, 256.0 * 1024 * 1024));
}

}  // namespace

SString SStringTable::Format(const SString& prefix, const SString& separator, const SString& suffix) const {
  if (IsEmpty()) return SString();
  SStringBuffer text(LikelyLength(*this, separator.Length()));
  text += prefix;
  for (int i = 0; i < m_count; ++i) {
    Prefetch(*this, i + kAhead);
    if (i != 0) text += separator;
    text += (*this)[i];
  }
  text += suffix;
  return text.Detach();
}
