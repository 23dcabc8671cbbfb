#include "tools/qxtool/attributes.h"

#include <charconv>

#include "qxcore/platform/win32.h"
#include "tools/common/failure.h"

namespace {

struct Attribute {
  unsigned long value;
  char letter;
  const char* name;
};

constexpr Attribute kAttributes[] = {
    {FILE_ATTRIBUTE_READONLY, 'r', "read-only"}, {FILE_ATTRIBUTE_HIDDEN, 'h', "hidden"},
    {FILE_ATTRIBUTE_SYSTEM, 's', "system"},      {FILE_ATTRIBUTE_DIRECTORY, 'd', "folder"},
    {FILE_ATTRIBUTE_ARCHIVE, 'a', "archive"},    {FILE_ATTRIBUTE_DEVICE, 'v', "device"},
    {FILE_ATTRIBUTE_REPARSE_POINT, 'l', "link"},
};

// 0 for an unknown letter.
unsigned long ValueOf(char letter) {
  for (const Attribute& attribute : kAttributes)
    if (attribute.letter == (letter | 0x20)) return attribute.value;
  return 0;
}

}  // namespace

unsigned long AttributesOf(std::string_view text, const char* option) {
  const Failure wrong{
      std::string(option) + ": \"" + std::string(text) + "\" are no attributes; r, h, s, d, a, v, l or a number are",
      kWrongUsage};
  if (!text.empty() && text[0] >= '0' && text[0] <= '9') {
    const bool isHexadecimal = text.substr(0, 2) == "0x" || text.substr(0, 2) == "0X";
    if (isHexadecimal) text.remove_prefix(2);
    unsigned value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, isHexadecimal ? 16 : 10);
    if (error != std::errc() || end != text.data() + text.size()) throw wrong;
    return value;
  }
  unsigned long attributes = 0;
  for (const char letter : text) {
    if (ValueOf(letter) == 0) throw wrong;
    attributes |= ValueOf(letter);
  }
  return attributes;
}

std::vector<std::string> AttributeNames(unsigned long attributes) {
  std::vector<std::string> names;
  for (const Attribute& attribute : kAttributes)
    if ((attributes & attribute.value) != 0) names.push_back(attribute.name);
  return names;
}
