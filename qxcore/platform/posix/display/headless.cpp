// The display that shows nothing: a screen of a fixed size. QXCORE_DPI in the environment is its resolution.

#include <cstdlib>

#include "qxcore/platform/posix/display/display.h"

namespace platform {
namespace {

constexpr SIZE kScreen{1280, 1024};
constexpr UINT kUsualDpi = 96, kLowestDpi = 48, kHighestDpi = 960;

UINT DpiOfEnvironment() {
  const char* text = std::getenv("QXCORE_DPI");
  if (text == nullptr) return kUsualDpi;
  const unsigned long dpi = std::strtoul(text, nullptr, 10);
  return dpi >= kLowestDpi && dpi <= kHighestDpi ? static_cast<UINT>(dpi) : kUsualDpi;
}

class HeadlessDisplay final : public Display {
 public:
  SIZE ScreenSize() override { return kScreen; }
  RECT WorkArea() override { return {0, 0, kScreen.cx, kScreen.cy}; }
  UINT Dpi() override { return m_dpi; }
  void Show(HWND, bool, const RECT&) override {}
  void Move(HWND, const RECT&) override {}
  void SetTitle(HWND, LPCWSTR) override {}
  void Present(HWND, const RECT&) override {}
  void Close(HWND) override {}
  void SetCursor(int) override {}
  void Wait(DWORD) override {}
  void Wake() override {}
  bool Serves(DWORD) override { return false; }

 private:
  const UINT m_dpi = DpiOfEnvironment();
};

}  // namespace

Display& TheDisplay() {
  static HeadlessDisplay* display = new HeadlessDisplay;  // outlives every static object that has a window
  return *display;
}

}  // namespace platform
