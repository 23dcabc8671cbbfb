// The choice among the candidate encodings by their evidence and the caller's hint.
#pragma once

#include "qxcore/stream/encoding/detection_counters.h"
#include "qxcore/stream/encoding/multi_format_support.h"

struct SEncodingGuess {
  using Encoding = SAbstractIO::SMultiFormatSupport::Encoding;  // see multi_format_support.h

  // How the choice came about; the reports are made of it.
  enum class Reason {
    kNone,            // nothing was tested
    kASCII,           // only 7-bit characters
    kNoneAcceptable,  // every candidate was rejected
    kGuess,           // the one with the most evidence
    kHint,            // the hint, which was acceptable
    kTie,             // several had the most evidence
    kTieHint          // the same, and the hint was taken
  };

  Encoding selected = 0;          // with the requested policy
  Encoding best = 0;              // the candidate with the most evidence; 0 when several have it
  Reason reason = Reason::kNone;  // how it came about
  bool isUnique = false;          // every other candidate was rejected
  bool isComplete = false;        // the whole input was seen
  bool isProvisional = false;     // more data may change it
  bool needsWarning = false;      // the user should know

  // `isComplete`: the whole input was read, and a detection level is set.
  static SEncodingGuess Make(Encoding requested, const SDetectionCounters& affinity, bool isComplete);
};
