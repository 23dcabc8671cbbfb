// The display that shows nothing: a screen of a fixed size, as it would be measured with a rule. QXCORE_DPI in the
// environment is its resolution.

#include "qxcore/platform/posix/display/module.h"

namespace platform {
namespace {

constexpr SIZE kScreen{1280, 1024};  // at the usual resolution
constexpr UINT kUsualDpi = 96;

class HeadlessDisplay final : public Display {
 public:
  SIZE ScreenSize() override { return m_size; }
  RECT WorkArea() override { return {0, 0, m_size.cx, m_size.cy}; }
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
  static LONG Scaled(LONG length, UINT dpi) { return MulDiv(length, static_cast<int>(dpi), kUsualDpi); }

  const UINT m_dpi = DpiOfEnvironment() != 0 ? DpiOfEnvironment() : kUsualDpi;
  const SIZE m_size{Scaled(kScreen.cx, m_dpi), Scaled(kScreen.cy, m_dpi)};
};

}  // namespace

std::unique_ptr<Display> OpenHeadlessDisplay() { return std::make_unique<HeadlessDisplay>(); }

}  // namespace platform
