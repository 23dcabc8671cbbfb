// SDList: a doubly linked list of objects that carry their own links.
//
// The elements derive from SDListItem; the list owns them and deletes them through their virtual
// destructor. An item is in one list at a time. Nothing here allocates or throws. Null items and
// positions out of range are ignored or return null. Access by position walks the list.
//
// For one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SDList;

class QXCORE_API SDListItem {
 public:
  SDListItem() = default;
  SDListItem(const SDListItem&) {}  // links are not copied
  SDListItem& operator=(const SDListItem&) { return *this; }
  virtual ~SDListItem();

  // The neighbours in the list; null at its ends and outside of a list.
  SDListItem* GetNext() const { return m_next; }
  SDListItem* GetPrevious() const { return m_previous; }

 private:
  friend class SDList;
  SDListItem* m_next = nullptr;
  SDListItem* m_previous = nullptr;
};

// A list that links items which carry their links themselves, and owns them.
class QXCORE_API SDList {
 public:
  using Visit = int (*)(SDListItem* item);                // what ForEach calls
  using Compare = int (*)(SDListItem* a, SDListItem* b);  // negative when a comes before b

  SDList() = default;
  SDList(const SDList&) = delete;
  SDList& operator=(const SDList&) = delete;
  ~SDList() { Done(); }  // deletes every item

  // With flag 1 deletes every item first; then adds the item, if any, at the head.
  void WINAPI Init(SDListItem* item, int flag);
  void WINAPI Done();  // deletes every item

  int GetCount() const { return m_count; }
  // The ends; null in an empty list.
  SDListItem* GetHead() const { return m_head; }
  SDListItem* GetTail() const { return m_tail; }
  // The item that is `index` steps behind the head; the head for an index below 1. Null when the list is
  // shorter.
  SDListItem* WINAPI GetAt(long index) const;

  // The list owns the item from then on; null is ignored.
  void WINAPI AddAtHead(SDListItem* item);
  void WINAPI AddAtTail(SDListItem* item);
  // The item becomes the element at the index; at the head for an index below 1, at the tail for one that
  // is not below the count.
  void WINAPI AddAt(SDListItem* item, long index);

  // Nothing happens in an empty list.
  void WINAPI DeleteAtHead();
  void WINAPI DeleteAtTail();
  void WINAPI DeleteAt(long index);  // an index outside of the list is ignored
  // Gives the item to the caller, who owns it then; null when there is none.
  SDListItem* WINAPI DetachAtHead();
  SDListItem* WINAPI DetachAtTail();
  SDListItem* WINAPI DetachAt(long index);

  // Calls `visit` for every item from head to tail; no result stops it. The call may delete its item, but
  // not the one behind. Returns the number of calls that did not return 0.
  int WINAPI ForEach(Visit visit);

  // Exchange the places of two items.
  void WINAPI Swap(long i, long j);  // an index outside of the list is ignored
  void WINAPI Swap(SDListItem* a, SDListItem* b);

  // Quicksort with the last item as pivot: n log n comparisons for a list in random order, n * n / 2 for
  // one that is in order already. Equal items may change places.
  void WINAPI Sort(Compare compare);

  void WINAPI AssertValid() const {}  // checks are compiled out

 protected:
  // Sorts the items from index left to index right.
  void QuickSort(Compare compare, long left, long right);
  friend class SDListIterator;
  void LinkBefore(SDListItem* item, SDListItem* before);  // null: at the tail
  SDListItem* Unlink(SDListItem* item);                   // returns the item

 private:
  void SortRange(Compare compare, SDListItem* first, SDListItem* last, long count);
  void SetNeighbours(SDListItem* item, SDListItem* previous, SDListItem* next);

  SDListItem* m_head = nullptr;
  SDListItem* m_tail = nullptr;
  std::int32_t m_count = 0;
};

static_assert(sizeof(void*) != 4 || (sizeof(SDList) == 12 && sizeof(SDListItem) == 12), "the layout is public");

// A position in an SDList. Beyond either end there is no current item, Next and Previous stay there, and
// First and Last come back.
class QXCORE_API SDListIterator {
 public:
  // Begins at the item that the list's GetAt returns for the index.
  explicit SDListIterator(SDList& list, long index = 0) : m_list(&list), m_current(list.GetAt(index)) {}

  SDListItem* GetCurrent() const { return m_current; }  // null beyond either end
  // Move, and return the item at the new position, or null.
  SDListItem* First() { return m_current = m_list->GetHead(); }
  SDListItem* Last() { return m_current = m_list->GetTail(); }
  SDListItem* Next() { return m_current = m_current != nullptr ? m_current->GetNext() : nullptr; }
  SDListItem* Previous() { return m_current = m_current != nullptr ? m_current->GetPrevious() : nullptr; }
  SDListItem* Skip(long n);  // n items on, or back for a negative n
  // Deletes the current item; the next one becomes the current one, and is given.
  SDListItem* DeleteCurrent();

 private:
  SDList* m_list;
  SDListItem* m_current;
};

// An SDList with operations relative to an item of the list. A null reference item is ignored (the new
// item then stays the caller's), and so is a missing neighbour.
class QXCORE_API SXDList : public SDList {
 public:
  // The list owns the item from then on.
  void AddBefore(SDListItem* reference, SDListItem* item);
  void AddAfter(SDListItem* reference, SDListItem* item);
  void DeleteBefore(SDListItem* reference);  // deletes the item in front of it
  void DeleteAfter(SDListItem* reference);   // deletes the item behind it
  void Delete(SDListItem* item);             // deletes the item itself
  // Give the item to the caller, who owns it then; null when there is none.
  SDListItem* DetachBefore(SDListItem* reference);
  SDListItem* DetachAfter(SDListItem* reference);
  SDListItem* Detach(SDListItem* item);
  SDListItem* GetBefore(SDListItem* reference) const;
  SDListItem* GetAfter(SDListItem* reference) const;
};
