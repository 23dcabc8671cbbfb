// Finds the entry of a table by its text in constant time: an index over all texts, made for one merge.
//
// Open addressing over a power of two of places, at most half of them taken; a place holds an entry's
// number plus one. The texts stay in the table.
#pragma once

#include <cstdint>
#include <limits>

#include "qxcore/container/table_dumb.h"
#include "qxcore/core/exception.h"
#include "qxcore/platform/bmp.h"
#include "qxcore/platform/win32.h"

namespace rtf {

// How texts are compared: as they are, or without case.
struct ExactText {
  static WCHAR Fold(WCHAR c) { return c; }
};
struct TextNoCase {
  static WCHAR Fold(WCHAR c) { return platform::ToLowerBmp(c); }
};

template <class Rule>
bool IsEqual(SStringView a, SStringView b) {
  if (a.size() != b.size()) return false;
  for (std::size_t i = 0; i < a.size(); ++i) {
    if (a[i] != b[i] && Rule::Fold(a[i]) != Rule::Fold(b[i])) return false;
  }
  return true;
}

template <class Rule>
std::uint32_t HashOf(SStringView text) {
  std::uint32_t hash = 2166136261u;  // FNV-1a by characters
  for (const WCHAR c : text) hash = (hash ^ Rule::Fold(c)) * 16777619u;
  return hash ^ hash >> 15;
}

template <class Rule>
class TextIndex {
 public:
  // Room for `count` texts; grows on demand. Throws SEOutOfMemory.
  explicit TextIndex(int count) {
    std::int64_t places = 16;
    while (places < std::int64_t{count} * 2) places *= 2;
    MakePlaces(places);
  }

  // The number of the text that equals this one, or -1. `textOf` gives the text of a number.
  template <class TextOf>
  int Find(SStringView text, TextOf textOf) const {
    const Place* places = m_places.GetArray();
    const std::uint32_t hash = HashOf<Rule>(text);
    for (std::uint32_t at = hash & m_mask; places[at].next != 0; at = (at + 1) & m_mask) {
      if (places[at].hash == hash && IsEqual<Rule>(textOf(places[at].next - 1), text)) return places[at].next - 1;
    }
    return -1;
  }
  // Adds a text that is not there yet, under its number.
  void Add(SStringView text, int number) {
    if (std::int64_t{m_count} * 2 > std::int64_t{m_mask}) Grow();
    Put({HashOf<Rule>(text), number + 1});
    ++m_count;
  }

 private:
  struct Place {
    std::uint32_t hash;
    std::int32_t next;  // number + 1; 0 where the place is free
  };

  void MakePlaces(std::int64_t places) {
    if (places > (std::numeric_limits<int>::max)()) throw SEOutOfMemory();
    m_places.GrowTo(static_cast<int>(places));
    for (std::int64_t i = 0; i < places; ++i) m_places.Add({0, 0});
    m_mask = static_cast<std::uint32_t>(places - 1);
  }
  void Put(Place place) {
    Place* places = m_places.GetArray();
    std::uint32_t at = place.hash & m_mask;
    while (places[at].next != 0) at = (at + 1) & m_mask;
    places[at] = place;
  }
  void Grow() {
    STableDumb<Place> old = m_places;
    m_places.Clear();
    MakePlaces((std::int64_t{m_mask} + 1) * 2);
    for (const Place& place : std::as_const(old)) {
      if (place.next != 0) Put(place);
    }
  }

  STableDumb<Place> m_places;
  std::uint32_t m_mask = 0;
  int m_count = 0;
};

}  // namespace rtf
