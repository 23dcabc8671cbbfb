// What a screen reader learns of a tab beam: a tab strip of tabs.

#include "qxcore/ui/accessible/accessible.h"
#include "qxcore/ui/layout/tab_beam.h"

namespace {

class TabsAccessible final : public SAccessible {
 public:
  explicit TabsAccessible(STabBeam& beam) : SAccessible(beam), m_beam(beam) {}

  int GetChildCount() const override { return m_beam.GetCount(); }
  int GetRole(int child) const override { return child == 0 ? kSRoleTabStrip : IsChild(child) ? kSRoleTab : 0; }
  SString GetName(int child) const override { return IsChild(child) ? m_beam.GetTabText(child - 1) : SString(); }
  DWORD GetState(int child) const override {
    const bool hasFocus = ::GetFocus() == GetWindow();
    if (child == 0) return WindowState() | kSStateFocusable | (hasFocus ? kSStateFocused : 0);
    if (!IsChild(child)) return 0;
    const bool isCurrent = child - 1 == m_beam.GetCurSel();
    DWORD state = WindowState() | kSStateSelectable | kSStateFocusable;
    if (isCurrent) state |= kSStateSelected;
    if (isCurrent && hasFocus) state |= kSStateFocused;
    if (child - 1 < m_beam.GetFirstVisible() || GetRect(child).IsEmpty()) state |= kSStateInvisible | kSStateOffscreen;
    return state;
  }
  // The part of a tab that the beam shows.
  SRect GetRect(int child) const override {
    if (child == 0) return WindowRect();
    if (!IsChild(child) || child - 1 < m_beam.GetFirstVisible()) return SRect();
    const SRect shown = m_beam.GetTabRect(child - 1) & m_beam.GetClientRect();
    return shown.IsEmpty() ? SRect() : OnScreen(shown);
  }
  SString GetDefaultAction(int child) const override { return IsChild(child) ? SString(WTEXT("Switch")) : SString(); }
  int DoDefaultAction(int child) override { return IsChild(child) && m_beam.ChooseTab(child - 1); }

 private:
  STabBeam& m_beam;
};

}  // namespace

std::unique_ptr<SAccessible> STabBeam::MakeAccessible() { return std::make_unique<TabsAccessible>(*this); }

LRESULT STabBeam::OnGetObject(WPARAM wParam, LPARAM lParam) {
  const LRESULT answer = SAsksForClient(lParam) ? SAnswerGetObject(wParam, lParam, MakeAccessible()) : 0;
  return answer != 0 ? answer : Default();
}
