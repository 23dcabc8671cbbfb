// A splitter that shows its protected side, and a frame around it: what the tests of splitters share.
#pragma once

#include "tests/layout/layout_fixture.h"

namespace test {

// A splitter whose protected members the tests see.
class Splitter : public SSplitterWnd {
 public:
  using SSplitterWnd::GetHitRect;
  using SSplitterWnd::GetInsideRect;
  using SSplitterWnd::HitTest;
  using SSplitterWnd::StartTracking;
  using SSplitterWnd::StopTracking;
  using SSplitterWnd::TrackColumnSize;
  using SSplitterWnd::TrackRowSize;
  SRect Limit() const { return m_limit; }
  bool IsTracking() const { return m_isTracking; }
  SRect Inside() const {
    SRect rect;
    GetInsideRect(&rect);
    return rect;
  }
  SRect Pane(int row, int column) const { return PlaceIn(*this, IdFromRowCol(row, column)); }
  SPoint MiddleOf(int code) {
    SRect rect;
    GetHitRect(code, &rect);
    return SPoint(std::max<int>(rect.CenterPoint().x, 3), std::max<int>(rect.CenterPoint().y, 3));
  }

  void OnInvertTracker(const SRect& rect) override {
    ++m_inversions;
    SSplitterWnd::OnInvertTracker(rect);
  }
  int m_inversions = 0;

  // The stated fields follow each other.
  void ExpectFieldOrder() {
    const int* fields[] = {&m_barWidth, &m_barHeight, &m_borderShareX, &m_borderShareY, &m_gapX,     &m_gapY,
                           &m_borderX,  &m_borderY,   &m_maxRows,      &m_maxColumns,   &m_rowCount, &m_columnCount};
    for (std::size_t i = 0; i < std::size(fields); ++i) EXPECT_EQ(fields[i], fields[0] + i);
    const auto* base = reinterpret_cast<const char*>(this);
    const void* rest[] = {&m_columnCount, &m_scrollStyle, &m_columns, &m_rows,  &m_paneClass, &m_context,
                          &m_isTracking,  &m_trackedCode, &m_tracker, &m_limit, &m_panes,     &m_keepRatio};
    for (std::size_t i = 1; i < std::size(rest); ++i) EXPECT_LT(rest[i - 1], rest[i]);
    if (sizeof(void*) == 4) {
      EXPECT_EQ(reinterpret_cast<const char*>(fields[0]) - base, 12);
    }
    const int values[] = {7, 7, 0, 0, 7, 7, 2, 2};
    for (std::size_t i = 0; i < std::size(values); ++i) EXPECT_EQ(*fields[i], values[i]);
  }
};

// A frame whose client is a splitter; its size is that of the splitter.
class Splitters : public FrameTest {
 protected:
  Splitters() : FrameTest(400) {}
  void TearDown() override {
    FrameTest::TearDown();
    PaneView::s_refuses = false;
    EXPECT_EQ(PaneView::s_living, 0);
  }

  void MakeStatic(int rows, int columns, DWORD scroll = 0) {
    ASSERT_TRUE(m_splitter.CreateStatic(m_frame, rows, columns, WS_CHILD | WS_VISIBLE | scroll));
    for (int i = 0; i < rows * columns; ++i) {
      ASSERT_NE(m_splitter.AddPane(i / columns, i % columns, &PaneView::classPaneView, SSize(50, 40)), nullptr);
    }
    Size(400, 300);
  }
  void MakeDynamic(int rows, int columns, SSize minimum = SSize(20, 20)) {
    SCreateContext context = PaneContext();
    ASSERT_TRUE(m_splitter.Create(m_frame, rows, columns, minimum, &context));
    Size(400, 300);
  }
  void Size(int width, int height) {
    m_frame->SetWindowPos(nullptr, 0, 0, width, height, SWP_NOZORDER | SWP_NOACTIVATE);
    m_splitter.RecalcLayout();
  }
  std::vector<int> Widths() {
    std::vector<int> widths(static_cast<std::size_t>(m_splitter.GetColumnCount()));
    for (std::size_t i = 0; i < widths.size(); ++i) {
      m_splitter.GetColumnInfo(static_cast<int>(i), &widths[i], nullptr);
    }
    return widths;
  }
  std::vector<int> Heights() {
    std::vector<int> heights(static_cast<std::size_t>(m_splitter.GetRowCount()));
    for (std::size_t i = 0; i < heights.size(); ++i) m_splitter.GetRowInfo(static_cast<int>(i), &heights[i], nullptr);
    return heights;
  }
  // Every pane lies at its place, with a gap to the next one.
  void ExpectPanesInPlace() {
    const SRect inside = m_splitter.Inside();
    int top = inside.top;
    for (int row = 0; row < m_splitter.GetRowCount(); ++row) {
      const int height = Heights()[static_cast<std::size_t>(row)];
      int left = inside.left;
      for (int column = 0; column < m_splitter.GetColumnCount(); ++column) {
        const int width = Widths()[static_cast<std::size_t>(column)];
        ASSERT_EQ(m_splitter.Pane(row, column), SRect(left, top, left + width, top + height)) << row << ' ' << column;
        left += width + 7;
      }
      top += height + 7;
    }
  }

  Splitter m_splitter;
};

}  // namespace test
