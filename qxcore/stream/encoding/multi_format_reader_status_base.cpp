#include "qxcore/stream/encoding/multi_format_reader_status_base.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/memory.h"
#include "qxcore/core/module_state.h"

using StatusBase = SMultiFormatReaderStatusBase;
using Reason = SEncodingGuess::Reason;

StatusBase::SMultiFormatReaderStatusBase(const SMultiFormatReaderStatusBase& other) : m_requested(0) { *this = other; }

SMultiFormatReaderStatusBase& StatusBase::operator=(const SMultiFormatReaderStatusBase& other) {
  m_requested = other.m_requested;
  m_selected = other.m_selected;
  m_status = other.m_status & ~kRawPresent;
  m_affinity = other.m_affinity;
  m_guess = other.m_guess;
  m_decoder = other.m_decoder;
  m_hasFailed = other.m_hasFailed;
  m_quickUTF8 = other.m_quickUTF8;
  return *this;
}

StatusBase::~SMultiFormatReaderStatusBase() { FreeBuffer(m_raw); }

void StatusBase::FreeBuffer(BufferStatus& buffer) noexcept {
  if (buffer.capacity != 0) SMemFree(buffer.block);
  buffer = BufferStatus();
}

static void Grow(SMultiFormatReaderStatusBase::BufferStatus& buffer, unsigned long size) {
  unsigned long before = static_cast<unsigned long>(buffer.start - buffer.block);
  if (size <= buffer.capacity - before) return;
  unsigned long content = buffer.Size();
  unsigned long capacity = std::max({size + before, buffer.capacity * 2, 256ul});
  unsigned char* block = static_cast<unsigned char*>(SMemRealloc(buffer.block, capacity));
  buffer.block = block;
  buffer.start = block + before;
  buffer.end = buffer.start + content;
  buffer.capacity = capacity;
}

void StatusBase::AllocRawData(BufferStatus& buffer, unsigned long size) { Grow(buffer, size); }
void StatusBase::AllocStrData(BufferStatus& buffer, unsigned long size) { Grow(buffer, size); }

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
  return m_hasFailed || (m_status & kWarning) != 0 ? GetDetectionReport() : SString();
}

SString StatusBase::GetDetectionReport() const {
  if (m_hasFailed) return Text(220);
  const SString hint = NameOf(m_requested);
  const SString selected = NameOf(m_selected);
  const bool differs = !Support::IsSameFormat(m_requested, m_selected);
  switch (m_guess.reason) {
    case Reason::kNone:
      return SString();
    case Reason::kNoneAcceptable:
      return Text(223, selected);
    case Reason::kTieHint:
      return Text(228, hint);
    case Reason::kTie:
      return Text(224, selected);
    case Reason::kHint:
      if (!Support::IsSameFormat(m_guess.best, m_requested)) return Text(227, NameOf(m_guess.best), hint);
      break;
    case Reason::kASCII:
    case Reason::kGuess:
      break;
  }
  if (m_guess.isComplete && m_guess.isUnique) return Text(221, selected) + (differs ? Text(222, hint) : SString());
  SString report = Text(224, selected);
  if (m_guess.isUnique) return report + Text(226);
  return differs ? report + Text(225, hint) : report;
}

SString StatusBase::GetEncodingWarning() const {
  const SString from = NameOf(m_selected);
  const SString to = Support::GetAppEncodingName();
  SString warning;
  if (GetReplacedCount() > 0) {
    warning.Format(Text(218), m_decoder.GetReplacement(), from.GetSafePointer(), to.GetSafePointer());
  } else if (GetDroppedCount() > 0) {
    warning.Format(Text(219), from.GetSafePointer(), to.GetSafePointer());
  }
  return warning;
}
