// The order of the virtual functions of bars, splitters and tabs, which is part of the binary interface.

#include <cstring>

#include "tests/layout/layout_fixture.h"

namespace {

constexpr int kAfterWindow = 31;  // SWnd's own, with the two slots of the destructor

// The number of a virtual function, as a pointer to it holds it.
template <class Function>
std::ptrdiff_t SlotOf(Function function) {
  std::ptrdiff_t parts[2];
  static_assert(sizeof(function) == sizeof(parts));
  std::memcpy(parts, &function, sizeof(parts));
  return (parts[0] - 1) / static_cast<std::ptrdiff_t>(sizeof(void*));
}

template <class... Functions>
void ExpectInOrder(Functions... functions) {
  std::ptrdiff_t expected = kAfterWindow;
  for (const std::ptrdiff_t slot : {SlotOf(functions)...}) EXPECT_EQ(slot, expected++);
}

struct Bar : SCtrlBar {
  static void Check() { ExpectInOrder(&Bar::OnBarStyleChange, &Bar::GetBarLayout, &Bar::GetCustomLayout); }
};

struct Splitter : SSplitterWnd {
  static void Check() {
    ExpectInOrder(&Splitter::RecalcLayout, &Splitter::SplitRow, &Splitter::SplitColumn, &Splitter::DeleteRow,
                  &Splitter::DeleteColumn, &Splitter::DeletePane, &Splitter::RemovePane, &Splitter::CreateScrollBarCtrl,
                  &Splitter::GetActivePane, &Splitter::SetActivePane, &Splitter::CanActivateNext,
                  &Splitter::ActivateNext, &Splitter::DoKeyboardSplit, &Splitter::DoScroll, &Splitter::DoScrollBy,
                  &Splitter::OnDrawSplitter, &Splitter::OnInvertTracker, &Splitter::HitTest, &Splitter::GetHitRect,
                  &Splitter::GetInsideRect, &Splitter::DrawAllSplitBars, &Splitter::SetSplitCursor,
                  &Splitter::StartTracking, &Splitter::StopTracking, &Splitter::TrackRowSize,
                  &Splitter::TrackColumnSize);
  }
};

struct Beam : STabBeam {
  static void Check() {
    ExpectInOrder(&Beam::InsertTab, &Beam::DeleteTab, &Beam::FindTab, &Beam::AdjustTabSize, &Beam::DrawTab,
                  &Beam::DrawButton, &Beam::CalcTabOffset, &Beam::CalcTabFromOffset, &Beam::AutoMove,
                  &Beam::SwitchToTab, &Beam::ScrollBtnHit, &Beam::Scroll);
  }
};

struct Tabs : STabWnd {
  static void Check() { ExpectInOrder(&Tabs::RecalcLayout); }
};

TEST(Slots, OfBarsSplittersAndTabsStandInTheirOrder) {
  Bar::Check();
  Splitter::Check();
  Beam::Check();
  Tabs::Check();
}

}  // namespace
