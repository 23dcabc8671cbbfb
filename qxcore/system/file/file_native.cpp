// SFile: the system's own spelling of names.

#include "qxcore/platform/internal/native_path.h"
#include "qxcore/system/file/file.h"

SString SFile::FromNative(std::string_view path) { return SString(SStringView(platform::FromNativePath(path))); }

std::string SFile::ToNative(const SString& path) { return platform::ToNativePath(path.View()); }
