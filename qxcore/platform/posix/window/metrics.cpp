// The system's colours and sizes: one table each, with the values of a plain desktop at 96 dots an inch.
#include <atomic>
#include <cstdlib>

#include "qxcore/platform/win32.h"

namespace {

constexpr int kColors = 31;

std::atomic<COLORREF> g_colors[kColors] = {
    0xFFFFFF, 0x956F25, 0xFA9632, 0x808080, 0xFFFFFF, 0xFFFFFF, 0x9E9E9E, 0x000000, 0x000000, 0x000000, 0xFFFFFF,
    0xFFFFFF, 0x808080, 0xFA9630, 0xFFFFFF, 0xF5F5F5, 0xA6A6A6, 0xA6A6A6, 0x000000, 0xC8C8C8, 0xFFFFFF, 0x6A6A6A,
    0xE3E3E3, 0x000000, 0xFFFFFF, 0xFFFFFF, 0xE0E0E0, 0xFA9632, 0x808080, 0xFA9630, 0xFFFFFF,
};

bool IsColor(int index) { return index >= 0 && index < kColors; }

// kFixed sizes stay as they are on every screen; the others grow with its dots an inch.
enum Growth { kFixed, kScaled };

struct Metric {
  int index, value;
  Growth growth;
};

constexpr Metric kMetrics[] = {
    {SM_CXSCREEN, 1280, kFixed},
    {SM_CYSCREEN, 1024, kFixed},
    {SM_CXVSCROLL, 17, kScaled},
    {SM_CYHSCROLL, 17, kScaled},
    {SM_CYCAPTION, 19, kScaled},
    {SM_CXBORDER, 1, kFixed},
    {SM_CYBORDER, 1, kFixed},
    {SM_CXDLGFRAME, 3, kFixed},
    {SM_CYDLGFRAME, 3, kFixed},
    {SM_CYVTHUMB, 17, kScaled},
    {SM_CXHTHUMB, 17, kScaled},
    {SM_CXICON, 32, kScaled},
    {SM_CYICON, 32, kScaled},
    {SM_CXCURSOR, 32, kScaled},
    {SM_CYCURSOR, 32, kScaled},
    {SM_CYMENU, 19, kScaled},
    {SM_CXFULLSCREEN, 1280, kFixed},
    {SM_CYFULLSCREEN, 1035, kFixed},
    {SM_MOUSEPRESENT, 1, kFixed},
    {SM_CYVSCROLL, 17, kScaled},
    {SM_CXHSCROLL, 17, kScaled},
    {SM_CXMIN, 112, kScaled},
    {SM_CYMIN, 27, kScaled},
    {SM_CXSIZE, 18, kScaled},
    {SM_CYSIZE, 18, kScaled},
    {SM_CXSIZEFRAME, 4, kScaled},
    {SM_CYSIZEFRAME, 4, kScaled},
    {SM_CXMINTRACK, 112, kScaled},
    {SM_CYMINTRACK, 27, kScaled},
    {SM_CXDOUBLECLK, 4, kFixed},
    {SM_CYDOUBLECLK, 4, kFixed},
    {SM_CMOUSEBUTTONS, 3, kFixed},
    {SM_CXEDGE, 2, kFixed},
    {SM_CYEDGE, 2, kFixed},
    {SM_CXSMICON, 16, kScaled},
    {SM_CYSMICON, 16, kScaled},
    {SM_CYSMCAPTION, 16, kScaled},
    {SM_CXSMSIZE, 15, kScaled},
    {SM_CYSMSIZE, 15, kScaled},
    {SM_CXMENUSIZE, 18, kScaled},
    {SM_CYMENUSIZE, 18, kScaled},
    {SM_CXDRAG, 4, kFixed},
    {SM_CYDRAG, 4, kFixed},
    {SM_CXMENUCHECK, 11, kScaled},
    {SM_CYMENUCHECK, 11, kScaled},
    {SM_MOUSEWHEELPRESENT, 1, kFixed},
    {SM_CXVIRTUALSCREEN, 1280, kFixed},
    {SM_CYVIRTUALSCREEN, 1024, kFixed},
};

UINT DpiOfEnvironment() {
  const char* text = std::getenv("QXCORE_DPI");
  long dpi = text ? std::strtol(text, nullptr, 10) : 96;
  return dpi >= 48 && dpi <= 960 ? static_cast<UINT>(dpi) : 96;
}

}  // namespace

DWORD GetSysColor(int index) { return IsColor(index) ? g_colors[index].load(std::memory_order_relaxed) : 0; }

BOOL SetSysColors(int count, const INT* indices, const COLORREF* colors) {
  for (int i = 0; i < count; ++i) {
    if (!IsColor(indices[i])) {
      SetLastError(ERROR_INVALID_PARAMETER);
      return FALSE;
    }
  }
  for (int i = 0; i < count; ++i) g_colors[indices[i]].store(colors[i] & 0xFFFFFF, std::memory_order_relaxed);
  return TRUE;
}

UINT GetDpiForSystem() {
  static const UINT dpi = DpiOfEnvironment();
  return dpi;
}

int GetSystemMetricsForDpi(int index, UINT dpi) {
  for (const Metric& metric : kMetrics) {
    if (metric.index == index)
      return metric.growth == kScaled ? MulDiv(metric.value, static_cast<int>(dpi), 96) : metric.value;
  }
  return 0;
}

int GetSystemMetrics(int index) { return GetSystemMetricsForDpi(index, GetDpiForSystem()); }
