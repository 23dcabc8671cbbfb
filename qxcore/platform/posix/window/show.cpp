// Showing and hiding, minimising and maximising.

#include "qxcore/platform/posix/display/display.h"
#include "qxcore/platform/posix/window/activate.h"
#include "qxcore/platform/posix/window/children_area.h"
#include "qxcore/platform/posix/window/default_proc.h"
#include "qxcore/platform/posix/window/paint.h"
#include "qxcore/platform/posix/window/place.h"
#include "qxcore/platform/posix/window/send.h"
#include "qxcore/platform/posix/window/tree.h"

namespace platform::model {
namespace {

struct State {
  DWORD style = 0;
  bool isChild = false, isParentShown = true, exists = false;
};

State StateOf(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  if (window == nullptr) return {};
  return {window->style, window->IsChild(), IsRoot(window->parent) || IsShown(window->parent), true};
}

// What minimising, maximising and restoring ask of SetWindowPos.
struct Change {
  RECT rect{};
  UINT flags = SWP_NOSIZE | SWP_NOMOVE;
};

POINT MinimisedPlace(const Window* window) {
  if (window->hasMinPosition) return window->minPosition;
  const int height = window->IsChild() ? Height(window->parent->client) : TheDisplay().WorkArea().bottom;
  return {0, height - GetSystemMetrics(SM_CYMINIMIZED)};
}

void RememberNormal(Window* window) {
  if (!(window->style & (WS_MINIMIZE | WS_MAXIMIZE))) window->normal = window->window;
}

RECT MaximisedPlace(HWND handle) {
  const MINMAXINFO limits = AskLimits(handle);
  return {limits.ptMaxPosition.x, limits.ptMaxPosition.y, limits.ptMaxPosition.x + limits.ptMaxSize.x,
          limits.ptMaxPosition.y + limits.ptMaxSize.y};
}

enum class Size { Minimised, Maximised, Restored };

Change ChangeSize(HWND handle, Size wanted, int command) {
  if (CbtRefuses(HCBT_MINMAX, reinterpret_cast<WPARAM>(handle), command)) return {};
  const DWORD style = StateOf(handle).style;
  if ((style & WS_MINIMIZE) && wanted != Size::Minimised && !Send(handle, WM_QUERYOPEN)) return {};
  if (wanted == Size::Minimised) {
    const HWND focus = GetFocus();
    if (focus != nullptr && (focus == handle || IsChild(handle, focus))) SetFocus(nullptr);
  }
  bool maximises = wanted == Size::Maximised;
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr) return {};
    RememberNormal(window);
    if (wanted == Size::Restored && (window->style & WS_MINIMIZE) && window->restoreToMaximized) maximises = true;
  }
  const RECT maximised = maximises ? MaximisedPlace(handle) : RECT{};

  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return {};
  Change change{window->normal, SWP_FRAMECHANGED | kStateChanged};
  if (wanted == Size::Minimised) {
    if (window->style & WS_MINIMIZE) return {};
    window->restoreToMaximized = window->style & WS_MAXIMIZE;
    window->style = (window->style & ~WS_MAXIMIZE) | WS_MINIMIZE;
    const POINT place = MinimisedPlace(window);
    change.rect = {place.x, place.y, place.x + GetSystemMetrics(SM_CXMINIMIZED),
                   place.y + GetSystemMetrics(SM_CYMINIMIZED)};
    change.flags |= SWP_NOCOPYBITS;
  } else if (maximises) {
    if (window->style & WS_MINIMIZE) change.flags |= SWP_NOCOPYBITS;
    window->style = (window->style & ~WS_MINIMIZE) | WS_MAXIMIZE;
    change.rect = maximised;
  } else {
    if (window->style & WS_MINIMIZE) change.flags |= SWP_NOCOPYBITS;
    window->style &= ~(WS_MINIMIZE | WS_MAXIMIZE);
  }
  return change;
}

// A child of a hidden parent only changes its style: nothing of it is on the screen.
void ToggleStyle(HWND handle, bool visible) {
  const Guard guard;
  Window* window = FindWindowObject(handle);
  if (window == nullptr) return;
  window->style = visible ? window->style | WS_VISIBLE : window->style & ~WS_VISIBLE;
  SceneChanged(window);
}

struct Plan {
  UINT flags = 0;
  RECT rect{};
  bool isNothing = false;
};

Plan PlanFor(HWND handle, int how, const State& state) {
  Plan plan;
  const bool wasVisible = state.style & WS_VISIBLE;
  const auto resize = [&](Size size) {
    const Change change = ChangeSize(handle, size, how);
    plan.flags |= change.flags;
    plan.rect = change.rect;
  };
  const UINT childFlags = state.isChild ? SWP_NOACTIVATE | SWP_NOZORDER : 0u;
  switch (how) {
    case SW_HIDE:
      plan.flags = SWP_HIDEWINDOW | SWP_NOSIZE | SWP_NOMOVE | childFlags;
      plan.isNothing = !wasVisible;
      break;
    case SW_SHOWMINNOACTIVE:
    case SW_MINIMIZE:
    case SW_FORCEMINIMIZE:
      plan.flags = SWP_NOACTIVATE | SWP_NOZORDER;
      [[fallthrough]];
    case SW_SHOWMINIMIZED:
      plan.flags |= SWP_SHOWWINDOW;
      resize(Size::Minimised);
      plan.isNothing = wasVisible && (state.style & WS_MINIMIZE);
      break;
    case SW_SHOWMAXIMIZED:
      if (!wasVisible) plan.flags |= SWP_SHOWWINDOW;
      if (!(state.style & WS_MAXIMIZE)) {
        resize(Size::Maximised);
      } else {
        plan.flags |= SWP_NOSIZE | SWP_NOMOVE;
        plan.isNothing = wasVisible;
      }
      break;
    case SW_SHOWNA:
      plan.flags = SWP_NOACTIVATE | SWP_SHOWWINDOW | SWP_NOSIZE | SWP_NOMOVE | (state.isChild ? SWP_NOZORDER : 0u);
      break;
    case SW_SHOW:
      plan.flags = SWP_SHOWWINDOW | SWP_NOSIZE | SWP_NOMOVE | childFlags;
      plan.isNothing = wasVisible;
      break;
    case SW_SHOWNOACTIVATE:
      plan.flags = SWP_NOACTIVATE | SWP_NOZORDER;
      [[fallthrough]];
    default:  // SW_SHOWNORMAL, SW_RESTORE, SW_SHOWDEFAULT
      if (!wasVisible) plan.flags |= SWP_SHOWWINDOW;
      if (state.style & (WS_MINIMIZE | WS_MAXIMIZE)) {
        resize(Size::Restored);
      } else {
        plan.flags |= SWP_NOSIZE | SWP_NOMOVE;
        plan.isNothing = wasVisible;
      }
      if (!(plan.flags & kStateChanged)) plan.flags |= childFlags;
  }
  return plan;
}

void AfterHiding(HWND handle) {
  if (GetActiveWindow() == handle) ActivateAnother(handle);
  LeaveFocus(handle);
}

// A restored window that is still the active one gets the focus back.
void AfterRestoring(HWND handle) {
  if (GetActiveWindow() != handle || GetFocus() != nullptr) return;
  SetFocus(handle);
  Send(handle, WM_ACTIVATE, WA_ACTIVE);
}

}  // namespace

MINMAXINFO AskLimits(HWND handle) {
  MINMAXINFO limits{};
  {
    const Guard guard;
    const Window* window = FindWindowObject(handle);
    if (window == nullptr) return {};
    RECT area = TheDisplay().WorkArea();
    if (window->IsChild()) area = AtOrigin(window->parent->client);
    const RECT frame = FrameWidths(window->style & ~WS_CAPTION, window->exStyle & ~WS_EX_CLIENTEDGE);
    const int dx = window->style & WS_THICKFRAME ? GetSystemMetrics(SM_CXSIZEFRAME) : frame.left;
    const int dy = window->style & WS_THICKFRAME ? GetSystemMetrics(SM_CYSIZEFRAME) : frame.top;
    limits.ptMaxSize = {Width(area) + 2 * dx, Height(area) + 2 * dy};
    limits.ptMaxPosition = {area.left - dx, area.top - dy};
    if (window->hasMaxPosition) limits.ptMaxPosition = window->maxPosition;
    limits.ptMaxTrackSize = {GetSystemMetrics(SM_CXMAXTRACK), GetSystemMetrics(SM_CYMAXTRACK)};
    limits.ptMinTrackSize = {GetSystemMetrics(SM_CXMINTRACK), GetSystemMetrics(SM_CYMINTRACK)};
    if (!(window->style & (WS_DLGFRAME | WS_BORDER))) limits.ptMinTrackSize = {2 * dx, 2 * dy};
  }
  Send(handle, WM_GETMINMAXINFO, 0, reinterpret_cast<LPARAM>(&limits));
  limits.ptMaxTrackSize.x = std::max(limits.ptMaxTrackSize.x, limits.ptMinTrackSize.x);
  limits.ptMaxTrackSize.y = std::max(limits.ptMaxTrackSize.y, limits.ptMinTrackSize.y);
  return limits;
}

bool WaitsForShow(HWND handle) {
  const Guard guard;
  const Window* window = FindWindowObject(handle);
  return window == nullptr || window->needsSize;
}

int FirstShow(DWORD style) {
  if (style & WS_MAXIMIZE) return SW_SHOWMAXIMIZED;
  if (style & WS_MINIMIZE) return SW_SHOWMINIMIZED;
  return SW_SHOW;
}

// What a window does when its owner is minimised or comes back.
LRESULT DefaultShowWindow(HWND handle, BOOL show, LPARAM why) {
  if (why != SW_PARENTCLOSING && why != SW_PARENTOPENING) return 0;
  {
    const Guard guard;
    Window* window = FindWindowObject(handle);
    if (window == nullptr || !(window->style & WS_POPUP) || window->owner == nullptr) return 0;
    if (!show == !window->IsVisible()) return 0;
    if (show && !window->shownWhenParentOpens) return 0;
    window->shownWhenParentOpens = !show;
  }
  ShowWindow(handle, show ? SW_SHOWNOACTIVATE : SW_HIDE);
  return 0;
}

}  // namespace platform::model

using namespace platform::model;

BOOL ShowWindow(HWND handle, int how) {
  const State state = StateOf(handle);
  if (!state.exists) return Fail(ERROR_INVALID_WINDOW_HANDLE);
  const BOOL wasVisible = (state.style & WS_VISIBLE) != 0;
  const bool show = how != SW_HIDE;
  const Plan plan = PlanFor(handle, how, state);
  if (plan.isNothing || !IsWindow(handle)) return wasVisible;

  const bool changesState = plan.flags & kStateChanged;
  if ((show != static_cast<bool>(wasVisible) || how == SW_SHOWNA) && how != SW_SHOWMAXIMIZED && !changesState)
    Send(handle, WM_SHOWWINDOW, show);
  if (!IsWindow(handle)) return wasVisible;
  if (state.isChild && !state.isParentShown && !changesState) {
    ToggleStyle(handle, show);
  } else {
    SetWindowPos(handle, HWND_TOP, plan.rect.left, plan.rect.top, Width(plan.rect), Height(plan.rect), plan.flags);
  }
  if (!IsWindow(handle)) return wasVisible;
  if (!show) AfterHiding(handle);
  if (WaitsForShow(handle) && IsWindow(handle)) SendSizeAndMove(handle);
  if (show && changesState && (state.style & WS_MINIMIZE)) AfterRestoring(handle);
  return wasVisible;
}

BOOL ShowOwnedPopups(HWND owner, BOOL show) {
  return OrNoMemory<BOOL>(FALSE, [&]() -> BOOL {
    List<HWND> owned;
    {
      const Guard guard;
      const Window* window = Expect(owner);
      if (window == nullptr) return FALSE;
      for (const Window* each = Desktop()->firstChild; each != nullptr; each = each->next)
        if (each->owner == window) owned.push_back(each->handle);
    }
    for (const HWND each : owned) Send(each, WM_SHOWWINDOW, show != 0, show ? SW_PARENTOPENING : SW_PARENTCLOSING);
    return TRUE;
  });
}

BOOL CloseWindow(HWND window) { return ShowWindow(window, SW_MINIMIZE), IsWindow(window); }
BOOL OpenIcon(HWND window) { return ShowWindow(window, SW_SHOWNORMAL), IsWindow(window); }

BOOL IsIconic(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr && (window->style & WS_MINIMIZE);
}

BOOL IsZoomed(HWND handle) {
  const Guard guard;
  const Window* window = Expect(handle);
  return window != nullptr && (window->style & WS_MAXIMIZE);
}

BOOL GetWindowPlacement(HWND handle, WINDOWPLACEMENT* placement) {
  const Guard guard;
  const Window* window = Expect(handle);
  if (window == nullptr) return FALSE;
  const bool isNormal = !(window->style & (WS_MINIMIZE | WS_MAXIMIZE));
  placement->length = sizeof *placement;
  placement->flags = (window->hasMinPosition ? WPF_SETMINPOSITION : 0u) |
                     (window->restoreToMaximized && (window->style & WS_MINIMIZE) ? WPF_RESTORETOMAXIMIZED : 0u);
  placement->showCmd = window->style & WS_MINIMIZE   ? SW_SHOWMINIMIZED
                       : window->style & WS_MAXIMIZE ? SW_SHOWMAXIMIZED
                                                     : SW_SHOWNORMAL;
  placement->ptMinPosition = window->hasMinPosition ? window->minPosition : POINT{-1, -1};
  placement->ptMaxPosition = window->hasMaxPosition ? window->maxPosition : POINT{-1, -1};
  placement->rcNormalPosition = isNormal ? window->window : window->normal;
  return TRUE;
}

BOOL SetWindowPlacement(HWND handle, const WINDOWPLACEMENT* placement) {
  if (placement == nullptr || placement->length != sizeof *placement) return Fail(ERROR_INVALID_PARAMETER);
  bool isNormal = false;
  {
    const Guard guard;
    Window* window = Expect(handle);
    if (window == nullptr) return FALSE;
    window->normal = placement->rcNormalPosition;
    window->hasMinPosition = placement->flags & WPF_SETMINPOSITION;
    window->minPosition = placement->ptMinPosition;
    window->restoreToMaximized = placement->flags & WPF_RESTORETOMAXIMIZED;
    isNormal = !(window->style & (WS_MINIMIZE | WS_MAXIMIZE));
  }
  const RECT& rect = placement->rcNormalPosition;
  if (isNormal)
    SetWindowPos(handle, nullptr, rect.left, rect.top, Width(rect), Height(rect), SWP_NOZORDER | SWP_NOACTIVATE);
  ShowWindow(handle, static_cast<int>(placement->showCmd));
  return IsWindow(handle);
}
