// Tables that decode single- and double-byte code pages, filled once from the platform's conversion.
//
// Tables are made on first use, are never freed, and may be read by several threads.
#pragma once

#include <atomic>
#include <cstdint>

#include "qxcore/platform/win32.h"

class SCodePageTable {
 public:
  static constexpr WCHAR kNone = 0xFFFF;  // no character: never the image of a byte

  // The table of a code page, or null when the page cannot be decoded by one: not installed, stateful,
  // or with characters of more than two bytes. Throws SEOutOfMemory.
  static const SCodePageTable* Get(unsigned int codePage);

  bool IsASCIICompatible() const { return m_isASCIICompatible; }    // bytes below 0x80 are themselves
  bool IsLead(unsigned char unit) const { return m_isLead[unit]; }  // the first byte of two
  bool HasLeads() const { return m_hasLeads; }                      // a double-byte page
  // The character of a byte that is no lead byte, or kNone.
  WCHAR Single(unsigned char unit) const { return m_single[unit]; }
  const WCHAR* Singles() const { return m_single; }
  // The 256 characters behind a lead byte, kNone where there is none. Throws SEOutOfMemory.
  const WCHAR* Trails(unsigned char lead) const {
    const WCHAR* trails = m_trails[lead].load(std::memory_order_acquire);
    return trails != nullptr ? trails : MakeTrails(lead);
  }

 private:
  SCodePageTable(unsigned int codePage, bool mayHaveLeads);
  const WCHAR* MakeTrails(unsigned char lead) const;

  unsigned int m_codePage;
  bool m_isASCIICompatible = true;
  bool m_hasLeads = false;
  bool m_isLead[256] = {};
  WCHAR m_single[256];
  mutable std::atomic<const WCHAR*> m_trails[256] = {};
  const SCodePageTable* m_next = nullptr;
};
