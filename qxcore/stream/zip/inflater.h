// SInflater: decompresses deflate data (RFC 1951), raw or wrapped as zlib data (RFC 1950), piece by piece.
//
// The input is not copied: what SetInput was given must stay where it is until it is used up or replaced.
// Failures throw SEZipException, or SEOutOfMemory; the inflater then goes on only after Reset.
// Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"

struct z_stream_s;

class QXCORE_API SInflater {
 public:
  // For raw deflate data when `raw` is not 0, as zip archives hold it, else for zlib-wrapped data.
  explicit SInflater(int raw = 0) { Init(raw); }
  SInflater(const SInflater&) = delete;
  SInflater& operator=(const SInflater&) = delete;
  ~SInflater();

  // The next `count` bytes of input; what is left of former input is forgotten.
  void SetInput(const void* bytes, int count);
  // Decompresses up to `length` bytes into `buffer` and returns how many. 0 when more input is needed, when a
  // dictionary is, and at the end of the data. Damaged data throws SEZipException, "zlib error!!!".
  int Inflate(void* buffer, int length);

  // 1 when the data cannot go on without SetDictionary (zlib-wrapped data only).
  int NeedsDictionary() const { return m_needsDictionary; }
  // The dictionary that the data was compressed with: the one that NeedsDictionary asks for, or for raw
  // data one of the user's choice. Throws SEZipException, "zlib error!!!", when it is not the right one.
  void SetDictionary(const void* bytes, int count);

  // 1 when the end of the data was met.
  int IsFinished() const { return m_finished; }
  // Bytes of the input that have not been used; those behind the end of the data stay here.
  int GetRemaining() const { return m_count; }
  const void* GetRest() const { return m_input; }  // they themselves
  // Bytes used and produced since the beginning or the last Reset.
  std::uint64_t GetTotalIn() const { return m_totalIn; }
  std::uint64_t GetTotalOut() const { return m_totalOut; }

  // Begins anew, for data of the same kind; input is forgotten.
  void Reset();
  // Frees the memory. Inflate then returns 0; Reset does not revive it.
  void End();

 protected:
  // Sets up zlib; for derived classes, after End.
  void Init(int raw);

 private:
  z_stream_s* m_stream = nullptr;  // null after End
  bool m_finished = false;
  bool m_needsDictionary = false;
  const unsigned char* m_input = nullptr;
  int m_count = 0;
  std::uint64_t m_totalIn = 0;
  std::uint64_t m_totalOut = 0;
};
