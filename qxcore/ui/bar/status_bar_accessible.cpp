// What a screen reader learns of a status bar: its panes, in the order in which they are shown, each by its text.

#include "qxcore/ui/accessible/accessible.h"
#include "qxcore/ui/bar/status_bar.h"
#include "qxcore/ui/bar/status_bar_layout.h"

class SStatusBar::Panes final : public SAccessible {
 public:
  explicit Panes(SStatusBar& bar) : SAccessible(bar), m_bar(bar) {}

  int GetChildCount() const override { return m_bar.GetPaneCount() + m_bar.ExtraCount(); }
  int GetRole(int child) const override { return child == 0 ? kSRoleStatusBar : IsChild(child) ? kSRoleStaticText : 0; }
  SString GetName(int child) const override {
    if (!IsChild(child)) return SString();
    const SStatusBarPane* pane = m_bar.FindShown(child - 1);
    return pane != nullptr && (pane->m_style & kSPaneKeepText) == 0 ? pane->m_text : SString();
  }
  DWORD GetState(int child) const override {
    if (child == 0) return WindowState() | kSStateReadOnly;
    if (!IsChild(child)) return 0;
    return WindowState() | kSStateReadOnly | (GetRect(child).IsEmpty() ? kSStateInvisible | kSStateOffscreen : 0);
  }
  // The part of a pane that the bar shows.
  SRect GetRect(int child) const override {
    if (child == 0) return WindowRect();
    SRect rect;
    if (!IsChild(child) || !m_bar.GetControlRect(child - 1, &rect)) return SRect();
    const SRect shown = rect & m_bar.GetClientRect();
    return shown.IsEmpty() ? SRect() : OnScreen(shown);
  }

 private:
  SStatusBar& m_bar;
};

std::unique_ptr<SAccessible> SStatusBar::MakeAccessible() { return std::make_unique<Panes>(*this); }

LRESULT SStatusBar::OnGetObject(WPARAM wParam, LPARAM lParam) {
  const LRESULT answer = SAsksForClient(lParam) ? SAnswerGetObject(wParam, lParam, MakeAccessible()) : 0;
  return answer != 0 ? answer : Default();
}
