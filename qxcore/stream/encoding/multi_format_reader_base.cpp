#include "qxcore/stream/encoding/multi_format_reader_base.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/io_exceptions.h"

QXCORE_IMPLEMENT_CLASS(SMultiFormatReaderBase, SInputStream, 0)

using Reader = SMultiFormatReaderBase;
using Encoding = SMultiFormatReaderStatusBase::Encoding;

namespace {

constexpr unsigned long kQuickSample = 4096;
constexpr unsigned long kFairSample = 16384;
constexpr unsigned long kLongestInput = 0x7FFFFFFF;
constexpr unsigned long kRawBlock = 65536;
constexpr unsigned long kTextRun = 8192;      // characters decoded at a time
constexpr unsigned long kLeastDirect = 1024;  // room from which on the caller's buffer is decoded to
constexpr unsigned long kLeastDetected = 3;
constexpr unsigned long kLeastXML = 11;
constexpr unsigned long kDefaultMarkLimit = 8192;
constexpr int kXMLLength = 5;

bool StartsWithXML(const unsigned char* at, std::size_t unit, std::size_t significant) {
  constexpr char kXMLStart[] = "<?xml";
  for (int i = 0; i < kXMLLength; ++i) {
    for (std::size_t byte = 0; byte < unit; ++byte) {
      unsigned char expected = byte == significant ? static_cast<unsigned char>(kXMLStart[i]) : 0;
      if (*at++ != expected) return false;
    }
  }
  return true;
}

}  // namespace

Reader::SMultiFormatReaderBase(SInputStream& in, Encoding requested)
    : SMultiFormatReaderStatusBase(requested), m_in(&in), m_owns(false) {}

Reader::SMultiFormatReaderBase(SInputStream* in, Encoding requested, bool owns)
    : SMultiFormatReaderStatusBase(requested), m_in(in), m_owns(owns) {}

Reader::~SMultiFormatReaderBase() {
  FreeBuffer(m_text);
  if (m_owns) delete m_in;
}

// --- raw data ---

unsigned long Reader::ReadRawData(unsigned char* buffer, unsigned long count) {
  unsigned long done = 0;
  while (done < count) {
    unsigned long got = m_in->Read(buffer + done, count - done);
    if (got == 0 || got > count - done) break;  // all ones: the source failed
    done += got;
  }
  return done;
}

unsigned long Reader::GetMoreRawData(BufferStatus& buffer, unsigned long count) {
  AllocRawData(buffer, buffer.Size() + count);
  unsigned long got = ReadRawData(buffer.end, count);
  buffer.end += got;
  if (got < count) m_status |= kWholeInput;
  return got;
}

// Raw data before the current run is gone for good, unless a mark holds it.
void Reader::DropConsumedRaw() {
  unsigned long position = RawOffset();
  if (m_hasMark && position - m_mark.runOffset > std::min(m_markLimit, kLongestInput) + kRawBlock) m_hasMark = false;
  unsigned long dropped = m_hasMark ? m_mark.runOffset : position;
  if (!m_hasDelivered) dropped = 0;  // a byte order mark may still be asked for
  if (dropped == 0) return;
  std::memmove(m_raw.block, m_raw.block + dropped, static_cast<std::size_t>(m_raw.end - m_raw.block) - dropped);
  m_raw.start -= dropped;
  m_raw.end -= dropped;
  m_run.runOffset = RawOffset();
  m_mark.runOffset -= m_hasMark ? dropped : 0;
}

// What lies in memory as a whole need not be copied.
bool Reader::TakeRestInPlace() {
  unsigned long size = 0;
  const void* rest = m_in->TakeRest(&size);
  if (rest == nullptr) return false;
  m_raw.block = m_raw.start = const_cast<unsigned char*>(static_cast<const unsigned char*>(rest));  // never written
  m_raw.end = m_raw.start + size;
  m_raw.capacity = 0;
  m_status |= kWholeInput;
  return true;
}

void Reader::ReadWholeInput() {
  if (m_raw.block == nullptr && TakeRestInPlace()) return;
  while ((m_status & kWholeInput) == 0 && m_raw.Size() < kLongestInput) {
    unsigned long expected = std::max(m_in->Available(), kRawBlock - 1) + 1;
    GetMoreRawData(m_raw, std::min(expected, kLongestInput - m_raw.Size()));
  }
}

// A sample that ends within a UTF-8 sequence would count its lead byte as evidence against UTF-8.
void Reader::CompleteCutSequence() {
  const unsigned char* end = m_raw.end;
  unsigned long back = 1;
  while (back < std::min(m_raw.Size(), 3ul) && (end[-static_cast<long>(back)] & 0xC0) == 0x80) ++back;
  if (m_raw.Size() == 0 || (m_status & kWholeInput) != 0) return;
  unsigned char lead = end[-static_cast<long>(back)];
  unsigned long needed = lead >= 0xE0 && lead < 0xF0 ? 3 : lead >= 0xC0 && lead < 0xE0 ? 2 : 1;
  if (needed > back) GetMoreRawData(m_raw, needed - back);
}

// The first step of a check; true when encodings are to be detected.
bool Reader::FillSample() {
  const Encoding level = m_requested & Support::kLevelMask;
  const bool detects =
      (level & Support::kWholeInOnce) != 0 || level == Support::kQuickDetect || level == Support::kDetect;
  if ((m_status & kRawPresent) != 0) {
    m_status &= ~kRawPresent;
    // Later data of an input that was long enough for detection is detected, however little is left of it.
    bool isAgain = (m_status & kProvisional) != 0 && m_hasDelivered;
    return detects && (isAgain || m_raw.Size() >= kLeastDetected);
  }
  if ((level & Support::kWholeInOnce) != 0) {
    ReadWholeInput();
  } else {
    GetMoreRawData(m_raw, level == Support::kDetect ? kFairSample : kQuickSample);
    if (detects) CompleteCutSequence();
  }
  return detects && m_raw.Size() >= kLeastDetected;
}

// --- the check of the format ---

void Reader::CheckFormat() {
  if (!m_needsCheck) return;
  const unsigned long skippedBefore = m_skippedMark;
  try {
    SelectFormat(FillSample());
  } catch (...) {
    // What was read stays, from its very beginning, for the next check.
    m_raw.start -= m_skippedMark - skippedBefore;
    m_skippedMark = skippedBefore;
    if (m_raw.Size() > 0) m_status |= kRawPresent;
    throw;
  }
  m_decoder.Select(m_selected, m_quickUTF8 != 0);
  m_run = {RawOffset(), 0, m_decoder};
  m_needsCheck = false;
}

void Reader::SelectFormat(bool detects) {
  const bool isBeginning = !m_hasDelivered;
  m_hasFailed = false;
  try {
    if (isBeginning && (m_status & kSelected) == 0) m_selected = m_requested;
    const bool needsMark = isBeginning && Support::IsUnicode(m_requested) && (m_requested & Support::kRequiredBOM) != 0;
    if (detects || needsMark) {
      Encoding sniffed = isBeginning ? SniffMark() : 0;
      if (detects && isBeginning) sniffed = SniffXML(sniffed);
      if (needsMark && (sniffed & Support::kOptionalBOM) == 0) throw SEIONoUnicodeBOM();
      if (detects) {
        Detect(sniffed);
      } else if (!Support::IsSameFormat(sniffed, m_selected)) {
        throw SEIOMismatchedBOM();
      }
    } else if (isBeginning) {
      DropOwnMark();
    }
    CheckSelection();
    if ((m_status & kProvisional) == 0) m_status |= kSelected;
  } catch (const SEEncodingException&) {
    m_selected = 0;
    m_status &= ~(kSelected | kProvisional);
    m_hasFailed = detects;
    throw;
  }
}

Encoding Reader::SniffMark() {
  const unsigned char* at = m_raw.start;
  const unsigned long size = m_raw.Size();
  Encoding found = 0;
  unsigned long length = 0;
  if (size >= 3 && at[0] == 0xEF && at[1] == 0xBB && at[2] == 0xBF) {
    found = Support::kUTF8;
    length = 3;
  } else if (size >= 2 && at[0] == 0xFE && at[1] == 0xFF) {
    found = Support::kUTF16BE;
    length = 2;
  } else if (size >= 2 && at[0] == 0xFF && at[1] == 0xFE) {
    found = Support::kUTF16LE;
    length = 2;
  }
  m_raw.start += length;
  m_skippedMark += length;
  return found != 0 ? found | Support::kOptionalBOM : 0;
}

// With no detection and an optional mark, a mark of the format itself is dropped; any other is data.
void Reader::DropOwnMark() {
  if (!Support::IsUnicode(m_selected) || (m_selected & Support::kOptionalBOM) == 0) return;
  Encoding found = SniffMark();
  if (found == 0 || Support::IsSameFormat(found, m_selected)) return;
  m_raw.start -= m_skippedMark;
  m_skippedMark = 0;
}

Encoding Reader::SniffXML(Encoding sniffed) {
  if (m_raw.Size() + m_skippedMark < kLeastXML) return sniffed;
  const unsigned char* at = m_raw.start;
  if (StartsWithXML(at, 1, 0)) {  // eight bytes at least stand behind any mark
    if (sniffed != 0) return sniffed | Support::kXML;
    m_status |= kProvisional;
    return Support::kXML | Support::kASCII;
  }
  if (m_raw.Size() < 2 * kXMLLength) return sniffed;
  const struct {
    std::size_t significant;
    Encoding format;
  } kOrders[] = {{0, Support::kUTF16LE}, {1, Support::kUTF16BE}};
  for (const auto& order : kOrders) {
    if (!StartsWithXML(at, 2, order.significant)) continue;
    if (sniffed == 0) return Support::kXML | order.format;
    if (Support::IsSameFormat(sniffed, order.format)) return sniffed | Support::kXML;
  }
  return sniffed;
}

void Reader::Detect(Encoding sniffed) {
  const Encoding policy = m_requested & Support::kFlagsMask;
  const bool isFirst = (m_status & kSelected) == 0;
  const bool isXML8 = (sniffed & Support::kXML) != 0 && Support::KindOf(sniffed) == Support::kASCII;
  if (sniffed != 0 && (m_status & kProvisional) == 0) {
    m_selected = isFirst ? policy | sniffed : m_selected | (sniffed & Support::kXML);
    return;
  }
  const Encoding xml = (sniffed | m_selected) & Support::kXML;
  const bool isHalf = (m_status & kWholeInput) != 0 && m_raw.Size() % 2 != 0;
  m_affinity = SDataAffinity();
  if (isHalf || isXML8) m_affinity.utf16 = m_affinity.littleZeros = m_affinity.bigZeros = SDataAffinity::kRejected;
  const unsigned page = Support::IsANSI(m_requested) ? m_requested & Support::kCodePageMask : 0;
  if (page != 0) m_affinity.specified = 0;

  const unsigned char* sampleEnd = m_raw.start + std::min(m_raw.Size(), kQuickSample);
  Encoding result = DataAffinity(m_raw.start, sampleEnd, m_affinity, page);
  const unsigned char* wholeEnd = m_raw.start + std::min(m_raw.Size(), kLongestInput);  // the platform counts in an int
  if (result == 0 && sampleEnd != wholeEnd) result = DataAffinity(m_raw.start, wholeEnd, m_affinity, page);
  if (result != 0) {
    if (Support::KindOf(result) != Support::kASCII) m_status &= ~kProvisional;
    m_guess = SEncodingGuess();
    result |= policy;
  } else {
    m_guess = GuessEncoding(m_requested, m_affinity);
    result = m_guess.selected;
    m_status = m_guess.isProvisional ? m_status | kProvisional : m_status & ~kProvisional;
    if (m_guess.needsWarning) m_status |= kWarning;
  }
  m_selected = isFirst ? result | xml : m_selected | xml;
}

Encoding Reader::DataAffinity(const unsigned char* begin, const unsigned char* end, SDataAffinity& affinity,
                              unsigned int codePage) {
  return affinity.Scan(begin, end, codePage);
}

SEncodingGuess Reader::GuessEncoding(Encoding requested, const SDataAffinity& affinity) {
  bool isComplete = (m_status & kWholeInput) != 0 && (requested & Support::kLevelMask) != 0;
  return SEncodingGuess::Make(requested, affinity, isComplete);
}

void Reader::CheckSelection() const {
  switch (Support::KindOf(m_selected)) {
    case 0:
      throw SEIODetectFailed();
    case Support::kASCII:
    case Support::kOEM:
      return;
    case Support::kUnicode:
      if (!Support::MachineSupports(m_selected)) throw SEEncodingException();
      return;
    default:
      if (!Support::MachineSupports(m_selected)) throw SEIOInvalidEncoding();
  }
}

void Reader::SetFormat(Encoding requested) {
  GoTo(CurrentPosition());
  m_requested = requested;
  m_needsCheck = true;
  m_status &= kWholeInput;
  if (!m_hasDelivered) {
    m_raw.start -= m_skippedMark;
    m_skippedMark = 0;
    m_decoder.ForgetLosses();
  }
  if (m_raw.Size() > 0) m_status |= kRawPresent;
  m_guess = SEncodingGuess();
  if (m_hasDelivered) m_selected = requested;
}

// --- decoding ---

void Reader::ReadMoreRaw() {
  const bool isProvisional = (m_status & kProvisional) != 0;
  const bool isFair = (m_requested & Support::kLevelMask) == Support::kDetect;
  DropConsumedRaw();
  unsigned long got = GetMoreRawData(m_raw, !isProvisional ? kRawBlock : isFair ? kFairSample : kQuickSample);
  m_isCut = false;
  if (!isProvisional) return;
  if (got == 0) {  // the whole input was ASCII
    m_status = (m_status & ~kProvisional) | kSelected;
    return;
  }
  m_status |= kRawPresent;
  m_needsCheck = true;
  CompleteCutSequence();
}

// Decodes up to `room` characters, at least one unless the data is at its end.
unsigned long Reader::DecodePiece(WCHAR* out, unsigned long room) {
  for (;;) {
    CheckFormat();
    if (m_raw.Size() == 0 || m_isCut) {
      if ((m_status & kWholeInput) != 0 && m_raw.Size() == 0) return 0;
      if ((m_status & kWholeInput) == 0) {
        ReadMoreRaw();
        continue;
      }
    }
    const unsigned long piece = std::min(m_raw.Size(), room);
    const bool isLast = (m_status & kWholeInput) != 0 && piece == m_raw.Size();
    m_run = {RawOffset(), 0, m_decoder};
    STextDecoder::Run run = m_decoder.Decode(m_raw.start, m_raw.start + piece, isLast, out);
    const bool moved = run.in != m_raw.start;
    m_raw.start += run.in - m_raw.start;
    if (run.out != out) return static_cast<unsigned long>(run.out - out);
    if (run.isLoss) m_decoder.ThrowLoss();
    m_isCut = !moved;
  }
}

bool Reader::DecodeNextRun() {
  CheckFormat();
  if (m_decoder.NeedsWholeInput()) {
    ReadWholeInput();
    const bool isWhole = (m_status & kWholeInput) != 0 && m_raw.Size() <= kLongestInput;
    if (!isWhole) throw SEOutOfMemory();  // more than the platform converts at once
  }
  const unsigned long room = m_decoder.NeedsWholeInput() ? std::max(m_raw.Size(), 1ul) : kTextRun;
  m_text.start = m_text.end = m_text.block;
  AllocStrData(m_text, room * sizeof(WCHAR));
  unsigned long characters = DecodePiece(reinterpret_cast<WCHAR*>(m_text.block), room);
  m_text.end = m_text.start + characters * sizeof(WCHAR);
  return characters > 0;
}

unsigned long Reader::DecodeInto(WCHAR* out, unsigned long room) {
  CheckFormat();
  if (room < kLeastDirect || m_decoder.NeedsWholeInput()) {
    if (!DecodeNextRun()) return 0;
    unsigned long count = std::min(room, TextLength());
    std::memcpy(out, m_text.start, count * sizeof(WCHAR));
    Deliver(count);
    return count;
  }
  unsigned long count = DecodePiece(out, room);
  m_run = {RawOffset(), 0, m_decoder};
  m_hasDelivered = m_hasDelivered || count > 0;
  m_delivered += count;
  return count;
}

// --- positions ---

Reader::Position Reader::CurrentPosition() const {
  Position position = m_run;
  if (TextLength() > 0) {
    position.delivered = static_cast<unsigned long>(m_text.start - m_text.block) / sizeof(WCHAR);
  } else {
    position = {RawOffset(), 0, m_decoder};
  }
  return position;
}

// Decodes the run of the position anew and passes over what was delivered of it, byte by byte, because
// only that tells where in the raw data a character begins.
void Reader::GoTo(const Position& position) {
  m_text.start = m_text.end = m_text.block;
  m_raw.start = m_raw.block + position.runOffset;
  m_decoder = position.decoder;
  m_isCut = false;
  if (m_decoder.NeedsWholeInput()) {
    // One run holds all of the text; no part of it can be decoded alone.
    if (position.delivered > 0 && DecodeNextRun()) {
      m_text.start += std::min(position.delivered, TextLength()) * sizeof(WCHAR);
    }
    return;
  }
  for (unsigned long passed = 0; passed < position.delivered && m_raw.start != m_raw.end;) {
    STextDecoder::Run run{};
    WCHAR character[8];
    const STextDecoder before = m_decoder;
    for (const unsigned char* end = m_raw.start + 1;; ++end) {
      bool isLast = end == m_raw.end && (m_status & kWholeInput) != 0;
      run = m_decoder.Decode(m_raw.start, end, isLast, character);
      if (run.in != m_raw.start || end == m_raw.end) break;
    }
    // A byte that ended an invalid sequence may have become a character of its own at once; when only what
    // stands for the sequence was delivered, the position is in front of that byte.
    const unsigned long wanted = position.delivered - passed;
    for (const unsigned char* end = run.in; static_cast<unsigned long>(run.out - character) > wanted;) {
      if (--end == m_raw.start) break;
      m_decoder = before;
      STextDecoder::Run shorter = m_decoder.Decode(m_raw.start, end, true, character);
      if (shorter.in == end && static_cast<unsigned long>(shorter.out - character) == wanted) run = shorter;
    }
    if (run.in == m_raw.start) break;
    m_raw.start += run.in - m_raw.start;
    passed += static_cast<unsigned long>(run.out - character);
  }
  m_run = {RawOffset(), 0, m_decoder};
}

void Reader::Mark(unsigned long limit) {
  CheckFormat();
  m_mark = CurrentPosition();
  m_markDelivered = m_delivered;
  m_markLimit = limit != 0 ? limit : kDefaultMarkLimit;
  m_hasMark = true;
}

void Reader::Reset() {
  if (!m_hasMark) throw SEIOResetInvalid();
  GoTo(m_mark);
  m_delivered = m_markDelivered;
  m_mark = CurrentPosition();
}

unsigned long Reader::Available() {
  unsigned long waiting = TextLength() + m_raw.Size();
  return (m_status & kWholeInput) != 0 ? waiting : waiting + m_in->Available();
}

int Reader::IsEOF() { return TextLength() == 0 && !DecodeNextRun(); }

void Reader::Close() {
  FreeBuffer(m_text);
  FreeBuffer(m_raw);
  m_hasMark = m_isCut = m_needsCheck = false;
  m_status |= kWholeInput;
  m_in->Close();
}
