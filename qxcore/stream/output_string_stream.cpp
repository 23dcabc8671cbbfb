#include "qxcore/stream/output_string_stream.h"

#include "qxcore/core/internal/quietly.h"
#include "qxcore/core/io_exceptions.h"
#include "qxcore/core/module_state.h"
#include "qxcore/platform/internal/utf.h"
#include "qxcore/stream/encoding/internal/text_encoder.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SOutputStringStream, SOutputStream, 0)

using Stream = SOutputStringStream;
using Encoding = Stream::Encoding;

namespace {

constexpr unsigned kFirstRoom = 1024;

}  // namespace

Stream::SOutputStringStream() : SOutputStringStream(nullptr, Support::kUTF16LE, false) {}
Stream::SOutputStringStream(SOutputStream& out, Encoding format) : SOutputStringStream(&out, format, false) {}
Stream::SOutputStringStream(SOutputStream* out, Encoding format, bool owns)
    : m_out(out, owns), m_encoder(new STextEncoder), m_text(kFirstRoom, 2, 1) {
  SetFormat(format);
}

Stream::~SOutputStringStream() {
  SQuietly([this] { WriteWaiting(); });
}

void Stream::Begin() {
  if (m_hasBegun) return;
  m_encoder->WriteMark(*m_out);
  m_hasBegun = true;
}

void Stream::WriteWaiting() {
  if (!m_out) return;
  Begin();
  if (m_waitingHalf == 0) return;
  WCHAR half = m_waitingHalf;
  m_waitingHalf = 0;
  m_encoder->Write(&half, 1, *m_out);
}

unsigned long Stream::Write(const WCHAR* text, unsigned int count) {
  if (text == nullptr || count == 0) return 0;
  if (!m_out) {
    m_text.Concat(text, text + count);
    return count;
  }
  Begin();
  const WCHAR* at = text;
  const WCHAR* end = text + count;
  if (m_waitingHalf != 0) {
    const WCHAR pair[2] = {m_waitingHalf, *at};
    bool isPair = platform::IsLowSurrogate(*at);
    m_waitingHalf = 0;
    m_encoder->Write(pair, isPair ? 2 : 1, *m_out);
    if (isPair) ++at;
  }
  if (at != end && platform::IsHighSurrogate(end[-1])) m_waitingHalf = *--end;
  m_encoder->Write(at, static_cast<std::size_t>(end - at), *m_out);
  return count;
}

void Stream::Write(int character) {
  WCHAR text = static_cast<WCHAR>(character);
  Write(&text, 1u);
}

unsigned long Stream::Write(const void* buffer, unsigned long count) {
  constexpr unsigned long kUnit = sizeof(WCHAR);
  return Write(static_cast<const WCHAR*>(buffer), static_cast<unsigned int>(count / kUnit)) * kUnit;
}

unsigned long Stream::WriteLn(const WCHAR* text, unsigned int count) {
  unsigned long written = Write(text, count);
  WriteLn();
  return written;
}

void Stream::WriteLn() { Write(SString::CrLf.GetSafePointer(), 2u); }

void Stream::Flush() {
  if (!m_out) return;
  Begin();
  m_out->Flush();
}

void Stream::Close() {
  if (!m_out) return;
  WriteWaiting();
  m_out->Close();
}

int Stream::GetString(SString* text) const {
  if (text == nullptr) return 0;
  *text = !m_out ? SString(m_text) : SString();
  return !m_out;
}

void Stream::SetFormat(Encoding format) {
  if (!Support::MachineSupports(format)) throw SEIOInvalidEncoding();
  m_encoder->Select(format);
}

WCHAR Stream::SetReplacement(WCHAR replacement) {
  WCHAR former = m_encoder->GetReplacement();
  m_encoder->SetReplacement(replacement);
  return former;
}

Encoding Stream::GetFormat() const { return m_encoder->GetEncoding(); }
WCHAR Stream::GetReplacement() const { return m_encoder->GetReplacement(); }
unsigned long long Stream::GetReplacedCount() const { return m_encoder->GetReplaced(); }
unsigned long long Stream::GetDroppedCount() const { return m_encoder->GetDropped(); }

SString Stream::GetEncodingWarning() const {
  SString warning;
  const SString from = Support::GetAppEncodingName();
  const SString to = Support::GetEncodingName(GetFormat(), 0, 1);
  SModuleState* texts = SCoreGetModuleState();
  if (GetReplacedCount() > 0) {
    warning = texts->Format(239, GetReplacement(), from.GetSafePointer(), to.GetSafePointer());
  } else if (GetDroppedCount() > 0) {
    warning = texts->Format(240, from.GetSafePointer(), to.GetSafePointer());
  }
  return warning;
}
