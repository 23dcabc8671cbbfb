#include "qxcore/ui/app/modal_state.h"

#include <memory>
#include <utility>

#include "qxcore/container/map.h"
#include "qxcore/platform/ole.h"
#include "qxcore/ui/app/application.h"
#include "qxcore/ui/app/internal/modal_record.h"
#include "qxcore/ui/window/thread_state.h"
#include "qxcore/ui/window/window.h"

namespace {

// The records of started states, and of Enable(0), which belongs to no state.
using Records = SMap<SModalState*, SModalRecord*>;
Records& AllRecords() {
  static Records& records = *new Records;
  return records;
}
constinit SModalRecord* g_innermost = nullptr;
constinit bool g_windowsChanged = false;

using Frames = SMap<IOleInPlaceFrame*, int>;
Frames& AllFrames() {
  static Frames& frames = *new Frames;
  return frames;
}

// A frame that asked for the change itself is not told.
void TellFrames(int enable, const IOleInPlaceFrame* asking) {
  for (auto& entry : AllFrames()) {
    if (entry.m_key != asking) entry.m_key->EnableModeless(enable);
  }
}

void Link(SModalRecord* record) {
  record->m_outer = g_innermost;
  if (g_innermost != nullptr) g_innermost->m_inner = record;
  g_innermost = record;
}

void Unlink(SModalRecord* record) {
  if (record->m_outer != nullptr) record->m_outer->m_inner = record->m_inner;
  (record->m_inner != nullptr ? record->m_inner->m_outer : g_innermost) = record->m_outer;
}

// Makes the innermost record of a state. The record stands in the list before windows are disabled, so that what is
// called for them finds the application disabled.
void StartRecord(SModalState* state, bool ownerOnly, bool tellFrames, const IOleInPlaceFrame* asking) {
  auto record = std::make_unique<SModalRecord>(state);
  AllRecords().Add(state, record.get());
  Link(record.get());
  try {
    record->DisableWindows(SGetOwnerWnd()->GetSafeHwnd(), ownerOnly);
  } catch (...) {
    AllRecords().Remove(state);
    Unlink(record.get());
    record->EnableWindows();
    throw;
  }
  record.release()->m_tellsFrames = tellFrames;
  if (tellFrames) TellFrames(0, asking);
}

// What this record disabled goes to one that remains and was started later, which found it disabled already;
// without such a record it is enabled.
void StopRecord(SModalState* state, const IOleInPlaceFrame* asking) {
  SModalRecord** found = AllRecords().Retrieve(state);
  if (found == nullptr) return;
  const std::unique_ptr<SModalRecord> record(*found);
  AllRecords().Remove(state);
  SModalRecord* heir = record->m_inner;
  Unlink(record.get());
  if (heir != nullptr) {
    heir->Inherit(*record);
    return;
  }
  record->EnableWindows();
  if (record->m_tellsFrames) TellFrames(1, asking);
}

}  // namespace

SModalState::SModalState(int start) {
  if (start) Start(1);
}

SModalState::~SModalState() { StopQuietly(); }

void SModalState::Start(int disable, int waitCursor, int ownerOnly, int keepFrames) {
  if (IsActive()) {
    if (((m_flags & kDisable) != 0) == (disable != 0)) return;
    Stop();
  }
  if (disable) StartRecord(this, ownerOnly != 0, keepFrames == 0, nullptr);
  m_flags = kStarted | (disable ? kDisable : 0u) | (waitCursor ? kWaitCursor : 0u) | (ownerOnly ? kOwnerOnly : 0u) |
            (keepFrames ? kKeepFrames : 0u);
  if (SWinApp* app = SGetApp(); waitCursor && app != nullptr) app->DoWaitCursor(1);
  SWndThreadState::Get().ThrowException();
}

void SModalState::Stop() {
  StopQuietly();
  SWndThreadState::Get().ThrowException();
}

void SModalState::StopQuietly() noexcept {
  if (!IsActive()) return;
  const unsigned flags = std::exchange(m_flags, 0u);
  if ((flags & kDisable) != 0) StopRecord(this, nullptr);
  if (SWinApp* app = SGetApp(); (flags & kWaitCursor) != 0 && app != nullptr) app->DoWaitCursor(-1);
}

int SModalState::State() { return g_innermost != nullptr ? g_innermost->m_enabled : 1; }

int SModalState::Enable(int enable, IOleInPlaceFrame* frame) {
  constexpr SModalState* kNobody = nullptr;
  if (enable) {
    StopRecord(kNobody, frame);
    g_windowsChanged = true;
  } else if (g_windowsChanged) {
    StopRecord(kNobody, frame);
    StartRecord(kNobody, false, true, frame);
    g_windowsChanged = false;
  }
  SWndThreadState::Get().ThrowException();
  return State();
}

int SModalState::Register(IOleInPlaceFrame* frame) {
  if (frame == nullptr) return 0;
  AllFrames().Add(frame, 1);
  return 1;
}

int SModalState::Unregister(IOleInPlaceFrame* frame) { return AllFrames().Remove(frame); }

void SModalState::WindowsChanged() noexcept { g_windowsChanged = true; }
