#include "qxcore/ui/bar/status_texts.h"

int SStatusTexts::Find(LPARAM user) const {
  int i = m_messages.GetCount() - 1;
  while (i >= 0 && m_messages.GetConst(i).m_user != user) --i;
  return i;
}

void SStatusTexts::Show(SStatusBar& bar, LPARAM user, LPCWSTR text) {
  const bool isFurther = user == 0 ? !m_messages.IsEmpty() : Find(user) >= 0;
  if (!isFurther) m_messages.Add({user, bar.GetPaneText(kSMainPane)});
  const SString shown(text);
  bar.SetMainPaneText(&shown);
}

void SStatusTexts::Restore(SStatusBar& bar, LPARAM user) {
  int at = Find(user);
  if (at < 0) at = Find(0);
  if (at < 0) return;
  const SString before = m_messages.GetConst(at).m_before;
  m_messages.Remove(at);
  if (at < m_messages.GetCount()) {
    m_messages[at].m_before = before;
  } else {
    bar.SetMainPaneText(&before);
  }
}
