#include "qxcore/ui/accessible/accessible.h"

#include <utility>

#include "qxcore/platform/internal/accessibility.h"
#include "qxcore/ui/window/window.h"

namespace {

constexpr LONG kClientObject = -4;  // the published number of a window's client area

// The object as the platform asks for it.
class Source final : public platform::AccessibleSource {
 public:
  explicit Source(std::unique_ptr<SAccessible> object) : m_object(std::move(object)) {}

  HWND Window() const override { return m_object->GetWindow(); }
  int ChildCount() const override { return m_object->GetChildCount(); }
  int Role(int child) const override { return m_object->GetRole(child); }
  DWORD State(int child) const override { return m_object->GetState(child); }
  Text Name(int child) const override { return Text(m_object->GetName(child).View()); }
  Text Value(int child) const override { return Text(m_object->GetValue(child).View()); }
  Text DefaultAction(int child) const override { return Text(m_object->GetDefaultAction(child).View()); }
  RECT Place(int child) const override { return m_object->GetRect(child); }
  int DoDefaultAction(int child) override { return m_object->DoDefaultAction(child); }
  int ChildAt(POINT point) const override { return m_object->ChildAt(point); }
  int FocusedChild() const override { return m_object->GetFocusedChild(); }

 private:
  std::unique_ptr<SAccessible> m_object;
};

}  // namespace

SAccessible::SAccessible(const SWnd& window) : m_window(window.GetSafeHwnd()) {}

SAccessible::~SAccessible() = default;

SString SAccessible::GetValue(int) const { return SString(); }

SString SAccessible::GetDefaultAction(int) const { return SString(); }

int SAccessible::DoDefaultAction(int) { return 0; }

int SAccessible::ChildAt(const POINT& point) const {
  for (int child = 1; child <= GetChildCount(); ++child) {
    if ((GetState(child) & kSStateInvisible) == 0 && GetRect(child).Contains(point)) return child;
  }
  return WindowRect().Contains(point) ? 0 : -1;
}

int SAccessible::GetFocusedChild() const {
  for (int child = 1; child <= GetChildCount(); ++child) {
    if (GetState(child) & kSStateFocused) return child;
  }
  return ::GetFocus() == m_window ? 0 : -1;
}

DWORD SAccessible::WindowState() const {
  DWORD state = 0;
  if (!::IsWindowVisible(m_window)) state |= kSStateInvisible;
  if (!::IsWindowEnabled(m_window)) state |= kSStateUnavailable;
  return state;
}

SRect SAccessible::WindowRect() const {
  SRect rect;
  ::GetWindowRect(m_window, &rect);
  return rect;
}

SRect SAccessible::OnScreen(const SRect& client) const {
  POINT corner = {client.left, client.top};
  ::ClientToScreen(m_window, &corner);
  return SRect(corner.x, corner.y, corner.x + client.Width(), corner.y + client.Height());
}

bool SAsksForClient(LPARAM lParam) { return static_cast<LONG>(lParam) == kClientObject; }

LRESULT SAnswerGetObject(WPARAM wParam, LPARAM lParam, std::unique_ptr<SAccessible> object) {
  return SAsksForClient(lParam) ? platform::AnswerGetObject(wParam, std::make_unique<Source>(std::move(object))) : 0;
}
