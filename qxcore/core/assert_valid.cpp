#include "qxcore/core/assert_valid.h"

int SAssertValidObject(const SObject*, const char*, int, int*) { return 1; }
int SAssertValidObject(const IUnknown*, const char*, int, int*) { return 1; }
int SAssertValidObjectPtr(const void*, const char*, int, int*) { return 1; }
int SAssertValidInterface(const IUnknown*, const char*, int, int*) { return 1; }
int SAssertValidVirtual(const void*, const char*, int, int*) { return 1; }

const WCHAR* SDumpText(const SObject* object) {
  return object == nullptr ? WTEXT("NULL Pointer") : WTEXT("Dump not available");
}
