// The geometry of tabs beside a second reading of the rules: tabs painted on a line.

#include "qxcore/ui/layout/tab_strip.h"

#include <gtest/gtest.h>

#include <memory>
#include <random>
#include <vector>

namespace {

class Strip {
 public:
  STabStrip Get() {
    m_pointers.clear();
    for (const auto& tab : m_tabs) m_pointers.push_back(tab.get());
    return {m_pointers.data(), static_cast<int>(m_tabs.size()), m_first, m_spacing, m_buttons.TabOrigin(), m_width};
  }
  int Count() const { return static_cast<int>(m_tabs.size()); }
  void Insert(int at, int width) {
    m_tabs.insert(m_tabs.begin() + at, std::make_unique<STab>())->get()->m_width = width;
  }
  void Remove(int at) { m_tabs.erase(m_tabs.begin() + at); }

  // Where each tab begins when the first tab of all begins at 0.
  std::vector<int> Starts() const {
    std::vector<int> starts = {0};
    for (const auto& tab : m_tabs) starts.push_back(starts.back() + tab->m_width + m_spacing);
    return starts;
  }

  int m_first = 0;
  int m_spacing = 8;
  int m_width = 300;
  STabButtons m_buttons;

 private:
  std::vector<std::unique_ptr<STab>> m_tabs;
  std::vector<STab*> m_pointers;
};

// The last tab that is whole when `first` is the first visible one: one after the other is tried.
int LastVisibleFrom(const Strip& strip, int first) {
  const std::vector<int> starts = strip.Starts();
  int last = first;
  for (int i = first + 1; i < strip.Count(); ++i) {
    const int right = strip.m_buttons.TabOrigin() + starts[static_cast<std::size_t>(i) + 1] -
                      starts[static_cast<std::size_t>(first)] + strip.m_spacing;
    if (right > strip.m_width) break;
    last = i;
  }
  return last;
}

// The first visible tab, moved one at a time until the tab is visible.
int FirstAfterEnsuring(const Strip& strip, int tab) {
  int first = std::min(tab, strip.m_first);
  while (tab > LastVisibleFrom(strip, first)) ++first;
  return first;
}

// The button at a point, by the rules for one and for what refuses it.
int HitButton(const Strip& strip, int x, int y) {
  const STabButtons& buttons = strip.m_buttons;
  if (x < 0 || y < 0 || y >= buttons.m_height || x >= buttons.m_count * buttons.m_width) return -1;
  const int button = x / buttons.m_width + (buttons.m_count == 2);
  const bool isBack = button <= 1;
  const bool isUseless = isBack ? strip.m_first == 0 : LastVisibleFrom(strip, strip.m_first) >= strip.Count() - 1;
  return isUseless ? -1 : button;
}

int OurHit(Strip& strip, int x, int y) {
  const int button = strip.m_buttons.At(SPoint(x, y));
  return STabCanScroll(strip.Get(), button) ? button : kSTabNoButton;
}

TEST(TabStrip, TwoButtonsArePreviousAndNext) {
  Strip strip;
  for (int i = 0; i < 10; ++i) strip.Insert(i, 60);
  strip.m_first = 3;
  strip.m_buttons.SetSize(17);
  strip.m_buttons.Show(1, 1);
  EXPECT_EQ(OurHit(strip, 16, 16), kSTabToPrevious);
  EXPECT_EQ(OurHit(strip, 17, 0), kSTabToNext);
  EXPECT_EQ(OurHit(strip, 34, 0), kSTabNoButton);
  EXPECT_EQ(OurHit(strip, 0, 17), kSTabNoButton);
  strip.m_buttons.Show(1, 0);
  EXPECT_EQ(OurHit(strip, 67, 0), kSTabToLast);
  strip.m_first = 0;
  EXPECT_EQ(OurHit(strip, 0, 0), kSTabNoButton);
  EXPECT_EQ(OurHit(strip, 17, 0), kSTabNoButton);
  strip.m_buttons.Show(0, 0);
  EXPECT_EQ(strip.m_buttons.m_areaWidth, 0);
  EXPECT_EQ(strip.m_buttons.m_count, 0);
  EXPECT_EQ(strip.m_buttons.TabOrigin(), 0);
}

TEST(TabStrip, RandomSequences) {
  std::mt19937 random(93);
  auto below = [&random](int limit) { return static_cast<int>(random() % static_cast<unsigned>(limit)); };
  Strip strip;
  strip.m_buttons.SetSize(17);
  for (int step = 0; step < 100000; ++step) {
    switch (below(8)) {
      case 0:
        strip.Insert(below(strip.Count() + 1), below(10) ? 20 + below(100) : 0);
        break;
      case 1:
        if (strip.Count() > 0 && (strip.Count() > 40 || below(2))) strip.Remove(below(strip.Count()));
        break;
      case 2:
        strip.m_width = below(900);
        break;
      case 3:
        strip.m_spacing = below(20);
        break;
      case 4:
        strip.m_buttons.Show(below(3), below(2));
        break;
      case 5:
        strip.m_buttons.SetSize(10 + below(20));
        break;
      default:
        strip.m_first = strip.Count() ? below(strip.Count()) : 0;
        break;
    }
    strip.m_first = std::max(std::min(strip.m_first, strip.Count() - 1), 0);
    if (strip.Count() == 0) continue;
    const STabStrip geometry = strip.Get();
    const std::vector<int> starts = strip.Starts();
    const int origin = strip.m_buttons.m_shown ? strip.m_buttons.m_count * strip.m_buttons.m_width + 1 : 0;
    const int moved = origin - starts[static_cast<std::size_t>(strip.m_first)];

    const int tab = below(strip.Count());
    ASSERT_EQ(geometry.Offset(tab), starts[static_cast<std::size_t>(tab)] + moved) << "step " << step;
    ASSERT_EQ(geometry.LastVisible(), LastVisibleFrom(strip, strip.m_first)) << "step " << step;
    ASSERT_EQ(geometry.FirstThatShows(tab), FirstAfterEnsuring(strip, tab)) << "step " << step;

    const int x = below(1000) - 20;
    int under = -1;
    for (int i = strip.m_first; i < strip.Count(); ++i) {
      const auto at = static_cast<std::size_t>(i);
      if (x >= starts[at] + moved && x < starts[at + 1] + moved) under = i;
    }
    ASSERT_EQ(geometry.TabAt(x), under) << "step " << step;

    const int buttonX = below(110) - 5, buttonY = below(40) - 5;
    ASSERT_EQ(OurHit(strip, buttonX, buttonY), HitButton(strip, buttonX, buttonY)) << "step " << step;

    // To the last: its target shows the last tab, and the one before it would not.
    const int target = STabScrollTarget(geometry, kSTabToLast);
    ASSERT_EQ(LastVisibleFrom(strip, target), strip.Count() - 1) << "step " << step;
    if (target > 0) {
      ASSERT_LT(LastVisibleFrom(strip, target - 1), strip.Count() - 1) << "step " << step;
    }
    ASSERT_EQ(STabScrollTarget(geometry, kSTabToFirst), 0);
    ASSERT_EQ(STabScrollTarget(geometry, kSTabToPrevious), std::max(strip.m_first - 1, 0));
    ASSERT_EQ(STabScrollTarget(geometry, kSTabToNext), std::min(strip.m_first + 1, strip.Count() - 1));
    ASSERT_EQ(STabScrollTarget(geometry, 4), strip.m_first);
  }
}

}  // namespace
