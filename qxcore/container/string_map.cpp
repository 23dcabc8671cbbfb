#include "qxcore/container/string_map.h"

#include <new>

#include "qxcore/container/internal/list_escape.h"

const SStringMap SStringMap::null;
const SStringMapNoCase SStringMapNoCase::null;
const SStringUnsortedMap SStringUnsortedMap::null;
const SStringUnsortedMapNoCase SStringUnsortedMapNoCase::null;

// --- the pool ---

constinit SFixedAlloc* SStringMapAllocator::m_pool = nullptr;
SFixedAlloc& SStringMapAllocator::m_Nodes = SStringMapAllocator::Nodes();

SFixedAlloc& SStringMapAllocator::MakePool() {
  alignas(SFixedAlloc) static std::byte storage[sizeof(SFixedAlloc)];
  constexpr unsigned kElementSize = sizeof(__STree::Entry) + 2 * sizeof(SString);
  m_pool = new (storage) SFixedAlloc(kElementSize, 128, WTEXT("SStringMapAllocator"), nullptr);
  return *m_pool;
}

// --- the list form ---

void SMapListFormat::Write(const SString& key, const SString& value) {
  if (!m_isFirst) m_text += m_item;
  m_isFirst = false;
  AppendEscaped(m_text, key.View(), m_pair, m_escape);
  m_text += m_pair;
  AppendEscaped(m_text, value.View(), m_item, m_escape);
}

namespace {

bool IsEscape(WCHAR c, const WCHAR* escapes) {
  for (; escapes != nullptr && *escapes != 0; ++escapes) {
    if (*escapes == c) return true;
  }
  return false;
}

// Reads up to the separator or the end of the text, without its escapes; returns where it stopped.
const WCHAR* ReadEscaped(const WCHAR* at, WCHAR separator, const WCHAR* escapes, SString* part) {
  *part = SString::null;
  const WCHAR* run = at;
  for (; *at != 0 && *at != separator; ++at) {
    if (!IsEscape(*at, escapes) || at[1] == 0) continue;
    *part += SStringView(run, static_cast<std::size_t>(at - run));
    run = ++at;
  }
  *part += SStringView(run, static_cast<std::size_t>(at - run));
  return at;
}

}  // namespace

bool SMapListFormat::Read(const WCHAR** at, WCHAR item, WCHAR pair, const WCHAR* escapes, SString* key, SString* value,
                          bool* hasValue) {
  if (**at == 0) return false;
  const WCHAR* end = ReadEscaped(*at, pair, escapes, key);
  *value = SString::null;
  *hasValue = *end != 0;
  if (*hasValue) end = ReadEscaped(end + 1, item, escapes, value);
  *at = *end != 0 ? end + 1 : end;
  return true;
}
