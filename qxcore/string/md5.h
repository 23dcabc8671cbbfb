// MD5 message digest (RFC 1321). Not for security: it is a fingerprint of contents.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/string/string.h"

// Digests bytes that come in pieces.
class QXCORE_API SMd5 {
 public:
  SMd5() noexcept;
  // Appends bytes to the message.
  void Add(const void* bytes, std::size_t count) noexcept;
  // Ends the message and writes the 16 bytes of the digest; the object must not be used further.
  void Finish(unsigned char digest[16]) noexcept;

 private:
  std::uint32_t m_state[4];
  std::uint64_t m_bytes = 0;
  unsigned char m_block[64];
};

// The digest of the string's characters as little-endian 16-bit units, terminator excluded, as 32
// lower-case hexadecimal digits.
QXCORE_API SString MD5(const SString& text);
