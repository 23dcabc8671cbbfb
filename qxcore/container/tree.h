// __STree: the untyped red-black tree behind all maps. Use SMap, SUnsortedMap or the string maps.
//
// Entries never move: the address of a payload is valid until its own entry is removed, also when
// other entries are. Search, insertion and removal are logarithmic. What a payload is, and how keys
// compare, only the virtual operations know.
//
// One tree is for one thread at a time. Only inserting allocates; failure throws SEOutOfMemory and
// leaves the tree as it was.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/export.h"

class QXCORE_API __STree {
 public:
  // The colour of an entry.
  enum _Redbl : std::int32_t { kRed, kBlack };

  // The head of an entry; the payload follows directly.
  struct Entry {
    // Links to the entries below and above; null for none.
    Entry* m_left;
    Entry* m_parent;
    Entry* m_right;
    _Redbl m_color;  // of the link from above

    // Key and value.
    void* Payload() { return this + 1; }
    const void* Payload() const { return this + 1; }
  };

  int GetCount() const { return m_count; }
  bool IsEmpty() const { return m_count == 0; }

 protected:
  // A place in the order of a tree; no entry means behind the last one.
  class iterator {
   public:
    iterator() = default;
    // Stands at an entry of the tree, or with null behind the last one.
    iterator(const __STree* tree, Entry* entry) : m_tree(tree), m_entry(entry) {}
    // In the order of the keys; Previous from behind the last one returns that.
    void Next() { m_entry = Successor(m_entry); }
    void Previous() { m_entry = m_entry != nullptr ? Predecessor(m_entry) : m_tree->GetLastEntry(); }
    friend bool operator==(const iterator& a, const iterator& b) { return a.m_entry == b.m_entry; }

    const __STree* m_tree = nullptr;  // not owned
    Entry* m_entry = nullptr;         // null behind the last one
  };

  // Where a key is, or where it would be put in.
  struct Place {
    Entry* m_found;   // the entry with the key, or null
    Entry* m_parent;  // else: the entry below which it belongs, null in an empty tree
    bool m_isLeft;    // and on which side
  };

  __STree() noexcept = default;
  __STree(const __STree&) = delete;

  // Frees nothing: the entry operations are the derived class's, which has to call Clear itself.
  virtual ~__STree();
  virtual Entry* AllocEntry() = 0;  // room for a head and a payload; throws SEOutOfMemory
  virtual void FreeEntry(Entry* entry) = 0;
  virtual void DestroyPayload(Entry* entry) = 0;
  virtual void CopyPayload(Entry* entry, const void* source) = 0;  // constructs a copy in the entry
  // Negative, 0 or positive; the keys are what KeyOf returns, or what the operations below were called with.
  virtual int CompareKey(long a, long b) const = 0;
  virtual long KeyOf(const void* payload) const = 0;

  // Clears, then copies every entry in order. A failure leaves the entries copied so far.
  __STree& operator=(const __STree& other);

  // --- search; null or false where the key is absent ---
  Entry* GetEntry(long key) const;
  void* Find(long key) const;
  bool Contains(long key) const { return GetEntry(key) != nullptr; }

  // --- insertion ---
  // The payload with the key in *payload; when there was none, it is inserted, and true comes back: then
  // the caller constructs the payload, or calls Discard.
  bool GetVoid(long key, void** payload);
  // Replaces the payload with the key by a copy, or inserts one. When copying over an old payload fails,
  // its entry is gone. Returns the new payload.
  void* AddCopy(long key, const void* source);
  void* AddCopy(const void* source) { return AddCopy(KeyOf(source), source); }

  // --- removal; true when there was something to remove ---
  bool Remove(long key);
  bool Remove(Entry* entry);  // false for null
  bool Remove(const iterator& place) { return Remove(place.m_entry); }
  void Discard(Entry* entry);  // removes an entry whose payload does not live
  void Clear();

  // --- walking; null at the ends ---
  Entry* GetFirstEntry() const { return GetMinimum(m_root); }
  Entry* GetLastEntry() const { return GetMaximum(m_root); }
  static Entry* Successor(Entry* entry) {
    if (entry->m_right != nullptr) return GetMinimum(entry->m_right);
    Entry* parent = entry->m_parent;
    while (parent != nullptr && entry == parent->m_right) {
      entry = parent;
      parent = parent->m_parent;
    }
    return parent;
  }
  static Entry* Predecessor(Entry* entry) {
    if (entry->m_left != nullptr) return GetMaximum(entry->m_left);
    Entry* parent = entry->m_parent;
    while (parent != nullptr && entry == parent->m_left) {
      entry = parent;
      parent = parent->m_parent;
    }
    return parent;
  }
  // The first and the last entry below (and with) this one; null for null.
  static Entry* GetMinimum(Entry* entry) {
    if (entry == nullptr) return nullptr;
    while (entry->m_left != nullptr) entry = entry->m_left;
    return entry;
  }
  static Entry* GetMaximum(Entry* entry) {
    if (entry == nullptr) return nullptr;
    while (entry->m_right != nullptr) entry = entry->m_right;
    return entry;
  }

  // --- an entry's fields; a null entry has null neighbours and is black ---
  static Entry* _Left(const Entry* entry) { return entry != nullptr ? entry->m_left : nullptr; }
  static Entry* _Right(const Entry* entry) { return entry != nullptr ? entry->m_right : nullptr; }
  static Entry* _Parent(const Entry* entry) { return entry != nullptr ? entry->m_parent : nullptr; }
  static _Redbl _Color(const Entry* entry) { return entry != nullptr ? entry->m_color : kBlack; }
  static void _SetColor(Entry* entry, _Redbl color) {
    if (entry != nullptr) entry->m_color = color;
  }

  // --- the steps that typed trees are made of ---
  // Descends from the root; `compare` returns the order of the wanted key and an entry.
  template <class Compare>
  Place Descend(Compare compare) const {
    Place place{nullptr, nullptr, false};
    Entry* entry = m_root;
    while (entry != nullptr) {
      int order = compare(entry);
      if (order == 0) {
        place.m_found = entry;
        break;
      }
      place.m_parent = entry;
      place.m_isLeft = order < 0;
      entry = place.m_isLeft ? entry->m_left : entry->m_right;
    }
    return place;
  }
  template <class Compare>
  Entry* Search(Compare compare) const {
    Entry* entry = m_root;
    while (entry != nullptr) {
      int order = compare(entry);
      if (order == 0) break;
      entry = order < 0 ? entry->m_left : entry->m_right;
    }
    return entry;
  }
  void Link(Entry* entry, const Place& place);  // puts an entry in where nothing was found
  void Swap(__STree& other) noexcept;           // exchanges the contents; both must be of one type

  std::int32_t m_count = 0;
  Entry* m_root = nullptr;

 private:
  Place FindPlace(long key) const;
  void Unlink(Entry* entry);
  void FreeTree(Entry* entry);
  void ReplaceChild(Entry* old, Entry* entry);
  void SwapPosition(Entry* upper, Entry* successor);
  void RotateLeft(Entry* entry);
  void RotateRight(Entry* entry);
  void FixAfterInsertion(Entry* entry);
  void FixAfterDelete(Entry* entry);
};

static_assert(sizeof(void*) != 4 || (sizeof(__STree) == 12 && sizeof(__STree::Entry) == 16), "the layout is public");
