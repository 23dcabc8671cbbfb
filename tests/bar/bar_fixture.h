// What the tests of bars share: a frame with a client area of a known size, and what a status bar's control shows.
#pragma once

#include "tests/support/wine.h"
#include "tests/ui/ui_fixture.h"

namespace test {

// A frame whose client area is 400 × 300 pixels. It lives as long as its window.
class Frame : public SDockSiteFrameWnd {
 public:
  static Frame* Make(DWORD style = WS_OVERLAPPEDWINDOW | WS_VISIBLE) {
    auto* frame = new Frame;
    if (!frame->Create(nullptr, WTEXT("frame"), style, SRect(20, 20, 320, 220))) return nullptr;
    frame->SetClientSize(400, 300);
    return frame;
  }
  void SetClientSize(int width, int height) {
    const SSize border = GetWindowRect().Size() - GetClientRect().Size();
    SetWindowPos(nullptr, 0, 0, width + border.cx, height + border.cy, SWP_NOMOVE | SWP_NOZORDER | SWP_NOACTIVATE);
  }
};

// The place of a child in its parent's client area.
inline SRect PlaceOf(const SWnd& child) {
  SRect rect = child.GetWindowRect();
  child.GetParent()->ScreenToClient(&rect);
  return rect;
}

// What the control itself says of its parts.
inline std::vector<int> PartsOf(const SWnd& bar) {
  std::vector<int> edges(static_cast<std::size_t>(bar.SendMessageW(SB_GETPARTS)));
  bar.SendMessageW(SB_GETPARTS, edges.size(), reinterpret_cast<LPARAM>(edges.data()));
  return edges;
}
inline WideString PartText(const SWnd& bar, int part) {
  const LRESULT length = bar.SendMessageW(SB_GETTEXTLENGTHW, static_cast<WPARAM>(part));
  WideString text(static_cast<std::size_t>(LOWORD(length)) + 1, 0);
  bar.SendMessageW(SB_GETTEXTW, static_cast<WPARAM>(part), reinterpret_cast<LPARAM>(text.data()));
  text.pop_back();
  return text;
}
inline int PartType(const SWnd& bar, int part) {
  return HIWORD(bar.SendMessageW(SB_GETTEXTLENGTHW, static_cast<WPARAM>(part)));
}
inline SRect PartRect(const SWnd& bar, int part) {
  SRect rect(-7, -7, -7, -7);
  bar.SendMessageW(SB_GETRECT, static_cast<WPARAM>(part), reinterpret_cast<LPARAM>(&rect));
  return rect;
}

// The width of a text in the bar's font.
inline int WidthOf(const SWnd& bar, SStringView text) {
  SClientDC dc(bar.m_hWnd);
  const SSelectObject font(dc, bar.GetFont());
  return dc.GetTextExtent(text).cx;
}

}  // namespace test
