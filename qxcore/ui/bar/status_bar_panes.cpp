#include "qxcore/ui/bar/status_bar_panes.h"

#include <algorithm>

#include "qxcore/core/exception.h"
#include "qxcore/ui/app/internal/scaled_pixels.h"

int SStatusBarPanes::Find(int index) const {
  if (index == kSMainPane) return FindMain();
  return index >= 0 && index < GetCount() ? index : -1;
}

int SStatusBarPanes::FindMain() const {
  const auto main = std::find_if(begin(), end(), [](const auto& pane) { return (pane.m_style & kSPaneMain) != 0; });
  return main != end() ? static_cast<int>(main - begin()) : -1;
}

int SStatusBarPanes::FindSplice() const {
  for (int i = GetCount(); i-- > 0;) {
    if (GetConst(i).m_style & kSPaneSplice) return i;
  }
  return GetCount();
}

int SStatusBarPanes::InsertPane(int index, int width, DWORD style) {
  if (index < -2) return -1;
  const int at = index < 0 ? std::max(FindMain(), 0) : std::min(index, GetCount());
  SStatusBarPane pane;
  pane.m_width = style & kSPaneAutoSize ? 0 : width;
  pane.m_style = style;
  Insert(at, pane);
  return at;
}

int SStatusBarPanes::DeletePane(int index) {
  const int at = Find(index);
  if (at < 0) return 0;
  Remove(at);
  return 1;
}

int SStatusBarPanes::SetPaneText(int index, const SString* text) {
  const int at = Find(index);
  if (at < 0) return -1;
  const SStringView wanted = text != nullptr ? text->View() : SStringView();
  if (GetConst(at).m_text.View() == wanted) return at;
  try {
    SStatusBarPane& pane = GetAt(at);
    if (text != nullptr) {
      pane.m_text = *text;
    } else {
      pane.m_text = SString();
    }
    pane.m_flags |= SStatusBarPane::kTextDirty;
  } catch (const SEOutOfMemory&) {
    return -1;
  }
  return at;
}

int SStatusBarPanes::GetPaneText(int index, SString* text) const {
  const int at = Find(index);
  if (at < 0) return 0;
  *text = GetConst(at).m_text;
  return 1;
}

SString SStatusBarPanes::GetPaneText(int index) const {
  const int at = Find(index);
  return at >= 0 ? GetConst(at).m_text : SString();
}

DWORD SStatusBarPanes::GetPaneStyle(int index) const {
  const int at = Find(index);
  return at >= 0 ? GetConst(at).m_style : 0;
}

int SStatusBarPanes::GetPaneWidth(int index) const {
  const int at = Find(index);
  return at >= 0 ? GetConst(at).m_width : 0;
}

void SStatusBarPanes::ScaleWidths(int fromDpi, int toDpi) {
  for (SStatusBarPane& pane : *this) pane.m_width = SScaledPixels(pane.m_width, toDpi, fromDpi);
}
