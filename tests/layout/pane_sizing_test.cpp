// The division of a length among panes, and the places of their bars, beside a second reading of the rules.

#include "qxcore/ui/layout/pane_sizing.h"

#include <gtest/gtest.h>

#include <numeric>
#include <random>
#include <vector>

namespace {

using Panes = std::vector<SPaneInfo>;

int Count(const Panes& panes) { return static_cast<int>(panes.size()); }

std::vector<int> SizesOf(const Panes& panes) {
  std::vector<int> sizes;
  for (const SPaneInfo& pane : panes) sizes.push_back(pane.m_current);
  return sizes;
}

Panes WithIdeals(std::initializer_list<int> ideals) {
  Panes panes;
  for (int ideal : ideals) panes.emplace_back().m_ideal = ideal;
  return panes;
}

std::vector<int> Sized(Panes panes, int length, int gap, bool keepRatio) {
  SSizePanes(panes.data(), Count(panes), length, gap, keepRatio);
  return SizesOf(panes);
}

// The rules, read once more: who asks for how much, who gets it, and what becomes of the rest.
struct SecondReading {
  std::vector<int> asked;
  std::vector<int> minima;
  std::size_t filler = 0;

  explicit SecondReading(const Panes& panes) : filler(panes.size() - 1) {
    for (std::size_t i = panes.size(); i-- > 0;) {
      const bool isLast = i + 1 == panes.size();
      const bool counts = isLast || panes[i].m_ideal >= panes[i].m_min;
      asked.insert(asked.begin(), counts ? panes[i].m_ideal : 0);
      minima.insert(minima.begin(), panes[i].m_min);
      if (!isLast && (panes[i].m_flags & 2) != 0) filler = i;  // the first of them stays
    }
  }

  std::vector<int> Sizes(long long length, long long gap, bool keepRatio) const {
    long long space = length < 0 ? 0 : length;
    space -= (static_cast<long long>(asked.size()) - 1) * gap;
    if (space < 0) space = 0;
    long long sum = 0;
    for (int size : asked) sum += size;
    std::vector<int> sizes;
    long long rest = space;
    for (std::size_t i = 0; i < asked.size(); ++i) {
      long long size = asked[i];
      if (keepRatio) {
        size = sum > 0 ? size * space / sum : 0;
      } else if (size > rest) {
        size = rest;
      }
      if (size < minima[i]) size = 0;
      rest -= size;
      sizes.push_back(static_cast<int>(size));
    }
    sizes[filler] += static_cast<int>(rest);
    return sizes;
  }
};

// The bar at a place, by painting all bars on a line.
int PaintedBarAt(const Panes& panes, int gap, int distance) {
  std::vector<int> line;
  for (int i = 0; i < Count(panes); ++i) {
    line.insert(line.end(), static_cast<std::size_t>(panes[static_cast<std::size_t>(i)].m_current), -1);
    const bool hasBar = i + 1 < Count(panes) && (panes[static_cast<std::size_t>(i)].m_flags & 1) == 0;
    line.insert(line.end(), static_cast<std::size_t>(gap), hasBar ? i : -1);
  }
  return distance >= 0 && distance < static_cast<int>(line.size()) ? line[static_cast<std::size_t>(distance)] : -1;
}

TEST(PaneSizing, StatedExamples) {
  EXPECT_EQ(Sized(WithIdeals({1, 3}), 407, 7, true), (std::vector<int>{100, 300}));
  EXPECT_EQ(Sized(WithIdeals({1, 1, 1}), 24, 7, true), (std::vector<int>{3, 3, 4}));
  Panes collapsing = WithIdeals({1, 9, 10});
  collapsing[0].m_min = 1;
  EXPECT_EQ(Sized(collapsing, 200, 0, true), (std::vector<int>{10, 90, 100}));
  collapsing[0].m_min = 11;
  collapsing[0].m_ideal = 11;  // 200 * 11 / 30 is above 11, 20 * 11 / 30 is not
  EXPECT_EQ(Sized(collapsing, 20, 0, true), (std::vector<int>{0, 6, 14}));
}

TEST(PaneSizing, IdealSizesInOrder) {
  EXPECT_EQ(Sized(WithIdeals({50, 60, 0}), 214, 7, false), (std::vector<int>{50, 60, 90}));
  EXPECT_EQ(Sized(WithIdeals({50, 60, 30}), 114, 7, false), (std::vector<int>{50, 50, 0}));
  EXPECT_EQ(Sized(WithIdeals({50, 60}), -5, 7, false), (std::vector<int>{0, 0}));
  Panes panes = WithIdeals({50, 60, 40});
  panes[0].m_flags = SPaneInfo::kFiller;
  EXPECT_EQ(Sized(panes, 214, 7, false), (std::vector<int>{100, 60, 40}));
  panes[1].m_min = 55;  // 50 are left, and go to the last pane and then to the filler
  EXPECT_EQ(Sized(panes, 114, 7, false), (std::vector<int>{60, 0, 40}));
}

TEST(PaneSizing, SetTouchesWhatItSays) {
  SPaneInfo pane;
  pane.Set(100, 20, 1);
  EXPECT_EQ(pane.m_ideal, 100);
  EXPECT_EQ(pane.m_min, 20);
  EXPECT_EQ(pane.m_flags, SPaneInfo::kFixed);
  pane.Set(-1, -1, 0);
  EXPECT_EQ(pane.m_ideal, 100);
  EXPECT_EQ(pane.m_min, 20);
  EXPECT_EQ(pane.m_flags, SPaneInfo::kFixed | SPaneInfo::kFiller);
  pane.Set(50, -1, 0);
  EXPECT_EQ(pane.m_ideal, 50);
  EXPECT_EQ(pane.m_flags, SPaneInfo::kFiller);
  pane.Set(-1, 30, 1);
  EXPECT_EQ(pane.m_min, 30);
  EXPECT_EQ(pane.m_flags, 0u);
}

// Random changes of random panes; after each, the sizes, the bars and what holds for all layouts.
TEST(PaneSizing, RandomSequences) {
  std::mt19937 random(20261121);
  auto below = [&random](int limit) { return static_cast<int>(random() % static_cast<unsigned>(limit)); };
  Panes panes(3);
  int length = 500, gap = 7, keepRatio = 0;
  for (int step = 0; step < 100000; ++step) {
    auto at = static_cast<std::size_t>(below(Count(panes)));
    switch (below(8)) {
      case 0:
        panes[at].Set(below(300), below(3) ? -1 : below(80), below(4) == 0);
        break;
      case 1:
        panes[at].Set(-1, below(2) ? -1 : below(80), 0);
        break;
      case 2:
        panes[at].m_ideal = below(40) == 0 ? 0x7FFFFFFF : below(5);
        break;
      case 3:
        length = below(12) == 0 ? below(100) - 50 : below(2000);
        break;
      case 4:
        keepRatio = below(2);
        break;
      case 5:
        gap = below(15);
        break;
      case 6:
        if (below(2) && Count(panes) < 16) {
          panes.insert(panes.begin() + below(Count(panes) + 1), SPaneInfo{});
        } else if (Count(panes) > 1) {
          panes.erase(panes.begin() + static_cast<std::ptrdiff_t>(at));
        }
        break;
      case 7:
        if (int bar = below(Count(panes)); bar + 1 < Count(panes)) {
          SMoveBar(panes.data(), Count(panes), bar, below(600) - 20, keepRatio);
        }
        break;
    }
    const std::vector<int> expected = SecondReading(panes).Sizes(length, gap, keepRatio != 0);
    SSizePanes(panes.data(), Count(panes), length, gap, keepRatio);
    ASSERT_EQ(SizesOf(panes), expected) << "step " << step;

    const long long sum = std::accumulate(expected.begin(), expected.end(), 0LL);
    ASSERT_EQ(sum, std::max(0, std::max(length, 0) - (Count(panes) - 1) * gap)) << "step " << step;
    for (int size : expected) ASSERT_GE(size, 0);

    const int place = below(2100) - 20;
    ASSERT_EQ(SBarAt(panes.data(), Count(panes), gap, place), PaintedBarAt(panes, gap, place)) << "step " << step;
  }
}

// A bar goes where it was moved to, whoever the filler is.
TEST(PaneSizing, MovedBarLiesWhereItWasMoved) {
  std::mt19937 random(7);
  auto below = [&random](int limit) { return static_cast<int>(random() % static_cast<unsigned>(limit)); };
  for (int step = 0; step < 20000; ++step) {
    Panes panes(static_cast<std::size_t>(2 + below(5)));
    for (SPaneInfo& pane : panes) pane.m_ideal = 20 + below(60);
    panes[static_cast<std::size_t>(below(Count(panes)))].m_flags = SPaneInfo::kFiller;
    const int keepRatio = below(2);
    SSizePanes(panes.data(), Count(panes), 900, 7, keepRatio);
    const Panes former = panes;
    const int bar = below(Count(panes) - 1);
    const auto at = static_cast<std::size_t>(bar);
    // Anywhere between its neighbours.
    const int size = below(panes[at].m_current + panes[at + 1].m_current + 1);
    SMoveBar(panes.data(), Count(panes), bar, size, keepRatio);
    SSizePanes(panes.data(), Count(panes), 900, 7, keepRatio);
    ASSERT_EQ(panes[at].m_current, size) << "step " << step;
    ASSERT_EQ(SPaneStart(panes.data(), bar, 7), SPaneStart(former.data(), bar, 7)) << "step " << step;
  }
}

}  // namespace
