// Invariants of a red-black tree, which every public operation leaves intact:
//  1. in order, the keys ascend;
//  2. the root is black, and no red entry has a red child;
//  3. every way from the root to a null child passes the same number of black entries.

#include "qxcore/container/tree.h"

#include <utility>

__STree::~__STree() = default;

__STree& __STree::operator=(const __STree& other) {
  if (this == &other) return *this;
  Clear();
  for (Entry* entry = other.GetFirstEntry(); entry != nullptr; entry = Successor(entry)) AddCopy(entry->Payload());
  return *this;
}

// --- search and insertion ---

__STree::Entry* __STree::GetEntry(long key) const {
  return Search([this, key](Entry* entry) { return CompareKey(key, KeyOf(entry->Payload())); });
}

__STree::Place __STree::FindPlace(long key) const {
  return Descend([this, key](Entry* entry) { return CompareKey(key, KeyOf(entry->Payload())); });
}

void* __STree::Find(long key) const {
  Entry* entry = GetEntry(key);
  return entry != nullptr ? entry->Payload() : nullptr;
}

bool __STree::GetVoid(long key, void** payload) {
  Place place = FindPlace(key);
  bool isNew = place.m_found == nullptr;
  if (isNew) {
    place.m_found = AllocEntry();
    Link(place.m_found, place);
  }
  *payload = place.m_found->Payload();
  return isNew;
}

void* __STree::AddCopy(long key, const void* source) {
  void* payload;
  bool isNew = GetVoid(key, &payload);
  if (payload == source) return payload;
  Entry* entry = static_cast<Entry*>(payload) - 1;
  if (!isNew) DestroyPayload(entry);
  try {
    CopyPayload(entry, source);
  } catch (...) {
    Discard(entry);
    throw;
  }
  return payload;
}

void __STree::Link(Entry* entry, const Place& place) {
  *entry = {nullptr, place.m_parent, nullptr, kRed};
  if (place.m_parent == nullptr) {
    m_root = entry;
  } else if (place.m_isLeft) {
    place.m_parent->m_left = entry;
  } else {
    place.m_parent->m_right = entry;
  }
  ++m_count;
  FixAfterInsertion(entry);
}

// --- removal ---

bool __STree::Remove(long key) { return Remove(GetEntry(key)); }

bool __STree::Remove(Entry* entry) {
  if (entry == nullptr) return false;
  Unlink(entry);
  DestroyPayload(entry);
  FreeEntry(entry);
  return true;
}

void __STree::Discard(Entry* entry) {
  Unlink(entry);
  FreeEntry(entry);
}

void __STree::Clear() {
  FreeTree(m_root);
  m_count = 0;
  m_root = nullptr;
}

// The depth of the recursion is the height of the tree: twice the logarithm of the count at most.
void __STree::FreeTree(Entry* entry) {
  while (entry != nullptr) {
    FreeTree(entry->m_left);
    Entry* right = entry->m_right;
    DestroyPayload(entry);
    FreeEntry(entry);
    entry = right;
  }
}

void __STree::Swap(__STree& other) noexcept {
  std::swap(m_count, other.m_count);
  std::swap(m_root, other.m_root);
}

// Lets the parent of `old` (or the root) point to `entry` instead.
void __STree::ReplaceChild(Entry* old, Entry* entry) {
  Entry* parent = old->m_parent;
  if (parent == nullptr) {
    m_root = entry;
  } else if (old == parent->m_left) {
    parent->m_left = entry;
  } else {
    parent->m_right = entry;
  }
}

// Exchanges the places of an entry with two children and its successor, by links and colours, so that
// the payloads stay where they are.
void __STree::SwapPosition(Entry* upper, Entry* successor) {
  bool isChild = successor->m_parent == upper;
  ReplaceChild(upper, successor);
  if (!isChild) ReplaceChild(successor, upper);
  std::swap(*upper, *successor);
  if (isChild) {
    upper->m_parent = successor;
    successor->m_right = upper;
  }
  for (Entry* entry : {upper, successor}) {
    if (entry->m_left != nullptr) entry->m_left->m_parent = entry;
    if (entry->m_right != nullptr) entry->m_right->m_parent = entry;
  }
}

void __STree::Unlink(Entry* entry) {
  if (entry->m_left != nullptr && entry->m_right != nullptr) SwapPosition(entry, Successor(entry));
  Entry* child = entry->m_left != nullptr ? entry->m_left : entry->m_right;
  if (child != nullptr) {
    child->m_parent = entry->m_parent;
    ReplaceChild(entry, child);
    if (entry->m_color == kBlack) FixAfterDelete(child);
  } else {
    // Stands in for the null child that takes its place, while the tree is put right.
    if (entry->m_color == kBlack) FixAfterDelete(entry);
    ReplaceChild(entry, nullptr);
  }
  --m_count;
}

// --- the balance ---

void __STree::RotateLeft(Entry* entry) {
  Entry* right = entry->m_right;
  entry->m_right = right->m_left;
  if (right->m_left != nullptr) right->m_left->m_parent = entry;
  right->m_parent = entry->m_parent;
  ReplaceChild(entry, right);
  right->m_left = entry;
  entry->m_parent = right;
}

void __STree::RotateRight(Entry* entry) {
  Entry* left = entry->m_left;
  entry->m_left = left->m_right;
  if (left->m_right != nullptr) left->m_right->m_parent = entry;
  left->m_parent = entry->m_parent;
  ReplaceChild(entry, left);
  left->m_right = entry;
  entry->m_parent = left;
}

void __STree::FixAfterInsertion(Entry* entry) {
  while (_Color(_Parent(entry)) == kRed) {
    Entry* parent = entry->m_parent;
    Entry* grandparent = parent->m_parent;  // there is one: the root is black
    bool isLeft = parent == grandparent->m_left;
    Entry* uncle = isLeft ? grandparent->m_right : grandparent->m_left;
    if (_Color(uncle) == kRed) {
      parent->m_color = kBlack;
      uncle->m_color = kBlack;
      grandparent->m_color = kRed;
      entry = grandparent;
      continue;
    }
    if (isLeft) {
      if (entry == parent->m_right) {
        RotateLeft(parent);
        parent = entry;
      }
      parent->m_color = kBlack;
      grandparent->m_color = kRed;
      RotateRight(grandparent);
    } else {
      if (entry == parent->m_left) {
        RotateRight(parent);
        parent = entry;
      }
      parent->m_color = kBlack;
      grandparent->m_color = kRed;
      RotateLeft(grandparent);
    }
    break;
  }
  m_root->m_color = kBlack;
}

// The ways through `entry` have one black entry too few.
void __STree::FixAfterDelete(Entry* entry) {
  while (entry != m_root && _Color(entry) == kBlack) {
    Entry* parent = entry->m_parent;
    bool isLeft = entry == parent->m_left;
    Entry* sibling = isLeft ? parent->m_right : parent->m_left;
    if (_Color(sibling) == kRed) {
      sibling->m_color = kBlack;
      parent->m_color = kRed;
      isLeft ? RotateLeft(parent) : RotateRight(parent);
      sibling = isLeft ? parent->m_right : parent->m_left;
    }
    Entry* near = isLeft ? _Left(sibling) : _Right(sibling);
    Entry* far = isLeft ? _Right(sibling) : _Left(sibling);
    if (_Color(near) == kBlack && _Color(far) == kBlack) {
      _SetColor(sibling, kRed);
      entry = parent;
      continue;
    }
    if (_Color(far) == kBlack) {
      near->m_color = kBlack;
      sibling->m_color = kRed;
      isLeft ? RotateRight(sibling) : RotateLeft(sibling);
      far = sibling;
      sibling = near;
    }
    sibling->m_color = parent->m_color;
    parent->m_color = kBlack;
    _SetColor(far, kBlack);
    isLeft ? RotateLeft(parent) : RotateRight(parent);
    entry = m_root;
  }
  _SetColor(entry, kBlack);
}
