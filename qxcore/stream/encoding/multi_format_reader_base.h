// Readers of text in an encoding that is given, or found out from the data.
//
// The encoding is checked once, before the first character is delivered: marks and an XML
// declaration are looked for, the sample that the level orders is scored, and a choice is made (see
// docs/text-encodings.md). A choice of ASCII from a part of the input is provisional: the next bytes are
// looked at again before they are decoded.
//
// Reading asks nobody whether to go on; the inner stream does (an SInputFile with a progress
// indicator asks each time it takes data from the file), and its SEIOAbortedException passes through
// with nothing lost: reading may go on.
//
// A level that looks at the whole input keeps up to 16 MB of it. More is looked at in pieces where the inner stream
// can go back (GetPlace), and else kept, too, up to 2 GB; what is longer then stays provisional while it is ASCII.
// Threads: a reader and its source belong to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/stream/encoding/multi_format_reader_status_base.h"
#include "qxcore/stream/inner_stream.h"
#include "qxcore/stream/input_stream.h"

class QXCORE_API SMultiFormatReaderBase : public SInputStream, public SMultiFormatReaderStatusBase {
  QXCORE_DECLARE_CLASS(SMultiFormatReaderBase)

  SMultiFormatReaderBase(const SMultiFormatReaderBase&) = delete;
  SMultiFormatReaderBase& operator=(const SMultiFormatReaderBase&) = delete;
  ~SMultiFormatReaderBase() override;

  // Selects the encoding now rather than at the first read. Throws SEIONoUnicodeBOM, SEIOMismatchedBOM,
  // SEIODetectFailed, SEIOInvalidEncoding or SEEncodingException (a Unicode value without a form); the
  // reader then has no selection, and what was read from the inner stream stays for the next check.
  virtual void CheckFormat();
  // Changes the request. What was not delivered yet is read anew with the next check.
  virtual void SetFormat(Encoding requested);

  // An estimate of the characters still to come: those decoded, and a byte for one of the rest. 0 only
  // at the end.
  unsigned long Available() override;
  int IsEOF() override;
  // The mark lies on the raw data, which is kept from there on for `limit` bytes (0: 8192). Reset goes back to it; the
  // text is decoded anew, in the encoding that is selected then.
  void Mark(unsigned long limit) override;
  void Reset() override;
  // Ends both buffers and closes the inner stream.
  void Close() override;
  int GetError() const override { return m_in->GetError(); }

 protected:
  // `in` must stay alive; the second form deletes it at the end when `owns` is set.
  SMultiFormatReaderBase(SInputStream& in, Encoding requested);
  SMultiFormatReaderBase(SInputStream* in, Encoding requested, bool owns);

  // One read of the inner stream: up to `count` bytes; returns how many, 0 at the end.
  virtual unsigned long ReadRawData(unsigned char* buffer, unsigned long count);
  // Adds up to `count` bytes to the buffer, reading until they are there; returns how many. Fewer than asked for end
  // the input. What came before a read throws stays in the buffer.
  virtual unsigned long GetMoreRawData(BufferStatus& buffer, unsigned long count);
  // Scores a sample: adds its evidence to the seven counters (see SDetectionCounters). `codePage` is the one that the
  // hint names, or 0. Returns an encoding when the sample settles it, else 0. Called for the first 4096 bytes, then
  // for all of the sample, then, for inputs too long to keep, for each further piece with counters of its own.
  virtual Encoding DataAffinity(const unsigned char* begin, const unsigned char* end, std::int32_t& ascii,
                                std::int32_t& utf8, std::int32_t& active, std::int32_t& utf16,
                                std::int32_t& littleZeros, std::int32_t& bigZeros, std::int32_t& specified,
                                unsigned short codePage);
  // Chooses among the candidates by their evidence; returns the encoding with the requested policy.
  virtual Encoding GuessEncoding(Encoding requested, std::int32_t ascii, std::int32_t utf8, std::int32_t active,
                                 std::int32_t utf16, std::int32_t littleZeros, std::int32_t bigZeros,
                                 std::int32_t specified);

  // Decodes the next run of raw bytes into the empty character buffer; false at the end of the data.
  bool DecodeNextRun();
  // Decodes straight into the caller's buffer; returns the number of characters, 0 at the end.
  unsigned long DecodeInto(WCHAR* out, unsigned long room);
  // The characters decoded and not delivered.
  const WCHAR* TextStart() const { return reinterpret_cast<const WCHAR*>(m_text.start); }
  unsigned long TextLength() const { return m_text.Size() / sizeof(WCHAR); }
  void Deliver(unsigned long characters) {
    m_text.start += characters * sizeof(WCHAR);
    m_delivered += characters;
  }

  SInnerStream<SInputStream> m_in;  // where the bytes come from
  unsigned long m_delivered = 0;    // characters

 private:
  class Scorer;

  // A place in the text: that of a run of decoded characters in the input, how many of them were delivered, and the
  // losses before the run.
  struct Position {
    std::uint64_t run = 0;
    unsigned long delivered = 0;
    std::uint64_t replaced = 0, dropped = 0;
  };

  bool NeedsCheck() const;
  void FillSample();
  void CompleteCutSequence();
  bool TakeRestInPlace();
  void ReadWholeInput(unsigned long most);
  void ThrowFailure() const;
  bool ScoreRest(const unsigned char* begin, SDetectionCounters& counters, unsigned short codePage);
  void ScorePieces(const unsigned char* begin, SDetectionCounters& counters, unsigned short codePage);
  void ReadMoreRaw();
  unsigned long DecodePiece(WCHAR* out, unsigned long room);
  unsigned long DecodeWhole();
  void ClearText() { m_text.start = m_text.end = m_text.block; }
  bool IsAtBeginning() const;
  Position PositionOfRaw() const;
  Position CurrentPosition() const;
  void GoTo(const Position& position);
  void Settle(Position& position);
  void DropConsumedRaw();

  BufferStatus m_text;  // decoded characters of one run
  Position m_run;       // the run that m_text was decoded from
  Position m_mark;
  bool m_hasMark = false;
  bool m_isFilled = false;  // the sample for the check, or the data behind a provisional choice, was read
  unsigned long m_markLimit = 0;
  unsigned long m_markDelivered = 0;
};
