// Construction, assignment, sharing, copy-on-write and lent-out buffers.

#include "qxcore/string/string.h"

#include <algorithm>
#include <climits>

#include "qxcore/platform/wide.h"

constinit const SStaticString<0> g_emptyString = SStaticString<0>::Of(WTEXT(""));

namespace {

constinit const auto g_yes = SStaticString<3>::Of(WTEXT("Yes"));
constinit const auto g_no = SStaticString<2>::Of(WTEXT("No"));
constinit const auto g_space = SStaticString<1>::Of(WTEXT(" "));
constinit const auto g_crLf = SStaticString<2>::Of(WTEXT("\r\n"));

void CopyText(WCHAR* to, const WCHAR* from, int n) {
  std::memmove(to, from, static_cast<std::size_t>(n) * sizeof(WCHAR));
}

// What no int can hold is more than any buffer takes; AllocBuffer refuses the largest int as well.
int LengthOf(SStringView text) { return static_cast<int>(std::min(text.size(), static_cast<std::size_t>(INT_MAX))); }
int LengthOf(const WCHAR* text) { return LengthOf(SString::ViewOf(text)); }

int LengthUpTo(const WCHAR* text, int limit) {
  return static_cast<int>(platform::WideLength(text, static_cast<std::size_t>(limit)));
}

}  // namespace

constinit const SString SString::null(g_emptyString);
constinit const SString SString::Yes(g_yes);
constinit const SString SString::No(g_no);
constinit const SString SString::Space(g_space);
constinit const SString SString::CrLf(g_crLf);

// --- construction ---

SString::SString(const WCHAR* text) : SString(ViewOf(text)) {}

SString::SString(SStringView text) : m_text(AllocBuffer(LengthOf(text))) {
  if (!text.empty()) CopyText(m_text, text.data(), Length());
}

SString::SString(int truth) : SString(truth != 0 ? Yes : No) {}

SString::SString(long number) : SString() { Format(WTEXT("%ld"), number); }

SString::SString(double number) : SString() { Format(WTEXT("%g"), number); }

SString::SString(HINSTANCE instance, unsigned int id) : SString() { LoadStringW(id, instance); }

void SString::CopyLocked(const SString& other) {
  int length = LengthUpTo(other.m_text, other.Length());
  m_text = AllocBuffer(length);
  if (length > 0) CopyText(m_text, other.m_text, length);
}

// --- assignment ---

SString& SString::operator=(const SString& other) {
  if (m_text == other.m_text) return *this;
  std::int32_t refs = other.Data()->Refs();
  bool locked = Data()->Refs() == SStringData::kLocked;
  if (refs == SStringData::kLocked) {
    AssignCopy(LengthUpTo(other.m_text, other.Length()), other.m_text);
  } else if (locked && (refs != SStringData::kStatic || other.IsEmpty())) {
    AssignCopy(other.Length(), other.m_text);
  } else {
    SString shared(other);
    Swap(shared);
  }
  return *this;
}

SString& SString::operator=(SString&& other) {
  if (Data()->Refs() == SStringData::kLocked) return *this = static_cast<const SString&>(other);
  Swap(other);
  return *this;
}

SString& SString::operator=(const WCHAR* text) {
  AssignCopy(LengthOf(text), text);
  return *this;
}

SString& SString::operator=(SStringView text) {
  AssignCopy(LengthOf(text), text.data());
  return *this;
}

SString& SString::operator=(WCHAR character) {
  AssignCopy(character != 0 ? 1 : 0, &character);
  return *this;
}

// --- appending ---

SString& SString::operator+=(const SString& text) {
  ConcatInPlace(text.Length(), text.m_text);
  return *this;
}

SString& SString::operator+=(const WCHAR* text) {
  ConcatInPlace(LengthOf(text), text);
  return *this;
}

SString& SString::operator+=(SStringView text) {
  ConcatInPlace(LengthOf(text), text.data());
  return *this;
}

void SString::ConcatByCopy(int n, const WCHAR* text) {
  if (n <= 0) return;
  SString joined = ConcatCopy(Length(), m_text, n, text);
  Swap(joined);
}

SString SString::ConcatCopy(int n1, const WCHAR* text1, int n2, const WCHAR* text2) {
  // The sum of two lengths may exceed an int; AllocBuffer refuses any length as large as the clipped one.
  long long sum = static_cast<long long>(n1) + n2;
  SString joined(Adopt{}, AllocBuffer(static_cast<int>(std::min<long long>(sum, 0x7FFFFFFF))));
  if (n1 > 0) CopyText(joined.m_text, text1, n1);
  if (n2 > 0) CopyText(joined.m_text + n1, text2, n2);
  return joined;
}

static SString Concat(SStringView a, SStringView b) {
  return SString::ConcatCopy(LengthOf(a), a.data(), LengthOf(b), b.data());
}

SString operator+(const SString& a, const SString& b) { return Concat(a.View(), b.View()); }
SString operator+(const SString& a, const WCHAR* b) { return Concat(a.View(), SString::ViewOf(b)); }
SString operator+(const WCHAR* a, const SString& b) { return Concat(SString::ViewOf(a), b.View()); }
SString operator+(const SString& a, WCHAR b) { return Concat(a.View(), SStringView(&b, 1)); }
SString operator+(WCHAR a, const SString& b) { return Concat(SStringView(&a, 1), b.View()); }

// --- copy-on-write ---

void SString::CopyBeforeWrite() {
  SStringData* data = Data();
  if (IsOwn(data)) return;
  if (data->m_length == 0) return Release();  // nothing is ever written to the constant empty text
  SString copy(Adopt{}, AllocBuffer(data->m_length));
  CopyText(copy.m_text, m_text, data->m_length);
  Swap(copy);
}

void SString::AllocBeforeWrite(int n) {
  SStringData* data = Data();
  if (IsOwn(data) && n <= data->m_allocLength) return;
  SString fresh(Adopt{}, AllocBuffer(n));
  Swap(fresh);
}

void SString::AssignCopy(int n, const WCHAR* text) {
  SStringData* data = Data();
  if (!IsOwn(data) || n > data->m_allocLength) {
    SString fresh(Adopt{}, AllocBuffer(n));
    if (n > 0) CopyText(fresh.m_text, text, n);
    Swap(fresh);  // the old buffer, in which `text` may lie, goes last
    return;
  }
  if (n > 0) CopyText(m_text, text, n);
  m_text[std::max(n, 0)] = 0;
  if (n <= 0 && data->m_refs == SStringData::kLocked) return;  // keeps its length: see operator=
  data->m_length = std::max(n, 0);
  if (n <= 0) Release();
}

// The same, but an empty text empties a locked string, too.
void SString::AssignActual(int n, const WCHAR* text) {
  AssignCopy(n, text);
  if (n <= 0 && Data()->m_refs == SStringData::kLocked) Data()->m_length = 0;
}

// --- writable buffers ---

WCHAR* SString::LockTchar(int n) {
  n = std::max(n, 1);
  SStringData* data = Data();
  if (IsOwn(data) && n <= data->m_allocLength) return m_text;
  int kept = std::min(data->m_length, n);
  SString fresh(Adopt{}, AllocBuffer(n));
  CopyText(fresh.m_text, m_text, kept);
  fresh.m_text[kept] = 0;
  fresh.Data()->m_length = kept;
  Swap(fresh);
  return m_text;
}

WCHAR* SString::LockBuffer(int n) {
  if (n < 1) n = std::max(Length(), 1);
  LockTchar(n);
  SStringData* data = Data();
  data->m_length = n;
  m_text[n] = 0;
  data->m_refs = SStringData::kLocked;
  return m_text;
}

void SString::UnlockBuffer(bool recalc) {
  SStringData* data = Data();
  if (data->Refs() == SStringData::kStatic) return;
  if (data->Refs() == SStringData::kLocked) data->m_refs = 1;
  if (!recalc) return;
  int length = LengthUpTo(m_text, data->m_allocLength);
  if (length == 0) {
    Release();
    return;
  }
  if (length == data->m_length) return;
  Unlock(length);
}

void SString::Unlock(int n) {
  SStringData* data = Data();
  if (!IsOwn(data)) {  // what was written there belongs to others; the text is cut in a buffer of its own
    *this = SString(n < 0 ? ViewOf(m_text) : View().substr(0, static_cast<std::size_t>(n)));
    return;
  }
  n = n < 0 ? LengthUpTo(m_text, data->m_allocLength) : std::min(n, data->m_allocLength);
  if (n == 0) {
    Release();
    return;
  }
  m_text[n] = 0;
  data->m_length = n;
}

WCHAR* SString::GetBufferSetLength(int n) { return GetBufferSetTcharLength(n); }

WCHAR* SString::GetBufferSetTcharLength(int n) {
  WCHAR* text = LockTchar(n);
  n = std::max(n, 0);
  text[n] = 0;
  Data()->m_length = n;
  return text;
}
