// SCRC32: a running CRC-32 as zip, gzip and PNG use it (ISO 3309; polynomial 0xEDB88320, reflected).
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"

class QXCORE_API SCRC32 {
 public:
  // Begins anew: the checksum of no bytes, 0.
  void Reset() { m_value = 0; }
  // Takes `count` further bytes into account.
  void Update(const void* bytes, unsigned long count);
  // The checksum of all bytes since the beginning.
  std::uint32_t GetValue() const { return m_value; }

 private:
  std::uint32_t m_value = 0;
};
