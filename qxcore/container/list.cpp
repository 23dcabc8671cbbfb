#include "qxcore/container/list.h"

#include <utility>

__SList::~__SList() = default;

__SList& __SList::operator=(const __SList& other) {
  if (this == &other) return *this;
  Clear();
  for (const Node* node = other.m_end->m_next; node != other.m_end; node = node->m_next) {
    Insert(m_end, node->Payload());
  }
  return *this;
}

void* __SList::GetAt(int position) const {
  if (position < 0 || position >= m_count) return nullptr;
  Node* node = m_end;
  if (position < m_count / 2) {
    for (int i = 0; i <= position; ++i) node = node->m_next;
  } else {
    for (int i = m_count; i > position; --i) node = node->m_prev;
  }
  return node->Payload();
}

void __SList::Clear() {
  while (m_count != 0) Erase(m_end->m_next);
}

void __SList::MoveTo(Node* node, Node* before) {
  if (node == before) return;
  Unlink(node);
  LinkBefore(node, before);
}

void __SList::Swap(__SList& other) noexcept {
  if (this == &other) return;
  std::swap(m_count, other.m_count);
  std::swap(m_sentinel, other.m_sentinel);
  for (__SList* list : {this, &other}) {
    if (list->m_count == 0) {
      list->m_sentinel = {&list->m_sentinel, &list->m_sentinel};
    } else {
      list->m_sentinel.m_next->m_prev = &list->m_sentinel;
      list->m_sentinel.m_prev->m_next = &list->m_sentinel;
    }
  }
}
