#include "qxcore/stream/encoding/internal/encoding_guess.h"

#include <algorithm>

using Support = SAbstractIO::SMultiFormatSupport;
using Encoding = Support::Encoding;

namespace {

struct Candidate {
  std::int32_t counter;
  Encoding encoding;
};

// The candidate strictly above all others, or null.
const Candidate* Strongest(const Candidate (&candidates)[4]) {
  for (const Candidate& one : candidates) {
    bool isAbove = std::all_of(std::begin(candidates), std::end(candidates),
                               [&](const Candidate& other) { return &other == &one || one.counter > other.counter; });
    if (isAbove) return &one;
  }
  return nullptr;
}

bool IsHintAcceptable(Encoding hint, const SDetectionCounters& affinity, Encoding guessedOrder) {
  if ((hint & Support::kFormatMask) == Support::kUTF8) return affinity.utf8 > 0;
  // A hint that names a code page, even the active one, is never accepted here; that is on purpose.
  if ((hint & Support::kValueMask) == Support::kANSI) return affinity.active > 0;
  return (hint & Support::kFormatMask) == guessedOrder && affinity.utf16 > 0;
}

Encoding BreakTie(Encoding requested, const SDetectionCounters& a) {
  if (a.active == a.utf8 && a.active > a.specified) return Support::kANSI;
  if (a.utf8 > a.active && a.utf8 > a.specified && a.utf8 == a.utf16) return Support::kUTF8;
  if (a.active > a.utf8 && a.active > a.specified && a.active == a.utf16) return Support::kANSI;
  return requested;
}

}  // namespace

SEncodingGuess SEncodingGuess::Make(Encoding requested, const SDetectionCounters& affinity, bool isComplete) {
  const Encoding policy = requested & Support::kFlagsMask;
  const Encoding order = affinity.littleZeros > affinity.bigZeros ? Support::kUTF16LE : Support::kUTF16BE;
  SEncodingGuess guess;
  guess.isComplete = isComplete;

  if (affinity.ascii >= 0) {
    guess.selected = policy | Support::kASCII;
    guess.best = Support::kASCII;
    guess.reason = Reason::kASCII;
    guess.isUnique = true;
    guess.isProvisional = !isComplete;
    return guess;
  }

  const Candidate candidates[4] = {{affinity.utf8, Support::kUTF8},
                                   {affinity.active, Support::kANSI},
                                   {affinity.specified, requested & Support::kValueMask},
                                   {affinity.utf16, order}};
  auto acceptable = std::count_if(std::begin(candidates), std::end(candidates),
                                  [](const Candidate& one) { return one.counter >= 0; });
  if (acceptable == 0) {
    bool staysAsAsked =
        Support::KindOf(requested) == Support::kOEM || (policy & (Support::kFavorHint | Support::kFavorGuess)) != 0;
    guess.selected = staysAsAsked ? requested : policy | Support::kOEM;
    guess.reason = Reason::kNoneAcceptable;
    guess.needsWarning = !staysAsAsked;
    return guess;
  }

  const Candidate* best = Strongest(candidates);
  guess.best = best != nullptr ? best->encoding : 0;
  guess.isUnique = best != nullptr && acceptable == 1;
  const bool isSettled = guess.isComplete && guess.isUnique;
  if (best != nullptr && (policy & Support::kFavorGuess) != 0) {
    guess.selected = policy | best->encoding;
    guess.reason = Reason::kGuess;
    return guess;
  }
  if (IsHintAcceptable(requested, affinity, order)) {
    bool differs = guess.best != (requested & Support::kValueMask);
    guess.selected = requested;
    guess.reason = best != nullptr ? Reason::kHint : Reason::kTieHint;
    guess.needsWarning = !isSettled && (policy & Support::kFavorHint) == 0 && differs;
    return guess;
  }
  if (best != nullptr) {
    guess.selected = policy | best->encoding;
    guess.reason = Reason::kGuess;
    guess.needsWarning = !isSettled;
    return guess;
  }
  Encoding broken = BreakTie(requested, affinity);
  guess.selected = policy | broken;
  guess.reason = broken == requested ? Reason::kTieHint : Reason::kTie;
  guess.needsWarning = true;
  return guess;
}
