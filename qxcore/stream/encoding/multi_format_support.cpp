#include "qxcore/stream/encoding/multi_format_support.h"

#include <algorithm>

#include "qxcore/core/module_state.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/string_buffer.h"

using Support = SAbstractIO::SMultiFormatSupport;
using Encoding = Support::Encoding;

namespace {

struct NameRow {
  Encoding value;
  SStringView name;
};
#define E(value, name) {value, WTEXT(name)},
constexpr NameRow kNames[] = {
#include "qxcore/stream/encoding/encoding_names.inc"
};
#undef E

struct FlagRow {
  Encoding flag;
  SStringView suffix;
};
// In the order in which suffixes are written. The whole level stands for all of its bits.
constexpr FlagRow kFlags[] = {
    {Support::kQuickDetect, WTEXT("+QuickDetect")}, {Support::kDetect, WTEXT("+Detect")},
    {Support::kFullDetect, WTEXT("+FullDetect")},   {Support::kFavorHint, WTEXT("+FavorHint")},
    {Support::kFavorGuess, WTEXT("+FavorGuess")},   {Support::kWholeInOnce, WTEXT("+WholeInOnce")},
    {Support::kLossless, WTEXT("+Lossless")},       {Support::kXML, WTEXT("(xml)")},
    {Support::kFullUnicode, WTEXT("+FullUnicode")}};

constexpr SStringView kCodePagePattern = WTEXT("Cp%d");
constexpr SStringView kUnicodePattern = WTEXT("Unicode(0x%0.4X)");
constexpr SStringView kBlanks = WTEXT(" \t\r\n");
constexpr unsigned kUtf7Page = 65000;
constexpr unsigned kUtf8Page = 65001;

bool IsPattern(SStringView name) { return name.find(WTEXT('%')) != SStringView::npos; }

SString LibraryText(unsigned id) { return SCoreGetModuleState()->LoadStringW(id); }

bool StartsNoCase(SStringView text, SStringView start) {
  return text.size() >= start.size() && std::equal(start.begin(), start.end(), text.begin(), [](WCHAR a, WCHAR b) {
           return platform::ToLowerBmp(a) == platform::ToLowerBmp(b);
         });
}

// --- value to name ---

// The first name of a value, patterns left out; empty when it has none.
SStringView FirstName(Encoding value) {
  for (const NameRow& row : kNames) {
    if (row.value == value && !IsPattern(row.name)) return row.name;
  }
  return {};
}

SString NameOfValue(Encoding value) {
  SStringView name = FirstName(value);
  if (!name.empty()) return SString(name);
  SString made;
  if (Support::IsANSI(value)) {
    made.Format(WTEXT("Cp%d"), static_cast<int>(value & Support::kCodePageMask));
  } else {
    made.Format(WTEXT("Unicode(0x%0.4X)"), value & Support::kCodePageMask);
  }
  return made;
}

SString PolicySuffixes(Encoding encoding) {
  SString suffixes;
  Encoding left = encoding & Support::kFlagsMask;
  const bool isFull = (left & Support::kLevelMask) == Support::kFullDetect;
  for (const FlagRow& row : kFlags) {
    bool isPartOfFull = isFull && row.flag != Support::kFullDetect && (row.flag & Support::kLevelMask) != 0;
    if (isPartOfFull || (left & row.flag) != row.flag) continue;
    suffixes += row.suffix;
  }
  return suffixes;
}

bool IsMissingPage(Encoding value) {
  unsigned page = value & Support::kCodePageMask;
  return Support::IsANSI(value) && page != 0 && page != GetACP() && !IsValidCodePage(page);
}

// --- name to value ---

struct Match {
  Encoding value = 0;
  std::size_t length = 0;
};

std::size_t ReadDecimal(SStringView text, unsigned& number) {
  std::size_t length = 0;
  number = 0;
  for (; length < text.size() && text[length] >= WTEXT('0') && text[length] <= WTEXT('9'); ++length) {
    number = std::min(number * 10 + (text[length] - WTEXT('0')), 0x10000u);
  }
  return length;
}

Encoding ValueOfPage(unsigned page) {
  if (page == kUtf8Page) return Support::kUTF8;
  return page == 0 || page > 0xFFFF || page == kUtf7Page ? 0 : Support::kANSI | page;
}

Match MatchCodePagePattern(SStringView text) {
  constexpr std::size_t kPrefix = 2;
  if (!StartsNoCase(text, WTEXT("Cp"))) return {};
  unsigned page;
  std::size_t digits = ReadDecimal(text.substr(kPrefix), page);
  Encoding value = digits > 0 ? ValueOfPage(page) : 0;
  return value != 0 ? Match{value, kPrefix + digits} : Match{};
}

Match MatchUnicodePattern(SStringView text) {
  constexpr SStringView kPrefix = WTEXT("Unicode(0x");
  if (!StartsNoCase(text, kPrefix)) return {};
  Encoding bits = 0;
  std::size_t at = kPrefix.size();
  for (; at < text.size() && platform::IsXDigit(text[at]) && bits <= 0xFFFF; ++at) {
    WCHAR digit = platform::ToLowerBmp(text[at]);
    bits = bits * 16 + (digit <= WTEXT('9') ? digit - WTEXT('0') : digit - WTEXT('a') + 10);
  }
  bool isWhole = at > kPrefix.size() && bits <= 0xFFFF && at < text.size() && text[at] == WTEXT(')');
  return isWhole ? Match{Support::kUnicode | bits, at + 1} : Match{};
}

Match MatchTable(SStringView text) {
  Match best;
  for (const NameRow& row : kNames) {
    Match match;
    if (row.name == kCodePagePattern) {
      match = MatchCodePagePattern(text);
    } else if (row.name == kUnicodePattern) {
      match = MatchUnicodePattern(text);
    } else if (StartsNoCase(text, row.name)) {
      match = {row.value, row.name.size()};
    }
    if (match.length > best.length) best = match;
    if (best.length == text.size()) break;
  }
  return best;
}

// The platform's callback takes no context; the listing is short and the thread's own.
thread_local SStringView t_wanted;
thread_local Match t_installed;

// A platform description reads "1252  (ANSI - Latin I)".
BOOL CALLBACK MatchInstalledPage(LPWSTR pageDigits) {
  unsigned page;
  ReadDecimal(pageDigits, page);
  CPINFOEXW info;
  if (ValueOfPage(page) == 0 || !GetCPInfoExW(page, 0, &info)) return TRUE;
  SStringView description(info.CodePageName);
  std::size_t open = description.find(WTEXT('('));
  std::size_t close = description.rfind(WTEXT(')'));
  SStringView names[] = {
      pageDigits, description,
      open < close && close != SStringView::npos ? description.substr(open + 1, close - open - 1) : SStringView()};
  for (SStringView name : names) {
    bool fits = !name.empty() && name.size() > t_installed.length && StartsNoCase(t_wanted, name);
    if (fits) t_installed = {ValueOfPage(page), name.size()};
  }
  return TRUE;
}

Match MatchInstalled(SStringView text) {
  t_wanted = text;
  t_installed = {};
  EnumSystemCodePagesW(MatchInstalledPage, CP_INSTALLED);
  return t_installed;
}

Match MatchSuffixes(SStringView text) {
  Match flags;
  for (bool found = true; found;) {
    found = false;
    for (const FlagRow& row : kFlags) {
      if (!StartsNoCase(text.substr(flags.length), row.suffix)) continue;
      flags.value |= row.flag;
      flags.length += row.suffix.size();
      found = true;
    }
  }
  return flags;
}

SStringView WithoutBlanks(SStringView text) {
  std::size_t first = text.find_first_not_of(kBlanks);
  if (first == SStringView::npos) return {};
  return text.substr(first, text.find_last_not_of(kBlanks) - first + 1);
}

}  // namespace

unsigned int Support::CodePageOf(Encoding encoding) {
  if (KindOf(encoding) == kOEM) return GetOEMCP();
  if (!IsANSI(encoding)) return 0;
  unsigned page = encoding & kCodePageMask;
  return page != 0 ? page : GetACP();
}

SString Support::GetEncodingName(Encoding encoding, int withPolicy, int userFriendly, int emptyIfUndefined) {
  Encoding value = encoding & kValueMask;
  if (value == 0) return emptyIfUndefined ? SString() : LibraryText(247);
  SStringView whole = withPolicy ? FirstName(encoding) : SStringView();
  SString name = whole.empty() ? NameOfValue(value) : SString(whole);
  if (withPolicy && whole.empty()) name += PolicySuffixes(encoding);
  if (userFriendly) name = MakeUserFriendly(name);
  if (IsMissingPage(value)) name += SString::Space + LibraryText(259);
  return name;
}

Encoding Support::MatchEncodingName(const SString& name, int installed, int* matched) {
  SStringView text = WithoutBlanks(name.View());
  int understood = 0;
  Encoding encoding = 0;
  SString undefined = LibraryText(247);
  if (text.empty() || (text.size() == undefined.View().size() && StartsNoCase(text, undefined.View()))) {
    understood = name.Length();
  } else {
    Match match = MatchTable(text);
    if (installed && match.length < text.size()) {
      Match other = MatchInstalled(text);
      if (other.length > match.length) match = other;
    }
    if (match.length > 0) {
      Match flags = MatchSuffixes(text.substr(match.length));
      encoding = match.value | flags.value;
      std::size_t length = match.length + flags.length;
      understood =
          length == text.size() ? name.Length() : static_cast<int>(text.data() - name.GetSafePointer() + length);
    }
  }
  if (matched != nullptr) *matched = understood;
  return encoding;
}

int Support::MachineSupports(Encoding encoding) {
  switch (KindOf(encoding)) {
    case kASCII:
    case kOEM:
      return 1;
    case kANSI: {
      unsigned page = CodePageOf(encoding);
      return page == GetACP() || (page != kUtf7Page && page != kUtf8Page && IsValidCodePage(page));
    }
    case kUnicode: {
      Encoding form = encoding & (kBigEndian | kLittleEndian | kUtf8Form);
      return form == kBigEndian || form == kLittleEndian || form == kUtf8Form;
    }
    default:
      return 0;
  }
}

SString Support::GetAppEncodingName() { return GetEncodingName(kUTF16LE); }

SString Support::GetLevelLabel(Encoding encoding) {
  constexpr unsigned kNone = 248, kQuick = 249, kFair = 250, kFull = 251, kWhole = 255;
  switch (encoding & kLevelMask) {
    case kQuickDetect:
      return LibraryText(kQuick);
    case kDetect:
      return LibraryText(kFair);
    case kFullDetect:
      return LibraryText(kFull);
    default:
      return LibraryText((encoding & kWholeInOnce) != 0 ? kWhole : kNone);
  }
}

SString Support::GetFavorLabel(Encoding encoding) {
  constexpr unsigned kWarn = 252, kHint = 253, kGuess = 254;
  return LibraryText((encoding & kFavorGuess) != 0 ? kGuess : (encoding & kFavorHint) != 0 ? kHint : kWarn);
}

SString Support::GetFlagLabels(Encoding encoding) {
  constexpr struct {
    Encoding flag;
    unsigned label;
  } kLabels[] = {{kLossless, 256}, {kXML, 257}};
  SString labels;
  for (const auto& one : kLabels) {
    if ((encoding & one.flag) == 0) continue;
    if (!labels.IsEmpty()) labels += WTEXT(", ");
    labels += LibraryText(one.label);
  }
  return labels;
}

SString Support::MakeUserFriendly(const SString& name) {
  SString friendly = name;
  friendly.Replace(WTEXT("with signature"), LibraryText(278));
  friendly.Replace(WTEXT("Active Code Page"), LibraryText(258));
  return friendly;
}

int Support::ListAvailableEncodings(EncodingMap& names, int installedOnly, int aliases) {
  int added = 0;
  for (const NameRow& row : kNames) {
    bool isDisplayName = row.name == FirstName(row.value);
    if (IsPattern(row.name) || (!aliases && !isDisplayName)) continue;
    if (installedOnly && !MachineSupports(row.value)) continue;
    names.Add(SString(row.name), row.value);
    ++added;
  }
  return added;
}
