// The order of the virtual functions of bars, splitters and tabs, which is part of the binary interface.

#include "tests/layout/layout_fixture.h"
#include "tests/support/slots.h"

namespace {

constexpr int kAfterWindow = 31;  // SWnd's own, with the two slots of the destructor

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
