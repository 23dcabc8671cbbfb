#include "qxcore/platform/internal/rich_edit_class.h"

namespace platform {

const WCHAR* LoadRichEditClass() {
  static const HMODULE library = LoadLibraryW(L"msftedit.dll");
  return library != nullptr ? L"RICHEDIT50W" : nullptr;
}

}  // namespace platform
