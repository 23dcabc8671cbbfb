// SRtfDocument: works on texts in the Rich Text Format, version 1.9.1, held in SStrings.
//
// It converts between RTF and plain text, cuts an RTF text into tags, takes its header apart, and renumbers
// references to fonts and colours. To put a fragment into another document:
//   1. ExtractFontTable and ExtractColorTable of both;
//   2. SRtfFontTable::AddFontTable and SRtfColorTable::AddColorTable: the document's tables, then the fragment's;
//   3. ChangeFontAndColor on the fragment's body with the two maps of the fragment;
//   4. write the header with the merged tables, the document's body, the fragment's body.
//
// Operations answer with an int, 0 for failure, and let no exception out; results are unchanged then unless
// stated otherwise. Groups may be nested to any depth. A group without its closing brace runs to the end of
// the text. For one thread at a time, the conversions for the user-interface thread.
#pragma once

#include <concepts>
#include <type_traits>

#include "qxcore/container/map.h"
#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class SRichEditCtrl;

class QXCORE_API SRtfDocument {
 public:
  // A document without a control; the first conversion makes one.
  SRtfDocument() = default;
  // A copy makes a control of its own when it needs one; assignment keeps the one that is there.
  SRtfDocument(const SRtfDocument&) {}
  SRtfDocument& operator=(const SRtfDocument&) { return *this; }
  ~SRtfDocument() { DeleteEditCtrl(); }

  // --- tags ---
  // Moves the cursor over blanks, tabs, carriage returns and line feeds. Returns 1; 0 for a null argument.
  static int SkipSpace(WCHAR** cursor);
  template <std::same_as<const WCHAR> Char>
  static int SkipSpace(Char** cursor) {
    return SkipSpace(const_cast<WCHAR**>(cursor));
  }
  // Removes the first `length` characters of the terminated text in place; a length beyond its end empties it.
  // Returns 1; 0 for a null text or a length below 1.
  static int RemoveTag(WCHAR* text, long length);
  // Finds the tag at the start of a terminated text, behind blanks: its address and its length in characters.
  // Returns 1; 0 for a null argument, and at the end of the text, where the length is 0.
  //   "{", "}"         one character; "{" with `wholeGroup` not 0 the group with all that is in it
  //   "\\", "\{", "\}" two characters, which belong to the text around them
  //   another "\"      a control word: up to the next backslash, brace or line end, or with the blank or tab
  //                    that ends it
  //   anything else    text, with its hexadecimal escapes: up to the next brace or other backslash
  static int GetNextTag(WCHAR** tagStart, long* tagLength, WCHAR* text, int wholeGroup);
  template <std::same_as<const WCHAR> Char>
  static int GetNextTag(Char** tagStart, long* tagLength, std::type_identity_t<Char>* text, int wholeGroup) {
    return GetNextTag(const_cast<WCHAR**>(tagStart), tagLength, const_cast<WCHAR*>(text), wholeGroup);
  }

  // --- parts of a text ---
  // Hand out a part. With `cut` not 0 the part is also removed from `rtf`. Return 1; 0 with an empty part when
  // it is missing, or when memory runs out. `rtf` and the part may not be one string.
  //
  // The header: from the opening brace up to the first thing that does not belong to it, with the blanks before
  // that; the brace stays open, so header and rest are the whole text again. Its parts are the control words
  // for version, character set, default fonts and languages, and the groups of tables and document
  // information (fonts, files, colours, styles, lists, revisions, document variables, generator, ...). Words that
  // format pages, sections, paragraphs or characters belong to the body. 0 for a text that is not RTF.
  static int ExtractHeader(SString& rtf, SString& header, int cut);
  // The first \fonttbl group, with its braces. Entries that stand in it without braces of their own, as some
  // writers leave them, are handed out with braces, and a table behind "\*" without that, so that
  // SRtfFontTable::AddFontTable reads them.
  static int ExtractFontTable(SString& rtf, SString& table, int cut);
  // The first \colortbl group and the first \stylesheet group, with their braces.
  static int ExtractColorTable(SString& rtf, SString& table, int cut);
  static int ExtractStyleTable(SString& rtf, SString& table, int cut);

  // Rewrites references to fonts (\f, \af, \deff, \pnf, ...) and colours (\cf, \cb, \highlight, \brdrcf, ...)
  // through the maps; numbers that are not in a map stay, and so does everything else: text, escapes, binary
  // data and the font and colour tables themselves. References in groups of every kind are rewritten, in style
  // sheets and list tables, too. Returns 1; 0 when memory runs out. `result` may be `rtf`.
  //
  // Text without a reference has the default font of the document that it is put into; \plain goes back to it.
  static int ChangeFontAndColor(const SString& rtf, SString& result, const SMap<int, int>& fontMap,
                                const SMap<int, int>& colorMap);

  // --- conversions, through a hidden rich-edit control ---
  // The control is a child of the owner window, or of the dummy window where there is no owner. It ends with its
  // parent, and the next conversion makes another one.
  //
  // Make the control if it is missing, put the text in and read it back. Text ends at a NUL; lines end with CR LF.
  // Return 1 when what was read back is not empty, or when the input is empty; 0 without a control, with a null
  // output, or when memory runs out. The output may be the input.
  //
  // RtfToText returns the text that a reader sees. Plain text comes back as it is. On Linux: tabs between cells,
  // a line for each table row, a form feed for a page end; of a field its result; footnotes where they are
  // anchored; no headers, footers, pictures and comments. On Windows: what the system's control makes of it.
  int RtfToText(SString* text, const SString& rtf);
  // TextToRtf returns the text as a document; a text that begins with "{\rtf" is read as RTF and written anew.
  int TextToRtf(SString* rtf, const SString& text);

  // Makes the control if it is missing. Returns 1; 0 when that fails.
  int CreateEditCtrl();
  // Destroys the control, if there is one.
  void DeleteEditCtrl();

 private:
  SRichEditCtrl* m_edit = nullptr;
};

static_assert(sizeof(SRtfDocument) == sizeof(void*), "the layout is public");
