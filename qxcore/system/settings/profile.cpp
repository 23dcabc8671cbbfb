#include "qxcore/system/settings/profile.h"

namespace {

constexpr DWORD kRoom = 256;  // 255 characters and the terminator

SString Digits(int value) { return SString(static_cast<long>(value)); }

}  // namespace

HRESULT SProfile::Init(const SString& file, const SString& section, int) {
  m_file = file;
  m_section = section;
  return S_OK;
}

void SProfile::Done() {
  m_file.Done();
  m_section.Done();
}

HRESULT SProfile::WriteProfile(const SString& key, int value) { return WriteProfile(key, Digits(value)); }

HRESULT SProfile::WriteProfile(const SString& key, long value) { return WriteProfile(key, SString(value)); }

HRESULT SProfile::WriteProfile(const SString& key, const SString& value) {
  return WritePrivateProfileStringW(m_section, key, value, m_file) ? S_OK : static_cast<HRESULT>(kWriteFailed);
}

HRESULT SProfile::GetProfile(const SString& key, int* out, int standard) const {
  if (out == nullptr) return E_POINTER;
  *out = Read(key, Digits(standard)).ToBOOL();
  return S_OK;
}

HRESULT SProfile::GetProfile(const SString& key, long* out, long standard) const {
  if (out == nullptr) return E_POINTER;
  *out = Read(key, SString(standard)).ToLONG();
  return S_OK;
}

HRESULT SProfile::GetProfile(const SString& key, SString* out, const SString& standard) const {
  if (out == nullptr) return E_POINTER;
  // The platform would cut the default, too.
  const SString value = Read(key, SString::null);
  *out = value.IsEmpty() ? standard : value;
  return S_OK;
}

SString SProfile::Read(const SString& key, const SString& standard) const {
  WCHAR text[kRoom];
  const DWORD length = GetPrivateProfileStringW(m_section, key, standard, text, kRoom, m_file);
  return SString(SStringView(text, length));
}
