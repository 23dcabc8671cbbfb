// The parts of a status bar: what each shows, and where it lies.
#pragma once

#include "qxcore/platform/posix/window/memory.h"

namespace platform::controls {

using model::List;
using model::Text;

// Pixels that never change.
inline constexpr int kBarTopBorder = 2;  // above the parts
inline constexpr int kBarGap = 2;        // between two parts
inline constexpr int kMostParts = 256;

struct BarPart {
  Text text;
  UINT type = 0;         // SBT_ bits
  LPARAM ownerData = 0;  // for SBT_OWNERDRAW, instead of the text
  int rightEdge = -1;    // as it was set; -1 is the end of the bar

  // Takes over the text or the number of SB_SETTEXT. Control characters other than tabs become blanks.
  void Set(UINT newType, LPARAM shown);
};

struct StatusBar : model::OnModelHeap {
  List<BarPart> parts = List<BarPart>(1);
  BarPart simple;  // shown alone in the simple mode
  bool isSimple = false;
  HFONT font = nullptr;     // not owned
  HFONT ownFont = nullptr;  // the font at first
  int minHeight = 0;
  COLORREF background = CLR_DEFAULT;

  // The part that an index of SB_SETTEXT names; null for an unknown one.
  BarPart* PartToSet(UINT index);
  // The part that an index names in what is shown; null for an unknown one.
  const BarPart* ShownPart(UINT index) const;
  // Its place; `client` is the bar's client area.
  RECT PartRect(UINT index, const RECT& client) const;
  // The index of the part at a point; -1 outside of all parts.
  int PartAt(POINT point, const RECT& client) const;
  // Returns false, and changes nothing, for a number of parts that is not from 1 to kMostParts.
  bool SetParts(int count, const int* edges);
  UINT PartCount() const { return static_cast<UINT>(parts.size()); }
};

}  // namespace platform::controls
