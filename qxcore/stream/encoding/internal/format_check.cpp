#include "qxcore/stream/encoding/internal/format_check.h"

#include <algorithm>

#include "qxcore/stream/encoding/internal/data_affinity.h"

using Support = SAbstractIO::SMultiFormatSupport;
using Encoding = Support::Encoding;
using Choice = SFormatChoice;

namespace {

constexpr unsigned long kQuickSample = 4096;
constexpr unsigned long kLongestSample = 0x7FFFFFFE;  // the platform counts in an int; even, for 16-bit text
constexpr unsigned long kLeastXML = 11;
constexpr int kXMLLength = 5;

struct Mark {
  Encoding format = 0;
  unsigned length = 0;
};

Mark SniffMark(const unsigned char* at, unsigned long size) {
  if (size >= 3 && at[0] == 0xEF && at[1] == 0xBB && at[2] == 0xBF) return {Support::kUTF8 | Support::kOptionalBOM, 3};
  if (size >= 2 && at[0] == 0xFE && at[1] == 0xFF) return {Support::kUTF16BE | Support::kOptionalBOM, 2};
  if (size >= 2 && at[0] == 0xFF && at[1] == 0xFE) return {Support::kUTF16LE | Support::kOptionalBOM, 2};
  return {};
}

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

// One check, step by step.
class Check {
 public:
  Check(Encoding requested, const SFormatSample& sample, const Choice& before, SFormatScorer& scorer)
      : m_requested(requested), m_sample(sample), m_before(before), m_scorer(scorer) {
    m_choice.selected = before.state == Choice::State::kProvisional ? before.selected : requested;
    m_choice.wasDetected = sample.detects;
    m_choice.state = Choice::State::kFinal;
  }

  Choice Run() {
    const bool needsMark =
        m_sample.isBeginning && Support::IsUnicode(m_requested) && (m_requested & Support::kRequiredBOM) != 0;
    if (m_sample.detects || needsMark) {
      if (m_sample.isBeginning) SniffBeginning();
      if (needsMark && (m_sniffed & Support::kOptionalBOM) == 0) return Fail(Choice::Failure::kNoMark);
      if (m_sample.detects) {
        Detect();
      } else if (!Support::IsSameFormat(m_sniffed, m_choice.selected)) {
        return Fail(Choice::Failure::kMismatchedMark);
      }
    } else if (m_sample.isBeginning) {
      DropOwnMark();
    }
    return CheckSelection();
  }

 private:
  Choice Fail(Choice::Failure failure) {
    m_choice.selected = 0;
    m_choice.markLength = 0;
    m_choice.state = Choice::State::kFailed;
    m_choice.failure = failure;
    m_choice.guess.needsWarning = false;
    return m_choice;
  }

  void SniffBeginning() {
    const Mark mark = SniffMark(m_sample.begin, m_sample.Size());
    m_sniffed = mark.format;
    m_choice.markLength = mark.length;
    if (m_sample.detects) SniffXML();
  }

  // With no detection and an optional mark, a mark of the format itself is dropped; any other is data.
  void DropOwnMark() {
    if (!Support::IsUnicode(m_choice.selected) || (m_choice.selected & Support::kOptionalBOM) == 0) return;
    const Mark mark = SniffMark(m_sample.begin, m_sample.Size());
    if (mark.format != 0 && Support::IsSameFormat(mark.format, m_choice.selected)) m_choice.markLength = mark.length;
  }

  void SniffXML() {
    if (m_sample.Size() < kLeastXML) return;
    const unsigned char* at = m_sample.begin + m_choice.markLength;
    if (StartsWithXML(at, 1, 0)) {  // eight bytes at least stand behind any mark
      m_isXML8 = m_sniffed == 0;
      m_sniffed |= Support::kXML | (m_isXML8 ? Support::kASCII : 0);
      return;
    }
    if (m_sample.end - at < 2 * kXMLLength) return;
    const struct {
      std::size_t significant;
      Encoding format;
    } kOrders[] = {{0, Support::kUTF16LE}, {1, Support::kUTF16BE}};
    for (const auto& order : kOrders) {
      if (!StartsWithXML(at, 2, order.significant)) continue;
      if (m_sniffed == 0 || Support::IsSameFormat(m_sniffed, order.format)) m_sniffed |= Support::kXML;
      if (m_sniffed == Support::kXML) m_sniffed |= order.format;
    }
  }

  void Detect() {
    const Encoding policy = m_requested & Support::kFlagsMask;
    const bool wasProvisional = m_before.state == Choice::State::kProvisional;
    if (m_sniffed != 0 && !m_isXML8 && !wasProvisional) {
      m_choice.selected = policy | m_sniffed;
      return;
    }
    const Encoding xml = (m_sniffed | m_choice.selected) & Support::kXML;
    bool isComplete = m_sample.isWhole && (m_requested & Support::kLevelMask) != 0;
    const Encoding settled = Score(isComplete);
    bool isProvisional;
    if (settled != 0) {
      m_choice.selected = policy | settled | xml;
      isProvisional = Support::KindOf(settled) == Support::kASCII && (wasProvisional || m_isXML8);
    } else {
      m_choice.guess = m_scorer.Choose(m_choice.counters, isComplete);
      m_choice.selected = m_choice.guess.selected | xml;
      isProvisional = m_choice.guess.isProvisional;
    }
    m_choice.state = isProvisional ? Choice::State::kProvisional : Choice::State::kFinal;
  }

  // The evidence of the sample: that of its beginning first, then that of all of it; an encoding when it settles it.
  Encoding Score(bool& isComplete) {
    const unsigned char* begin = m_sample.begin + m_choice.markLength;
    const unsigned long size = static_cast<unsigned long>(m_sample.end - begin);
    Counters& counters = m_choice.counters;
    if (m_isXML8 || (m_sample.isWhole && size % 2 != 0)) {
      counters.utf16 = counters.littleZeros = counters.bigZeros = Counters::kRejected;
    }
    const auto page =
        static_cast<unsigned short>(Support::IsANSI(m_requested) ? m_requested & Support::kCodePageMask : 0);
    if (page != 0) counters.specified = 0;

    const unsigned char* quickEnd = begin + std::min(size, kQuickSample);
    const unsigned char* wholeEnd = begin + std::min(size, kLongestSample);
    Encoding settled = m_scorer.ScoreSample(begin, quickEnd, counters, page);
    if (settled == 0 && quickEnd != wholeEnd) settled = m_scorer.ScoreSample(begin, wholeEnd, counters, page);
    if (settled != 0) return settled;
    if (wholeEnd != m_sample.end) ScoreBehind(wholeEnd, page);
    if (!m_sample.isWhole) isComplete = m_scorer.ScoreRest(counters, page);
    return 0;
  }

  // What lies in memory beyond the longest sample.
  void ScoreBehind(const unsigned char* at, unsigned short page) {
    constexpr unsigned long kPiece = 0x40000000;
    SAffinitySum sum(m_choice.counters, kLongestSample);
    while (at != m_sample.end) {
      const unsigned char* end = at + std::min(static_cast<unsigned long>(m_sample.end - at), kPiece);
      if (end != m_sample.end) end = SEndOfPiece(at, end);
      Counters piece = sum.Fresh();
      m_scorer.ScorePiece(at, end, piece, page);
      sum.Add(piece, end - at);
      at = end;
    }
    m_choice.counters = sum.Total();
  }

  Choice CheckSelection() {
    const Encoding selected = m_choice.selected;
    switch (Support::KindOf(selected)) {
      case 0:
        return Fail(Choice::Failure::kNoEncoding);
      case Support::kASCII:
      case Support::kOEM:
        return m_choice;
      case Support::kUnicode:
        return Support::MachineSupports(selected) ? m_choice : Fail(Choice::Failure::kNoForm);
      default:
        return Support::MachineSupports(selected) ? m_choice : Fail(Choice::Failure::kUnsupportedPage);
    }
  }

  using Counters = SDetectionCounters;

  const Encoding m_requested;
  const SFormatSample& m_sample;
  const Choice& m_before;
  SFormatScorer& m_scorer;
  Choice m_choice;
  Encoding m_sniffed = 0;  // what mark and declaration say
  bool m_isXML8 = false;   // a declaration in 8-bit characters without a mark: any 8-bit encoding may follow
};

}  // namespace

SFormatChoice SCheckFormat(Encoding requested, const SFormatSample& sample, const SFormatChoice& before,
                           SFormatScorer& scorer) {
  return Check(requested, sample, before, scorer).Run();
}
