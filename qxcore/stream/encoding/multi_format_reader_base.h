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
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/stream/encoding/multi_format_reader_status_base.h"
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
  // The mark lies on the raw data, which is kept from there on for `limit` bytes (0: 8192).
  void Mark(unsigned long limit) override;
  void Reset() override;
  // Gives both buffers up and closes the inner stream.
  void Close() override;
  int GetError() const override { return m_in->GetError(); }

 protected:
  // `in` must stay alive; the second form deletes it at the end when `owns` is set.
  SMultiFormatReaderBase(SInputStream& in, Encoding requested);
  SMultiFormatReaderBase(SInputStream* in, Encoding requested, bool owns);

  // Up to `count` bytes, asking the inner stream until it gives 0; gives how many.
  virtual unsigned long ReadRawData(unsigned char* buffer, unsigned long count);
  // Adds up to `count` bytes to the buffer; gives how many. Fewer than asked for end the input.
  virtual unsigned long GetMoreRawData(BufferStatus& buffer, unsigned long count);
  // Scores a sample; an encoding when that settles it, else 0.
  virtual Encoding DataAffinity(const unsigned char* begin, const unsigned char* end, SDataAffinity& affinity,
                                unsigned int codePage);
  // Chooses among the candidates.
  virtual SEncodingGuess GuessEncoding(Encoding requested, const SDataAffinity& affinity);

  // Decodes the next run of raw bytes into the empty character buffer; false at the end of the data.
  bool DecodeNextRun();
  // Decodes straight into the caller's buffer; gives the number of characters, 0 at the end.
  unsigned long DecodeInto(WCHAR* out, unsigned long room);
  // The characters decoded and not delivered.
  const WCHAR* TextStart() const { return reinterpret_cast<const WCHAR*>(m_text.start); }
  unsigned long TextLength() const { return m_text.Size() / sizeof(WCHAR); }
  void Deliver(unsigned long characters) {
    m_text.start += characters * sizeof(WCHAR);
    m_delivered += characters;
    m_hasDelivered = true;
  }

  SInputStream* m_in;             // where the bytes come from
  bool m_owns;                    // deletes m_in at the end
  unsigned long m_delivered = 0;  // characters

 private:
  // Where reading stood: the start of a decoded run in the raw block, how many of its characters were
  // delivered, and the decoder as it was at the start of the run.
  struct Position {
    unsigned long runOffset = 0;
    unsigned long delivered = 0;
    STextDecoder decoder;
  };

  bool FillSample();
  void CompleteCutSequence();
  bool TakeRestInPlace();
  void ReadWholeInput();
  void SelectFormat(bool detects);
  Encoding SniffMark();
  Encoding SniffXML(Encoding sniffed);
  void Detect(Encoding sniffed);
  void DropOwnMark();
  void CheckSelection() const;
  void ReadMoreRaw();
  unsigned long DecodePiece(WCHAR* out, unsigned long room);
  Position CurrentPosition() const;
  void GoTo(const Position& position);
  void DropConsumedRaw();
  unsigned long RawOffset() const { return static_cast<unsigned long>(m_raw.start - m_raw.block); }

  BufferStatus m_text;  // decoded characters of one run
  Position m_run;       // the run that m_text was decoded from
  Position m_mark;
  bool m_hasMark = false;
  unsigned long m_markLimit = 0;
  unsigned long m_markDelivered = 0;
  unsigned long m_skippedMark = 0;  // bytes of a byte order mark that were passed over
  bool m_needsCheck = true;
  bool m_hasDelivered = false;
  bool m_isCut = false;  // the raw data ends within a sequence
};
