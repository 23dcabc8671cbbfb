// SRegistry: reading values and enumeration.

#include <cstring>

#include "qxcore/core/memory.h"
#include "qxcore/system/hglobal.h"
#include "qxcore/system/settings/registry.h"

namespace {

constexpr const WCHAR* kBlank = WTEXT(" \t\r\n");

bool Is(LSTATUS result, DWORD code) { return static_cast<DWORD>(result) == code; }

// The type and the bytes of one value.
class ValueData {
 public:
  ValueData() = default;
  ValueData(const ValueData&) = delete;
  ValueData& operator=(const ValueData&) = delete;
  ~ValueData() { Free(); }

  // However often others change the size meanwhile. Returns the platform's code.
  LSTATUS Read(HKEY key, const WCHAR* name) {
    DWORD size = kInPlace;
    for (;;) {
      BYTE* const room = Reserve(size);
      const LSTATUS result = RegQueryValueExW(key, name, nullptr, &m_type, room, &size);
      m_size = Is(result, ERROR_SUCCESS) ? size : 0;
      if (!Is(result, ERROR_MORE_DATA)) return result;
    }
  }
  // The same by index; ERROR_MORE_DATA for a name that does not fit.
  LSTATUS ReadAt(HKEY key, DWORD index, WCHAR* name, DWORD* nameLength) {
    const DWORD nameRoom = *nameLength;
    DWORD size = kInPlace;
    for (;;) {
      const DWORD given = size;
      BYTE* const room = Reserve(given);
      *nameLength = nameRoom;
      const LSTATUS result = RegEnumValueW(key, index, name, nameLength, nullptr, &m_type, room, &size);
      m_size = Is(result, ERROR_SUCCESS) ? size : 0;
      if (!Is(result, ERROR_MORE_DATA) || size <= given) return result;
    }
  }

  DWORD Type() const { return m_type; }
  DWORD Size() const { return m_size; }
  const BYTE* Bytes() const { return m_bytes; }

  // Up to the first NUL; half a character at the end does not count.
  SString Text() const {
    const SStringView text(reinterpret_cast<const WCHAR*>(m_bytes), m_size / sizeof(WCHAR));
    return SString(text.substr(0, text.find(WCHAR{0})));
  }
  // False when there are not just its four bytes.
  bool Number(DWORD& number) const {
    if (m_size != sizeof number) return false;
    std::memcpy(&number, m_bytes, sizeof number);
    return true;
  }

 private:
  static constexpr DWORD kInPlace = 512;

  BYTE* Reserve(DWORD size) {
    Free();
    if (size > kInPlace) m_bytes = static_cast<BYTE*>(SMemAlloc(size));
    return m_bytes;
  }
  void Free() {
    if (m_bytes != m_inPlace) SMemFree(m_bytes);
    m_bytes = m_inPlace;
  }

  DWORD m_type = REG_NONE;
  DWORD m_size = 0;
  alignas(WCHAR) BYTE m_inPlace[kInPlace];
  BYTE* m_bytes = m_inPlace;
};

SString Decimal(DWORD number) { return SString(static_cast<long>(static_cast<std::int32_t>(number))); }

SString WithoutReferences(const SString& text) {
  DWORD room = static_cast<DWORD>((text.Length() + 1) * sizeof(WCHAR) + 2 + 128);
  SString expanded;
  for (int attempt = 0; attempt < 2; ++attempt) {
    const DWORD needed = ExpandEnvironmentStringsW(text, expanded.Lock(static_cast<int>(room)), room);
    expanded.Unlock(needed >= 1 && needed <= room ? static_cast<int>(needed) - 1 : 0);
    if (needed <= room) break;
    room = needed;
  }
  return expanded;
}

// False for types that have no text, and for numbers of another size.
bool ReadAsText(const ValueData& data, SString& text) {
  DWORD number;
  switch (data.Type()) {
    case REG_SZ:
      text = data.Text();
      return true;
    case REG_EXPAND_SZ:
      text = WithoutReferences(data.Text());
      return true;
    case REG_DWORD:
      if (!data.Number(number)) return false;
      text = Decimal(number);
      return true;
    case REG_DWORD_BIG_ENDIAN:
      if (!data.Number(number)) return false;
      text = Decimal(number << 24 | (number & 0xFF00) << 8 | (number >> 8 & 0xFF00) | number >> 24);
      return true;
    default:
      return false;
  }
}

bool IsTrue(const SString& trimmed) {
  return trimmed.CompareNoCase(SString::Yes) == 0 || trimmed.CompareNoCase(WTEXT("True")) == 0;
}

}  // namespace

HRESULT SRegistry::GetProfile(const SString& name, SString* out, const SString& standard, unsigned long* type) const {
  if (out == nullptr) return E_POINTER;
  // Both may be the same string.
  const SString fallback = standard;
  ValueData data;
  const LSTATUS read = m_key == nullptr ? static_cast<LSTATUS>(ERROR_FILE_NOT_FOUND) : data.Read(m_key, name);
  const bool isMissing = Is(read, ERROR_FILE_NOT_FOUND);
  if (!isMissing && type != nullptr) *type = data.Type();
  SString text;
  if (Is(read, ERROR_SUCCESS) && ReadAsText(data, text) && !(name.IsEmpty() && text.IsEmpty())) {
    *out = text;
    return S_OK;
  }
  *out = fallback;
  return isMissing ? static_cast<HRESULT>(kDefaultUsed) : E_FAIL;
}

HRESULT SRegistry::GetProfile(const SString& name, int* out, int standard) const {
  if (out == nullptr) return E_POINTER;
  *out = standard;
  SString text;
  const HRESULT result = GetProfile(name, &text, SString(standard));
  if (result == E_FAIL) return result;
  text.Trim(kBlank);
  *out = IsTrue(text) || text == WTEXT("1");
  return result;
}

HRESULT SRegistry::GetProfile(const SString& name, long* out, long standard, unsigned long* type) const {
  if (out == nullptr) return E_POINTER;
  *out = standard;
  SString text;
  const HRESULT result = GetProfile(name, &text, SString(standard), type);
  if (result != S_OK) return result;
  text.Trim(kBlank);
  const WCHAR first = text.GetAt(0);
  const bool isNumber = (first >= '0' && first <= '9') || first == '-' || first == '+';
  *out = isNumber ? text.ToLONG() : IsTrue(text) ? 1 : 0;
  return S_OK;
}

HRESULT SRegistry::GetProfile(const SString& name, void** globalBlock, unsigned long* size) const {
  if (globalBlock == nullptr || size == nullptr) return E_POINTER;
  *globalBlock = nullptr;
  *size = 0;
  ValueData data;
  if (m_key == nullptr || !Is(data.Read(m_key, name), ERROR_SUCCESS) || data.Type() != REG_BINARY)
    return static_cast<HRESULT>(kDefaultUsed);
  SHGlobal block;
  block.Alloc(GMEM_ZEROINIT, data.Size());
  if (data.Size() > 0) {
    std::memcpy(block.Lock(), data.Bytes(), data.Size());
    block.Unlock();
  }
  *globalBlock = block.Detach();
  *size = data.Size();
  return S_OK;
}

// --- enumeration ---

namespace {

constexpr DWORD kKeyText = 512;    // characters
constexpr DWORD kValueName = 256;  // with the terminator

void Clear(SString* text) {
  if (text != nullptr) *text = SString::null;
}

}  // namespace

long SRegistry::GetEnumKey(long index, SString* name, SString* className) const {
  WCHAR nameText[kKeyText], classText[kKeyText];
  DWORD nameLength = kKeyText, classLength = kKeyText;
  Clear(name);
  Clear(className);
  const LSTATUS result =
      RegEnumKeyExW(m_key, static_cast<DWORD>(index), nameText, &nameLength, nullptr, classText, &classLength, nullptr);
  if (!Is(result, ERROR_SUCCESS)) return result;
  if (name != nullptr) *name = SStringView(nameText, nameLength);
  if (className != nullptr) *className = SStringView(classText, classLength);
  return result;
}

long SRegistry::GetEnumValue(long index, SString* name, SString* value, unsigned long* type) const {
  WCHAR nameText[kValueName];
  Clear(name);
  Clear(value);
  DWORD nameLength = kValueName, valueType = REG_NONE;
  ValueData data;
  LSTATUS result;
  if (value != nullptr) {
    result = data.ReadAt(m_key, static_cast<DWORD>(index), nameText, &nameLength);
    valueType = data.Type();
  } else {
    result =
        RegEnumValueW(m_key, static_cast<DWORD>(index), nameText, &nameLength, nullptr, &valueType, nullptr, nullptr);
  }
  if (!Is(result, ERROR_SUCCESS)) return result;
  if (name != nullptr) *name = SStringView(nameText, nameLength);
  if (type != nullptr) *type = valueType;
  if (value == nullptr) return result;
  DWORD number;
  if (valueType == REG_DWORD && data.Number(number)) {
    value->Format(WTEXT("%lu"), static_cast<unsigned long>(number));
  } else {
    *value = data.Text();
  }
  return result;
}
