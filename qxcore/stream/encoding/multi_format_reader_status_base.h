// What all multi-format readers know of themselves: the requested and the selected encoding, how the
// selection came about, and what was lost while reading. Threads: a reader belongs to one thread at a time.
#pragma once

#include <memory>

#include "qxcore/platform/export.h"
#include "qxcore/stream/encoding/detection_counters.h"
#include "qxcore/stream/encoding/multi_format_support.h"
#include "qxcore/stream/encoding/raw_buffer.h"
#include "qxcore/string/string.h"

struct SReaderState;

class QXCORE_API SMultiFormatReaderStatusBase {
 public:
  using Support = SAbstractIO::SMultiFormatSupport;  // the encodings
  using Encoding = Support::Encoding;                // see multi_format_support.h
  using BufferStatus = SRawBuffer;                   // a growing buffer

  // Status bits.
  enum Status : unsigned {
    kRawPresent = 0x1,   // raw data is there, and the format is still to be checked
    kWholeInput = 0x2,   // no more raw data follows
    kProvisional = 0x4,  // ASCII so far; more data may show other bytes
    kSelected = 0x20,    // a selection was made
    kWarning = 0x40      // detection's result deserves a warning
  };

  // A copy has the encodings, the status and the reports, but empty buffers of its own. Throw SEOutOfMemory.
  SMultiFormatReaderStatusBase(const SMultiFormatReaderStatusBase& other);
  SMultiFormatReaderStatusBase& operator=(const SMultiFormatReaderStatusBase& other);
  virtual ~SMultiFormatReaderStatusBase();

  // Makes room for `size` bytes from the buffer's start on, keeping its content; by doubling. Throws
  // SEOutOfMemory and changes nothing.
  virtual void AllocRawData(BufferStatus& buffer, unsigned long size);
  virtual void AllocStrData(BufferStatus& buffer, unsigned long size);

  Encoding GetRequestedFormat() const { return m_requested; }  // the hint and the policy
  // The selected encoding with the requested policy; 0 before the check (the first one, or that which SetFormat
  // orders), and when it failed.
  Encoding GetFormat() const;
  unsigned int GetStatus() const;                 // status bits, as they are now
  const SDetectionCounters& GetCounters() const;  // the evidence of the last detection

  // With a flag other than 0, UTF-8 is taken for well-formed and its continuation bytes are not checked.
  // Returns the former flag. Takes effect with the next check of the format.
  int SetQuickUTF8ToUTF16(int quick);

  // What a user should know of the selection; empty when there is nothing to say.
  SString GetDetectionWarning() const;
  // How the selection came about, also where that deserves no warning; empty when nothing was detected.
  SString GetDetectionReport() const;
  // That characters were replaced or dropped; empty while none was.
  SString GetEncodingWarning() const;
  unsigned long long GetReplacedCount() const;
  unsigned long long GetDroppedCount() const;

 protected:
  // Nothing is selected yet. Throws SEOutOfMemory.
  explicit SMultiFormatReaderStatusBase(Encoding requested);
  static void FreeBuffer(BufferStatus& buffer) noexcept;  // frees the block and empties the buffer

  Encoding m_requested;                   // hint and policy
  BufferStatus m_raw;                     // bytes not decoded yet
  int m_quickUTF8 = 0;                    // UTF-8 is taken for well-formed
  std::unique_ptr<SReaderState> m_state;  // the rest
};
