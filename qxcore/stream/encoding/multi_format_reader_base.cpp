#include "qxcore/stream/encoding/multi_format_reader_base.h"

#include <algorithm>
#include <cstring>
#include <limits>

#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/memory.h"
#include "qxcore/stream/encoding/internal/data_affinity.h"
#include "qxcore/stream/encoding/internal/reader_state.h"
#include "qxcore/stream/internal/add_clipped.h"

QXCORE_IMPLEMENT_CLASS(SMultiFormatReaderBase, SInputStream, 0)

using Reader = SMultiFormatReaderBase;
using Encoding = SMultiFormatReaderStatusBase::Encoding;
using State = SFormatChoice::State;

namespace {

constexpr unsigned long kQuickSample = 4096;
constexpr unsigned long kFairSample = 16384;
constexpr unsigned long kLongestInput = 0x7FFFFFFF;
constexpr unsigned long kKeptInput = 0x1000000;  // of an input that can be read again
constexpr unsigned long kRawBlock = 65536;
constexpr unsigned long kTextRun = 8192;      // characters decoded at a time
constexpr unsigned long kLeastDirect = 1024;  // room from which on the caller's buffer is decoded to
constexpr unsigned long kLeastDetected = 3;
constexpr unsigned long kDefaultMarkLimit = 8192;

bool Detects(Encoding requested) {
  const Encoding level = requested & SAbstractIO::SMultiFormatSupport::kLevelMask;
  using Support = SAbstractIO::SMultiFormatSupport;
  return (level & Support::kWholeInOnce) != 0 || level == Support::kQuickDetect || level == Support::kDetect;
}

// While it lives, the samples that are scored lie behind others.
class Behind {
 public:
  explicit Behind(SReaderState& state) : m_state(state) { m_state.samplePlace = SSamplePlace::kBehind; }
  Behind(const Behind&) = delete;
  Behind& operator=(const Behind&) = delete;
  ~Behind() { m_state.samplePlace = SSamplePlace::kBeginning; }

 private:
  SReaderState& m_state;
};

}  // namespace

// Lets derived readers score and choose.
class SMultiFormatReaderBase::Scorer final : public SFormatScorer {
 public:
  Scorer(Reader& reader, const SFormatSample& sample) : m_reader(reader), m_sample(sample) {}

  Encoding ScoreSample(const unsigned char* begin, const unsigned char* end, SDetectionCounters& counters,
                       unsigned short codePage) override {
    return m_reader.DataAffinity(begin, end, counters.ascii, counters.utf8, counters.active, counters.utf16,
                                 counters.littleZeros, counters.bigZeros, counters.specified, codePage);
  }

  void ScorePiece(const unsigned char* begin, const unsigned char* end, SDetectionCounters& counters,
                  unsigned short codePage) override {
    const Behind others(*m_reader.m_state);
    ScoreSample(begin, end, counters, codePage);
  }

  bool ScoreRest(SDetectionCounters& counters, unsigned short codePage) override {
    return m_reader.ScoreRest(m_sample.end, counters, codePage);
  }

  SEncodingGuess Choose(const SDetectionCounters& counters, bool isComplete) override {
    m_reader.m_state->isComplete = isComplete;
    SEncodingGuess& made = m_reader.m_state->guess;
    made = SEncodingGuess();
    const Encoding selected =
        m_reader.GuessEncoding(m_reader.m_requested, counters.ascii, counters.utf8, counters.active, counters.utf16,
                               counters.littleZeros, counters.bigZeros, counters.specified);
    if (made.selected == selected) return made;
    SEncodingGuess other;  // a derived class chose by itself
    other.selected = selected;
    return other;
  }

 private:
  Reader& m_reader;
  const SFormatSample& m_sample;
};

Reader::SMultiFormatReaderBase(SInputStream& in, Encoding requested)
    : SMultiFormatReaderStatusBase(requested), m_in(in) {}

Reader::SMultiFormatReaderBase(SInputStream* in, Encoding requested, bool owns)
    : SMultiFormatReaderStatusBase(requested), m_in(in, owns) {}

Reader::~SMultiFormatReaderBase() { FreeBuffer(m_text); }

// --- raw data ---

unsigned long Reader::ReadRawData(unsigned char* buffer, unsigned long count) {
  const unsigned long got = m_in->Read(buffer, count);
  return got <= count ? got : 0;  // all ones: the source failed
}

unsigned long Reader::GetMoreRawData(BufferStatus& buffer, unsigned long count) {
  AllocRawData(buffer, buffer.Size() + count);
  unsigned long done = 0;
  while (done < count) {
    const unsigned long got = ReadRawData(buffer.end, count - done);
    if (got == 0) {
      m_state->raw.SetAtEnd();
      break;
    }
    buffer.end += got;
    done += got;
  }
  return done;
}

// Raw data before the current run is gone for good, unless a mark holds it, or a byte order mark may still be asked
// for.
void Reader::DropConsumedRaw() {
  SRawInput& raw = m_state->raw;
  const std::uint64_t position = raw.Position();
  if (m_hasMark && position - m_mark.run > std::min(m_markLimit, kLongestInput) + kRawBlock) m_hasMark = false;
  const bool maySniffAgain = m_delivered == 0 && raw.HasBeginning() && position <= kRawBlock;
  if (!maySniffAgain) raw.DropBefore(m_hasMark ? std::min(m_mark.run, position) : position);
}

// What lies in memory as a whole need not be copied.
bool Reader::TakeRestInPlace() {
  unsigned long size = 0;
  const void* rest = m_in->TakeRest(&size);
  if (rest == nullptr) return false;
  m_state->raw.Borrow(rest, size);
  return true;
}

void Reader::ReadWholeInput(unsigned long most) {
  SRawInput& raw = m_state->raw;
  if (raw.IsAtEnd() || (m_raw.block == nullptr && TakeRestInPlace())) return;
  while (!raw.IsAtEnd() && m_raw.Size() < most) {
    // What a source says of itself is no reason to take all that memory at once.
    const unsigned long expected = std::clamp(m_in->Available(), kRawBlock - 1, kKeptInput) + 1;
    GetMoreRawData(m_raw, std::min(expected, most - m_raw.Size()));
  }
}

// A sample that ends within a UTF-8 sequence would count its lead byte as evidence against UTF-8.
void Reader::CompleteCutSequence() {
  const unsigned char* end = m_raw.end;
  unsigned long back = 1;
  while (back < std::min(m_raw.Size(), 4ul) && (end[-static_cast<long>(back)] & 0xC0) == 0x80) ++back;
  if (m_raw.Size() == 0 || m_state->raw.IsAtEnd()) return;
  unsigned char lead = end[-static_cast<long>(back)];
  unsigned long needed = lead >= 0xF0   ? ((m_requested & Support::kFullUnicode) != 0 ? 4 : 1)
                         : lead >= 0xE0 ? 3
                         : lead >= 0xC0 ? 2
                                        : 1;
  if (needed > back) GetMoreRawData(m_raw, needed - back);
}

// Reads what the level orders, or what follows a provisional choice; after SetFormat the data that is there is enough.
void Reader::FillSample() {
  const bool isAgain = m_state->choice.state == State::kProvisional;
  if (m_isFilled && m_raw.Size() > 0) return;
  const Encoding level = m_requested & Support::kLevelMask;
  if ((level & Support::kWholeInOnce) != 0 && !isAgain) {
    std::uint64_t place;
    ReadWholeInput(m_in->GetPlace(&place) ? kKeptInput : kLongestInput);
  } else {
    const unsigned long wanted = level == Support::kDetect ? kFairSample : kQuickSample;
    if (m_raw.Size() < wanted && !m_state->raw.IsAtEnd()) GetMoreRawData(m_raw, wanted - m_raw.Size());
    if (Detects(m_requested)) CompleteCutSequence();
  }
  m_isFilled = true;
}

// --- the check of the format ---

bool Reader::NeedsCheck() const {
  const State state = m_state->choice.state;
  return state == State::kNone || state == State::kFailed || (state == State::kProvisional && !m_isFilled);
}

bool Reader::IsAtBeginning() const { return m_delivered == 0 && m_state->raw.Position() == 0; }

void Reader::CheckFormat() {
  if (!NeedsCheck()) return;
  SReaderState& state = *m_state;
  const bool isAgain = state.choice.state == State::kProvisional;
  FillSample();
  if (isAgain && m_raw.Size() == 0) {  // the whole input was ASCII
    state.choice.state = State::kFinal;
    return;
  }
  SFormatSample sample;
  sample.begin = m_raw.start;
  sample.end = m_raw.end;
  sample.isBeginning = IsAtBeginning();
  sample.isWhole = state.raw.IsAtEnd();
  // Later data of an input that was long enough for detection is detected, however little is left of it.
  sample.detects = Detects(m_requested) && (isAgain || m_raw.Size() >= kLeastDetected);
  const bool scansOn = sample.detects && !sample.isWhole && (m_requested & Support::kWholeInOnce) != 0;
  if (scansOn) sample.end = SEndOfPiece(sample.begin, sample.end);

  Scorer scorer(*this, sample);
  const SFormatChoice choice = SCheckFormat(m_requested, sample, state.choice, scorer);
  if (choice.state == State::kFailed) {
    state.choice = choice;
    ThrowFailure();
  }
  STextDecoder decoder = state.decoder;
  decoder.Select(choice.selected, m_quickUTF8 != 0);
  state.decoder = decoder;
  state.choice = choice;
  m_raw.start += choice.markLength;
}

void Reader::ThrowFailure() const {
  using Failure = SFormatChoice::Failure;
  switch (m_state->choice.failure) {
    case Failure::kNoMark:
      throw SEIONoUnicodeBOM();
    case Failure::kMismatchedMark:
      throw SEIOMismatchedBOM();
    case Failure::kUnsupportedPage:
      throw SEIOInvalidEncoding();
    case Failure::kNoForm:
      throw SEEncodingException();
    default:
      throw SEIODetectFailed();
  }
}

Encoding Reader::DataAffinity(const unsigned char* begin, const unsigned char* end, std::int32_t& ascii,
                              std::int32_t& utf8, std::int32_t& active, std::int32_t& utf16, std::int32_t& littleZeros,
                              std::int32_t& bigZeros, std::int32_t& specified, unsigned short codePage) {
  SDetectionCounters counters{ascii, utf8, active, utf16, littleZeros, bigZeros, specified};
  const auto rules = (m_requested & Support::kFullUnicode) != 0 ? SUnicodeRules::kFull : SUnicodeRules::kBasic;
  const Encoding settled = SScanAffinity(begin, end, counters, codePage, rules, m_state->samplePlace);
  ascii = counters.ascii;
  utf8 = counters.utf8;
  active = counters.active;
  utf16 = counters.utf16;
  littleZeros = counters.littleZeros;
  bigZeros = counters.bigZeros;
  specified = counters.specified;
  return settled;
}

Encoding Reader::GuessEncoding(Encoding requested, std::int32_t ascii, std::int32_t utf8, std::int32_t active,
                               std::int32_t utf16, std::int32_t littleZeros, std::int32_t bigZeros,
                               std::int32_t specified) {
  const SDetectionCounters counters{ascii, utf8, active, utf16, littleZeros, bigZeros, specified};
  m_state->guess = SEncodingGuess::Make(requested, counters, m_state->isComplete);
  return m_state->guess.selected;
}

// Looks at an input that is too long to keep, from `begin` in the raw data to its end, and goes back. True when that
// was possible, so that the evidence is that of the whole input.
bool Reader::ScoreRest(const unsigned char* begin, SDetectionCounters& counters, unsigned short codePage) {
  std::uint64_t place;
  if ((m_requested & Support::kWholeInOnce) == 0 || !m_in->GetPlace(&place)) return false;
  try {
    ScorePieces(begin, counters, codePage);
  } catch (...) {
    m_in->GoToPlace(place);
    throw;
  }
  if (!m_in->GoToPlace(place)) throw SEIOException();
  return true;
}

void Reader::ScorePieces(const unsigned char* begin, SDetectionCounters& counters, unsigned short codePage) {
  constexpr unsigned long kPiece = 0x400000;
  struct Block {
    BufferStatus bytes;
    ~Block() { FreeBuffer(bytes); }
  } piece;
  AllocRawData(piece.bytes, kPiece);
  unsigned char* const start = piece.bytes.block;
  unsigned long held = static_cast<unsigned long>(m_raw.end - begin);
  std::memcpy(start, begin, held);
  std::uint64_t total = static_cast<std::uint64_t>(begin - m_raw.start);
  SAffinitySum sum(counters, begin - m_raw.start);
  const Behind others(*m_state);
  for (bool isLast = false; !isLast;) {
    while (held < kPiece && !isLast) {
      const unsigned long got = ReadRawData(start + held, kPiece - held);
      held += got;
      isLast = got == 0;
    }
    const unsigned char* end = isLast ? start + held : SEndOfPiece(start, start + held);
    SDetectionCounters fresh = sum.Fresh();
    DataAffinity(start, end, fresh.ascii, fresh.utf8, fresh.active, fresh.utf16, fresh.littleZeros, fresh.bigZeros,
                 fresh.specified, codePage);
    sum.Add(fresh, end - start);
    total += static_cast<std::uint64_t>(end - start);
    held -= static_cast<unsigned long>(end - start);
    std::memmove(start, end, held);
  }
  if (total % 2 != 0) {  // odd lengths are no 16-bit text
    SDetectionCounters rejected = sum.Fresh();
    rejected.utf16 = rejected.littleZeros = rejected.bigZeros = SDetectionCounters::kRejected;
    sum.Add(rejected, 0);
  }
  counters = sum.Total();
}

void Reader::SetFormat(Encoding requested) {
  // With the decoder that the text was read with, as long as there is one.
  Position current = CurrentPosition();
  Settle(current);
  if (m_hasMark) Settle(m_mark);
  ClearText();
  if (m_delivered == 0 && m_state->raw.HasBeginning()) current = Position();
  GoTo(current);
  m_requested = requested;
  m_state->choice = SFormatChoice();
  m_state->loss = SReaderState::kNowhere;
}

// --- decoding ---

void Reader::ReadMoreRaw() {
  DropConsumedRaw();
  if (m_state->choice.state == State::kProvisional) {
    m_isFilled = false;
    CheckFormat();
  } else {
    GetMoreRawData(m_raw, kRawBlock);
  }
}

// Decodes up to `room` characters, at least one; 0 at the end of the data, and when the format turns out to be one
// that must be decoded as a whole.
unsigned long Reader::DecodePiece(WCHAR* out, unsigned long room) {
  SReaderState& state = *m_state;
  for (;;) {
    CheckFormat();
    if (state.decoder.NeedsWholeInput()) return 0;
    if (m_raw.Size() > 0) {
      m_run = PositionOfRaw();
      const STextDecoder::Run run = state.decoder.Decode(m_raw.start, m_raw.end, state.raw.IsAtEnd(), out, room);
      const bool moved = run.in != m_raw.start;
      m_raw.start += run.in - m_raw.start;
      if (run.out != out) return static_cast<unsigned long>(run.out - out);
      if (run.isLoss) state.decoder.ThrowLoss();
      if (moved) continue;  // everything was dropped
    }
    if (state.raw.IsAtEnd()) return 0;
    ReadMoreRaw();
  }
}

// The same for all that is left, into the text buffer.
unsigned long Reader::DecodeWhole() {
  SReaderState& state = *m_state;
  ReadWholeInput(kLongestInput);
  if (!state.raw.IsAtEnd() || m_raw.Size() > kLongestInput) throw SEOutOfMemory();  // more than the platform converts
  if (m_raw.Size() == 0) return 0;
  if (state.raw.Position() == state.loss) state.decoder.ThrowLoss();
  AllocStrData(m_text, m_raw.Size() * static_cast<unsigned long>(sizeof(WCHAR)));
  m_run = PositionOfRaw();
  WCHAR* out = reinterpret_cast<WCHAR*>(m_text.block);
  const STextDecoder::Run run = state.decoder.Decode(m_raw.start, m_raw.end, true, out, m_raw.Size());
  if (run.isLoss) {
    if (run.out == out) state.decoder.ThrowLoss();
    state.loss = state.raw.PositionOf(run.in);
  }
  m_raw.start += run.in - m_raw.start;
  return static_cast<unsigned long>(run.out - out);
}

bool Reader::DecodeNextRun() {
  ClearText();
  AllocStrData(m_text, kTextRun * static_cast<unsigned long>(sizeof(WCHAR)));
  unsigned long characters = DecodePiece(reinterpret_cast<WCHAR*>(m_text.block), kTextRun);
  if (characters == 0 && m_state->decoder.NeedsWholeInput()) characters = DecodeWhole();
  m_text.end = m_text.start + characters * sizeof(WCHAR);
  return characters > 0;
}

unsigned long Reader::DecodeInto(WCHAR* out, unsigned long room) {
  if (room >= kLeastDirect) {
    ClearText();
    if (const unsigned long count = DecodePiece(out, room)) {
      m_delivered += count;
      return count;
    }
    if (!m_state->decoder.NeedsWholeInput()) return 0;
  }
  if (!DecodeNextRun()) return 0;
  const unsigned long count = std::min(room, TextLength());
  std::memcpy(out, m_text.start, count * sizeof(WCHAR));
  Deliver(count);
  return count;
}

// --- positions ---

Reader::Position Reader::PositionOfRaw() const {
  const STextDecoder::Losses& losses = m_state->decoder.GetLosses();
  return {m_state->raw.Position(), 0, losses.replaced, losses.dropped};
}

Reader::Position Reader::CurrentPosition() const {
  if (TextLength() == 0) return PositionOfRaw();
  Position position = m_run;
  position.delivered = static_cast<unsigned long>(m_text.start - m_text.block) / sizeof(WCHAR);
  return position;
}

// Decodes the run of the position anew and passes over what was delivered of it.
void Reader::GoTo(const Position& position) {
  ClearText();
  m_state->raw.GoTo(position.run);
  m_state->decoder.SetLosses({position.replaced, position.dropped});
  for (unsigned long left = position.delivered; left > 0 && DecodeNextRun();) {
    const unsigned long passed = std::min(left, TextLength());
    m_text.start += passed * sizeof(WCHAR);
    left -= passed;
  }
}

// Finds the byte at which the character of the position begins, because another decoder comes.
void Reader::Settle(Position& position) {
  if (position.delivered == 0) return;
  SReaderState& state = *m_state;
  STextDecoder decoder = state.decoder;
  decoder.SetLosses({position.replaced, position.dropped});
  const unsigned char* found =
      decoder.Locate(state.raw.ByteAt(position.run), m_raw.end, state.raw.IsAtEnd(), position.delivered);
  const STextDecoder::Losses& losses = decoder.GetLosses();
  position = {state.raw.PositionOf(found), 0, losses.replaced, losses.dropped};
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
}

unsigned long Reader::Available() {
  const unsigned long waiting = SAddClipped(TextLength(), m_raw.Size());
  return m_state->raw.IsAtEnd() ? waiting : SAddClipped(waiting, m_in->Available());
}

int Reader::IsEOF() { return TextLength() == 0 && !DecodeNextRun(); }

void Reader::Close() {
  FreeBuffer(m_text);
  FreeBuffer(m_raw);
  m_hasMark = false;
  m_isFilled = true;
  m_state->raw.SetAtEnd();
  m_state->choice.state = State::kFinal;
  m_in->Close();
}
