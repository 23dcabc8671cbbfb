// The colours of a dark desktop, for as long as the object lives. On some systems they hold for all programs.
#pragma once

#include <vector>

#include "qxcore/platform/win32.h"

class DarkColors {
 public:
  DarkColors();
  DarkColors(const DarkColors&) = delete;
  DarkColors& operator=(const DarkColors&) = delete;
  ~DarkColors();  // brings the former ones back

 private:
  std::vector<COLORREF> m_former;
};
