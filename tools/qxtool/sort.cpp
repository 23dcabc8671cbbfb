// qxtool sort: the lines of a text file in order, in UTF-8.

#include <algorithm>
#include <string>

#include "qxcore/container/string_table.h"
#include "qxcore/core/io_exceptions.h"
#include "tools/common/console.h"
#include "tools/common/encoding_option.h"
#include "tools/common/failure.h"
#include "tools/common/standard_streams.h"
#include "tools/common/text_source.h"
#include "tools/common/utf8.h"
#include "tools/qxtool/commands.h"

namespace {

// A line ends with CR LF, LF or CR; the last one may lack it.
class Lines {
 public:
  void Add(SStringView text) {
    while (!text.empty()) {
      if (m_endsWithCr && text.front() == '\n') {  // its line has ended
        m_endsWithCr = false;
        text.remove_prefix(1);
        continue;
      }
      const auto end = std::find_if(text.begin(), text.end(), [](WCHAR c) { return c == '\n' || c == '\r'; });
      const auto length = static_cast<std::size_t>(end - text.begin());
      m_endsWithCr = end != text.end() && *end == '\r';
      if (end == text.end()) {
        m_line += text;
        return;
      }
      End(text.substr(0, length));
      text.remove_prefix(length + 1);
    }
  }
  SStringTable& Finish() {
    if (!m_line.empty()) End({});
    return m_lines;
  }

 private:
  void End(SStringView rest) {
    if (m_line.empty()) {
      m_lines.Add(SString(rest));
    } else {
      m_lines.Add(SString(SStringView(m_line += rest)));
      m_line.clear();
    }
  }

  SStringTable m_lines;
  std::basic_string<WCHAR> m_line;  // begun in the piece before
  bool m_endsWithCr = false;
};

// In pieces, for a conversion has its price.
void PrintLines(const SStringTable& lines) {
  constexpr std::size_t kPiece = 16384;
  std::basic_string<WCHAR> piece;
  for (const SString& line : lines) {
    piece += line.View();
    piece += WTEXT('\n');
    if (piece.size() < kPiece) continue;
    Print(ToUtf8(SStringView(piece)));
    piece.clear();
  }
  Print(ToUtf8(SStringView(piece)));
}

void ReadLines(const SortOptions& options, Lines& lines, SString& warning) {
  const Encoding from = options.from.empty() ? Encodings::kANSI | Encodings::kFullDetect | Encodings::kFavorGuess
                                             : EncodingOf(options.from, "--from");
  TextSource source(options.file, from | UnicodePolicy(options.fullUnicode));
  source.Select();
  WCHAR text[8192];
  while (const unsigned long bytes = source.Reader().Read(text, sizeof text)) {
    if (console::Interrupted()) throw SEIOAbortedException();
    lines.Add({text, bytes / sizeof(WCHAR)});
  }
  source.CheckRead();
  warning = source.Reader().GetEncodingWarning();
}

void SortLines(const SortOptions& options, SStringTable& lines) {
  const int direction = options.reverse ? SStringTable::kDescending : SStringTable::kAscending;
  if (options.by == "length") {
    lines.SortOnLength(direction);
  } else if (options.by == "number") {
    options.ignoreCase ? lines.SortNumberedNoCase(direction) : lines.SortNumbered(direction);
  } else {
    options.ignoreCase ? lines.SortNoCase(direction) : lines.Sort(direction);
  }
}

}  // namespace

int Sort(const SortOptions& options) {
  if (options.by == "length" && options.ignoreCase)
    throw Failure{"--ignore-case: letters do not matter in the order by length", kWrongUsage};
  Lines lines;
  SString warning;
  try {
    ReadLines(options, lines, warning);
  } catch (...) {
    FailAt(options.file);
  }
  SStringTable& table = lines.Finish();
  SortLines(options, table);
  PrintLines(table);
  FlushPrinted();
  if (!warning.IsEmpty()) Complain(options.file + ": " + ToUtf8(warning));
  return kDone;
}
