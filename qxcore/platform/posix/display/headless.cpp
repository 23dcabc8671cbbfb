// The display that shows nothing: a screen of a fixed size. QXCORE_DPI in the environment is its resolution.

#include "qxcore/platform/posix/display/module.h"

namespace platform {
namespace {

constexpr SIZE kScreen{1280, 1024};
constexpr UINT kUsualDpi = 96;

class HeadlessDisplay final : public Display {
 public:
  SIZE ScreenSize() override { return kScreen; }
  RECT WorkArea() override { return {0, 0, kScreen.cx, kScreen.cy}; }
  UINT Dpi() override { return m_dpi; }
  int Monitors() override { return 0; }
  void Show(const ShownWindow&) override {}
  void SetTitle(HWND, std::u16string_view) override {}
  void Activate(HWND) override {}
  void Present(HWND, const ShownPixels&, const RECT&) override {}
  void Close(HWND) override {}
  void SetCursor(int) override {}
  bool ClipboardText(std::u16string*) override { return false; }
  void SetClipboardText(std::u16string_view) override {}
  void Wait(DWORD) override {}
  void Wake() override {}
  bool Serves(DWORD) override { return false; }

 private:
  const UINT m_dpi = DpiOfEnvironment() != 0 ? DpiOfEnvironment() : kUsualDpi;
};

}  // namespace

std::unique_ptr<Display> OpenHeadlessDisplay() { return std::make_unique<HeadlessDisplay>(); }

}  // namespace platform
