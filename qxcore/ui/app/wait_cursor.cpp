#include "qxcore/ui/app/wait_cursor.h"

#include "qxcore/ui/app/application.h"

SWaitCursor::SWaitCursor() : SWaitCursor(1, 0, 0) {}

SWaitCursor::SWaitCursor(int begin, int onlyFirst, int modal) {
  if (modal) m_modal.Start(1);
  SWinApp* app = SGetApp();
  if (!begin || app == nullptr || (onlyFirst && app->GetWaitCount() > 0)) return;
  app->DoWaitCursor(1);
  m_isShown = true;
}

// After ForceReset there is nothing to take back.
SWaitCursor::~SWaitCursor() {
  SWinApp* app = SGetApp();
  if (m_isShown && app != nullptr && app->GetWaitCount() > 0) app->DoWaitCursor(-1);
}

void SWaitCursor::Restore() {
  if (SWinApp* app = SGetApp(); m_isShown && app != nullptr) app->DoWaitCursor(0);
}

void SWaitCursor::ForceReset() {
  SWinApp* app = SGetApp();
  while (app != nullptr && app->GetWaitCount() > 0) app->DoWaitCursor(-1);
}
