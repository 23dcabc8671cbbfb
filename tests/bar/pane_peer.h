// A second reading of the rules by which a status bar's panes are named and share the width.
#pragma once

#include <string>
#include <vector>

#include "qxcore/ui/bar/internal/pane_placing.h"

namespace test {

// A bar as a user would describe it: a list of records, and what each index means.
struct PeerPane {
  int width;
  DWORD style;
  std::basic_string<WCHAR> text;
};
using Peer = std::vector<PeerPane>;

inline int MainOf(const Peer& peer) {
  for (std::size_t i = 0; i < peer.size(); ++i) {
    if (peer[i].style & 0x00200000) return static_cast<int>(i);
  }
  return -1;
}

inline int Resolve(const Peer& peer, int index) {
  if (index == -1) return MainOf(peer);
  return index < 0 || index >= static_cast<int>(peer.size()) ? -1 : index;
}

inline std::size_t SpliceOf(const Peer& peer) {
  std::size_t splice = peer.size();
  for (std::size_t i = 0; i < peer.size(); ++i) {
    if (peer[i].style & 0x00100000) splice = i;
  }
  return splice;
}

// The panes in the order of display.
inline Peer Displayed(const Peer& own, const Peer& extra) {
  Peer shown(own.begin(), own.begin() + static_cast<std::ptrdiff_t>(SpliceOf(own)));
  shown.insert(shown.end(), extra.begin(), extra.end());
  shown.insert(shown.end(), own.begin() + static_cast<std::ptrdiff_t>(SpliceOf(own)), own.end());
  return shown;
}

// First the widths, as if there were no order of display; then the edges.
inline std::vector<int> EdgesOf(const Peer& own, const Peer& extra, const SPaneSpace& space) {
  const Peer shown = Displayed(own, extra);
  long long needed = 0;
  std::vector<std::size_t> stretch;
  for (std::size_t i = 0; i < shown.size(); ++i) {
    needed += shown[i].width + space.m_padding;
    if (shown[i].style & 0x04000000) stretch.push_back(i);
  }
  if (!shown.empty()) needed += static_cast<long long>(shown.size() - 1) * space.m_gap;
  const long long left = space.m_width - needed;

  // n panes share `left`: all get the quotient, and the last (left mod n) ones one more.
  std::vector<long long> grows(shown.size(), 0);
  const auto n = static_cast<long long>(stretch.size());
  for (long long k = 0; left > 0 && k < n; ++k)
    grows[stretch[static_cast<std::size_t>(k)]] = left / n + (k >= n - left % n);

  std::vector<int> edges;
  long long x = space.m_border;
  for (std::size_t i = 0; i < shown.size(); ++i) {
    x += shown[i].width + space.m_padding + grows[i];
    edges.push_back(static_cast<int>(x));
    x += space.m_gap;
  }
  return edges;
}

}  // namespace test
