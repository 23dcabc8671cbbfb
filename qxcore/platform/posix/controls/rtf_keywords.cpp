#include "qxcore/platform/posix/controls/rtf_keywords.h"

#include <array>

#include "qxcore/platform/internal/rtf_word.h"
#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {
namespace {

constexpr Keyword Word(std::string_view name, Action action, unsigned value = 0) {
  return {RtfKey(name), action, static_cast<std::uint16_t>(value)};
}
constexpr Keyword Skip(std::string_view name) { return Word(name, Action::kSkipGroup); }
constexpr Keyword Char(std::string_view name, unsigned character) { return Word(name, Action::kCharacter, character); }
constexpr Keyword Flag(std::string_view name, unsigned flag) { return Word(name, Action::kFlag, flag); }

using F = CharFormat;

constexpr Keyword kWords[] = {
    // What ends something.
    Word("par", Action::kParagraphEnd),
    Word("line", Action::kParagraphEnd),
    Word("sect", Action::kParagraphEnd),
    Word("column", Action::kParagraphEnd),
    Word("lbr", Action::kParagraphEnd),
    Word("cell", Action::kCellEnd),
    Word("nestcell", Action::kCellEnd),
    Word("row", Action::kRowEnd),
    Word("nestrow", Action::kRowEnd),

    // Characters by name.
    Char("tab", '\t'),
    Char("page", '\f'),
    Char("emdash", 0x2014),
    Char("endash", 0x2013),
    Char("lquote", 0x2018),
    Char("rquote", 0x2019),
    Char("ldblquote", 0x201C),
    Char("rdblquote", 0x201D),
    Char("bullet", 0x2022),
    Char("emspace", 0x2003),
    Char("enspace", 0x2002),
    Char("qmspace", 0x2005),
    Char("zwj", 0x200D),
    Char("zwnj", 0x200C),
    Char("zwbo", 0x200B),
    Char("zwnbo", 0x2060),
    Char("ltrmark", 0x200E),
    Char("rtlmark", 0x200F),

    // How bytes and numbers become characters.
    Word("u", Action::kUnicode),
    Word("uc", Action::kFallback),
    Word("upr", Action::kUnicodeGroup),
    Word("bin", Action::kBinary),
    Word("ansi", Action::kCharset, 1252),
    Word("mac", Action::kCharset, 10000),
    Word("pc", Action::kCharset, 437),
    Word("pca", Action::kCharset, 850),
    Word("ansicpg", Action::kCodePage),
    Word("fonttbl", Action::kFontTable),
    Word("deff", Action::kDefaultFont),
    Word("f", Action::kFont),

    // Formats of characters.
    Word("plain", Action::kPlain),
    Word("fs", Action::kSize),
    Word("cf", Action::kColor),
    Word("highlight", Action::kBackColor),
    Word("chcbpat", Action::kBackColor),
    Word("cb", Action::kBackColor),
    Word("colortbl", Action::kColorTable),
    Flag("b", F::kBold),
    Flag("i", F::kItalic),
    Flag("ul", F::kUnderline),
    Flag("uld", F::kUnderline),
    Flag("uldb", F::kUnderline),
    Flag("ulw", F::kUnderline),
    Flag("ulwave", F::kUnderline),
    Flag("uldash", F::kUnderline),
    Flag("ulth", F::kUnderline),
    Flag("strike", F::kStrike),
    Flag("striked", F::kStrike),
    Flag("super", F::kSuper),
    Flag("sub", F::kSub),
    Flag("v", F::kHidden),
    Flag("caps", F::kCaps),
    Flag("scaps", F::kSmallCaps),
    Word("ulnone", Action::kNoFlag, F::kUnderline),
    Word("nosupersub", Action::kNoFlag, F::kSuper | F::kSub),

    // Formats of paragraphs.
    Word("pard", Action::kParagraph),
    Word("ql", Action::kAlignment, ParagraphFormat::kLeft),
    Word("qc", Action::kAlignment, ParagraphFormat::kCenter),
    Word("qr", Action::kAlignment, ParagraphFormat::kRight),
    Word("qj", Action::kAlignment, ParagraphFormat::kJustified),
    Word("li", Action::kLeftIndent),
    Word("fi", Action::kFirstIndent),
    Word("ri", Action::kRightIndent),

    // Groups that hold text of the body, though a reader may not know them.
    Word("rtf", Action::kNothing),
    Word("ud", Action::kNothing),
    Word("nesttableprops", Action::kNothing),
    Word("shpinst", Action::kNothing),
    Word("do", Action::kNothing),
    Word("listtext", Action::kNothing),
    Word("pntext", Action::kNothing),
    Word("fldrslt", Action::kNothing),
    Word("shptxt", Action::kNothing),

    // Groups without text of the body: tables of the document, ...
    Skip("stylesheet"),
    Skip("listtable"),
    Skip("listoverridetable"),
    Skip("revtbl"),
    Skip("filetbl"),
    Skip("info"),
    Skip("generator"),
    Skip("themedata"),
    Skip("datastore"),
    Skip("rsidtbl"),
    Skip("latentstyles"),
    Skip("xmlnstbl"),
    Skip("mmathPr"),
    Skip("colorschememapping"),
    Skip("userprops"),
    Skip("docvar"),
    Skip("private"),
    Skip("template"),
    // headers and footers, and what separates notes, ...
    Skip("header"),
    Skip("headerl"),
    Skip("headerr"),
    Skip("headerf"),
    Skip("footer"),
    Skip("footerl"),
    Skip("footerr"),
    Skip("footerf"),
    Skip("ftnsep"),
    Skip("ftnsepc"),
    Skip("ftncn"),
    Skip("aftnsep"),
    Skip("aftnsepc"),
    Skip("aftncn"),
    // pictures, objects and shapes, ...
    Skip("pict"),
    Skip("shppict"),
    Skip("nonshppict"),
    Skip("objdata"),
    Skip("objclass"),
    Skip("objname"),
    Skip("objalias"),
    Skip("objsect"),
    Skip("shprslt"),
    Skip("sp"),
    Skip("background"),
    Skip("dptxbxtextproperties"),
    // entries and instructions of fields, indexes, bookmarks, notes of editors and forms, ...
    Skip("fldinst"),
    Skip("fldtype"),
    Skip("datafield"),
    Skip("formfield"),
    Skip("xe"),
    Skip("tc"),
    Skip("tcn"),
    Skip("bkmkstart"),
    Skip("bkmkend"),
    Skip("annotation"),
    Skip("atnid"),
    Skip("atnauthor"),
    Skip("atndate"),
    Skip("atnref"),
    Skip("atntime"),
    Skip("atnicn"),
    Skip("atrfstart"),
    Skip("atrfend"),
    // lists' definitions, nested tables for those who know none, and HTML that the text was made from.
    Skip("pn"),
    Skip("pntxta"),
    Skip("pntxtb"),
    Skip("pnseclvl"),
    Skip("nonesttables"),
    Skip("htmltag"),
    Skip("mhtmltag"),
};

constexpr std::size_t kPlaces = 1024;

constexpr std::size_t PlaceOf(std::uint64_t key) { return (key * 0x9E3779B97F4A7C15u) >> 54; }

constexpr std::array<Keyword, kPlaces> MakeTable() {
  std::array<Keyword, kPlaces> table{};
  for (const Keyword& word : kWords) {
    std::size_t at = PlaceOf(word.key);
    while (table[at].key != 0) at = (at + 1) % kPlaces;
    table[at] = word;
  }
  return table;
}

constexpr std::array<Keyword, kPlaces> kTable = MakeTable();

}  // namespace

const Keyword* FindKeyword(std::uint64_t key) {
  for (std::size_t at = PlaceOf(key); kTable[at].key != 0; at = (at + 1) % kPlaces) {
    if (kTable[at].key == key) return &kTable[at];
  }
  return nullptr;
}

}  // namespace platform::rich
