#include "qxcore/platform/posix/controls/status_bar_parts.h"

#include <algorithm>

namespace platform::controls {

void BarPart::Set(UINT newType, LPARAM shown) {
  Text newText;
  if ((newType & SBT_OWNERDRAW) == 0 && shown != 0) newText = reinterpret_cast<LPCWSTR>(shown);
  for (WCHAR& character : newText) {
    if (character < u' ' && character != u'\t') character = u' ';
  }
  text.swap(newText);
  ownerData = newType & SBT_OWNERDRAW ? shown : 0;
  type = newType;
}

BarPart* StatusBar::PartToSet(UINT index) {
  if (index == SB_SIMPLEID) return &simple;
  return index < PartCount() ? &parts[index] : nullptr;
}

const BarPart* StatusBar::ShownPart(UINT index) const {
  if (index >= PartCount()) return nullptr;
  return isSimple ? &simple : &parts[index];
}

RECT StatusBar::PartRect(UINT index, const RECT& client) const {
  if (isSimple) return {0, kBarTopBorder, client.right, client.bottom};
  const auto edge = [&](UINT part) { return parts[part].rightEdge == -1 ? client.right : parts[part].rightEdge; };
  return {index > 0 ? edge(index - 1) + kBarGap : 0, kBarTopBorder, edge(index), client.bottom};
}

int StatusBar::PartAt(POINT point, const RECT& client) const {
  for (UINT i = 0; i < PartCount(); ++i) {
    const RECT rect = PartRect(i, client);
    if (point.x >= rect.left && point.x < rect.right) return static_cast<int>(i);
  }
  return -1;
}

bool StatusBar::SetParts(int count, const int* edges) {
  if (count < 1 || count > kMostParts || edges == nullptr) return false;
  parts.resize(static_cast<std::size_t>(count));
  for (BarPart& part : parts) part.rightEdge = *edges++;
  return true;
}

}  // namespace platform::controls
