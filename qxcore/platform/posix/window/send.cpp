#include "qxcore/platform/posix/window/send.h"

#include "qxcore/platform/posix/window/queue.h"

namespace platform::model {

LRESULT CallProcedure(WNDPROC procedure, HWND window, UINT message, WPARAM wParam, LPARAM lParam) noexcept {
  return procedure(window, message, wParam, lParam);
}

namespace {

LRESULT Deliver(Thread* thread, HWND handle, WNDPROC procedure, UINT message, WPARAM wParam, LPARAM lParam) {
  if (HasHook(thread, HookKind::CallProcedure)) {
    CWPSTRUCT record{lParam, wParam, message, handle};
    RunHook(thread, HookKind::CallProcedure, HC_ACTION, FALSE, reinterpret_cast<LPARAM>(&record));
  }
  return CallProcedure(procedure, handle, message, wParam, lParam);
}

void HandleOne(Thread* thread, SentMessage* sent) {
  const Window* window = FindWindowObject(sent->window);
  const WNDPROC procedure = window != nullptr ? window->procedure.load(std::memory_order_relaxed) : nullptr;
  LRESULT result = 0;
  if (procedure != nullptr) {
    ++thread->sendDepth;
    {
      const Unguarded unguarded;
      result = Deliver(thread, sent->window, procedure, sent->message, sent->wParam, sent->lParam);
    }
    --thread->sendDepth;
  }
  sent->result = result;
  sent->isDone = true;
  Wake(sent->sender);
}

// With the lock held. Two threads that send to each other both come through, for each handles the other's
// messages while it waits.
LRESULT SendAcross(Thread* sender, Thread* receiver, HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  SentMessage sent{handle, message, wParam, lParam};
  sent.sender = sender;
  receiver->sent.Push(&sent);
  receiver->changed |= QS_SENDMESSAGE;
  Wake(receiver);
  while (!sent.isDone) {
    HandleSentMessages(sender);
    if (!sent.isDone) WaitForWake(sender, nullptr);
  }
  return sent.result;
}

LRESULT SendSlowly(Thread* thread, HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  return OrNoMemory<LRESULT>(0, [&]() -> LRESULT {
    const Guard guard;
    const Window* window = Expect(handle);
    if (window == nullptr) return 0;
    if (!IsRoot(window)) return SendAcross(thread, window->thread, handle, message, wParam, lParam);
    const WNDPROC procedure = window->procedure;
    const Unguarded unguarded;
    return CallProcedure(procedure, handle, message, wParam, lParam);
  });
}

}  // namespace

void HandleSentMessages(Thread* thread) {
  while (!thread->sent.IsEmpty()) {
    SentMessage* sent = thread->sent.At(0);
    thread->sent.Remove(0);
    HandleOne(thread, sent);
  }
}

void AnswerSentMessages(Thread* thread, HWND window) {
  for (std::size_t i = thread->sent.Count(); i-- > 0;) {
    SentMessage* sent = thread->sent.At(i);
    if (window != nullptr && sent->window != window) continue;
    thread->sent.Remove(i);
    sent->isDone = true;
    Wake(sent->sender);
  }
}

LRESULT Send(HWND handle, UINT message, WPARAM wParam, LPARAM lParam) {
  Thread* thread = CurrentThread();
  const Window* window = FindOwnWindow(handle, thread);
  if (window == nullptr) return SendSlowly(thread, handle, message, wParam, lParam);
  return Deliver(thread, handle, window->procedure.load(std::memory_order_relaxed), message, wParam, lParam);
}

}  // namespace platform::model

using namespace platform::model;

LRESULT SendMessageW(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (window == HWND_BROADCAST) {
    return OrNoMemory<LRESULT>(FALSE, [&] {
      Broadcast([&](HWND each) { Send(each, message, wParam, lParam); });
      return TRUE;
    });
  }
  return Send(window, message, wParam, lParam);
}

LRESULT CallWindowProcW(WNDPROC procedure, HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  return procedure != nullptr ? CallProcedure(procedure, window, message, wParam, lParam) : 0;
}

BOOL InSendMessage() { return CurrentThread()->sendDepth > 0; }
