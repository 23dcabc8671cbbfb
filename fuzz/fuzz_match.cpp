// Wildcards beside a plain matcher, the laws of the natural order, and searches beside the standard ones.

#include <algorithm>
#include <vector>

#include "fuzz/fuzz_input.h"
#include "qxcore/platform/bmp.h"
#include "qxcore/string/natural_compare.h"
#include "qxcore/string/string.h"

namespace {

using Text = std::basic_string<WCHAR>;

// One pattern character: what it stands for.
struct Element {
  enum Kind { kRun, kAny, kLiteral } kind;
  WCHAR character;
};

std::vector<Element> Parse(const Text& pattern) {
  std::vector<Element> elements;
  for (std::size_t i = 0; i < pattern.size(); ++i) {
    if (pattern[i] == '*') {
      elements.push_back({Element::kRun, 0});
    } else if (pattern[i] == '?') {
      elements.push_back({Element::kAny, 0});
    } else {
      if (pattern[i] == '\\' && i + 1 < pattern.size()) ++i;
      elements.push_back({Element::kLiteral, pattern[i]});
    }
  }
  return elements;
}

// By a table of which beginnings of the pattern match which beginnings of the text.
bool PlainMatch(const Text& text, const Text& pattern, bool noCase) {
  auto fold = [noCase](WCHAR c) { return noCase ? platform::ToLowerBmp(c) : c; };
  std::vector<char> matches(text.size() + 1, 0);
  matches[0] = 1;
  for (const Element& element : Parse(pattern)) {
    std::vector<char> next(text.size() + 1, 0);
    for (std::size_t i = 0; i <= text.size(); ++i) {
      if (element.kind == Element::kRun) {
        next[i] = matches[i] != 0 || (i > 0 && next[i - 1] != 0);
      } else if (i > 0 && (element.kind == Element::kAny || fold(text[i - 1]) == fold(element.character))) {
        next[i] = matches[i - 1];
      }
    }
    matches = next;
  }
  return matches[text.size()] != 0;
}

int Sign(int order) { return (order > 0) - (order < 0); }

template <class Compare>
void CheckOrder(const Text& a, const Text& b, const Text& c, Compare compare) {
  int ab = Sign(compare(a.c_str(), b.c_str()));
  int bc = Sign(compare(b.c_str(), c.c_str()));
  int ac = Sign(compare(a.c_str(), c.c_str()));
  FUZZ_CHECK(ab == -Sign(compare(b.c_str(), a.c_str())));
  FUZZ_CHECK(compare(a.c_str(), a.c_str()) == 0);
  if (ab <= 0 && bc <= 0) FUZZ_CHECK(ac <= 0);
  if (ab >= 0 && bc >= 0) FUZZ_CHECK(ac >= 0);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size > 400) return 0;
  FuzzInput input(data, size);
  int count = input.Byte();
  Text a = ToText(input.Part("\n")), b = ToText(input.Part("\n")), c = ToText(input.Rest());

  SString text(a.c_str());
  FUZZ_CHECK((text.Match(b.c_str()) != 0) == PlainMatch(a, b, false));
  FUZZ_CHECK((text.MatchNoCase(b.c_str()) != 0) == PlainMatch(a, b, true));

  CheckOrder(a, b, c, [](const WCHAR* x, const WCHAR* y) { return _tcscmpi(x, y); });
  CheckOrder(a, b, c, [](const WCHAR* x, const WCHAR* y) { return _tcsicmpi(x, y); });
  CheckOrder(a, b, c, [count](const WCHAR* x, const WCHAR* y) { return _tcsncmpi(x, y, count); });
  CheckOrder(a, b, c, [count](const WCHAR* x, const WCHAR* y) { return _tcsnicmpi(x, y, count); });
  FUZZ_CHECK(Sign(_tcsncmpi(a.c_str(), b.c_str(), 1000)) == Sign(_tcscmpi(a.c_str(), b.c_str())));

  std::size_t first = a.find(b);
  const WCHAR* found = text.Find(b.c_str());
  FUZZ_CHECK(first == Text::npos ? found == nullptr : found == text.GetSafePointer() + first);
  std::size_t last = a.rfind(b);
  const WCHAR* foundLast = text.ReverseFind(b.c_str());
  FUZZ_CHECK(last == Text::npos ? foundLast == nullptr : foundLast == text.GetSafePointer() + last);
  auto lower = [](Text folded) {
    std::transform(folded.begin(), folded.end(), folded.begin(), platform::ToLowerBmp);
    return folded;
  };
  std::size_t firstNoCase = lower(a).find(lower(b));
  const WCHAR* foundNoCase = text.FindNoCase(b.c_str());
  FUZZ_CHECK(firstNoCase == Text::npos ? foundNoCase == nullptr : foundNoCase == text.GetSafePointer() + firstNoCase);
  return 0;
}
