// The colour table of an RTF text: entries, reading, writing, merging.
//
// The texts are those of a \colortbl group: "{\colortbl\r\n;\r\n\red255\green0\blue0;\r\n}\r\n". A colour's
// number is its place in the table; an empty definition, usually the first, is the reader's default colour.
// For one thread at a time.
#pragma once

#include "qxcore/container/map.h"
#include "qxcore/container/table_mem.h"
#include "qxcore/platform/export.h"
#include "qxcore/string/string.h"

// One colour.
struct QXCORE_API SRtfColorEntry {
  int m_number = 0;  // N of the references \cfN; SetColorEntry sets 0, a table the place
  SString m_text;    // the definition without the closing ";", as in "\red255\green0\blue0"

  // The definition with its ";".
  SString GetColorEntry() const;
  // Takes one definition: the number becomes 0; one ";" is removed when it is the very last character, then
  // blanks at the end. So a ";" before a line end stays, on purpose. Always returns 1; throws SEOutOfMemory.
  int SetColorEntry(const SString& text);

  // Entries are equal when their texts are, with regard to case.
  friend bool operator==(const SRtfColorEntry& a, const SRtfColorEntry& b) { return a.m_text == b.m_text; }
};

static_assert(sizeof(void*) != 4 || sizeof(SRtfColorEntry) == 8, "the layout is public");

// The colours in the order of the text. Copies share one block; Clear empties it.
class QXCORE_API SRtfColorTable : public STableMem<SRtfColorEntry> {
 public:
  // The table as text: "{\colortbl", each definition with its ";" on a line of its own, "}". Throws
  // SEOutOfMemory.
  SString GetColorTable() const;
  // Adds the colours of another table whose exact text this one does not have. Returns the numbers of the
  // colours that were read, each with the number that the same colour has here.
  //
  // `text` is a colour table group. Its definitions end at each ";"; blanks around one do not count, and an
  // empty one is a colour, too. Behind the last ";" only a definition that is not empty counts. They are
  // numbered from 0 in the order of the text. Groups inside are skipped, with what stands before them; a text of
  // another kind has no colours. Time grows with the sizes of both tables, not with their product. On a failure
  // g_RaiseError is called with "RTF Color table: Add color table"; what was read so far is kept and returned.
  SMap<int, int> AddColorTable(const SString& text);
};
