// What was read from the registry and is still true: answers by name, and neighbours in an enumeration.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "qxcore/platform/win32.h"

namespace platform {

using KeyId = std::int64_t;  // never used again for another key

// Names are distinguished by their upper-case letters. The bytes are in the order of the code units, so that
// comparing them byte by byte compares the names.
std::string FoldRegistryName(std::u16string_view name);

// Answers by key and name, exactly as they were asked for. `SizeOf` is the memory of a content beside the object
// itself.
template <class Content, std::size_t (*SizeOf)(const Content&)>
class RegistryCache {
 public:
  // The answer of this generation, or null. Good until the next call of Keep.
  const Content* Find(KeyId key, std::u16string_view name, std::uint64_t generation) const {
    const auto found = m_entries.find(PlaceView{key, name});
    return found != m_entries.end() && found->second.generation == generation ? &found->second.content : nullptr;
  }
  // Takes an answer in, and lets all others go when they would be too much.
  const Content& Keep(KeyId key, std::u16string_view name, std::uint64_t generation, Content content) {
    const std::size_t bytes = kEntryBytes + name.size() * sizeof(WCHAR) + SizeOf(content);
    if (m_bytes + bytes > kMostBytes) {
      m_entries.clear();
      m_bytes = 0;
    }
    auto [at, isNew] = m_entries.try_emplace(Place{key, std::u16string(name)});
    if (!isNew) m_bytes -= at->second.bytes;
    at->second = {generation, bytes, std::move(content)};
    m_bytes += bytes;
    return at->second.content;
  }

 private:
  static constexpr std::size_t kMostBytes = 16u << 20;
  static constexpr std::size_t kEntryBytes = 128;  // of the table's node, roughly

  struct Entry {
    std::uint64_t generation = 0;
    std::size_t bytes = 0;
    Content content{};
  };
  struct Place {
    KeyId key;
    std::u16string name;
  };
  struct PlaceView {
    KeyId key;
    std::u16string_view name;
  };
  struct Hash {
    using is_transparent = void;
    std::size_t operator()(const PlaceView& place) const {
      return std::hash<std::u16string_view>()(place.name) * 31 + static_cast<std::size_t>(place.key);
    }
    std::size_t operator()(const Place& place) const { return (*this)(PlaceView{place.key, place.name}); }
  };
  struct Equal {
    using is_transparent = void;
    template <class A, class B>
    bool operator()(const A& a, const B& b) const {
      return a.key == b.key && a.name == b.name;
    }
  };

  std::unordered_map<Place, Entry, Hash, Equal> m_entries;
  std::size_t m_bytes = 0;
};

// Neighbours in an enumeration, which is asked for one by one.
template <class Content>
class RegistryWindow {
 public:
  // The item of this index, or null behind the last one; `read` is asked for the items from an index on when they
  // are not here. Good until the next call.
  template <class Read>
  const Content* At(KeyId key, DWORD index, std::uint64_t generation, Read read) {
    if (m_generation != generation || m_key != key || index < m_first || index - m_first >= m_items.size()) {
      m_items.clear();
      m_generation = generation;
      m_key = key;
      m_first = index;
      read(m_items);
    }
    return m_items.empty() ? nullptr : &m_items[index - m_first];
  }

 private:
  std::uint64_t m_generation = 0;
  KeyId m_key = 0;
  DWORD m_first = 0;
  std::vector<Content> m_items;
};

}  // namespace platform
