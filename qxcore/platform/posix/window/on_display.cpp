// The model and the display: what is shown, and what the display reports.

#include "qxcore/platform/posix/window/on_display.h"

#include "qxcore/platform/internal/native_path.h"
#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/controls.h"
#include "qxcore/platform/posix/window/deferred_copies.h"
#include "qxcore/platform/posix/window/drop_files.h"
#include "qxcore/platform/posix/window/frame.h"
#include "qxcore/platform/posix/window/input.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

bool IsOnDisplay() { return TheDisplay().Serves(CurrentThread()->id); }

RECT InsideOfFrame(const Window* window) {
  RECT inside = InsideBorder(window);
  inside.top += Height(CaptionRect(window));
  return Moved(inside, window->window.left, window->window.top);
}

// Under the lock. The title is the window's own.
ShownWindow Describe(const Window* window) {
  ShownWindow shown;
  shown.window = window->handle;
  shown.owner = HandleOf(window->owner);
  shown.title = window->text;
  shown.rect = window->window;
  shown.inside = InsideOfFrame(window);
  shown.state = window->style & WS_MINIMIZE   ? ShownWindow::State::Minimised
                : window->style & WS_MAXIMIZE ? ShownWindow::State::Maximised
                                              : ShownWindow::State::Normal;
  shown.isVisible = window->IsVisible();
  shown.hasCaption = (window->style & WS_CAPTION) == WS_CAPTION;
  shown.isPopup = !shown.hasCaption && (window->exStyle & (WS_EX_TOOLWINDOW | WS_EX_TOPMOST));
  shown.canSize = window->style & WS_THICKFRAME;
  return shown;
}

// Whether the user may use the window: a modal dialog disables its owner.
bool IsInUse(HWND handle) { return IsWindow(handle) && IsWindowEnabled(handle); }

// Runs what takes memory; without any the report is lost, as input is that no queue has room for.
template <class Work>
void Report(Work work) {
  OrNoMemory<int>(0, [&] {
    const Guard guard;
    work();
    return 0;
  });
}

class Events final : public DisplayEvents {
 public:
  void Mouse(UINT message, POINT point, int wheel) override {
    Report([&] { ReportMouse(message, point, wheel); });
  }
  void Key(WORD key, WORD scan, bool isUp, bool isExtended, char16_t character) override {
    Report([&] { ReportKey(key, scan, isUp, isExtended, character); });
  }
  void Character(char16_t unit) override {
    Report([&] {
      ReportKey(VK_PACKET, unit, false, false);
      ReportKey(VK_PACKET, unit, true, false);
    });
  }
  void Placed(HWND handle, const RECT& rect) override {
    SetWindowPos(handle, nullptr, rect.left, rect.top, Width(rect), Height(rect), SWP_NOZORDER | SWP_NOACTIVATE);
  }
  void Command(HWND handle, UINT command) override {
    if (IsInUse(handle)) PostMessageW(handle, WM_SYSCOMMAND, command, 0);
  }
  // A disabled window passes the activation on to the dialog that stands for it.
  void Activated(HWND handle) override {
    if (handle == nullptr) {
      if (CurrentThread()->inMenuLoop) EndMenu();
      Activate(nullptr, By::Program, true);
      return;
    }
    const HWND active = IsInUse(handle) ? handle : GetLastActivePopup(handle);
    if (active != GetActiveWindow() && IsInUse(active)) SetForegroundWindow(active);
  }
  void Exposed(HWND handle) override {
    CopyNow();
    void* surface = nullptr;
    {
      const Guard guard;
      const Window* window = FindWindowObject(handle);
      if (window == nullptr) return;
      surface = window->surface;
    }
    ShownPixels pixels;
    if (surface == nullptr || g_painter.pixels == nullptr || !g_painter.pixels(surface, &pixels)) return;
    TheDisplay().Present(handle, pixels, {0, 0, pixels.width, pixels.height});
  }
  void Dropped(HWND handle, POINT point, const std::vector<std::string>& paths) override {
    List<Text> files;
    OrNoMemory<int>(0, [&] {
      for (const std::string& path : paths) files.push_back(Text(FromNativePath(path).c_str()));
      return PostDroppedFiles(handle, point, files);
    });
  }
};

Events g_events;
[[maybe_unused]] const bool g_installed = (g_displayEvents = &g_events, true);

}  // namespace

void ShowOnDisplay(HWND handle) {
  if (!IsOnDisplay()) return;
  ShownWindow shown;
  std::u16string title;
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr || window->parent != Desktop()) return;
    shown = Describe(window);
    title = shown.title;
  }
  shown.title = title;
  TheDisplay().Show(shown);
}

void PresentOnDisplay(HWND top, const ShownPixels& pixels, const RECT& changed) {
  if (IsOnDisplay()) TheDisplay().Present(top, pixels, changed);
}

}  // namespace platform::model
