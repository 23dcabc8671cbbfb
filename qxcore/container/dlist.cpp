#include "qxcore/container/dlist.h"

#include <utility>

SDListItem::~SDListItem() = default;

// --- links ---

void SDList::LinkBefore(SDListItem* item, SDListItem* before) {
  SetNeighbours(item, before != nullptr ? before->m_previous : m_tail, before);
  ++m_count;
}

// Puts the item between two neighbours, null being the ends of the list.
void SDList::SetNeighbours(SDListItem* item, SDListItem* previous, SDListItem* next) {
  item->m_previous = previous;
  item->m_next = next;
  (previous != nullptr ? previous->m_next : m_head) = item;
  (next != nullptr ? next->m_previous : m_tail) = item;
}

SDListItem* SDList::Unlink(SDListItem* item) {
  if (item == nullptr) return nullptr;
  (item->m_previous != nullptr ? item->m_previous->m_next : m_head) = item->m_next;
  (item->m_next != nullptr ? item->m_next->m_previous : m_tail) = item->m_previous;
  item->m_next = nullptr;
  item->m_previous = nullptr;
  --m_count;
  return item;
}

// --- adding, deleting ---

void SDList::Init(SDListItem* item, int flag) {
  if (flag == 1) Done();
  AddAtHead(item);
}

void SDList::Done() {
  while (m_head != nullptr) delete Unlink(m_head);
}

SDListItem* SDList::GetAt(long index) const {
  SDListItem* item = m_head;
  for (; index > 0 && item != nullptr; --index) item = item->m_next;
  return item;
}

void SDList::AddAtHead(SDListItem* item) {
  if (item != nullptr) LinkBefore(item, m_head);
}

void SDList::AddAtTail(SDListItem* item) {
  if (item != nullptr) LinkBefore(item, nullptr);
}

void SDList::AddAt(SDListItem* item, long index) {
  if (item != nullptr) LinkBefore(item, GetAt(index));
}

void SDList::DeleteAtHead() { delete DetachAtHead(); }
void SDList::DeleteAtTail() { delete DetachAtTail(); }
void SDList::DeleteAt(long index) { delete DetachAt(index); }
SDListItem* SDList::DetachAtHead() { return Unlink(m_head); }
SDListItem* SDList::DetachAtTail() { return Unlink(m_tail); }
SDListItem* SDList::DetachAt(long index) { return index >= 0 ? Unlink(GetAt(index)) : nullptr; }

int SDList::ForEach(Visit visit) {
  int count = 0;
  for (SDListItem* item = m_head; item != nullptr;) {
    SDListItem* next = item->m_next;
    if (visit(item) != 0) ++count;
    item = next;
  }
  return count;
}

// --- order ---

void SDList::Swap(long i, long j) {
  if (i < 0 || j < 0) return;
  Swap(GetAt(i), GetAt(j));
}

void SDList::Swap(SDListItem* a, SDListItem* b) {
  if (a == nullptr || b == nullptr || a == b) return;
  if (b->m_next == a) std::swap(a, b);
  SDListItem* beforeA = a->m_previous;
  SDListItem* behindB = b->m_next;
  if (a->m_next == b) {
    SetNeighbours(b, beforeA, a);
    SetNeighbours(a, b, behindB);
  } else {
    SDListItem* behindA = a->m_next;
    SDListItem* beforeB = b->m_previous;
    SetNeighbours(b, beforeA, behindA);
    SetNeighbours(a, beforeB, behindB);
  }
}

void SDList::Sort(Compare compare) { QuickSort(compare, 0, m_count - 1); }

void SDList::QuickSort(Compare compare, long left, long right) {
  if (right <= left || left < 0 || right >= m_count) return;
  SortRange(compare, GetAt(left), GetAt(right), right - left + 1);
}

// Sorts the `count` items from first to last. The items are held by their addresses: a walk from the
// head for each of them would make a partition quadratic.
void SDList::SortRange(Compare compare, SDListItem* first, SDListItem* last, long count) {
  while (count > 1) {
    SDListItem* pivot = last;
    SDListItem* before = first->m_previous;  // what surrounds the range stays in place
    SDListItem* behind = last->m_next;
    SDListItem* place = first;  // where the next smaller item goes
    long smaller = 0;
    for (SDListItem* item = first; item != pivot;) {
      SDListItem* next = item->m_next;
      if (compare(item, pivot) < 0) {
        // After the exchange the item stands at the place, and what stood there at the item's.
        Swap(place, item);
        place = item->m_next;
        ++smaller;
      }
      item = next;
    }
    if (place != pivot) Swap(place, pivot);
    first = before != nullptr ? before->m_next : m_head;
    last = behind != nullptr ? behind->m_previous : m_tail;
    long larger = count - smaller - 1;
    // The smaller part by recursion, so that its depth stays logarithmic.
    if (smaller < larger) {
      SortRange(compare, first, pivot->m_previous, smaller);
      first = pivot->m_next;
      count = larger;
    } else {
      SortRange(compare, pivot->m_next, last, larger);
      first = before != nullptr ? before->m_next : m_head;
      last = pivot->m_previous;
      count = smaller;
    }
  }
}

// --- positions ---

SDListItem* SDListIterator::Skip(long n) {
  for (; n > 0 && m_current != nullptr; --n) Next();
  for (; n < 0 && m_current != nullptr; ++n) Previous();
  return m_current;
}

SDListItem* SDListIterator::DeleteCurrent() {
  SDListItem* deleted = m_current;
  Next();
  delete m_list->Unlink(deleted);
  return m_current;
}

void SXDList::AddBefore(SDListItem* reference, SDListItem* item) {
  if (reference != nullptr && item != nullptr) LinkBefore(item, reference);
}

void SXDList::AddAfter(SDListItem* reference, SDListItem* item) {
  if (reference != nullptr && item != nullptr) LinkBefore(item, reference->GetNext());
}

void SXDList::DeleteBefore(SDListItem* reference) { delete DetachBefore(reference); }
void SXDList::DeleteAfter(SDListItem* reference) { delete DetachAfter(reference); }
void SXDList::Delete(SDListItem* item) { delete Detach(item); }
SDListItem* SXDList::DetachBefore(SDListItem* reference) { return Unlink(GetBefore(reference)); }
SDListItem* SXDList::DetachAfter(SDListItem* reference) { return Unlink(GetAfter(reference)); }
SDListItem* SXDList::Detach(SDListItem* item) { return Unlink(item); }

SDListItem* SXDList::GetBefore(SDListItem* reference) const {
  return reference != nullptr ? reference->GetPrevious() : nullptr;
}

SDListItem* SXDList::GetAfter(SDListItem* reference) const {
  return reference != nullptr ? reference->GetNext() : nullptr;
}
