// Windows made and destroyed in trees, at random, with a model beside them; failing allocations; stale handles.

#include <gtest/gtest.h>

#include <algorithm>
#include <random>
#include <set>
#include <vector>

#include "qxcore/core/internal/memory_failures.h"
#include "tests/window/recorder.h"

namespace {

#ifdef _WIN32
constexpr int kWindows = 10000;
#else
constexpr int kWindows = 100000;
#endif
constexpr std::size_t kMostAlive = 5000;

int g_alive = 0;  // between WM_NCCREATE and WM_NCDESTROY

LRESULT CALLBACK Counting(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_NCCREATE) ++g_alive;
  if (message == WM_NCDESTROY) --g_alive;
  return DefWindowProcW(window, message, wParam, lParam);
}

void RegisterCounting() {
  static bool isDone = false;
  if (isDone) return;
  isDone = true;
  WNDCLASSW wanted{};
  wanted.lpfnWndProc = &Counting;
  wanted.hInstance = GetModuleHandleW(nullptr);
  wanted.lpszClassName = WTEXT("Counting");
  RegisterClassW(&wanted);
}

HWND MakeCounting(HWND parent, DWORD style) {
  RegisterCounting();
  return CreateWindowExW(0, WTEXT("Counting"), WTEXT("w"), style, 0, 0, 50, 50, parent, nullptr,
                         GetModuleHandleW(nullptr), nullptr);
}

// The tree as it should be: children from the top of the order to the bottom.
struct Node {
  HWND window = nullptr;
  Node* parent = nullptr;
  std::vector<Node*> children;
};

class Trees {
 public:
  explicit Trees(unsigned seed) : m_random(seed) {}
  Trees(const Trees&) = delete;
  Trees& operator=(const Trees&) = delete;
  ~Trees() {
    for (Node* node : m_nodes) delete node;
  }

  int Roll(int sides) { return static_cast<int>(m_random() % static_cast<unsigned>(sides)); }
  std::size_t Count() const { return m_nodes.size(); }
  Node* Any() {
    return m_nodes.empty() ? nullptr : m_nodes[static_cast<std::size_t>(Roll(static_cast<int>(m_nodes.size())))];
  }

  void Make() {
    Node* parent = Roll(8) == 0 ? nullptr : Any();
    auto* node = new Node;
    node->parent = parent;
    node->window = MakeCounting(parent != nullptr ? parent->window : nullptr,
                                parent != nullptr ? WS_CHILD | (Roll(2) ? WS_VISIBLE : 0u) : WS_POPUP);
    ASSERT_NE(node->window, nullptr);
    m_seen.insert(node->window);
    if (parent != nullptr) parent->children.push_back(node);  // a new child lies below its siblings
    m_nodes.push_back(node);
  }

  void Destroy(Node* node) {
    EXPECT_TRUE(DestroyWindow(node->window));
    if (node->parent != nullptr) std::erase(node->parent->children, node);
    Forget(node);
  }

  void Raise(Node* node) {
    SetWindowPos(node->window, HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
    if (node->parent == nullptr) return;
    std::erase(node->parent->children, node);
    node->parent->children.insert(node->parent->children.begin(), node);
  }

  void Check(const Node* node) {
    std::vector<HWND> expected, found;
    for (const Node* child : node->children) expected.push_back(child->window);
    for (HWND child = GetWindow(node->window, GW_CHILD); child != nullptr; child = GetWindow(child, GW_HWNDNEXT))
      found.push_back(child);
    ASSERT_EQ(found, expected);
    if (node->parent != nullptr) {
      EXPECT_EQ(GetParent(node->window), node->parent->window);
    }
  }

  void DestroyAll() {
    while (!m_nodes.empty()) {
      Node* node = m_nodes.front();
      while (node->parent != nullptr) node = node->parent;
      Destroy(node);
    }
    for (const HWND window : m_seen) ASSERT_FALSE(IsWindow(window));
  }

 private:
  void Forget(Node* node) {
    for (Node* child : node->children) Forget(child);
    std::erase(m_nodes, node);
    delete node;
  }

  std::mt19937 m_random;
  std::vector<Node*> m_nodes;
  std::set<HWND> m_seen;
};

TEST(WindowTree, RandomTreesKeepTheirShape) {
  Trees trees(20261121);
  for (int made = 0; made < kWindows; ++made) {
    trees.Make();
    if (HasFatalFailure()) return;
    const int roll = trees.Roll(100);
    if (trees.Count() > kMostAlive || roll < 30) trees.Destroy(trees.Any());
    if (trees.Count() > 0 && roll >= 95) trees.Raise(trees.Any());
    if (trees.Count() > 0 && roll % 10 == 0) trees.Check(trees.Any());
    if (HasFatalFailure()) return;
  }
  trees.DestroyAll();
  EXPECT_EQ(g_alive, 0);
}

// Nothing of a window is kept while it is minimised, so that its children must be painted as well.
TEST(WindowTree, ARestoredWindowIsPaintedWithItsChildren) {
  const HWND top = MakeCounting(nullptr, WS_OVERLAPPEDWINDOW | WS_CLIPCHILDREN | WS_VISIBLE);
  const HWND child = MakeCounting(top, WS_CHILD | WS_VISIBLE);
  ASSERT_NE(child, nullptr);
  SetWindowPos(top, nullptr, 20, 20, 300, 200, SWP_NOZORDER);
  ValidateRect(child, nullptr);
  ASSERT_FALSE(GetUpdateRect(child, nullptr, FALSE));
  ShowWindow(top, SW_MINIMIZE);
  ShowWindow(top, SW_RESTORE);
  EXPECT_TRUE(GetUpdateRect(child, nullptr, FALSE));
  DestroyWindow(top);
}

TEST(WindowTree, StaleHandles) {
  const HWND window = MakeCounting(nullptr, WS_POPUP);
  const HWND child = MakeCounting(window, WS_CHILD);
  EXPECT_TRUE(PostMessageW(child, WM_USER, 0, 0));
  DestroyWindow(window);
  for (const HWND stale : {window, child}) {
    SetLastError(0);
    EXPECT_FALSE(SetWindowPos(stale, nullptr, 0, 0, 1, 1, 0));
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_INVALID_WINDOW_HANDLE));
    SetLastError(0);
    EXPECT_EQ(GetParent(stale), nullptr);
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_INVALID_WINDOW_HANDLE));
    SetLastError(0);
    EXPECT_FALSE(PostMessageW(stale, WM_USER, 0, 0));
    EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_INVALID_WINDOW_HANDLE));
    EXPECT_FALSE(DestroyWindow(stale));
    EXPECT_EQ(SendMessageW(stale, WM_USER, 0, 0), 0);
  }
  MSG message;
  EXPECT_FALSE(PeekMessageW(&message, nullptr, WM_USER, WM_USER, PM_REMOVE)) << "the message of a destroyed window";
  SetLastError(0);
  EXPECT_EQ(CreateWindowExW(0, WTEXT("No such class"), nullptr, 0, 0, 0, 0, 0, nullptr, nullptr, nullptr, nullptr),
            nullptr);
#ifdef _WIN32
  // Wine says that the class does not exist.
  EXPECT_TRUE(GetLastError() == ERROR_CANNOT_FIND_WND_CLASS || GetLastError() == ERROR_CLASS_DOES_NOT_EXIST);
#else
  EXPECT_EQ(GetLastError(), ERROR_CANNOT_FIND_WND_CLASS);
#endif
  EXPECT_EQ(MakeCounting(nullptr, WS_CHILD), nullptr);
  EXPECT_EQ(GetLastError(), static_cast<DWORD>(ERROR_TLW_WITH_WSCHILD));
}

#ifndef _WIN32
// The model takes its memory through the library's allocator, so that every single allocation can fail.
TEST(WindowTree, EveryAllocationFails) {
  const auto make = [] {
    const HWND frame = MakeCounting(nullptr, WS_OVERLAPPEDWINDOW);
    if (frame == nullptr) return false;
    const HMENU menu = CreateMenu();
    bool isWhole = menu != nullptr && AppendMenuW(menu, MF_STRING, 1, WTEXT("an item with a longer text"));
    if (menu != nullptr && !SetMenu(frame, menu)) DestroyMenu(menu);
    for (int i = 0; i < 3; ++i) isWhole &= MakeCounting(frame, WS_CHILD | WS_VISIBLE) != nullptr;
    isWhole &= SetPropW(frame, WTEXT("property"), frame) && PostMessageW(frame, WM_USER, 0, 0) &&
               SetWindowTextW(frame, WTEXT("a text that is longer than the short ones")) &&
               SetTimer(frame, 1, 1000, nullptr) != 0;
    ShowWindow(frame, SW_SHOW);
    DestroyWindow(frame);
    return isWhole;
  };
  ASSERT_TRUE(make());
  for (const bool forever : {false, true}) {
    int failures = 0;
    for (long n = 1; n < 10000; ++n) {
      SMemFailAt(n, forever);
      const bool isWhole = make();
      const bool hasFailed = SMemHasFailed();
      SMemFailAt(0);
      ASSERT_EQ(g_alive, 0) << "allocation " << n;
      if (!hasFailed) {
        EXPECT_TRUE(isWhole);
        break;
      }
      ++failures;
    }
    EXPECT_GT(failures, 3);
  }
}
#endif

}  // namespace
