// What code pages there are, and their properties.

#include <cstdio>
#include <cstring>

#include "qxcore/platform/posix/code_page.h"
#include "qxcore/platform/posix/failure.h"

namespace {

using namespace platform;

const CodePageInfo* FindOrFail(UINT number) {
  const CodePageInfo* page = FindCodePage(ResolveCodePage(number));
  return page != nullptr ? page : FailWith<const CodePageInfo*>(ERROR_INVALID_PARAMETER);
}

template <class Info>
void FillInfo(const CodePageInfo& page, Info* info) {
  info->MaxCharSize = page.maxBytes;
  info->DefaultChar[0] = page.defaultByte;
  info->DefaultChar[1] = 0;
  std::memset(info->LeadByte, 0, sizeof info->LeadByte);
  std::memcpy(info->LeadByte, page.leadRanges.data(), page.leadRanges.size());
}

}  // namespace

BOOL GetCPInfo(UINT number, CPINFO* info) {
  const CodePageInfo* page = FindOrFail(number);
  if (page == nullptr) return FALSE;
  if (info == nullptr) return FailWith(ERROR_INVALID_PARAMETER);
  FillInfo(*page, info);
  return TRUE;
}

BOOL GetCPInfoExW(UINT number, DWORD flags, CPINFOEXW* info) {
  const CodePageInfo* page = FindOrFail(number);
  if (page == nullptr) return FALSE;
  if (info == nullptr || flags != 0) return FailWith(ERROR_INVALID_PARAMETER);
  FillInfo(*page, info);
  info->UnicodeDefaultChar = page->defaultChar;
  info->CodePage = page->number;
  std::size_t length = 0;
  for (; page->name[length] != 0; ++length) info->CodePageName[length] = static_cast<WCHAR>(page->name[length]);
  info->CodePageName[length] = 0;
  return TRUE;
}

BOOL IsDBCSLeadByteEx(UINT number, BYTE byte) {
  const CodePageInfo* page = FindCodePage(ResolveCodePage(number));
  return page != nullptr && page->IsLead(byte);
}

BOOL IsValidCodePage(UINT number) {
  const CodePageInfo* page = FindCodePage(number);
  return page != nullptr && page->kind != CodePageKind::kSymbol;
}

BOOL EnumSystemCodePagesW(CODEPAGE_ENUMPROCW callback, DWORD flags) {
  if (callback == nullptr || (flags != CP_INSTALLED && flags != CP_SUPPORTED)) return FailWith(ERROR_INVALID_PARAMETER);
  const CodePageRange all = AllCodePages();
  for (const CodePageInfo* page = all.first; page != all.last; ++page) {
    if (page->kind == CodePageKind::kSymbol || !IsInstalled(*page)) continue;
    char digits[16];
    WCHAR text[16];
    const int length = std::snprintf(digits, sizeof digits, "%u", page->number);
    for (int i = 0; i <= length; ++i) text[i] = static_cast<WCHAR>(digits[i]);
    if (!callback(text)) break;
  }
  return TRUE;
}
