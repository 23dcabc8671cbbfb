// Trees of windows, made, changed and destroyed at random, with a model of what there must be beside them.

#include <random>
#include <set>

#include "tests/ui/ui_fixture.h"

namespace {

#ifdef _WIN32
constexpr int kWindows = 10000;  // a window costs a third of a millisecond there
#else
constexpr int kWindows = 100000;
#endif
constexpr std::size_t kMostAlive = 2000;
constexpr UINT kDestroy = WM_USER + 1;  // wParam: the object whose window the receiver destroys

class Forest;

// A window that deletes itself with its window, owns a drawing object, and may refuse to be made.
class Tree : public SWnd {
 public:
  Tree(Forest* forest, Tree* parent, bool refuses);
  ~Tree() override;
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override;
  void PostNcDestroy() override { delete this; }

  Forest* m_forest;
  Tree* m_parent;
  std::set<Tree*> m_children;
  std::size_t m_index;  // in the forest's list
  bool m_refuses;
  SPen m_pen{PS_SOLID, 1, RGB(1, 2, 3)};
};

// The model: all objects, and all handles that there ever were.
class Forest {
 public:
  explicit Forest(unsigned seed) : m_random(seed) {}
  int Below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }
  Tree* Any() { return m_trees.empty() ? nullptr : m_trees[static_cast<std::size_t>(Below(int(m_trees.size())))]; }

  void Make() {
    Tree* parent = Below(10) == 0 ? nullptr : Any();
    const bool refuses = Below(50) == 0;
    auto* tree = new Tree(this, parent, refuses);
    const DWORD style = (Below(2) ? WS_VISIBLE : 0u) | (Below(4) == 0 ? WS_CLIPCHILDREN : 0u);
    const SRect rect(Below(50), Below(50), 60 + Below(200), 60 + Below(200));
    const int made = parent != nullptr ? tree->Create(nullptr, nullptr, style, rect, parent, UINT(Below(100)))
                                       : tree->CreateEx(0, nullptr, WTEXT("tree"), WS_POPUP | style, rect.left,
                                                        rect.top, rect.Width(), rect.Height(), nullptr, nullptr);
    EXPECT_EQ(made, refuses ? 0 : 1);
    ++m_made;
  }

  // Destroys a window in one of the ways there are; all that is below it goes with it, and nothing else.
  void Destroy(Tree* victim) {
    std::vector<HWND> doomed;
    Collect(victim, &doomed);
    const std::size_t left = m_trees.size() - doomed.size();
    switch (Below(4)) {
      case 0:
        delete victim;
        break;
      case 1:
        Any()->SendMessageW(kDestroy, reinterpret_cast<WPARAM>(victim));
        break;
      case 2:
        victim->SendMessageW(WM_CLOSE);
        break;
      default:
        victim->DestroyWindow();
    }
    EXPECT_EQ(m_trees.size(), left);
    for (const HWND window : doomed) EXPECT_FALSE(::IsWindow(window));
  }

  void Change(Tree* tree) {
    switch (Below(8)) {
      case 0:
        tree->ShowWindow(Below(2) ? SW_SHOW : SW_HIDE);
        break;
      case 1:
        tree->MoveWindow(SRect(Below(80), Below(80), 100 + Below(100), 100 + Below(100)));
        break;
      case 2:
        tree->SetWindowPos(Below(2) ? HWND_TOP : HWND_BOTTOM, 0, 0, 0, 0, SWP_NOSIZE | SWP_NOMOVE | SWP_NOACTIVATE);
        break;
      case 3:
        tree->EnableWindow(Below(2));
        break;
      case 4:
        tree->SetFocus();
        break;
      case 5:
        tree->Invalidate();
        if (Below(4) == 0) tree->UpdateWindow();
        break;
      case 6:
        EXPECT_EQ(tree->GetParent(), tree->m_parent) << "a permanent object";
        SWnd::FromHandle(::GetDesktopWindow())->GetStyle();
        break;
      default:
        Adopt(tree, Any());
    }
  }

  // What the system knows of every window is what the model knows.
  void Check() {
    EXPECT_EQ(SWnd::HandleMap().GetPermanentCount(), static_cast<int>(m_trees.size()) + m_otherObjects);
    for (Tree* tree : m_trees) {
      ASSERT_TRUE(::IsWindow(tree->m_hWnd));
      ASSERT_EQ(SWnd::FromHandlePermanent(tree->m_hWnd), tree);
      std::set<Tree*> children;
      for (HWND child = ::GetWindow(tree->m_hWnd, GW_CHILD); child != nullptr;
           child = ::GetWindow(child, GW_HWNDNEXT)) {
        children.insert(static_cast<Tree*>(SWnd::FromHandlePermanent(child)));
      }
      ASSERT_TRUE(children == tree->m_children);
    }
  }

  std::vector<Tree*> m_trees;
  std::set<HWND> m_windows;
  std::set<HGDIOBJ> m_pens;
  int m_made = 0;
  int m_otherObjects = SWnd::HandleMap().GetPermanentCount();

 private:
  static void Collect(const Tree* top, std::vector<HWND>* handles) {
    handles->push_back(top->m_hWnd);
    for (const Tree* child : top->m_children) Collect(child, handles);
  }
  static void Adopt(Tree* tree, Tree* parent) {
    if (tree->m_parent == nullptr) return;
    for (const Tree* above = parent; above != nullptr; above = above->m_parent) {
      if (above == tree) return;
    }
    tree->m_parent->m_children.erase(tree);
    parent->m_children.insert(tree);
    tree->m_parent = parent;
    tree->SetParent(parent);
  }

  std::mt19937 m_random;
};

Tree::Tree(Forest* forest, Tree* parent, bool refuses)
    : m_forest(forest), m_parent(parent), m_index(forest->m_trees.size()), m_refuses(refuses) {
  forest->m_trees.push_back(this);
  forest->m_pens.insert(m_pen.GetSafeHandle());
  if (parent != nullptr) parent->m_children.insert(this);
}

Tree::~Tree() {
  if (m_parent != nullptr) m_parent->m_children.erase(this);
  for (Tree* child : m_children) child->m_parent = nullptr;
  m_forest->m_trees.back()->m_index = m_index;
  m_forest->m_trees[m_index] = m_forest->m_trees.back();
  m_forest->m_trees.pop_back();
}

int Tree::OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
  if (message == WM_NCCREATE) m_forest->m_windows.insert(m_hWnd);
  if (message == WM_CREATE && m_refuses) return *result = -1, 1;
  // The receiver may go with what it destroys.
  if (message == kDestroy) return reinterpret_cast<Tree*>(wParam)->DestroyWindow(), 1;
  return SWnd::OnWndMsg(message, wParam, lParam, result);
}

class TreeStress : public test::UiTest {
 protected:
  TreeStress() : UiTest(600) {}
};

TEST_F(TreeStress, WindowsAtRandom_LeaveNothing) {
  constexpr unsigned kSeed = 20261121;
  SCOPED_TRACE(testing::Message() << "seed " << kSeed);
  test::App app;
  Forest forest(kSeed);
  std::size_t most = 0;
  for (int step = 0; forest.m_made < kWindows && !HasFailure(); ++step) {
    const bool isFull = forest.m_trees.size() >= kMostAlive;
    if (const int choice = forest.Below(10); choice < 5 && !isFull) {
      forest.Make();
    } else if ((choice < 6 || isFull) && !forest.m_trees.empty()) {
      forest.Destroy(forest.Any());
    } else if (!forest.m_trees.empty()) {
      forest.Change(forest.Any());
    }
    most = std::max(most, forest.m_trees.size());
    if (step % 256 == 0) test::PumpAll();
    if (step % 1024 == 0) app.OnIdle(1);
    if (step % 4096 == 0) forest.Check();
  }
  while (!forest.m_trees.empty() && !HasFailure()) forest.Destroy(forest.Any());
  forest.Check();
  EXPECT_LE(most, 5000u);
  EXPECT_GT(most, 100u);
  app.OnIdle(1);
  test::PumpAll();
  for (const HWND window : forest.m_windows) ASSERT_FALSE(::IsWindow(window));
  for (const HGDIOBJ pen : forest.m_pens) ASSERT_EQ(::GetObjectType(pen), 0u);
  EXPECT_EQ(SWnd::HandleMap().GetTemporaryCount(), 0);
}

}  // namespace
