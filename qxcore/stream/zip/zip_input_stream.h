// SZipInputStream: reads the entries of a zip archive one after the other from any stream.
//
// Each entry is found through its local header, in the order of the archive; the central directory behind
// them is not looked at. GetNextEntry goes to an entry, whose data the stream then delivers. Sizes are checked
// against what the archive says of them; checksums are not, for who wants only a part of an entry does
// not pay for the rest: compare GetCRC with the entry's when all of it was read. Damage throws
// SEZipException, an archive that ends too early SEEOFException; after either the stream is of no
// more use. GetError says whether the source failed. Threads: a stream and its source belong to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/stream/input_pushback_stream.h"
#include "qxcore/stream/zip/crc32.h"
#include "qxcore/stream/zip/inflater_input_stream.h"
#include "qxcore/stream/zip/zip_entry.h"

class QXCORE_API SZipInputStream : public SInflaterInputStream {
  QXCORE_DECLARE_CLASS(SZipInputStream)

  // Reads from `in`, which must stay alive and stand at a local header, in an archive at its start; the second
  // form deletes it at the end when `owns` is set. Throws SEOutOfMemory.
  explicit SZipInputStream(SInputStream& in);
  SZipInputStream(SInputStream* in, bool owns);

  // Goes to the next entry, over what is left of the present one. Null when no local header follows: at the
  // central directory, and in front of anything else that is no entry. The entry is the stream's own and changes
  // with the next call. Throws SEZipException for entries that cannot be read: "encrypted ZIP entry not
  // supported", "only DEFLATED entries can have EXT descriptor", "missing entry name", "ZIP64 entry not
  // supported" (sizes of 4 GB and more).
  SZipEntry* GetNextEntry();
  // Reads the present entry to its end; nothing when none is open.
  void CloseEntry();

  int Read() override;
  // Data of the present entry, as much as is asked for but at its end; 0 there, and when no entry is open.
  // Throws SEZipException: "invalid compression method" (neither stored nor deflated), "unexpected EOF" in
  // stored data, "Invalid ZLIB data format" in deflated data, and, when the sizes are not those that the archive
  // tells, "invalid entry size", "invalid entry compressed size", "invalid EXT descriptor signature".
  unsigned long Read(void* buffer, unsigned long count) override;
  unsigned long Available() override;
  // 1 when the present entry was read to its end, and when no entry is open.
  int IsEOF() override { return !m_isOpen; }

  // Where the archive's next record stands, counted from where the stream began: the next local header, or what
  // was met in its place. Within the data of an entry, where that data begins.
  std::int64_t GetPosition() const { return m_position; }
  // CRC-32 of the data of the present entry, as far as it was read.
  std::uint32_t GetCRC() const { return m_crc.GetValue(); }

 protected:
  // Reads a local header into the entry; false when what follows is no header; it stays in the stream.
  bool ReadLOC();
  // Behind deflated data: pushes back what was read too far, reads the descriptor, checks the sizes.
  void ReadEnd();
  // Throws SEEOFException when fewer bytes follow.
  void ReadFully(void* buffer, unsigned long count);

 private:
  unsigned long ReadStored(unsigned char* buffer, unsigned long count);
  unsigned long ReadDeflated(unsigned char* buffer, unsigned long count);
  void ReadName(unsigned length);
  void CheckNotBeyond() const;

  SInputPushbackStream m_source;
  SZipEntry m_entry;
  std::int64_t m_position = 0;
  std::uint64_t m_remaining = 0;  // of a stored entry
  SCRC32 m_crc;
  bool m_isOpen = false;
};
