#include "qxcore/stream/zip/crc32.h"

#include <zlib.h>

#include <algorithm>

void SCRC32::Update(const void* bytes, unsigned long count) {
  constexpr unsigned long kLargestPiece = 0x40000000;  // zlib counts in 32 bits
  const auto* from = static_cast<const unsigned char*>(bytes);
  while (count > 0) {
    const unsigned long piece = std::min(count, kLargestPiece);
    m_value = static_cast<std::uint32_t>(crc32(m_value, from, static_cast<uInt>(piece)));
    from += piece;
    count -= piece;
  }
}
