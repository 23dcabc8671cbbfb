// What the control words of an RTF text do. Words that are not listed do nothing; a group that begins with an
// unlisted word behind "\*" is skipped. The words are those of RTF 1.9.1, as Microsoft has published it.
#pragma once

#include <cstdint>

namespace platform::rich {

enum class Action : std::uint8_t {
  kNothing,       // known; the group that it begins is read
  kSkipGroup,     // a destination without text of the body
  kCharacter,     // value: the character
  kParagraphEnd,  // and of lines
  kCellEnd,
  kRowEnd,
  kBinary,
  kUnicode,
  kFallback,      // \uc
  kUnicodeGroup,  // \upr: the group behind it is a substitute of the next
  kFontTable,
  kColorTable,
  kCharset,   // of the document; value: code page
  kCodePage,  // \ansicpg
  kDefaultFont,
  kFont,
  kSize,
  kFlag,    // value: CharFormat::Flag, cleared by the number 0
  kNoFlag,  // value: the flags that are cleared
  kColor,
  kBackColor,
  kPlain,
  kParagraph,  // \pard
  kAlignment,  // value: ParagraphFormat::Alignment
  kLeftIndent,
  kFirstIndent,
  kRightIndent,
};

struct Keyword {
  std::uint64_t key;  // see RtfKey; 0 in a free place of the table
  Action action;
  std::uint16_t value;
};

// The word with that key, or null.
const Keyword* FindKeyword(std::uint64_t key);

}  // namespace platform::rich
