#include "qxcore/stream/encoding/multi_format_reader_status_base.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

#include "qxcore/core/exception.h"
#include "qxcore/core/memory.h"
#include "qxcore/core/module_state.h"
#include "qxcore/stream/encoding/internal/reader_state.h"

using StatusBase = SMultiFormatReaderStatusBase;
using Encoding = StatusBase::Encoding;
using Reason = SEncodingGuess::Reason;

StatusBase::SMultiFormatReaderStatusBase(Encoding requested)
    : m_requested(requested), m_state(new SReaderState(m_raw)) {}

StatusBase::SMultiFormatReaderStatusBase(const SMultiFormatReaderStatusBase& other)
    : SMultiFormatReaderStatusBase(other.m_requested) {
  *this = other;
}

SMultiFormatReaderStatusBase& StatusBase::operator=(const SMultiFormatReaderStatusBase& other) {
  m_requested = other.m_requested;
  m_quickUTF8 = other.m_quickUTF8;
  m_state->choice = other.m_state->choice;
  m_state->decoder = other.m_state->decoder;
  m_state->raw.SetAtEnd(other.m_state->raw.IsAtEnd());
  return *this;
}

StatusBase::~SMultiFormatReaderStatusBase() { FreeBuffer(m_raw); }

void StatusBase::FreeBuffer(BufferStatus& buffer) noexcept {
  if (!buffer.isBorrowed) SMemFree(buffer.block);
  buffer = BufferStatus();
}

static void Grow(SRawBuffer& buffer, unsigned long size) {
  const unsigned long before = static_cast<unsigned long>(buffer.start - buffer.block);
  const bool fits = size <= buffer.capacity - before;
  if (fits && !buffer.isBorrowed) return;
  constexpr unsigned long kMost = std::numeric_limits<unsigned long>::max();
  if (size > kMost - before) throw SEOutOfMemory();
  const unsigned long content = buffer.Size();
  const unsigned long twice = buffer.capacity <= kMost / 2 ? buffer.capacity * 2 : kMost;
  const unsigned long capacity = std::max({size + before, fits ? buffer.capacity : twice, 256ul});
  void* block = buffer.isBorrowed ? SMemAlloc(capacity) : SMemRealloc(buffer.block, capacity);
  if (buffer.isBorrowed) std::memcpy(block, buffer.block, before + content);
  buffer.block = static_cast<unsigned char*>(block);
  buffer.start = buffer.block + before;
  buffer.end = buffer.start + content;
  buffer.capacity = capacity;
  buffer.isBorrowed = false;
}

void StatusBase::AllocRawData(BufferStatus& buffer, unsigned long size) { Grow(buffer, size); }
void StatusBase::AllocStrData(BufferStatus& buffer, unsigned long size) { Grow(buffer, size); }

Encoding StatusBase::GetFormat() const { return m_state->choice.selected; }
const SDetectionCounters& StatusBase::GetCounters() const { return m_state->choice.counters; }

unsigned int StatusBase::GetStatus() const {
  using State = SFormatChoice::State;
  const State state = m_state->choice.state;
  const bool isChecked = state == State::kProvisional || state == State::kFinal;
  return (!isChecked && m_raw.Size() > 0 ? kRawPresent : 0u) | (m_state->raw.IsAtEnd() ? kWholeInput : 0u) |
         (state == State::kProvisional ? kProvisional : 0u) | (state == State::kFinal ? kSelected : 0u) |
         (m_state->choice.NeedsWarning() ? kWarning : 0u);
}

int StatusBase::SetQuickUTF8ToUTF16(int quick) {
  std::swap(quick, m_quickUTF8);
  return quick;
}

// --- reports ---

static SString Text(unsigned id) { return SCoreGetModuleState()->LoadStringW(id); }
static SString Text(unsigned id, const SString& first, const SString& second = SString()) {
  SString formatted;
  formatted.Format(Text(id), first.GetSafePointer(), second.GetSafePointer());
  return formatted;
}
static SString NameOf(StatusBase::Encoding encoding) { return StatusBase::Support::GetEncodingName(encoding, 0, 1); }

SString StatusBase::GetDetectionWarning() const {
  const SFormatChoice& choice = m_state->choice;
  return choice.state == SFormatChoice::State::kFailed || choice.NeedsWarning() ? GetDetectionReport() : SString();
}

SString StatusBase::GetDetectionReport() const {
  const SFormatChoice& choice = m_state->choice;
  const SEncodingGuess& guess = choice.guess;
  if (choice.state == SFormatChoice::State::kFailed) {
    const bool hasNone = choice.wasDetected || choice.failure == SFormatChoice::Failure::kNoEncoding;
    return hasNone ? Text(220) : SString();
  }
  const SString hint = NameOf(m_requested);
  const SString selected = NameOf(choice.selected);
  const bool differs = !Support::IsSameFormat(m_requested, choice.selected);
  switch (guess.reason) {
    case Reason::kNone:
      return SString();
    case Reason::kNoneAcceptable:
      return Text(223, selected);
    case Reason::kTieHint:
      return Text(228, hint);
    case Reason::kTie:
      return Text(224, selected);
    case Reason::kHint:
      if (!Support::IsSameFormat(guess.best, m_requested)) return Text(227, NameOf(guess.best), hint);
      break;
    case Reason::kASCII:
    case Reason::kGuess:
      break;
  }
  if (guess.isComplete && guess.isUnique) return Text(221, selected) + (differs ? Text(222, hint) : SString());
  SString report = Text(224, selected);
  if (guess.isUnique) return report + Text(226);
  return differs ? report + Text(225, hint) : report;
}

SString StatusBase::GetEncodingWarning() const {
  const SString from = NameOf(GetFormat());
  const SString to = Support::GetAppEncodingName();
  SString warning;
  if (GetReplacedCount() > 0) {
    warning.Format(Text(218), m_state->decoder.GetReplacement(), from.GetSafePointer(), to.GetSafePointer());
  } else if (GetDroppedCount() > 0) {
    warning.Format(Text(219), from.GetSafePointer(), to.GetSafePointer());
  }
  return warning;
}

unsigned long long StatusBase::GetReplacedCount() const { return m_state->decoder.GetLosses().replaced; }
unsigned long long StatusBase::GetDroppedCount() const { return m_state->decoder.GetLosses().dropped; }
