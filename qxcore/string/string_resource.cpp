// Texts of string tables.

#include "qxcore/core/module_state.h"
#include "qxcore/string/string.h"

int SString::LoadStringW(unsigned int id, HINSTANCE instance) {
  constexpr int kOnStack = 2048;
  constexpr int kFirstGrown = 2560;
  constexpr int kTooLarge = 10485761;
  if (instance == nullptr) {
    const WCHAR* name = reinterpret_cast<const WCHAR*>(static_cast<std::uintptr_t>(id & 0xFFFF));
    const WCHAR* stringType = reinterpret_cast<const WCHAR*>(static_cast<std::uintptr_t>(6));  // RT_STRING
    instance = SGetResInstance(name, stringType);
  }
  WCHAR text[kOnStack];
  int length = ::LoadStringW(instance, id, text, kOnStack);
  if (kOnStack - length >= 2) {
    AssignActual(length, text);
    return length > 0;
  }
  // The text may have been cut: load it again with more room until some stays unused.
  SString loaded;
  for (int size = kFirstGrown; size < kTooLarge; size += size / 4) {
    length = ::LoadStringW(instance, id, loaded.Lock(size), size);
    loaded.Unlock(length);
    if (size - length >= 2) break;
  }
  AssignActual(loaded.Length(), loaded);
  return Length() > 0;
}

SString SStringLoad(unsigned int id, const WCHAR* fallback, HINSTANCE instance) {
  SString text;
  return text.LoadStringW(id, instance) != 0 ? text : SString(fallback);
}
