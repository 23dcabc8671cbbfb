// Message maps: what is published about their layout, the lookup, the cache, and the shapes of handlers.

#include "tests/support/slots.h"
#include "tests/ui/ui_fixture.h"

namespace {

using test::Window;

// A class gives its tests a look at what it inherits.
class Probe : public SWnd {
 public:
  static int CountOf(const SMsgMap& map) {
    int count = 0;
    while (map.m_entries[count].m_signature.m_number != 0) ++count;
    return count;
  }
  static const SMsgMap& WndMap() { return SWnd::msgMap; }
  static const SMsgMap& TargetMap() { return SCmdTarget::msgMap; }
};
class FrameProbe : public SFrameWnd {
 public:
  static const SMsgMap& FrameMap() { return SFrameWnd::msgMap; }
};

// Under this ABI the destructor takes two slots.
constexpr int kDestructor = 1;

class OrderProbe : public SWnd {
 public:
  static void Check() {
    int slot = 4 + kDestructor;
    EXPECT_EQ(SlotOf(&OrderProbe::Create), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::DestroyWindow), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::ContinueModal), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::EndModalLoop), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::PreTranslateMessage), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::CalcWindowRect), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::SetWindowTextW), slot++);
    EXPECT_EQ(SlotOf(static_cast<int (SWnd::*)(SString*) const>(&OrderProbe::GetWindowTextW)), slot++);
    EXPECT_EQ(SlotOf(static_cast<int (SWnd::*)(LPWSTR, int) const>(&OrderProbe::GetWindowTextW)), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::GetWindowTextLengthW), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::GetScrollBarCtrl), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::UpdateData), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::SetReadOnly), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::IsReadOnly), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::OnModalDisable), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::GetSuperWndProc), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::SetSuperWndProc), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::WindowProc), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::OnWndMsg), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::PreCreateWindow), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::OnCommand), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::OnNotify), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::DefWindowProcW), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::PostNcDestroy), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::OnChildNotify), slot++);
    EXPECT_EQ(SlotOf(&OrderProbe::SafeOnKillFocus), slot++);
    EXPECT_EQ(slot, 30 + kDestructor);
    EXPECT_EQ(reinterpret_cast<char*>(&reinterpret_cast<OrderProbe*>(64)->m_hWnd) - reinterpret_cast<char*>(64),
              static_cast<std::ptrdiff_t>(sizeof(void*)));
  }
};

TEST(Layout, Slots_OfWindowsFramesAndApplications_StandInTheirOrder) {
  OrderProbe::Check();
  EXPECT_EQ(SlotOf(&SCmdTarget::OnCmdMsg), 2 + kDestructor);
  int slot = 30 + kDestructor;
  EXPECT_EQ(SlotOf(&SFrameWnd::LoadAccelTable), slot++);
  EXPECT_EQ(SlotOf(&SFrameWnd::GetActiveFrame), slot++);
  EXPECT_EQ(SlotOf(&SFrameWnd::ActivateFrame), slot++);
  EXPECT_EQ(SlotOf(&SFrameWnd::GetDefaultAccelerator), slot++);
  EXPECT_EQ(SlotOf(&SFrameWnd::OnCreateClient), slot++);
  slot = 4 + kDestructor;
  EXPECT_EQ(SlotOf(&SWinApp::InitApplication), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::InitInstance), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::ExitInstance), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::Run), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::PreTranslateMessage), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::PumpMessage), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::OnIdle), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::IsIdleMessage), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::GetFrameWnd), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::GetOwnerWnd), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::DoWaitCursor), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::GetWaitCount), slot++);
  EXPECT_EQ(SlotOf(&SWinApp::OnDDECommand), slot++);
}

TEST(Layout, Entries_OfTheLibrarysMaps_AreThePublishedNumber) {
  EXPECT_EQ(Probe::CountOf(Probe::TargetMap()), 0);
  EXPECT_EQ(Probe::TargetMap().m_getBase(), nullptr);
  EXPECT_EQ(Probe::CountOf(Probe::WndMap()), 50);
  EXPECT_EQ(Probe::WndMap().m_getBase(), &Probe::TargetMap());
  EXPECT_EQ(Probe::CountOf(FrameProbe::FrameMap()), 7);
  EXPECT_EQ(FrameProbe::FrameMap().m_getBase(), &Probe::WndMap());
}

TEST(Layout, Signatures_ThatArePublished_HaveTheirNumbers) {
  const auto numberOf = [](const SMsgMap& map, UINT message) {
    const SMsgEntry* entry = SFindMessageEntry(&map, message);
    return entry != nullptr ? entry->m_signature.m_number : 0;
  };
  const SMsgMap& wnd = Probe::WndMap();
  const SMsgMap& frame = FrameProbe::FrameMap();
  EXPECT_EQ(numberOf(frame, WM_ERASEBKGND), 1u);
  EXPECT_EQ(numberOf(frame, WM_SETCURSOR), 3u);
  EXPECT_EQ(numberOf(frame, WM_CREATE), 11u);
  EXPECT_EQ(numberOf(wnd, WM_NCDESTROY), 15u);
  EXPECT_EQ(numberOf(wnd, WM_NCPAINT), 15u);
  EXPECT_EQ(numberOf(wnd, WM_SYSCOLORCHANGE), 15u);
  EXPECT_EQ(numberOf(frame, WM_SETFOCUS), 26u);
  EXPECT_EQ(numberOf(frame, WM_HSCROLL), 32u);
  EXPECT_EQ(numberOf(frame, WM_VSCROLL), 32u);
  EXPECT_EQ(numberOf(wnd, WM_DRAWITEM), 35u);
  EXPECT_EQ(numberOf(wnd, WM_MEASUREITEM), 35u);
  EXPECT_EQ(numberOf(wnd, WM_DELETEITEM), 35u);
  EXPECT_EQ(numberOf(wnd, WM_COMPAREITEM), 36u);
}

// --- lookup ---

LRESULT Return1(SCmdTarget*, WPARAM, LPARAM) { return 1; }
LRESULT Return2(SCmdTarget*, WPARAM, LPARAM) { return 2; }

UINT g_registeredNumber = 0;
const SMsgEntry kBaseEntries[] = {{WM_USER, 0, 0, 0, {5}, &Return1},
                                  {WM_USER + 1, 0, 0, 0, {5}, &Return1},
                                  {WM_COMMAND, 0, 10, 20, {2}, &Return1},
                                  {}};
const SMsgEntry kDerivedEntries[] = {{WM_USER, 0, 0, 0, {5}, &Return2},
                                     {WM_USER, 0, 0, 0, {5}, &Return1},
                                     {WM_USER + 2, 0, 3, 5, {5}, &Return2},
                                     {kSMsgRegistered, 0, 0, 0, {5}, &Return1},
                                     {kSMsgRegistered, 0, 0, 0, {.m_registered = &g_registeredNumber}, &Return2},
                                     {WM_COMMAND, 0, 15, 15, {2}, &Return2},
                                     {WM_COMMAND, 3, 15, 15, {2}, &Return1},
                                     {}};
const SMsgMap kBaseMap = {[]() -> const SMsgMap* { return nullptr; }, kBaseEntries};
const SMsgMap kDerivedMap = {[]() -> const SMsgMap* { return &kBaseMap; }, kDerivedEntries};

TEST(Lookup, Messages_TakeTheFirstEntryOfTheMostDerivedMap) {
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, WM_USER), &kDerivedEntries[0]);
  EXPECT_EQ(SFindMessageEntry(&kBaseMap, WM_USER), &kBaseEntries[0]);
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, WM_USER + 1), &kBaseEntries[1]);
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, WM_USER + 2), nullptr) << "its identifiers do not hold 0";
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, WM_COMMAND), nullptr);
  EXPECT_EQ(SFindMessageEntry(nullptr, WM_USER), nullptr);
}

TEST(Lookup, RegisteredMessages_AreMatchedByTheirVariableAlone) {
  g_registeredNumber = 0xC345;
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, 0xC345), &kDerivedEntries[4]);
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, 0xC346), nullptr);
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, kSMsgRegistered), nullptr) << "a small number is no address";
  g_registeredNumber = kSMsgRegistered;
  EXPECT_EQ(SFindMessageEntry(&kDerivedMap, kSMsgRegistered), &kDerivedEntries[4]);
}

TEST(Lookup, Commands_AreMatchedByCodeAndRange) {
  EXPECT_EQ(SFindCommandEntry(&kDerivedMap, WM_COMMAND, 0, 15), &kDerivedEntries[5]);
  EXPECT_EQ(SFindCommandEntry(&kDerivedMap, WM_COMMAND, 3, 15), &kDerivedEntries[6]);
  EXPECT_EQ(SFindCommandEntry(&kDerivedMap, WM_COMMAND, 0, 10), &kBaseEntries[2]);
  EXPECT_EQ(SFindCommandEntry(&kDerivedMap, WM_COMMAND, 0, 20), &kBaseEntries[2]);
  EXPECT_EQ(SFindCommandEntry(&kDerivedMap, WM_COMMAND, 0, 21), nullptr);
  EXPECT_EQ(SFindCommandEntry(&kDerivedMap, WM_COMMAND, 4, 15), nullptr);
}

// Maps whose addresses end in the same byte share all their slots.
TEST(Cache, MapsThatShareASlot_NeverSeeEachOthersEntries) {
  constexpr int kMaps = 8;
  struct Spaced {
    alignas(256) SMsgMap map;
  };
  static const SMsgEntry entries[kMaps][2] = {{{WM_USER, 0, 0, 0, {5}, &Return1}, {}},
                                              {{WM_USER, 0, 0, 0, {5}, &Return2}, {}}};
  static Spaced maps[kMaps];
  for (int i = 0; i < kMaps; ++i) maps[i].map = {kBaseMap.m_getBase, entries[i]};
  RandomText random(7);
  for (int step = 0; step < 20000; ++step) {
    const SMsgMap* map = step % 5 == 0 ? &kDerivedMap : &maps[random.Number(kMaps)].map;
    const UINT message = WM_USER + static_cast<UINT>(random.Number(600));
    ASSERT_EQ(SFindMessageEntryCached(map, message), SFindMessageEntry(map, message)) << "step " << step;
  }
}

// --- dispatch ---

class Dispatched : public test::Window {
 public:
  const SMsgMap* GetMessageMap() const override { return m_map; }
  const SMsgMap* m_map = nullptr;
};

class Dispatch : public test::UiTest {};

// Signatures that are no shapes, and those of commands, handle no message, whatever their handler would do.
TEST_F(Dispatch, EverySignature_OutsideTheRangeOrOfCommands_IsNotHandled) {
  for (std::uintptr_t number = 1; number <= 60; ++number) {
    const SMsgEntry entries[] = {{WM_USER, 0, 0, 0, {number}, &Return2}, {}};
    const SMsgMap map = {kBaseMap.m_getBase, entries};
    Dispatched window;
    window.m_map = &map;
    const bool isOfCommands = number == 2 || number == 4 || number == 47 || number == 49 || number == 50;
    // Not through the cache, which knows maps by address: this one lives on the stack.
    SFindMessageEntryCached(&kBaseMap, WM_USER);
    LRESULT result = 0;
    // Each map stands at the same address: another message in between empties the slot.
    for (UINT message = 0; message < 256; ++message) SFindMessageEntryCached(&kDerivedMap, message);
    EXPECT_EQ(window.OnWndMsg(WM_USER, 0, 0, &result), number <= 52 && !isOfCommands) << number;
    EXPECT_EQ(result, number <= 52 && !isOfCommands ? 2 : 0) << number;
  }
}

// What handlers get, for messages whose arguments are packed.
class Unpacking : public SWnd {
 public:
  int m_numbers[4] = {};
  void Set(int a, int b = 0, int c = 0, int d = 0) {
    m_numbers[0] = a, m_numbers[1] = b, m_numbers[2] = c, m_numbers[3] = d;
  }
  void OnSize(UINT kind, int width, int height) { Set(static_cast<int>(kind), width, height); }
  void OnMove(int x, int y) { Set(x, y); }
  void OnMouseMove(UINT keys, SPoint point) { Set(static_cast<int>(keys), point.x, point.y); }
  int OnMouseWheel(UINT keys, short turn, SPoint point) {
    Set(static_cast<int>(keys), turn, point.x, point.y);
    return 5;
  }
  void OnKeyDown(UINT key, UINT repeat, UINT flags) {
    Set(static_cast<int>(key), static_cast<int>(repeat), static_cast<int>(flags));
  }
  void OnActivate(UINT state, SWnd* other, int minimized) { Set(static_cast<int>(state), other == this, minimized); }
  HBRUSH OnCtlColor(SDC* dc, SWnd* control, UINT kind) {
    Set(dc == nullptr, control == nullptr, static_cast<int>(kind));
    return reinterpret_cast<HBRUSH>(static_cast<LONG_PTR>(0x77));
  }
  LRESULT OnAny(WPARAM wParam, LPARAM lParam) { return static_cast<LRESULT>(wParam) + lParam; }
  void OnReflectedScroll(UINT code, UINT position) { Set(static_cast<int>(code), static_cast<int>(position)); }
  LRESULT Send(UINT message, WPARAM wParam, LPARAM lParam) {
    LRESULT result = -1;
    EXPECT_EQ(OnWndMsg(message, wParam, lParam, &result), 1);
    return result;
  }
  void Expect(int a, int b = 0, int c = 0, int d = 0) {
    EXPECT_EQ(m_numbers[0], a);
    EXPECT_EQ(m_numbers[1], b);
    EXPECT_EQ(m_numbers[2], c);
    EXPECT_EQ(m_numbers[3], d);
  }
  QXCORE_DECLARE_MESSAGE_MAP()
};
QXCORE_IMPLEMENT_MESSAGE_MAP(Unpacking, SWnd, on<WM_SIZE, &Unpacking::OnSize>(), on<WM_MOVE, &Unpacking::OnMove>(),
                             on<WM_MOUSEMOVE, &Unpacking::OnMouseMove>(), on<WM_MOUSEWHEEL, &Unpacking::OnMouseWheel>(),
                             on<WM_KEYDOWN, &Unpacking::OnKeyDown>(), on<WM_ACTIVATE, &Unpacking::OnActivate>(),
                             on<WM_CTLCOLORDLG, &Unpacking::OnCtlColor>(), on<WM_USER, &Unpacking::OnAny>(),
                             reflected<WM_HSCROLL, &Unpacking::OnReflectedScroll>())

TEST_F(Dispatch, Arguments_AreUnpackedWithTheirSigns) {
  Unpacking window;
  EXPECT_EQ(window.Send(WM_SIZE, SIZE_MAXIMIZED, MAKELPARAM(300, 200)), 0);
  window.Expect(SIZE_MAXIMIZED, 300, 200);
  window.Send(WM_MOVE, 0, MAKELPARAM(-7, -8));
  window.Expect(-7, -8);
  window.Send(WM_MOUSEMOVE, MK_SHIFT, MAKELPARAM(-1, 32767));
  window.Expect(MK_SHIFT, -1, 32767);
  EXPECT_EQ(window.Send(WM_MOUSEWHEEL, MAKEWPARAM(MK_CONTROL, static_cast<WORD>(-120)), MAKELPARAM(3, -4)), 5);
  window.Expect(MK_CONTROL, -120, 3, -4);
  window.Send(WM_KEYDOWN, VK_F5, static_cast<LPARAM>(0xC0410002));
  window.Expect(VK_F5, 2, 0xC041);
  window.Send(WM_ACTIVATE, MAKEWPARAM(WA_CLICKACTIVE, 1), 0);
  window.Expect(WA_CLICKACTIVE, 0, 1);
  EXPECT_EQ(window.Send(WM_CTLCOLORDLG, 0, 0), 0x77);
  window.Expect(1, 1, 4);
  EXPECT_EQ(window.Send(WM_USER, 3, -5), -2);
  window.Send(WM_HSCROLL + kSMsgReflected, MAKEWPARAM(SB_THUMBPOSITION, 40000), 0);
  window.Expect(SB_THUMBPOSITION, 40000);
}

// Before the library asked for its three names, a program cannot have asked for one.
TEST(Notifications, AProgramsFirstKind_IsTheFourth) {
  EXPECT_EQ(SNotificationManager::NotificationKind(WTEXT("idle step")), kSIdleStep);
  EXPECT_EQ(SNotificationManager::NotificationKind(WTEXT("idle started")), kSIdleStarted);
  EXPECT_EQ(SNotificationManager::NotificationKind(WTEXT("idle ended")), kSIdleEnded);
  EXPECT_GE(SNotificationManager::NotificationKind(WTEXT("a name of the test's own")), 4);
}

}  // namespace
