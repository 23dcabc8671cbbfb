// The check of the format: a sample of the input in, the selected encoding and how sure it is out.
//
// Marks and an XML declaration are looked for, the sample is scored, and a choice is made. Nothing is read and
// nothing is kept here; what a reader lets others override comes in through SFormatScorer.
#pragma once

#include "qxcore/stream/encoding/detection_counters.h"
#include "qxcore/stream/encoding/internal/encoding_guess.h"
#include "qxcore/stream/encoding/multi_format_support.h"

struct SFormatChoice {
  using Encoding = SAbstractIO::SMultiFormatSupport::Encoding;  // see multi_format_support.h

  enum class State {
    kNone,         // nothing was checked yet
    kProvisional,  // ASCII so far; more data may show other bytes
    kFinal,
    kFailed  // nothing is selected; `failure` says why
  };
  enum class Failure {
    kNothing,
    kNoMark,           // a mark was required, and there is none
    kMismatchedMark,   // the mark is that of another format
    kNoEncoding,       // detection selected nothing
    kUnsupportedPage,  // a code page that the machine lacks
    kNoForm            // a Unicode value without a form
  };

  State state = State::kNone;
  Failure failure = Failure::kNothing;
  Encoding selected = 0;        // with the requested policy
  unsigned markLength = 0;      // bytes of a byte order mark at the start of the sample, which are no text
  bool wasDetected = false;     // encodings were looked for
  SDetectionCounters counters;  // the evidence of the last detection
  SEncodingGuess guess;         // what was made of it
  bool NeedsWarning() const { return guess.needsWarning; }
};

struct SFormatSample {
  const unsigned char* begin = nullptr;
  const unsigned char* end = nullptr;
  bool isBeginning = true;  // the sample begins where the input does, so that a mark may stand there
  bool isWhole = false;     // it holds the whole input
  bool detects = false;     // the level orders detection, and the input is long enough for it

  unsigned long Size() const { return static_cast<unsigned long>(end - begin); }
};

// The steps that a reader lets derived classes replace.
class SFormatScorer {
 public:
  using Encoding = SAbstractIO::SMultiFormatSupport::Encoding;  // see multi_format_support.h

  // Scores a sample; an encoding when that settles it, else 0.
  virtual Encoding ScoreSample(const unsigned char* begin, const unsigned char* end, SDetectionCounters& counters,
                               unsigned short codePage) = 0;
  // Adds the evidence of a piece that others precede, with counters of its own.
  virtual void ScorePiece(const unsigned char* begin, const unsigned char* end, SDetectionCounters& counters,
                          unsigned short codePage) = 0;
  // Scores what follows the sample, where it can be looked at without keeping it; true when that was up to
  // the end of the input.
  virtual bool ScoreRest(SDetectionCounters& counters, unsigned short codePage) = 0;
  // Chooses among the candidates.
  virtual SEncodingGuess Choose(const SDetectionCounters& counters, bool isComplete) = 0;

 protected:
  ~SFormatScorer() = default;
};

// Checks the sample against the request. `before` is the choice so far: a provisional one is decided anew with what
// came since, and keeps the XML flag.
SFormatChoice SCheckFormat(SFormatChoice::Encoding requested, const SFormatSample& sample, const SFormatChoice& before,
                           SFormatScorer& scorer);
