#include "qxcore/stream/encoding/internal/code_page_table.h"

#include <mutex>
#include <new>

#include "qxcore/core/memory.h"
#include "qxcore/platform/interlocked.h"

namespace {

constinit std::atomic<const SCodePageTable*> g_tables{nullptr};
constinit platform::ShortLock g_tablesLock;

// The one character of a byte sequence, or kNone.
WCHAR Image(unsigned codePage, const char* bytes, int count) {
  WCHAR text[4];
  int length = MultiByteToWideChar(codePage, MB_PRECOMPOSED | MB_ERR_INVALID_CHARS, bytes, count, text, 4);
  return length == 1 ? text[0] : SCodePageTable::kNone;
}

// Not every page says which bytes are lead bytes (the EUC pages do not), so the conversion itself is asked: a lead byte
// is no character alone, and makes one together with another byte.
bool IsLeadByte(unsigned codePage, unsigned char byte) {
  const char narrow = static_cast<char>(byte);
  if (IsDBCSLeadByteEx(codePage, byte)) return true;
  if (byte < 0x80 || Image(codePage, &narrow, 1) != SCodePageTable::kNone) return false;
  for (int trail = 0x21; trail < 256; ++trail) {
    const char bytes[2] = {narrow, static_cast<char>(trail)};
    if (Image(codePage, bytes, 2) != SCodePageTable::kNone) return true;
  }
  return false;
}

}  // namespace

SCodePageTable::SCodePageTable(unsigned int codePage, bool mayHaveLeads) : m_codePage(codePage) {
  for (int byte = 0; byte < 256; ++byte) {
    char narrow = static_cast<char>(byte);
    m_isLead[byte] = mayHaveLeads && IsLeadByte(codePage, static_cast<unsigned char>(byte));
    m_hasLeads = m_hasLeads || m_isLead[byte];
    m_single[byte] = m_isLead[byte] ? kNone : Image(codePage, &narrow, 1);
    if (byte < 0x80 && m_single[byte] != byte) m_isASCIICompatible = false;
  }
}

const WCHAR* SCodePageTable::MakeTrails(unsigned char lead) const {
  WCHAR* made = static_cast<WCHAR*>(SMemAlloc(256 * sizeof(WCHAR)));
  for (int trail = 0; trail < 256; ++trail) {
    const char bytes[2] = {static_cast<char>(lead), static_cast<char>(trail)};
    made[trail] = Image(m_codePage, bytes, 2);
  }
  const WCHAR* present = nullptr;
  if (m_trails[lead].compare_exchange_strong(present, made, std::memory_order_acq_rel)) return made;
  SMemFree(made);  // another thread was first
  return present;
}

const SCodePageTable* SCodePageTable::Get(unsigned int codePage) {
  const SCodePageTable* first = g_tables.load(std::memory_order_acquire);
  for (const SCodePageTable* table = first; table != nullptr; table = table->m_next) {
    if (table->m_codePage == codePage) return table;
  }
  CPINFO info;
  bool takesFlags = MultiByteToWideChar(codePage, MB_PRECOMPOSED | MB_ERR_INVALID_CHARS, "A", 1, nullptr, 0) > 0;
  if (!takesFlags || !GetCPInfo(codePage, &info) || info.MaxCharSize > 2) return nullptr;

  SCodePageTable* made = new (SMemAlloc(sizeof(SCodePageTable))) SCodePageTable(codePage, info.MaxCharSize > 1);
  std::lock_guard<platform::ShortLock> lock(g_tablesLock);
  made->m_next = g_tables.load(std::memory_order_relaxed);
  g_tables.store(made, std::memory_order_release);  // two threads may both make one; that does no harm
  return made;
}
