// qxtool sort: the lines of a text file in order, in UTF-8.

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
    for (const WCHAR c : text) {
      const bool endsPair = c == '\n' && m_last == '\r';
      m_last = c;
      if (endsPair) continue;
      if (c == '\n' || c == '\r') {
        End();
      } else {
        m_line += c;
      }
    }
  }
  SStringTable& Finish() {
    if (!m_line.empty()) End();
    return m_lines;
  }

 private:
  void End() {
    m_lines.Add(SString(SStringView(m_line)));
    m_line.clear();
  }

  SStringTable m_lines;
  std::basic_string<WCHAR> m_line;
  WCHAR m_last = 0;
};

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
  for (const SString& line : table) Print(ToUtf8(line) + "\n");
  FlushPrinted();
  if (!warning.IsEmpty()) Complain(options.file + ": " + ToUtf8(warning));
  return kDone;
}
