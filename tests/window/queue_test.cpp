// Queues, timers, sent messages between threads.

#include <gtest/gtest.h>

#include <atomic>
#include <thread>
#include <vector>

#include "tests/window/recorder.h"

namespace {

constexpr UINT kAdd = WM_USER + 10, kStop = WM_USER + 11, kForward = WM_USER + 12;

std::atomic<int> g_sum{0};

LRESULT CALLBACK Adding(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  switch (message) {
    case kAdd:
      g_sum += static_cast<int>(wParam);
      return static_cast<LRESULT>(wParam) * 2;
    case kForward:
      // Back to the sender, which waits: both must come through.
      return SendMessageW(reinterpret_cast<HWND>(lParam), kAdd, wParam, 0) + 1;
    case kStop:
      PostQuitMessage(static_cast<int>(wParam));
      return 0;
    default:
      return DefWindowProcW(window, message, wParam, lParam);
  }
}

HWND MakeAdding() {
  static const ATOM atom = [] {
    WNDCLASSW wanted{};
    wanted.lpfnWndProc = &Adding;
    wanted.hInstance = GetModuleHandleW(nullptr);
    wanted.lpszClassName = WTEXT("Adding");
    return RegisterClassW(&wanted);
  }();
  EXPECT_NE(atom, 0);
  return CreateWindowExW(0, WTEXT("Adding"), nullptr, WS_POPUP, 0, 0, 50, 50, nullptr, nullptr,
                         GetModuleHandleW(nullptr), nullptr);
}

int RunLoop() {
  MSG message;
  while (GetMessageW(&message, nullptr, 0, 0) > 0) {
    TranslateMessage(&message);
    DispatchMessageW(&message);
  }
  return static_cast<int>(message.wParam);
}

TEST(Queue, PostedThenQuitThenPaintThenTimer) {
  recorder::Pump();
  const HWND window = MakeAdding();
  ShowWindow(window, SW_SHOWNOACTIVATE);
  recorder::Pump();
  SetTimer(window, 7, 10, nullptr);
  while (!(HIWORD(GetQueueStatus(QS_TIMER)) & QS_TIMER)) Sleep(1);
  InvalidateRect(window, nullptr, FALSE);
  PostQuitMessage(3);
  PostMessageW(window, kAdd, 1, 0);
  PostMessageW(window, kAdd, 2, 0);
  MSG message;
  ASSERT_TRUE(PeekMessageW(&message, nullptr, 0, 0, PM_NOREMOVE));
  std::vector<UINT> order;
  for (int i = 0; i < 5 && PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE); ++i) {
    order.push_back(message.message);
    if (message.message == WM_PAINT) ValidateRect(window, nullptr);
    if (message.message == WM_QUIT) {
      EXPECT_EQ(message.wParam, 3u);
    }
  }
  EXPECT_EQ(order, (std::vector<UINT>{kAdd, kAdd, WM_QUIT, WM_PAINT, WM_TIMER}));
  EXPECT_TRUE(KillTimer(window, 7));
  EXPECT_FALSE(KillTimer(window, 7));
  DestroyWindow(window);
}

TEST(Queue, FiltersTakeTheirMessagesAndLeaveTheOthers) {
  recorder::Pump();
  const HWND one = MakeAdding(), two = MakeAdding();
  PostMessageW(one, kAdd, 1, 0);
  PostMessageW(two, kAdd, 2, 0);
  PostMessageW(nullptr, kStop, 3, 0);
  MSG message;
  ASSERT_TRUE(PeekMessageW(&message, two, kAdd, kAdd, PM_REMOVE));
  EXPECT_EQ(message.wParam, 2u);
  EXPECT_FALSE(PeekMessageW(&message, two, kAdd, kAdd, PM_REMOVE));
  ASSERT_TRUE(PeekMessageW(&message, reinterpret_cast<HWND>(static_cast<LONG_PTR>(-1)), 0, 0, PM_REMOVE));
  EXPECT_EQ(message.message, kStop);
  ASSERT_TRUE(PeekMessageW(&message, nullptr, kAdd, kAdd, PM_REMOVE));
  EXPECT_EQ(message.hwnd, one);
  DestroyWindow(one);
  DestroyWindow(two);
}

TEST(Queue, ManyPostedMessagesKeepTheirOrder) {
  recorder::Pump();
  const HWND window = MakeAdding();
  constexpr int kCount = 3000;
  for (int i = 0; i < kCount; ++i) ASSERT_TRUE(PostMessageW(window, kAdd, static_cast<WPARAM>(i), 0));
  MSG message;
  for (int i = 0; i < kCount; ++i) {
    ASSERT_TRUE(PeekMessageW(&message, window, kAdd, kAdd, PM_REMOVE));
    ASSERT_EQ(message.wParam, static_cast<WPARAM>(i));
  }
  EXPECT_FALSE(PeekMessageW(&message, window, kAdd, kAdd, PM_REMOVE));
  DestroyWindow(window);
}

// Three threads with a window each, and this one: all send to all, and post.
TEST(Queue, FourThreadsSendToEachOther) {
  recorder::Pump();
  g_sum = 0;
  constexpr int kThreads = 3, kRounds = 200;
  const HWND own = MakeAdding();
  std::atomic<HWND> windows[kThreads] = {};
  std::vector<std::thread> threads;
  for (int i = 0; i < kThreads; ++i) {
    threads.emplace_back([&windows, own, i] {
      const HWND window = MakeAdding();
      windows[i] = window;
      for (int round = 0; round < kRounds; ++round) EXPECT_EQ(SendMessageW(own, kAdd, 1, 0), 2);
      EXPECT_EQ(RunLoop(), 5);
      DestroyWindow(window);
    });
  }
  // The main thread handles what they send while it looks at its queue.
  MSG message;
  for (const std::atomic<HWND>& window : windows)
    while (window == nullptr) PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE);
  for (int round = 0; round < kRounds; ++round) {
    for (const std::atomic<HWND>& window : windows) {
      // Each sends back while this thread waits for it.
      EXPECT_EQ(SendMessageW(window, kForward, 1, reinterpret_cast<LPARAM>(own)), 3);
      EXPECT_TRUE(PostMessageW(window, kAdd, 1, 0));
    }
  }
  for (const std::atomic<HWND>& window : windows) PostMessageW(window, kStop, 5, 0);
  for (std::thread& thread : threads) thread.join();
  EXPECT_EQ(g_sum, kThreads * kRounds * 3);
  for (const std::atomic<HWND>& window : windows) EXPECT_FALSE(IsWindow(window));
  DestroyWindow(own);
}

TEST(Queue, AThreadThatEndsAnswersItsSenders) {
  recorder::Pump();
  std::atomic<HWND> window{nullptr};
  std::atomic<bool> ends{false};
  std::thread thread([&] {
    window = MakeAdding();
    while (!ends) std::this_thread::yield();  // never looks at its queue, and leaves its window behind
  });
  while (window == nullptr) std::this_thread::yield();
  std::thread sender([&] { EXPECT_EQ(SendMessageW(window, kAdd, 1, 0), 0); });
  // Until the message has arrived there is nothing to answer; ending at any time is right.
  ends = true;
  sender.join();
  thread.join();
  while (IsWindow(window)) std::this_thread::yield();
}

}  // namespace
