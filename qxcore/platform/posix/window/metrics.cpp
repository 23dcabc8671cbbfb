// Metrics and colours, from one table each: the system's values at 96 dots per inch, scaled.

#include <mutex>

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/queue.h"
#include "qxcore/platform/posix/window/send.h"

namespace platform::model {
namespace {

constexpr UINT kUsualDpi = 96;

struct Metric {
  short index, value;
};

// Lengths, which grow with the resolution.
constexpr Metric kLengths[] = {
    {SM_CXVSCROLL, 17},  {SM_CYHSCROLL, 17},   {SM_CYCAPTION, 19},   {SM_CYVTHUMB, 17},      {SM_CXHTHUMB, 17},
    {SM_CXICON, 32},     {SM_CYICON, 32},      {SM_CXCURSOR, 32},    {SM_CYCURSOR, 32},      {SM_CYMENU, 19},
    {SM_CYVSCROLL, 17},  {SM_CXHSCROLL, 17},   {SM_CXMIN, 112},      {SM_CYMIN, 27},         {SM_CXSIZE, 18},
    {SM_CYSIZE, 18},     {SM_CXMINTRACK, 112}, {SM_CYMINTRACK, 27},  {SM_CXICONSPACING, 75}, {SM_CYICONSPACING, 75},
    {SM_CXSMICON, 16},   {SM_CYSMICON, 16},    {SM_CYSMCAPTION, 16}, {SM_CXSMSIZE, 15},      {SM_CYSMSIZE, 15},
    {SM_CXMENUSIZE, 18}, {SM_CYMENUSIZE, 18},  {SM_CXMENUCHECK, 11}, {SM_CYMENUCHECK, 11},   {SM_CXMINIMIZED, 160},
    {SM_CXSIZEFRAME, 4}, {SM_CYSIZEFRAME, 4},  {SM_CYMINIMIZED, 24}, {SM_CXMINSPACING, 160}, {SM_CYMINSPACING, 24},
};

// Counts, flags and widths of lines, which do not.
constexpr Metric kFixed[] = {
    {SM_CXBORDER, 1},      {SM_CYBORDER, 1},      {SM_CXDLGFRAME, 3},        {SM_CYDLGFRAME, 3},
    {SM_MOUSEPRESENT, 1},  {SM_CXDOUBLECLK, 4},   {SM_CYDOUBLECLK, 4},       {SM_CMOUSEBUTTONS, 3},
    {SM_CXEDGE, 2},        {SM_CYEDGE, 2},        {SM_ARRANGE, 8},           {SM_NETWORK, 3},
    {SM_CXDRAG, 4},        {SM_CYDRAG, 4},        {SM_MOUSEWHEELPRESENT, 1}, {SM_SAMEDISPLAYFORMAT, 1},
    {SM_CXFOCUSBORDER, 1}, {SM_CYFOCUSBORDER, 1},
};

int OfScreen(int index, UINT dpi) {
  const SIZE screen = TheDisplay().ScreenSize();
  const RECT work = TheDisplay().WorkArea();
  const int frame = 2 * GetSystemMetricsForDpi(SM_CXSIZEFRAME, dpi);
  switch (index) {
    case SM_CMONITORS:
      return TheDisplay().Monitors();
    case SM_CXSCREEN:
    case SM_CXVIRTUALSCREEN:
      return screen.cx;
    case SM_CYSCREEN:
    case SM_CYVIRTUALSCREEN:
      return screen.cy;
    case SM_CXFULLSCREEN:
      return Width(work);
    case SM_CYFULLSCREEN:
      return Height(work) - GetSystemMetricsForDpi(SM_CYCAPTION, dpi);
    case SM_CXMAXIMIZED:
      return Width(work) + frame;
    case SM_CYMAXIMIZED:
      return Height(work) + frame;
    case SM_CXMAXTRACK:
      return screen.cx + 4 + frame;
    case SM_CYMAXTRACK:
      return screen.cy + 4 + frame;
    default:
      return 0;
  }
}

// 0x00BBGGRR, by COLOR_ index.
constexpr COLORREF kColors[] = {
    0xFFFFFF, 0x956F25, 0xFA9632, 0x808080, 0xFFFFFF, 0xFFFFFF, 0x9E9E9E, 0x000000, 0x000000, 0x000000, 0xFFFFFF,
    0xFFFFFF, 0x808080, 0xFA9630, 0xFFFFFF, 0xF5F5F5, 0xA6A6A6, 0xA6A6A6, 0x000000, 0xC8C8C8, 0xFFFFFF, 0x6A6A6A,
    0xE3E3E3, 0x000000, 0xFFFFFF, 0xFFFFFF, 0xE0E0E0, 0xFA9632, 0x808080, 0xFA9630, 0xFFFFFF,
};
constexpr int kColorCount = static_cast<int>(std::size(kColors));

struct Colors {
  std::atomic<COLORREF> of[kColorCount];
  Colors() {
    for (int i = 0; i < kColorCount; ++i) of[i] = kColors[i];
  }
};

Colors& TheColors() {
  static Colors* colors = new Colors;
  return *colors;
}

const HMONITOR kMonitor = reinterpret_cast<HMONITOR>(static_cast<ULONG_PTR>(0x10001));

}  // namespace
}  // namespace platform::model

using namespace platform::model;

int GetSystemMetricsForDpi(int index, UINT dpi) {
  for (const Metric& metric : kLengths)
    if (metric.index == index) return MulDiv(metric.value, static_cast<int>(dpi), kUsualDpi);
  for (const Metric& metric : kFixed)
    if (metric.index == index) return metric.value;
  return OfScreen(index, dpi);
}

int GetSystemMetrics(int index) { return GetSystemMetricsForDpi(index, platform::TheDisplay().Dpi()); }

UINT GetDpiForSystem() { return platform::TheDisplay().Dpi(); }

UINT GetDpiForWindow(HWND window) { return IsWindow(window) ? GetDpiForSystem() : 0; }

DWORD GetSysColor(int index) {
  return index >= 0 && index < kColorCount ? TheColors().of[index].load(std::memory_order_relaxed) : 0;
}

BOOL SetSysColors(int count, const int* indices, const COLORREF* colors) {
  for (int i = 0; i < count; ++i)
    if (indices[i] < 0 || indices[i] >= kColorCount) return Fail(ERROR_INVALID_PARAMETER);
  for (int i = 0; i < count; ++i) TheColors().of[indices[i]] = colors[i] & 0xFFFFFF;
  return OrNoMemory<BOOL>(FALSE, [] {
    Broadcast([](HWND window) { Send(window, WM_SYSCOLORCHANGE); });
    InvalidateRect(nullptr, nullptr, TRUE);
    return TRUE;
  });
}

HMONITOR MonitorFromWindow(HWND, DWORD) { return kMonitor; }
HMONITOR MonitorFromPoint(POINT point, DWORD flags) {
  const SIZE size = platform::TheDisplay().ScreenSize();
  return flags != MONITOR_DEFAULTTONULL || Contains({0, 0, size.cx, size.cy}, point) ? kMonitor : nullptr;
}
HMONITOR MonitorFromRect(LPCRECT rect, DWORD flags) {
  const SIZE size = platform::TheDisplay().ScreenSize();
  const RECT common = Common(*rect, {0, 0, size.cx, size.cy});
  return flags != MONITOR_DEFAULTTONULL || Width(common) > 0 ? kMonitor : nullptr;
}

BOOL GetMonitorInfoW(HMONITOR monitor, MONITORINFO* info) {
  if (monitor != kMonitor) return Fail(ERROR_INVALID_HANDLE);
  const SIZE size = platform::TheDisplay().ScreenSize();
  info->rcMonitor = {0, 0, size.cx, size.cy};
  info->rcWork = platform::TheDisplay().WorkArea();
  info->dwFlags = MONITORINFOF_PRIMARY;
  return TRUE;
}
