// Changes of a document between two places in its text.
//
// A failure leaves the document as it was. All throw std::bad_alloc.
#pragma once

#include <algorithm>

#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {

template <class Format>
using Runs = std::vector<FormatRun<Format>>;

// The format at a place; behind the text that of its end.
template <class Format>
Format FormatAt(const Runs<Format>& runs, std::size_t place) {
  const auto next = std::upper_bound(runs.begin(), runs.end(), place,
                                     [](std::size_t at, const FormatRun<Format>& run) { return at < run.start; });
  return next == runs.begin() ? Format() : std::prev(next)->format;
}

// Adds a run behind others. A run without text, and one of the same format, becomes one with it.
template <class Format>
void AppendRun(Runs<Format>& runs, std::size_t start, const Format& format) {
  if (!runs.empty() && runs.back().start == start) runs.pop_back();
  if (runs.empty() || !(runs.back().format == format)) runs.push_back({start, format});
}

// Adds the runs between two places, moved so that the first begins at `to` and changed by `change`.
template <class Format, class Change>
void AppendRuns(Runs<Format>& result, const Runs<Format>& runs, std::size_t start, std::size_t end, std::size_t to,
                Change change) {
  if (start >= end) return;
  AppendRun(result, to, change(FormatAt(runs, start)));
  for (const FormatRun<Format>& run : runs) {
    if (run.start > start && run.start < end) AppendRun(result, run.start - start + to, change(run.format));
  }
}

// Changes the format of the characters between two places.
template <class Change>
void ChangeFormats(Document& document, std::size_t start, std::size_t end, Change change) {
  const auto keep = [](const CharFormat& format) { return format; };
  Runs<CharFormat> runs;
  AppendRuns(runs, document.characters, 0, start, 0, keep);
  AppendRuns(runs, document.characters, start, end, start, change);
  AppendRuns(runs, document.characters, end, document.text.Length(), end, keep);
  document.characters.swap(runs);
}

// Copies what lies between two places, with all fonts and colours.
void CopyPart(const Document& document, std::size_t start, std::size_t end, Document& part);

// Adds a part's fonts and colours to the document's, and renumbers the part's formats accordingly.
void TakeLists(Document& document, Document& part);

// Puts a part, whose formats are by the document's fonts and colours, in the place of what lies between two places.
void ReplacePart(Document& document, std::size_t start, std::size_t end, const Document& part);

}  // namespace platform::rich
