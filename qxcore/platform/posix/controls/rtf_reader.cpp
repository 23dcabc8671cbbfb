#include "qxcore/platform/posix/controls/rtf_reader.h"

#include <algorithm>
#include <new>
#include <unordered_map>

#include "qxcore/platform/internal/rtf_word.h"
#include "qxcore/platform/posix/controls/rtf_bytes.h"
#include "qxcore/platform/posix/controls/rtf_charset.h"
#include "qxcore/platform/posix/controls/rtf_keywords.h"
#include "qxcore/platform/posix/controls/rtf_tables.h"

namespace platform::rich {
namespace {

// What a group's end restores.
struct State {
  CharFormat characters;
  ParagraphFormat paragraph;
  const Charset* charset = nullptr;
  std::int32_t fallback = 1;  // \uc
};

// The states of the groups that are open. A group that opens in the state in which the one around it did
// shares its entry.
class StateStack {
 public:
  void Push(const State& state, bool isChanged) {
    if (isChanged || m_entries.empty()) m_entries.push_back({state, 0});
    ++m_entries.back().groups;
  }
  // False when no group is open. `isChanged` says whether the next group needs an entry of its own.
  bool Pop(State& state, bool& isChanged) {
    if (m_entries.empty()) return false;
    state = m_entries.back().state;
    isChanged = --m_entries.back().groups == 0;
    if (isChanged) m_entries.pop_back();
    return true;
  }
  bool IsEmpty() const { return m_entries.empty(); }

 private:
  struct Entry {
    State state;
    std::size_t groups;
  };
  std::vector<Entry> m_entries;
};

// Characters that stand for themselves: neither controls nor braces nor backslashes, nor, of bytes, those above
// 0x7F.
template <class Char>
bool IsPlain(Char c) {
  struct Table {
    bool values[128];
  };
  static constexpr Table kTable = [] {
    Table table{};
    for (int i = ' '; i < 128; ++i) table.values[i] = i != '\\' && i != '{' && i != '}';
    return table;
  }();
  return c < 0x80 ? kTable.values[c] : sizeof(Char) > 1;
}

template <class Char>
class Reader {
 public:
  Reader(const Char* at, const Char* end, Document& document)
      : m_start(at), m_at(at), m_end(end), m_document(document) {}

  void Run() {
    m_document.text.Reserve(static_cast<std::size_t>(m_end - m_at) * (sizeof(Char) > 1 ? 1 : 2));
    SetDocumentPage(1252);
    while (TakeText()) TakeOther();
    m_document.defaultFont = m_defaultFont;
    EndDocument();
  }

 private:
  // --- text ---

  // Up to the next character that does not stand for itself; false at the end.
  bool TakeText() {
    const Char* start = m_at;
    while (m_at != m_end && IsPlain(*m_at)) ++m_at;
    if (m_at != start) {
      BeginText();
      m_document.text.Add(start, static_cast<std::size_t>(m_at - start));
    }
    return m_at != m_end;
  }
  void TakeOther() {
    const Char c = *m_at;
    if (c == '{') {
      ++m_at;
      m_stack.Push(m_state, m_isStateChanged);
      m_isStateChanged = false;
    } else if (c == '}') {
      ++m_at;
      EndGroup();
    } else if (c == '\\') {
      TakeControl();
    } else if (c == '\t') {
      ++m_at;
      Add('\t');
    } else if (c < ' ') {
      ++m_at;
    } else {
      BeginText();
      DecodeByte(m_at, m_end, *m_state.charset, m_document.text);
    }
  }
  // Notes the formats that the text from here on has.
  void BeginText() {
    m_isAfterCell = false;
    if (m_isFormatNew) NoteFormats();
  }
  void Add(char16_t character) {
    BeginText();
    m_document.text.Add(character);
  }
  void AddLineEnd() {
    Add('\r');
    m_document.text.Add(u'\n');
  }
  void NoteFormats() {
    m_isFormatNew = false;
    Note(m_document.characters, m_state.characters);
    Note(m_document.paragraphs, m_state.paragraph);
  }
  template <class Format>
  void Note(std::vector<FormatRun<Format>>& runs, const Format& format) {
    const std::size_t start = m_document.text.Length();
    if (!runs.empty() && runs.back().format == format) return;
    if (!runs.empty() && runs.back().start == start) {
      runs.back().format = format;
    } else {
      runs.push_back({start, format});
    }
  }

  // --- groups and controls ---

  void EndGroup() {
    m_isOptional = false;
    m_isFormatNew = true;
    if (!m_stack.Pop(m_state, m_isStateChanged)) return;
    if (m_stack.IsEmpty()) m_at = m_end;  // behind the document there is nothing
    if (m_isFontDue) ChooseFont(m_defaultFont);
  }
  void SkipGroup() {
    m_at = FindRtfGroupEnd(m_at, m_end);
    m_isOptional = false;
  }
  void TakeControl() {
    if (m_end - m_at < 2) {
      m_at = m_end;
    } else if (IsRtfLetter(m_at[1])) {
      const RtfWord<Char> word = ReadRtfWord(m_at + 1, m_end);
      m_at = word.end;
      TakeWord(word);
    } else if (m_at[1] == '\'') {
      TakeHexByte();
    } else {
      m_at += 2;
      TakeSymbol(m_at[-1]);
    }
  }
  // Control characters mean what they mean behind a backslash.
  void TakeHexByte() {
    const Char* behind = m_at;
    const int byte = ReadHexByte(behind, m_end);
    if (byte < ' ') {
      m_at = behind;
      if (byte > 0) TakeSymbol(static_cast<Char>(byte));
    } else {
      BeginText();
      DecodeByte(m_at, m_end, *m_state.charset, m_document.text);
    }
  }
  void TakeSymbol(Char symbol) {
    switch (symbol) {
      case '\\':
      case '{':
      case '}':
        return Add(static_cast<char16_t>(symbol));
      case '~':
        return Add(0xA0);
      case '-':
        return Add(0xAD);
      case '_':
        return Add(0x2011);
      case '\t':
        return Add('\t');
      case '\r':
      case '\n':
        return AddLineEnd();
      case '*':
        m_isOptional = BeginsGroup(m_at - 2);
        return;
      default:
        return;
    }
  }
  // Whether only blanks stand between what is at `at` and the brace in front of it.
  bool BeginsGroup(const Char* at) const {
    while (at != m_start && (at[-1] == ' ' || at[-1] == '\r' || at[-1] == '\n')) --at;
    return at != m_start && at[-1] == '{';
  }
  void TakeWord(const RtfWord<Char>& word) {
    const Keyword* keyword = FindKeyword(word.key);
    if (keyword != nullptr) {
      Perform(*keyword, word);
    } else if (m_isOptional) {
      SkipGroup();
    }
    m_isOptional = false;
  }
  void Perform(const Keyword& keyword, const RtfWord<Char>& word) {
    switch (keyword.action) {
      case Action::kNothing:
        return;
      case Action::kSkipGroup:
        return SkipGroup();
      case Action::kCharacter:
        return Add(keyword.value);
      case Action::kParagraphEnd:
        return AddLineEnd();
      case Action::kCellEnd:
        Add('\t');
        m_isAfterCell = true;
        return;
      case Action::kRowEnd:
        return EndRow();
      case Action::kBinary:
        m_at = SkipRtfBinary(word, m_end);
        return;
      case Action::kUnicode:
        return AddUnicode(word.number);
      case Action::kFallback:
        m_state.fallback = word.NumberOr(1);
        m_isStateChanged = true;
        return;
      case Action::kUnicodeGroup:
        return SkipSubstitute();
      case Action::kFontTable:
        return TakeFonts();
      case Action::kColorTable:
        ReadColors(m_at, FindRtfGroupEnd(m_at, m_end), m_document.colors);
        return SkipGroup();
      case Action::kCharset:
        return SetDocumentPage(keyword.value);
      case Action::kCodePage:
        return SetDocumentPage(word.number);
      case Action::kDefaultFont:
        m_defaultFont = word.number;
        return;
      default:
        Format(keyword, word);
        m_isFormatNew = m_isStateChanged = true;
        return;
    }
  }

  // --- characters and ends ---

  void AddUnicode(std::int32_t number) {
    const auto unit = static_cast<char16_t>(number);  // negative ones are those above 0x7FFF
    if (unit == '\r' || unit == '\n') {
      AddLineEnd();
    } else if (unit != 0) {
      Add(unit);
    }
    m_at = SkipFallback(m_at, m_end, m_state.fallback);
  }
  // The group behind \upr is for readers without Unicode.
  void SkipSubstitute() {
    const Char* at = m_at;
    while (at != m_end && (*at == ' ' || *at == '\r' || *at == '\n')) ++at;
    if (at == m_end || *at != '{') return;
    m_at = FindRtfGroupEnd(at + 1, m_end);
    if (m_at != m_end) ++m_at;
  }
  // Tabs stand between cells; the row's end takes the place of the last one.
  void EndRow() {
    if (m_isAfterCell) m_document.text.Cut(m_document.text.Length() - 1);
    AddLineEnd();
  }
  // The end of the last paragraph is the end of the text.
  void EndDocument() {
    if (m_document.text.EndsWith(u"\r\n")) m_document.text.Cut(m_document.text.Length() - 2);
    m_document.text.Shrink();
  }

  // --- formats ---

  void SetDocumentPage(std::int32_t page) {
    m_documentPage = static_cast<UINT>(page);
    m_state.charset = m_documentCharset = Charset::Of(m_documentPage);
    m_isStateChanged = true;
  }
  void Format(const Keyword& keyword, const RtfWord<Char>& word) {
    CharFormat& characters = m_state.characters;
    ParagraphFormat& paragraph = m_state.paragraph;
    switch (keyword.action) {
      case Action::kFont:
        return ChooseFont(word.number);
      case Action::kSize:
        characters.size = static_cast<std::int16_t>(word.NumberOr(24));
        return;
      case Action::kFlag:
        characters.flags = static_cast<std::uint16_t>(word.NumberOr(1) != 0 ? characters.flags | keyword.value
                                                                            : characters.flags & ~keyword.value);
        return;
      case Action::kNoFlag:
        characters.flags = static_cast<std::uint16_t>(characters.flags & ~keyword.value);
        return;
      case Action::kColor:
        characters.color = word.number;
        return;
      case Action::kBackColor:
        characters.back = word.number;
        return;
      case Action::kPlain:
        characters = CharFormat();
        return ChooseFont(m_defaultFont);
      case Action::kParagraph:
        paragraph = ParagraphFormat();
        return;
      case Action::kAlignment:
        paragraph.alignment = static_cast<ParagraphFormat::Alignment>(keyword.value);
        return;
      case Action::kLeftIndent:
        paragraph.left = word.number;
        return;
      case Action::kFirstIndent:
        paragraph.first = word.number;
        return;
      default:
        paragraph.right = word.number;
        return;
    }
  }
  void TakeFonts() {
    std::vector<Font>& fonts = m_document.fonts;
    const std::size_t former = fonts.size();
    ReadFonts(m_at, FindRtfGroupEnd(m_at, m_end), m_documentPage, fonts);
    for (std::size_t place = former; place < fonts.size(); ++place) {
      const UINT page = CodePageOf(fonts[place], 0);
      m_places[fonts[place].number] = {static_cast<std::int32_t>(place), page != 0 ? Charset::Of(page) : nullptr};
    }
    SkipGroup();
    m_isFontDue = true;
  }
  void ChooseFont(std::int32_t number) {
    m_isFontDue = false;
    m_isStateChanged = true;
    const auto found = m_places.find(number);
    const FontPlace place = found != m_places.end() ? found->second : FontPlace();
    m_state.characters.font = place.place;
    m_state.charset = place.charset != nullptr ? place.charset : m_documentCharset;
  }

  struct FontPlace {
    std::int32_t place = CharFormat::kNone;
    const Charset* charset = nullptr;  // null: the document's
  };

  const Char* m_start;
  const Char* m_at;
  const Char* m_end;
  Document& m_document;
  State m_state;
  StateStack m_stack;
  UINT m_documentPage = 0;
  const Charset* m_documentCharset = nullptr;
  std::unordered_map<std::int32_t, FontPlace> m_places;  // by their numbers
  std::int32_t m_defaultFont = 0;
  bool m_isFontDue = false;      // the fonts have been read, and the default one is not chosen yet
  bool m_isOptional = false;     // behind "\*"
  bool m_isStateChanged = true;  // since the last group opened
  bool m_isFormatNew = true;     // the formats changed behind the last text
  bool m_isAfterCell = false;    // the text ends with the tab of a cell
};

}  // namespace

template <class View>
static bool BeginsAsRtf(View text) {
  constexpr const char* kStarts[] = {"{\\rtf", "{\\urtf"};
  for (const std::string_view start : kStarts) {
    if (text.size() >= start.size() && std::equal(start.begin(), start.end(), text.begin())) return true;
  }
  return false;
}

bool IsRtf(std::u16string_view text) { return BeginsAsRtf(text); }
bool IsRtf(std::string_view bytes) { return BeginsAsRtf(bytes); }

void ReadRtf(std::u16string_view text, Document& document) {
  document = Document();
  Reader<char16_t>(text.data(), text.data() + text.size(), document).Run();
}

void ReadRtf(std::string_view bytes, Document& document) {
  document = Document();
  const auto* start = reinterpret_cast<const unsigned char*>(bytes.data());
  Reader<unsigned char>(start, start + bytes.size(), document).Run();
}

void ReadText(std::u16string_view text, Document& document) {
  document = Document();
  if (text.size() > SIZE_MAX / 4) throw std::bad_alloc();
  document.text.Reserve(text.size() * 2);
  for (std::size_t i = 0; i < text.size(); ++i) {
    const char16_t c = text[i];
    if (c == '\n' || c == '\r') {
      document.text.Add(u'\r');
      document.text.Add(u'\n');
      if (c == '\r' && i + 1 < text.size() && text[i + 1] == '\n') ++i;
    } else {
      document.text.Add(c);
    }
  }
  document.text.Shrink();
  document.characters.push_back({0, CharFormat()});
  document.paragraphs.push_back({0, ParagraphFormat()});
}

}  // namespace platform::rich
