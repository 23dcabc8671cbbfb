// Owning doubly linked lists: the untyped __SList and its typed shell SList<T>.
//
// Nodes never move: the address of an element is valid until it is erased. Inserting and erasing are
// O(1), access by position is O(n). Not for lists of objects that carry their own links: see SDList.
// Only inserting allocates; a failure throws SEOutOfMemory and leaves the list as it was.
//
// Threads: one list is for one thread at a time; different lists are independent.
#pragma once

#include <cstddef>
#include <cstdint>
#include <initializer_list>
#include <iterator>
#include <new>
#include <utility>

#include "qxcore/container/node_pool.h"
#include "qxcore/platform/export.h"

// The untyped list: nodes whose payload only the virtual operations know.
class QXCORE_API __SList {
 public:
  struct Node {
    // Neighbours in the ring.
    Node* m_next;
    Node* m_prev;
    // The element.
    void* Payload() { return this + 1; }
    const void* Payload() const { return this + 1; }
  };

  int GetCount() const { return m_count; }
  bool IsEmpty() const { return m_count == 0; }

 protected:
  __SList() noexcept : m_end(&m_sentinel), m_sentinel{&m_sentinel, &m_sentinel} {}
  __SList(const __SList&) = delete;

  // Frees nothing: the element operations are the derived class's, which has to call Clear itself.
  virtual ~__SList();

  virtual Node* AllocNode() = 0;                   // room for a node and its payload; throws SEOutOfMemory
  virtual void FreeNode(Node* node) = 0;           // frees the room; the payload has ended
  virtual void DestroyPayload(void* payload) = 0;  // ends the payload's life
  virtual void CopyPayload(Node* node, const void* source) = 0;  // constructs a copy in the node

  // Clears the list, then copies every payload in order. A failure leaves the elements copied so far.
  __SList& operator=(const __SList& other);

  // Payload of the first or last node; null in an empty list.
  void* GetFront() const { return m_count != 0 ? m_end->m_next->Payload() : nullptr; }
  void* GetBack() const { return m_count != 0 ? m_end->m_prev->Payload() : nullptr; }
  // Payload at a position, 0 being the first; null out of range.
  void* GetAt(int position) const;

  // A new node with a copy of the payload in front of `before`; the end node appends.
  Node* Insert(Node* before, const void* source) { return InsertInto(*this, before, source); }
  void Erase(Node* node) { EraseFrom(*this, node); }
  void Clear();
  void MoveTo(Node* node, Node* before);  // relinks the node in front of `before`
  void Swap(__SList& other) noexcept;     // exchanges the contents; both must be of one type

  std::int32_t m_count = 0;  // elements
  Node* m_end;               // &m_sentinel
  Node m_sentinel;           // links the first and the last node into a ring

  // The same for a list whose class is known, so that its element operations need no virtual call.
  template <class List>
  static Node* InsertInto(List& list, Node* before, const void* source) {
    Node* node = list.AllocNode();
    try {
      list.CopyPayload(node, source);
    } catch (...) {
      list.FreeNode(node);
      throw;
    }
    LinkBefore(node, before);
    ++list.m_count;
    return node;
  }
  template <class List>
  static void EraseFrom(List& list, Node* node) {
    Unlink(node);
    --list.m_count;
    list.DestroyPayload(node->Payload());
    list.FreeNode(node);
  }

 private:
  static void LinkBefore(Node* node, Node* before) {
    node->m_next = before;
    node->m_prev = before->m_prev;
    before->m_prev->m_next = node;
    before->m_prev = node;
  }
  static void Unlink(Node* node) {
    node->m_prev->m_next = node->m_next;
    node->m_next->m_prev = node->m_prev;
  }
};

static_assert(sizeof(void*) != 4 || sizeof(__SList) == 20, "the layout is public");

// A list of T. `Allocator` supplies the memory of the nodes (see SNodePools). T needs to be copyable; its
// destructor must not throw.
template <class T, class Allocator = SNodePools>
class SList : public __SList {
  struct TypedNode : Node {
    T m_value;
  };
  static_assert(alignof(T) <= sizeof(Node), "the payload follows the links directly");

  template <class Value>
  class Iterator {
   public:
    using iterator_category = std::bidirectional_iterator_tag;
    using value_type = T;
    using difference_type = std::ptrdiff_t;
    using pointer = Value*;
    using reference = Value&;

    Iterator() = default;
    explicit Iterator(Node* node) : m_node(node) {}
    operator Iterator<const T>() const { return Iterator<const T>(m_node); }
    Value& operator*() const { return *static_cast<T*>(m_node->Payload()); }
    Value* operator->() const { return static_cast<T*>(m_node->Payload()); }
    Iterator& operator++() { return m_node = m_node->m_next, *this; }
    Iterator& operator--() { return m_node = m_node->m_prev, *this; }
    Iterator operator++(int) { return Iterator(std::exchange(m_node, m_node->m_next)); }
    Iterator operator--(int) { return Iterator(std::exchange(m_node, m_node->m_prev)); }
    friend bool operator==(Iterator a, Iterator b) { return a.m_node == b.m_node; }

   private:
    friend class SList;
    Node* m_node = nullptr;
  };

 public:
  using value_type = T;
  using reference = T&;
  using const_reference = const T&;
  using size_type = std::size_t;
  using difference_type = std::ptrdiff_t;
  using iterator = Iterator<T>;
  using const_iterator = Iterator<const T>;

  SList() noexcept = default;
  SList(std::initializer_list<T> values) : SList() {
    for (const T& value : values) AddBack(value);
  }
  SList(const SList& other) : SList() { __SList::operator=(other); }
  SList(SList&& other) noexcept : SList() { Swap(other); }
  ~SList() override { __SList::Clear(); }
  // Clears, then copies in order; a failure leaves what was copied so far.
  SList& operator=(const SList& other) { return __SList::operator=(other), *this; }
  SList& operator=(SList&& other) noexcept { return Swap(other), *this; }

  // --- access; the list must hold the element that is asked for ---
  T& GetFront() { return *static_cast<T*>(__SList::GetFront()); }
  const T& GetFront() const { return *static_cast<const T*>(__SList::GetFront()); }
  T& GetBack() { return *static_cast<T*>(__SList::GetBack()); }
  const T& GetBack() const { return *static_cast<const T*>(__SList::GetBack()); }
  T& GetAt(int position) { return *static_cast<T*>(__SList::GetAt(position)); }
  const T& GetAt(int position) const { return *static_cast<const T*>(__SList::GetAt(position)); }

  iterator begin() { return iterator(m_end->m_next); }
  iterator end() { return iterator(m_end); }
  const_iterator begin() const { return const_iterator(m_end->m_next); }
  const_iterator end() const { return const_iterator(m_end); }
  auto rbegin() { return std::reverse_iterator(end()); }
  auto rend() { return std::reverse_iterator(begin()); }
  auto rbegin() const { return std::reverse_iterator(end()); }
  auto rend() const { return std::reverse_iterator(begin()); }
  std::size_t size() const { return static_cast<std::size_t>(m_count); }
  bool empty() const { return m_count == 0; }

  // --- modification; `value` may be an element of this list ---
  iterator AddFront(const T& value) { return iterator(InsertInto(*this, m_end->m_next, &value)); }
  iterator AddBack(const T& value) { return iterator(InsertInto(*this, m_end, &value)); }
  iterator Insert(const_iterator before, const T& value) { return iterator(InsertInto(*this, before.m_node, &value)); }
  void push_back(const T& value) { AddBack(value); }  // for std::back_inserter
  // Removes the element and returns the place behind it.
  iterator Erase(const_iterator place) {
    iterator next(place.m_node->m_next);
    EraseFrom(*this, place.m_node);
    return next;
  }
  void RemoveFront() { EraseFrom(*this, m_end->m_next); }  // the list must not be empty
  void RemoveBack() { EraseFrom(*this, m_end->m_prev); }
  void Clear() { __SList::Clear(); }
  // Moves the element without copying it; iterators stay valid.
  void MoveToFront(const_iterator place) { MoveTo(place.m_node, m_end->m_next); }
  void MoveToBack(const_iterator place) { MoveTo(place.m_node, m_end); }
  void Swap(SList& other) noexcept { __SList::Swap(other); }

 protected:
  friend class __SList;
  Node* AllocNode() final { return static_cast<Node*>(Allocator::Alloc(sizeof(TypedNode), alignof(TypedNode))); }
  void FreeNode(Node* node) final { Allocator::Free(node, sizeof(TypedNode), alignof(TypedNode)); }
  void DestroyPayload(void* payload) final { static_cast<T*>(payload)->~T(); }
  void CopyPayload(Node* node, const void* source) final { new (node->Payload()) T(*static_cast<const T*>(source)); }
};
