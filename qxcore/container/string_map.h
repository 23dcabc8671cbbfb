// Maps from text to text: SStringMap, SStringMapNoCase and the two that keep the order of insertion.
//
// SStringMap iterates by code unit (upper-case letters before lower-case ones). The NoCase forms find
// keys whatever their case, by the one-to-one lower-case mapping, and order by it. Values are always
// compared with case. Entries come from one pool (see fixed_alloc.h); one map is for one thread.
#pragma once

#include <concepts>
#include <type_traits>

#include "qxcore/container/map.h"
#include "qxcore/core/fixed_alloc.h"
#include "qxcore/string/string.h"
#include "qxcore/string/string_buffer.h"

// The entries of all string maps.
class QXCORE_API SStringMapAllocator {
 public:
  static SFixedAlloc& m_Nodes;  // "SStringMapAllocator", 128 entries a block; never destroyed

  // As an allocator of SMap; the sizes are those of an entry.
  static void* Alloc(std::size_t, std::size_t) { return Nodes().Alloc(); }
  static void Free(void* node, std::size_t, std::size_t) noexcept { Nodes().Free(node); }

 private:
  static SFixedAlloc& Nodes() { return m_pool != nullptr ? *m_pool : MakePool(); }
  static SFixedAlloc& MakePool();

  static SFixedAlloc* m_pool;  // for static objects of other files, which may come before m_Nodes
};

// Writes and reads the flat text form of a map.
class QXCORE_API SMapListFormat {
 public:
  // The separators between entries and between key and value, and what makes either literal.
  SMapListFormat(WCHAR item, WCHAR pair, WCHAR escape) : m_item(item), m_pair(pair), m_escape(escape) {}

  // Appends one entry, and the item separator before it unless it is the first.
  void Write(const SString& key, const SString& value);
  SString Take() { return m_text.Detach(); }

  // Reads the next entry at *at and moves *at behind it and its item separator; false at the end.
  // *hasValue says whether there was a pair separator. `escapes` are the escape characters, or null.
  static bool Read(const WCHAR** at, WCHAR item, WCHAR pair, const WCHAR* escapes, SString* key, SString* value,
                   bool* hasValue);

 private:
  SStringBuffer m_text{256};
  WCHAR m_item, m_pair, m_escape;
  bool m_isFirst = true;
};

// One of the four string maps, or a class derived from one.
template <class Map>
concept SIsStringMap = requires {
  typename Map::string_map_tag;
};

// What the four string maps add to their tree. `Map` is SMap or SUnsortedMap of strings.
template <class Map>
class SStringMapShell : public Map {
 public:
  // Tells the string maps from other types.
  using string_map_tag = void;
  using Map::Map;
  using Map::operator=;

  // The entries of another string map of any kind, in its order.
  template <class Other>
  requires(!std::derived_from<Other, Map>) SStringMapShell& operator=(const Other& other) {
    this->Clear();
    return *this += other;
  }
  // Adds the entries of any string map, replacing the values of keys that are there.
  template <SIsStringMap Other>
  SStringMapShell& operator+=(const Other& other) {
    if (static_cast<const void*>(this) == static_cast<const void*>(&other)) return *this;
    for (const auto& [key, value] : other) this->Add(key, value);
    return *this;
  }
  // The map as one text: key, pair separator, value, for each entry, with item separators between them.
  // An escape character is put before every pair separator in a key, every item separator in a value,
  // and every escape character in both. It has to differ from the separators; 0 for none. An empty map
  // gives an empty text, and so no entry whose key and value are empty gives one.
  SString GetAsList(WCHAR itemSeparator, WCHAR pairSeparator, WCHAR escape) const {
    SMapListFormat list(itemSeparator, pairSeparator, escape);
    for (const auto& [key, value] : *this) list.Write(key, value);
    return list.Take();
  }

  // Adds the entries of a list as GetAsList makes it:
  //   list = [item {itemSeparator item}]   item = key [pairSeparator value]
  // A key ends at the first pair separator, a value at the next item separator, unless a character of
  // `escapes` (null: none) stands in front, which takes the character behind it as it is; alone at the
  // end of the list it stands for itself. Item separators in a key and pair separators in a value are
  // ordinary characters. What follows the last item separator without a pair separator is a key with the
  // value `defaultValue`; when it is empty there is no item.
  // A key that is in the map gets the new value when `replace` is not 0, else it keeps its own.
  // Returns the number of items read. A failure leaves the entries added so far.
  int AddFromList(const WCHAR* list, const WCHAR* defaultValue, WCHAR itemSeparator, WCHAR pairSeparator,
                  const WCHAR* escapes, int replace) {
    SString text(list);  // the list may be a value of this map
    SString standard(defaultValue);
    SString key, value;
    bool hasValue;
    int items = 0;
    for (const WCHAR* at = text;
         SMapListFormat::Read(&at, itemSeparator, pairSeparator, escapes, &key, &value, &hasValue); ++items) {
      if (replace != 0 || !this->Contains(key)) this->Add(key, hasValue ? value : standard);
    }
    return items;
  }
  // The inverse of GetAsList with the same three characters.
  int AddFromList(const WCHAR* list, WCHAR itemSeparator, WCHAR pairSeparator, WCHAR escape) {
    const WCHAR escapes[] = {escape, 0};
    return AddFromList(list, nullptr, itemSeparator, pairSeparator, escapes, 1);
  }
};

// Equal counts, and every key of `a` is found in `b`, by b's comparison, with an equal value; so with maps
// of different kinds a == b is not always b == a.
template <SIsStringMap A, SIsStringMap B>
bool operator==(const A& a, const B& b) {
  if (a.GetCount() != b.GetCount()) return false;
  for (const auto& [key, value] : a) {
    const SString* found = b.Retrieve(key);
    if (found == nullptr || SAscStrCas::Compare(value, *found) != 0) return false;
  }
  return true;
}

class QXCORE_API SStringMap : public SStringMapShell<SMap<SString, SString, SAscStrCas, SStringMapAllocator>> {
 public:
  using SStringMapShell::SStringMapShell;
  using SStringMapShell::operator=;
  static const SStringMap null;  // always empty
};

// The same without regard to case.
class QXCORE_API SStringMapNoCase : public SStringMapShell<SMap<SString, SString, SAscStrNoC, SStringMapAllocator>> {
 public:
  using SStringMapShell::SStringMapShell;
  using SStringMapShell::operator=;
  static const SStringMapNoCase null;  // always empty
};

// In the order in which the keys came; see SUnsortedMap.
class QXCORE_API SStringUnsortedMap
    : public SStringMapShell<SUnsortedMap<SString, SString, SStringMapAllocator, SAscStrCas>> {
 public:
  using SStringMapShell::SStringMapShell;
  using SStringMapShell::operator=;
  static const SStringUnsortedMap null;  // always empty
};

// The same without regard to case.
class QXCORE_API SStringUnsortedMapNoCase
    : public SStringMapShell<SUnsortedMap<SString, SString, SStringMapAllocator, SAscStrNoC>> {
 public:
  using SStringMapShell::SStringMapShell;
  using SStringMapShell::operator=;
  static const SStringUnsortedMapNoCase null;  // always empty
};

static_assert(sizeof(void*) != 4 || (sizeof(SStringMap) == 12 && sizeof(SStringUnsortedMap) == 16),
              "the layout is public");
