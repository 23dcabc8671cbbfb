#include "tools/qxtool/encoding_option.h"

#include "tools/qxtool/failure.h"
#include "tools/qxtool/utf8.h"

Encoding EncodingOf(std::string_view text, const char* option) {
  SString name = FromUtf8(text);
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
  if (encoding & Encodings::kXML) name += WTEXT(" (XML)");
  return name;
}

Encoding ShownValue(Encoding encoding) { return encoding & (Encodings::kValueMask | Encodings::kXML); }
