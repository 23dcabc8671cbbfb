// Validation entry points. The checks are compiled out: each of them always returns 1. They stay so
// that modules which were built against them keep linking. Threads: the functions may be called in any thread.
#pragma once

#include "qxcore/core/object.h"
#include "qxcore/platform/export.h"

struct IUnknown;

// `file` and `line` name the caller; `flag`, where given, is left as it is.
QXCORE_API int SAssertValidObject(const SObject* object, const char* file, int line, int* flag = nullptr);
QXCORE_API int SAssertValidObject(const IUnknown* object, const char* file, int line, int* flag = nullptr);
QXCORE_API int SAssertValidObjectPtr(const void* object, const char* file, int line, int* flag = nullptr);
QXCORE_API int SAssertValidInterface(const IUnknown* object, const char* file, int line, int* flag = nullptr);
QXCORE_API int SAssertValidVirtual(const void* object, const char* file, int line, int* flag = nullptr);

// What a diagnostic dump shows for an object: "NULL Pointer" or "Dump not available".
QXCORE_API const WCHAR* SDumpText(const SObject* object);
