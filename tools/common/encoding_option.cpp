#include "tools/common/encoding_option.h"

#include <charconv>

#include "tools/common/failure.h"
#include "tools/common/utf8.h"

namespace {

constexpr const WCHAR* kXml = WTEXT(" (XML)");

// Takes away what ShownName adds to the name of the table.
SString WithoutRemarks(SString name) {
  const int xml = name.Length() - 6;
  if (xml > 0 && name.Mid(xml) == kXml) name = name.Left(xml);
  const std::size_t page = name.View().find(WTEXT(", Cp"));
  if (page != SStringView::npos && name[name.Length() - 1] == ')')
    name = name.Left(static_cast<int>(page)) + WTEXT(")");
  return name;
}

// "0x" and eight digits, as --json shows values; 0 for other texts.
Encoding ValueOf(std::string_view text) {
  constexpr std::size_t kLength = 10;
  if (text.size() != kLength || text.substr(0, 2) != "0x") return 0;
  Encoding value = 0;
  const auto [end, error] = std::from_chars(text.data() + 2, text.data() + kLength, value, 16);
  return error == std::errc() && end == text.data() + kLength ? value & ~Encodings::kXML : 0;
}

}  // namespace

Encoding EncodingOf(std::string_view text, const char* option) {
  const SString name = WithoutRemarks(FromUtf8(text));
  if (const Encoding value = ValueOf(text)) return value;
  int matched = 0;
  Encoding encoding = Encodings::MatchEncodingName(name, 0, &matched);
  if (encoding == 0 || matched < name.Length()) {
    throw Failure{
        std::string(option) + ": \"" + std::string(text) + "\" is no encoding; qxtool encodings lists the names",
        kWrongUsage};
  }
  return encoding;
}

void RequireOnThisMachine(Encoding encoding) {
  if (Encodings::MachineSupports(encoding)) return;
  throw Failure{"This machine cannot convert \"" + ToUtf8(Encodings::GetEncodingName(encoding).View()) + "\""};
}

SString ShownName(Encoding encoding) {
  SString name = Encodings::GetEncodingName(encoding & Encodings::kValueMask, 0, 1);
  // The active page is another one on another machine.
  if ((encoding & Encodings::kValueMask) == Encodings::kANSI && name[name.Length() - 1] == ')')
    name = name.Left(name.Length() - 1) + WTEXT(", Cp") + SString(static_cast<long>(GetACP())) + WTEXT(")");
  if (encoding & Encodings::kXML) name += kXml;
  return name;
}

Encoding ShownValue(Encoding encoding) { return encoding & (Encodings::kValueMask | Encodings::kXML); }
