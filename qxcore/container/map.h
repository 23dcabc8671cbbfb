// SMap<K, V>: an ordered map; SUnsortedMap<K, V>: the same, but iterated in the order of insertion.
//
// Both are red-black trees (see tree.h): lookup is logarithmic, and keys and values never move. Adding
// replaces the value of an existing key and keeps the key object. The unsorted map removes in linear
// time, since it keeps a table of its entries. For maps from text to text take those of string_map.h.
//
// Iterating yields entries: for (auto& [key, value] : map). One map is for one thread at a time.
#pragma once

#include <cstddef>
#include <initializer_list>
#include <iterator>
#include <new>
#include <utility>

#include "qxcore/container/comparers.h"
#include "qxcore/container/node_pool.h"
#include "qxcore/container/table_dumb.h"
#include "qxcore/container/tree.h"

// One entry: the key stays, the value may change.
template <class K, class V>
struct SMapEntry {
  const K m_key;  // what the map is ordered by
  V m_value;      // what it leads to
};

// What both maps have in common. A key is passed through the tree as the address of a K.
template <class K, class V, class Comparer, class Allocator>
class SMapBase : public __STree {
 public:
  using key_type = K;
  using mapped_type = V;
  using value_type = SMapEntry<K, V>;
  using size_type = std::size_t;
  using difference_type = std::ptrdiff_t;

  std::size_t size() const { return static_cast<std::size_t>(m_count); }
  bool empty() const { return m_count == 0; }

  // The value of the key, or null.
  V* Retrieve(const K& key) { return ValueOf(FindEntry(key)); }
  const V* Retrieve(const K& key) const { return ValueOf(FindEntry(key)); }
  bool Contains(const K& key) const { return FindEntry(key) != nullptr; }

 protected:
  SMapBase() noexcept = default;
  ~SMapBase() override = default;

  struct TypedEntry : Entry {
    value_type m_payload;  // key and value
  };
  static_assert(alignof(value_type) <= alignof(TypedEntry) && sizeof(Entry) % alignof(value_type) == 0,
                "the payload follows the head directly");

  // From an entry to what it holds, and from a key to the word that stands for it.
  static value_type& PayloadOf(Entry* entry) { return *static_cast<value_type*>(entry->Payload()); }
  static V* ValueOf(Entry* entry) { return entry != nullptr ? &PayloadOf(entry).m_value : nullptr; }
  static const K& ToKey(long key) { return *reinterpret_cast<const K*>(key); }
  static long FromKey(const K& key) { return reinterpret_cast<long>(&key); }

  // The entry with the key, or null.
  Entry* FindEntry(const K& key) const {
    return Search([&key](Entry* entry) { return Comparer::Compare(key, PayloadOf(entry).m_key); });
  }
  // Where the key is or would be.
  Place FindPlace(const K& key) const {
    return Descend([&key](Entry* entry) { return Comparer::Compare(key, PayloadOf(entry).m_key); });
  }
  // An entry that is not linked yet.
  template <class... Value>
  Entry* MakeEntry(const K& key, Value&&... value) {
    Entry* entry = SMapBase::AllocEntry();
    try {
      new (entry->Payload()) value_type{key, V(std::forward<Value>(value)...)};
    } catch (...) {
      SMapBase::FreeEntry(entry);
      throw;
    }
    return entry;
  }

  // The operations that the tree asks for.
  Entry* AllocEntry() final { return static_cast<Entry*>(Allocator::Alloc(sizeof(TypedEntry), alignof(TypedEntry))); }
  void FreeEntry(Entry* entry) final { Allocator::Free(entry, sizeof(TypedEntry), alignof(TypedEntry)); }
  void DestroyPayload(Entry* entry) final { PayloadOf(entry).~value_type(); }
  void CopyPayload(Entry* entry, const void* source) final {
    new (entry->Payload()) value_type(*static_cast<const value_type*>(source));
  }
  int CompareKey(long a, long b) const final { return Comparer::Compare(ToKey(a), ToKey(b)); }
  long KeyOf(const void* payload) const final { return FromKey(static_cast<const value_type*>(payload)->m_key); }
};

// An ordered map; iteration is in the order of the keys.
template <class K, class V, class Comparer = SAscending<K>, class Allocator = SNodePools>
class SMap : public SMapBase<K, V, Comparer, Allocator> {
  using Base = SMapBase<K, V, Comparer, Allocator>;

 public:
  using typename Base::Entry;

 private:
  template <class Value>
  class Iterator : __STree::iterator {
    using Tree = __STree::iterator;

   public:
    using iterator_category = std::bidirectional_iterator_tag;
    using value_type = SMapEntry<K, V>;
    using difference_type = std::ptrdiff_t;
    using pointer = Value*;
    using reference = Value&;

    Iterator() = default;
    Iterator(const __STree* tree, Entry* entry) : Tree(tree, entry) {}
    operator Iterator<const value_type>() const { return {this->m_tree, this->m_entry}; }
    Value& operator*() const { return *static_cast<Value*>(this->m_entry->Payload()); }
    Value* operator->() const { return static_cast<Value*>(this->m_entry->Payload()); }
    Iterator& operator++() { return this->Next(), *this; }
    Iterator& operator--() { return this->Previous(), *this; }
    Iterator operator++(int) {
      Iterator old = *this;
      this->Next();
      return old;
    }
    Iterator operator--(int) {
      Iterator old = *this;
      this->Previous();
      return old;
    }
    friend bool operator==(const Iterator& a, const Iterator& b) { return a.m_entry == b.m_entry; }

   private:
    friend class SMap;
  };

 public:
  using typename Base::value_type;
  using iterator = Iterator<value_type>;
  using const_iterator = Iterator<const value_type>;

  SMap() noexcept = default;
  SMap(std::initializer_list<value_type> entries) : SMap() {
    for (const value_type& entry : entries) Add(entry.m_key, entry.m_value);
  }
  SMap(const SMap& other) : SMap() { __STree::operator=(other); }
  SMap(SMap&& other) noexcept : SMap() { __STree::Swap(other); }
  ~SMap() override { __STree::Clear(); }
  SMap& operator=(const SMap& other) { return __STree::operator=(other), *this; }
  SMap& operator=(SMap&& other) noexcept { return __STree::Swap(other), *this; }

  // Inserts, or replaces the value of an existing key. Returns the value in the map.
  V& Add(const K& key, const V& value) {
    auto place = this->FindPlace(key);
    if (place.m_found == nullptr) {
      place.m_found = this->MakeEntry(key, value);
      this->Link(place.m_found, place);
    } else {
      *Base::ValueOf(place.m_found) = value;
    }
    return *Base::ValueOf(place.m_found);
  }
  // The value of the key, which is inserted with an empty value when it is absent.
  V& operator[](const K& key) {
    auto place = this->FindPlace(key);
    if (place.m_found == nullptr) {
      place.m_found = this->MakeEntry(key);
      this->Link(place.m_found, place);
    }
    return *Base::ValueOf(place.m_found);
  }
  // The same, but nothing is inserted: an absent key has the empty value.
  const V& operator[](const K& key) const {
    static const V empty{};
    const V* value = this->Retrieve(key);
    return value != nullptr ? *value : empty;
  }
  // True when there was something to remove.
  bool Remove(const K& key) { return __STree::Remove(this->FindEntry(key)); }
  // Removes the entry, which must exist; the iterator then stands at the next one.
  bool Remove(iterator& place) {
    Entry* entry = place.m_entry;
    ++place;
    return __STree::Remove(entry);
  }
  void Clear() { __STree::Clear(); }
  void Swap(SMap& other) noexcept { __STree::Swap(other); }

  // The entry with the key; end() when there is none.
  iterator Find(const K& key) { return {this, this->FindEntry(key)}; }
  const_iterator Find(const K& key) const { return {this, this->FindEntry(key)}; }
  iterator begin() { return {this, this->GetFirstEntry()}; }
  iterator end() { return {this, nullptr}; }
  const_iterator begin() const { return {this, this->GetFirstEntry()}; }
  const_iterator end() const { return {this, nullptr}; }
};

// A map whose iteration is in the order in which the keys came.
template <class K, class V, class Allocator = SNodePools, class Comparer = SAscending<K>>
class SUnsortedMap : public SMapBase<K, V, Comparer, Allocator> {
  using Base = SMapBase<K, V, Comparer, Allocator>;

 public:
  using typename Base::Entry;

 private:
  template <class Value>
  class Iterator {
   public:
    using iterator_category = std::bidirectional_iterator_tag;
    using value_type = SMapEntry<K, V>;
    using difference_type = std::ptrdiff_t;
    using pointer = Value*;
    using reference = Value&;

    Iterator() = default;
    Iterator(const SUnsortedMap* map, int index) : m_map(map), m_index(index) {}
    operator Iterator<const value_type>() const { return {m_map, m_index}; }
    Value& operator*() const { return *static_cast<Value*>(m_map->m_order.GetConst(m_index)); }
    Value* operator->() const { return &**this; }
    Iterator& operator++() { return ++m_index, *this; }
    Iterator& operator--() { return --m_index, *this; }
    Iterator operator++(int) { return {m_map, m_index++}; }
    Iterator operator--(int) { return {m_map, m_index--}; }
    friend bool operator==(const Iterator& a, const Iterator& b) { return a.m_index == b.m_index; }

   private:
    friend class SUnsortedMap;
    const SUnsortedMap* m_map = nullptr;
    int m_index = 0;
  };

 public:
  using typename Base::value_type;
  using iterator = Iterator<value_type>;
  using const_iterator = Iterator<const value_type>;

  SUnsortedMap() noexcept = default;
  SUnsortedMap(std::initializer_list<value_type> entries) : SUnsortedMap() {
    for (const value_type& entry : entries) Add(entry.m_key, entry.m_value);
  }
  SUnsortedMap(const SUnsortedMap& other) : SUnsortedMap() { *this = other; }
  SUnsortedMap(SUnsortedMap&& other) noexcept : SUnsortedMap() { Swap(other); }
  ~SUnsortedMap() override { Clear(); }
  // Clears, then copies in order of insertion. A failure leaves the entries copied so far.
  SUnsortedMap& operator=(const SUnsortedMap& other) {
    if (this == &other) return *this;
    Clear();
    for (const value_type& entry : other) Add(entry.m_key, entry.m_value);
    return *this;
  }
  SUnsortedMap& operator=(SUnsortedMap&& other) noexcept { return Swap(other), *this; }

  // Inserts at the end, or replaces the value of an existing key, which keeps its place. Returns the value
  // in the map.
  V& Add(const K& key, const V& value) {
    auto place = this->FindPlace(key);
    if (place.m_found == nullptr) return *Base::ValueOf(LinkLast(this->MakeEntry(key, value), place));
    return *Base::ValueOf(place.m_found) = value;
  }
  // The value of the key, which is inserted with an empty value when it is absent.
  V& operator[](const K& key) {
    auto place = this->FindPlace(key);
    if (place.m_found == nullptr) return *Base::ValueOf(LinkLast(this->MakeEntry(key), place));
    return *Base::ValueOf(place.m_found);
  }
  // The same, but nothing is inserted: an absent key has the empty value.
  const V& operator[](const K& key) const {
    static const V empty{};
    const V* value = this->Retrieve(key);
    return value != nullptr ? *value : empty;
  }
  // True when there was something to remove. Linear in the number of entries.
  bool Remove(const K& key) {
    Entry* entry = this->FindEntry(key);
    if (entry == nullptr) return false;
    int index = 0;
    while (m_order.GetConst(index) != entry->Payload()) ++index;
    m_order.Remove(index);
    return __STree::Remove(entry);
  }
  // Removes the entry, which must exist; the iterator then stands at the next one.
  bool Remove(iterator& place) {
    Entry* entry = static_cast<Entry*>(m_order.GetConst(place.m_index)) - 1;
    m_order.Remove(place.m_index);
    return __STree::Remove(entry);
  }
  void Clear() {
    __STree::Clear();
    m_order.Clear();
  }
  void Swap(SUnsortedMap& other) noexcept {
    __STree::Swap(other);
    std::swap(m_order, other.m_order);
  }

  iterator begin() { return {this, 0}; }
  iterator end() { return {this, this->m_count}; }
  const_iterator begin() const { return {this, 0}; }
  const_iterator end() const { return {this, this->m_count}; }

 private:
  Entry* LinkLast(Entry* entry, const typename Base::Place& place) {
    try {
      m_order.Add(entry->Payload());
    } catch (...) {
      this->DestroyPayload(entry);
      this->FreeEntry(entry);
      throw;
    }
    this->Link(entry, place);
    return entry;
  }

  STableDumb<void*> m_order;  // the payloads in the order of insertion
};
