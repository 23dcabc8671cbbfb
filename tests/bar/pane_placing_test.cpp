// The panes of a status bar: random changes and widths beside a second reading of the rules.

#include "tests/bar/pane_peer.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <climits>
#include <random>

#include "qxcore/ui/bar/internal/progress_area.h"

namespace {

using test::EdgesOf;
using test::MainOf;
using test::Peer;
using test::Resolve;
using test::SpliceOf;

std::vector<int> Placed(const SStatusBarPanes& own, const SStatusBarPanes* extra, const SPaneSpace& space) {
  std::vector<int> edges(256);
  edges.resize(static_cast<std::size_t>(SPlacePanes(own, own.FindSplice(), extra, space, edges.data(), 256)));
  return edges;
}

class Changes {
 public:
  explicit Changes(unsigned seed) : m_random(seed) {}
  int Number(int below) { return static_cast<int>(m_random() % static_cast<unsigned>(below)); }

  void Step(SStatusBarPanes& panes, Peer& peer) {
    const int count = static_cast<int>(peer.size());
    const int index = Number(count + 4) - 2;
    const int at = Resolve(peer, index);
    switch (Number(count > 12 ? 4 : 6)) {
      case 0:
      case 1:
        ASSERT_EQ(panes.DeletePane(index), at >= 0);
        if (at >= 0) peer.erase(peer.begin() + at);
        break;
      case 2:
        SetText(panes, peer, index, at);
        break;
      case 3:
        if (at >= 0) panes[at].m_width = peer[static_cast<std::size_t>(at)].width = Number(200) - 10;
        break;
      default:
        Insert(panes, peer, index);
        break;
    }
  }

 private:
  void Insert(SStatusBarPanes& panes, Peer& peer, int index) {
    static constexpr DWORD bits[] = {0x00100000, 0x00200000, 0x01000000, 0x02000000,
                                     0x04000000, 0x04000000, 0x08000000};
    const DWORD style = (Number(2) ? bits[Number(7)] : 0) | (Number(3) ? 0 : bits[Number(7)]) | (Number(5) ? 0 : 0x100);
    const int width = Number(150);
    int at = index;
    if (index == -1 || index == -2) at = std::max(MainOf(peer), 0);
    at = std::min(at, static_cast<int>(peer.size()));
    ASSERT_EQ(panes.InsertPane(index, width, style), at);
    peer.insert(peer.begin() + at, {style & 0x08000000 ? 0 : width, style, {}});
  }

  void SetText(SStatusBarPanes& panes, Peer& peer, int index, int at) {
    const std::basic_string<WCHAR> text(static_cast<std::size_t>(Number(3)), WTEXT('x'));
    const SString given((SStringView(text)));
    if (at >= 0) panes[at].m_flags = 0;
    ASSERT_EQ(panes.SetPaneText(index, text.empty() && Number(2) ? nullptr : &given), at);
    if (at < 0) return;
    const bool changed = peer[static_cast<std::size_t>(at)].text != text;
    ASSERT_EQ(panes[at].m_flags, changed ? SStatusBarPane::kTextDirty : 0u) << "an unchanged text is not sent again";
    peer[static_cast<std::size_t>(at)].text = text;
  }

  std::mt19937 m_random;
};

void ExpectSame(const SStatusBarPanes& panes, const Peer& peer) {
  ASSERT_EQ(panes.GetCount(), static_cast<int>(peer.size()));
  for (int index = -1; index < panes.GetCount(); ++index) {
    const int at = Resolve(peer, index);
    SString text(WTEXT("untouched"));
    ASSERT_EQ(panes.GetPaneText(index, &text), at >= 0);
    ASSERT_EQ(text.View(), at >= 0 ? SStringView(peer[static_cast<std::size_t>(at)].text) : WTEXT("untouched"));
    ASSERT_EQ(panes.GetPaneText(index).View(),
              at >= 0 ? SStringView(peer[static_cast<std::size_t>(at)].text) : SStringView());
    ASSERT_EQ(panes.GetPaneStyle(index), at >= 0 ? peer[static_cast<std::size_t>(at)].style : 0);
    ASSERT_EQ(panes.GetPaneWidth(index), at >= 0 ? peer[static_cast<std::size_t>(at)].width : 0);
  }
}

TEST(PanePlacing, RandomPanes_HaveTheEdgesOfASecondReading) {
  Changes changes(9);
  SStatusBarPanes own, extra;
  Peer ownPeer, extraPeer;
  for (int step = 0; step < 100000; ++step) {
    const bool isExtra = changes.Number(4) == 0;
    changes.Step(isExtra ? extra : own, isExtra ? extraPeer : ownPeer);
    const bool isActive = changes.Number(3) != 0;
    const SPaneSpace space{changes.Number(2000) - 100, changes.Number(4), changes.Number(5),
                           6 * (1 + changes.Number(3))};
    ASSERT_EQ(own.FindSplice(), static_cast<int>(SpliceOf(ownPeer)));
    ASSERT_EQ(Placed(own, isActive ? &extra : nullptr, space), EdgesOf(ownPeer, isActive ? extraPeer : Peer(), space))
        << "step " << step;
    if (step % 16 != 0) continue;
    ASSERT_NO_FATAL_FAILURE(ExpectSame(isExtra ? extra : own, isExtra ? extraPeer : ownPeer));
  }
}

TEST(PanePlacing, SpareWidth_IsSharedWithTheRemainderAtTheEnd) {
  SStatusBarPanes panes;
  for (int i = 0; i < 3; ++i) panes.InsertPane(i, 20, kSPaneStretch);
  const int needed = 3 * 26 + 2 * 2;
  EXPECT_EQ(Placed(panes, nullptr, {needed + 10, 0, 2, 6}), (std::vector<int>{29, 29 + 2 + 29, 29 + 2 + 29 + 2 + 30}));
  EXPECT_EQ(Placed(panes, nullptr, {needed - 1, 0, 2, 6}), (std::vector<int>{26, 54, 82}))
      << "nothing grows, nothing shrinks";
}

TEST(PanePlacing, WidthsBeyondAnInt_StopAtItsEnd) {
  SStatusBarPanes panes;
  for (int i = 0; i < 300; ++i) panes.InsertPane(i, INT_MAX, kSPaneStretch);
  const std::vector<int> edges = Placed(panes, nullptr, {INT_MIN, 0, INT_MAX, 6});
  EXPECT_EQ(edges.size(), 256u) << "as many as the control shows";
  EXPECT_EQ(edges.front(), INT_MAX);
  EXPECT_EQ(edges.back(), INT_MAX);
}

TEST(PanePlacing, ControlIndices_OfPanesBehindTheSpliceAreShifted) {
  const int splice = 2, extra = 3;
  EXPECT_EQ(SControlIndex(1, splice, extra), 1);
  EXPECT_EQ(SControlIndex(2, splice, extra), 5);
  EXPECT_EQ(SControlIndex(3, splice, 0), 3);
}

TEST(ProgressArea, TheButtonKeepsItsSize_AndTheProgressTakesTheRest) {
  const SSize button(60, 14);
  const SProgressPlaces alone = SPlaceProgress(SRect(10, 2, 210, 20), 2, nullptr);
  EXPECT_EQ(alone.m_progress, SRect(12, 2, 208, 20));
  EXPECT_TRUE(alone.m_button.IsEmpty());
  const SProgressPlaces both = SPlaceProgress(SRect(10, 2, 210, 20), 2, &button);
  EXPECT_EQ(both.m_button, SRect(148, 6, 208, 20));
  EXPECT_EQ(both.m_progress, SRect(12, 2, 148, 20));
  const SProgressPlaces narrow = SPlaceProgress(SRect(10, 2, 40, 20), 2, &button);
  EXPECT_EQ(narrow.m_button, SRect(-22, 6, 38, 20));
  EXPECT_EQ(narrow.m_progress.Width(), 0) << "a progress control is never wider than nothing";
}

}  // namespace
