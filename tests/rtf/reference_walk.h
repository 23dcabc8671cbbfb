// A second reading of where an RTF text refers to fonts and colours, written from the format's rules alone and
// without the library: for tests that compare with it.
#pragma once

#include <cstdint>
#include <cstdlib>
#include <map>
#include <set>
#include <string>
#include <vector>

#include "qxcore/platform/win32.h"

namespace walk {

using Text = std::basic_string<WCHAR>;

struct Reference {
  std::size_t numberAt, numberEnd;  // where the number stands in the text
  bool isFont;                      // else a colour
  long long number;
};

inline bool IsLetter(WCHAR c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }
inline bool IsDigit(WCHAR c) { return c >= '0' && c <= '9'; }

// All references, in their order; the font and colour tables hold none.
inline std::vector<Reference> References(const Text& text) {
  static const std::set<std::string> kFonts = {"f",         "af",        "deff",      "adeff",  "pnf",
                                               "stshfdbch", "stshfloch", "stshfhich", "stshfbi"};
  static const std::set<std::string> kColors = {
      "cf",   "cb",      "highlight", "chcfpat",    "chcbpat",    "ulc",     "cfpat",   "cbpat",       "brdrcf",
      "pncf", "clcfpat", "clcbpat",   "clcfpatraw", "clcbpatraw", "trcfpat", "trcbpat", "tscellcfpat", "tscellcbpat"};
  std::vector<Reference> found;
  long long depth = 0, tableDepth = -1;  // the depth of the table that is open
  for (std::size_t at = 0; at < text.size();) {
    const WCHAR c = text[at++];
    if (c == '{') ++depth;
    if (c == '}' && --depth < tableDepth) tableDepth = -1;
    if (c == '}' && tableDepth < 0 && depth < 0) depth = 0;
    if (c != '\\' || at == text.size()) continue;
    if (!IsLetter(text[at])) {
      ++at;
      continue;
    }
    std::string name, digits;
    while (at < text.size() && IsLetter(text[at])) name += static_cast<char>(text[at++]);
    const std::size_t numberAt = at;
    if (at + 1 < text.size() && text[at] == '-' && IsDigit(text[at + 1])) digits += static_cast<char>(text[at++]);
    while (at < text.size() && IsDigit(text[at])) digits += static_cast<char>(text[at++]);
    const std::size_t numberEnd = at;
    if (at < text.size() && text[at] == ' ') ++at;
    long long number = std::strtoll(digits.c_str(), nullptr, 10);
    if (number > INT32_MAX) number = INT32_MAX;
    if (number < INT32_MIN) number = INT32_MIN;
    if (name == "bin" && number > 0)
      at = number < static_cast<long long>(text.size() - at) ? at + static_cast<std::size_t>(number) : text.size();
    if (tableDepth >= 0) continue;
    if (name == "fonttbl" || name == "colortbl") tableDepth = depth;
    const bool isFont = kFonts.count(name) != 0;
    if (!digits.empty() && (isFont || kColors.count(name) != 0)) found.push_back({numberAt, numberEnd, isFont, number});
  }
  return found;
}

// The text with each reference renumbered, where its map has the number.
template <class Numbers>
Text Renumber(const Text& text, const Numbers& fonts, const Numbers& colors) {
  Text result;
  std::size_t copied = 0;
  for (const Reference& reference : References(text)) {
    const auto* number = (reference.isFont ? fonts : colors).Retrieve(static_cast<int>(reference.number));
    if (number == nullptr || *number == reference.number) continue;
    const std::string digits = std::to_string(*number);
    result.append(text, copied, reference.numberAt - copied).append(digits.begin(), digits.end());
    copied = reference.numberEnd;
  }
  return result.append(text, copied);
}

}  // namespace walk
