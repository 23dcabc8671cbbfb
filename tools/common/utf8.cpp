#include "tools/common/utf8.h"

#include "qxcore/system/file/file.h"

SString ShownArgument(const std::string& argument) {
  const SString text = FromUtf8(argument);
  return ToUtf8(text) == argument ? text : SFile::FromNative(argument);
}

SString ShownPath(const SString& path) {
  const std::string native = SFile::ToNative(path);
  return native.empty() ? path : ShownArgument(native);
}

int DisplayWidth(SStringView text) {
  int width = 0;
  for (WCHAR c : text) {
    bool none = (c >= 0x300 && c < 0x370) || c == 0x200B || c == 0x200D || (c >= 0xFE00 && c < 0xFE10);
    bool two = (c >= 0x1100 && c < 0x1160) || (c >= 0x2E80 && c < 0xA4D0) || (c >= 0xAC00 && c < 0xD7A4) ||
               (c >= 0xF900 && c < 0xFB00) || (c >= 0xFE30 && c < 0xFE70) || (c >= 0xFF00 && c < 0xFF61);
    // The two halves of a surrogate pair make two columns, as most of those characters take.
    width += none ? 0 : two ? 2 : 1;
  }
  return width;
}
