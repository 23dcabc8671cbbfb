// What a screen reader learns of a splitter: a pane whose children are the bars that can be moved. The panes
// themselves are windows with objects of their own.

#include "qxcore/ui/accessible/accessible.h"
#include "qxcore/ui/layout/internal/splitter_codes.h"
#include "qxcore/ui/layout/splitter.h"

// The bars' codes, from the first row's to the last column's.
class SSplitterWnd::Bars final : public SAccessible {
 public:
  explicit Bars(SSplitterWnd& splitter) : SAccessible(splitter), m_splitter(splitter) {}

  int GetChildCount() const override { return CountOf(true) + CountOf(false); }
  int GetRole(int child) const override { return child == 0 ? kSRolePane : IsChild(child) ? kSRoleSeparator : 0; }
  SString GetName(int child) const override {
    if (!IsChild(child)) return SString();
    const int code = CodeOf(child);
    SString name(SIsOfRows(code) ? WTEXT("Row bar ") : WTEXT("Column bar "));
    return name + SString(static_cast<long>(SBarNumber(code) + 1));
  }
  // The size of the pane before the bar, in pixels.
  SString GetValue(int child) const override {
    if (!IsChild(child)) return SString();
    const int code = CodeOf(child);
    return SString(static_cast<long>(m_splitter.Table(SIsOfRows(code))[SBarNumber(code)].m_current));
  }
  DWORD GetState(int child) const override {
    if (child == 0) return WindowState();
    if (!IsChild(child)) return 0;
    DWORD state = WindowState();
    if (!m_splitter.HasBar(CodeOf(child))) return state | kSStateUnavailable;  // it is fixed
    state |= kSStateMoveable | kSStateFocusable;
    return m_splitter.m_keyboardBar == CodeOf(child) ? state | kSStateFocused : state;
  }
  SRect GetRect(int child) const override {
    if (child == 0) return WindowRect();
    if (!IsChild(child)) return SRect();
    SRect inside;
    m_splitter.GetInsideRect(&inside);
    return OnScreen(m_splitter.BarRect(CodeOf(child), inside));
  }
  SString GetDefaultAction(int child) const override { return CanMove(child) ? SString(WTEXT("Collapse")) : SString(); }
  int DoDefaultAction(int child) override { return CanMove(child) && m_splitter.ToggleBar(CodeOf(child)); }

 private:
  int CountOf(bool rows) const { return m_splitter.Count(rows) > 0 ? m_splitter.Count(rows) - 1 : 0; }
  int CodeOf(int child) const {
    const int rows = CountOf(true);
    return child <= rows ? kSHitRowBar + child - 1 : kSHitColumnBar + child - rows - 1;
  }
  bool CanMove(int child) const { return IsChild(child) && m_splitter.HasBar(CodeOf(child)); }

  SSplitterWnd& m_splitter;
};

std::unique_ptr<SAccessible> SSplitterWnd::MakeAccessible() { return std::make_unique<Bars>(*this); }

LRESULT SSplitterWnd::OnGetObject(WPARAM wParam, LPARAM lParam) {
  const LRESULT answer = SAsksForClient(lParam) ? SAnswerGetObject(wParam, lParam, MakeAccessible()) : 0;
  return answer != 0 ? answer : Default();
}
