#include "qxcore/platform/posix/wildcard.h"

#include <algorithm>
#include <memory>
#include <utility>

#include "qxcore/platform/bmp.h"

namespace platform {
namespace {

// The published wildcards of the file system, which the mask's letters are turned into.
constexpr char16_t kStar = u'*';         // any run
constexpr char16_t kDosQuestion = u'>';  // one character, or nothing before a dot or at the end
constexpr char16_t kDosDot = u'"';       // a dot, or nothing at the end
constexpr char16_t kDosStar = u'<';      // any run, up to the last dot

}  // namespace

std::u16string CompileWildcard(std::u16string_view mask) {
  if (mask == u"*.*") return u"*";
  std::u16string compiled;
  for (std::size_t i = 0; i < mask.size(); ++i) {
    const char16_t next = i + 1 < mask.size() ? mask[i + 1] : u'\0';
    if (mask[i] == '?') {
      compiled += kDosQuestion;
    } else if (mask[i] == '.' && (next == '?' || next == '*')) {
      compiled += kDosDot;
    } else if (mask[i] == '*' && next == '.' && i + 2 == mask.size()) {
      compiled += kDosStar;
    } else if (mask[i] == '.' && i + 1 == mask.size() && i > 0 && mask[i - 1] == '*') {
      compiled += kDosDot;
    } else {
      compiled += ToLowerBmp(mask[i]);
    }
  }
  return compiled;
}

// Keeps the set of places in the pattern that the name so far can have reached; so no pattern takes longer
// than its length times the name's.
bool MatchesWildcard(std::u16string_view compiled, std::u16string_view name) {
  if (compiled.size() == 1 && compiled[0] == kStar) return true;
  const std::size_t places = compiled.size() + 1;
  const std::size_t lastDot = name.find_last_of(u'.');
  char local[2 * 256];
  std::unique_ptr<char[]> heap;
  if (2 * places > sizeof local) heap = std::make_unique<char[]>(2 * places);
  char* now = heap != nullptr ? heap.get() : local;
  char* next = now + places;
  std::fill_n(now, places, 0);
  now[0] = 1;
  for (std::size_t i = 0; i <= name.size(); ++i) {
    const bool atEnd = i == name.size();
    // What may stand for nothing lets the place behind it be reached at once.
    for (std::size_t p = 0; p < compiled.size(); ++p) {
      if (!now[p]) continue;
      const char16_t sign = compiled[p];
      const bool nothing = sign == kStar || sign == kDosStar || (sign == kDosDot && atEnd) ||
                           (sign == kDosQuestion && (atEnd || name[i] == '.'));
      if (nothing) now[p + 1] = 1;
    }
    if (atEnd) break;
    std::fill_n(next, places, 0);
    bool isAlive = false;
    const char16_t c = ToLowerBmp(name[i]);
    for (std::size_t p = 0; p < compiled.size(); ++p) {
      if (!now[p]) continue;
      const char16_t sign = compiled[p];
      if (sign == kStar || (sign == kDosStar && i != lastDot)) {
        next[p] = 1;
        isAlive = true;
      } else if (sign == kDosQuestion ? c != '.' : sign == kDosDot ? c == '.' : sign == c) {
        next[p + 1] = 1;
        isAlive = true;
      }
    }
    if (!isAlive) return false;
    std::swap(now, next);
  }
  return now[compiled.size()] != 0;
}

}  // namespace platform
