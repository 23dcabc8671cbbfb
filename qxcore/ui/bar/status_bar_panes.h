// SStatusBarPane and SStatusBarPanes: the records of a status bar's panes and the table that holds them.
//
// The table belongs to an SStatusBar or an SStatusBarLayout, which show its panes; change it through them.
// For the user-interface thread.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/container/table_mem.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

// The style of a pane: a sum of these, and in the low 16 bits drawing types of the control (SBT_NOBORDERS,
// SBT_POPOUT, SBT_RTLREADING), which it gets with the pane's text.
enum : std::uint32_t {
  kSPaneSplice = 0x00100000,  // an attached layout's panes are shown just before this pane; the last one with it counts
  kSPaneMain = 0x00200000,    // the pane that index -1 names; the first one with it counts
  kSPaneKeepText = 0x01000000,   // the text is kept, but not shown
  kSPaneOwnerDraw = 0x02000000,  // the bar paints the pane's text itself, in grey
  kSPaneStretch = 0x04000000,    // takes a share of the width that is left over
  kSPaneAutoSize = 0x08000000,   // the width follows the text's
};

// The index of the main pane, wherever an index is taken.
inline constexpr int kSMainPane = -1;

// One pane.
struct SStatusBarPane {
  enum : std::uint32_t { kTextDirty = 1 };  // the control must be given the text

  int m_width = 0;            // pixels, without the padding that each pane gets
  std::uint32_t m_style = 0;  // kSPane... and drawing types
  std::uint32_t m_flags = 0;  // kTextDirty
  SString m_text;             // what the pane shows
};

static_assert(sizeof(void*) != 4 || (sizeof(SStatusBarPane) == 16 && offsetof(SStatusBarPane, m_text) == 12),
              "the layout is public");

// The table of panes; the index kSMainPane names the main pane in every function that takes an index.
class QXCORE_API SStatusBarPanes : public STableMem<SStatusBarPane> {
 public:
  // Empty, with room for five panes.
  SStatusBarPanes() { GrowTo(5); }

  // The position of the pane that an index names; -1 when there is none.
  int Find(int index) const;
  // The position of the first main pane, or -1.
  int FindMain() const;
  // The position of the last pane with kSPaneSplice; the number of panes when there is none.
  int FindSplice() const;

  // Inserts a pane without a text before the one at `index`; an index behind the end appends; -1 and -2 insert at
  // the main pane's position, at 0 without one. An auto-size pane gets the width 0. Returns the new pane's position;
  // -1, and inserts nothing, for other negative indices. Throws SEOutOfMemory.
  int InsertPane(int index, int width, DWORD style);
  // Returns 1, or 0 when there is no such pane.
  int DeletePane(int index);
  // Stores a text, null for an empty one, and marks it dirty if it is another one than before. Returns the pane's
  // position, or -1 when there is no such pane or no memory.
  int SetPaneText(int index, const SString* text);
  // Returns 1, or 0 and changes nothing when there is no such pane.
  int GetPaneText(int index, SString* text) const;
  SString GetPaneText(int index) const;  // the empty string when there is no such pane
  DWORD GetPaneStyle(int index) const;   // 0 when there is no such pane
  int GetPaneWidth(int index) const;     // 0 when there is no such pane
  // Scales all widths from one number of dots an inch to another.
  void ScaleWidths(int fromDpi, int toDpi);
};

static_assert(sizeof(void*) != 4 || sizeof(SStatusBarPanes) == 8, "the layout is public");
