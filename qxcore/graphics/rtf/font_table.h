// The font table of an RTF text: entries, reading, writing, merging.
//
// The texts are those of a \fonttbl group: "{\fonttbl\r\n{\f0\froman\fcharset0 Times;}\r\n}\r\n". Names and
// control words are kept as they are written, escapes included. For one thread at a time.
#pragma once

#include "qxcore/container/map.h"
#include "qxcore/container/table_mem.h"
#include "qxcore/platform/export.h"
#include "qxcore/string/string.h"

// One font.
struct QXCORE_API SRtfFontEntry {
  int m_number = 0;        // N of the references \fN
  SString m_name;          // without the closing ";"
  SString m_controlWords;  // what stands between number and name, as in "\froman\fcharset0"

  // The entry as text, as in "{\f2\froman\fcharset0 Times;}".
  SString GetFontEntry() const;
  // Reads one entry, a group in braces, and returns 1; an invalid text clears this one and returns 0.
  //
  // The number is that of the entry's word \fN; what exceeds an int is clipped. The name begins at the first
  // tag that is a text, an escape or a Unicode character \uN, and runs to the end of the group; blanks are
  // trimmed, then one ";". Groups inside the entry (an alternative name, a panose number, an embedded font)
  // are skipped. An entry without a number or a name is invalid. Returns 0 also when memory runs out.
  int SetFontEntry(const SString& text);

  // Entries are equal when their names are, without regard to case.
  friend bool operator==(const SRtfFontEntry& a, const SRtfFontEntry& b) {
    return a.m_name.CompareNoCase(b.m_name) == 0;
  }
};

static_assert(sizeof(void*) != 4 || sizeof(SRtfFontEntry) == 12, "the layout is public");

// The fonts in the order of the text. Copies share one block; Clear empties it.
class QXCORE_API SRtfFontTable : public STableMem<SRtfFontEntry> {
 public:
  // The table as text: "{\fonttbl", each entry on a line of its own, "}". Throws SEOutOfMemory.
  SString GetFontTable() const;
  // Adds the fonts of another table that this one does not have by name, ignoring case; each gets the number
  // that is the table's size before. Returns the numbers of the fonts that were read, each with the number
  // that the same font has here. Of entries with one name the first counts, of those with one number the last.
  //
  // `text` is a font table group with each entry in a group of its own, as GetFontTable and
  // SRtfDocument::ExtractFontTable make it. Invalid entries are skipped; the table ends at the first tag
  // that is not a group. Time grows with the sizes of both tables, not with their product. On a failure
  // g_RaiseError is called with "RTF Font table: Add font table"; what was read so far is kept and returned.
  SMap<int, int> AddFontTable(const SString& text);
};
