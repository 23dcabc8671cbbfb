// What windows look like: the guide's program and a dialog box, beside the pictures in docs/pictures. `./dev pictures`
// draws these anew; each target has its own, for frames and controls are drawn by the system.

#include <cstdlib>

#include "qxcore/graphics/picture.h"
#include "tests/ui/dialog_template.h"
#include "tests/ui/ui_fixture.h"

// The program itself, as it stands in the guide. Its main function is not called, and may end without a result.
#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wreturn-type"
#define main GuideMain
#include "windows_guide.inc"
#undef main
#pragma GCC diagnostic pop

namespace {

// The pixels of a window with its frame.
void Photograph(const SWnd& window, SBitmap* picture) {
  const SRect place = window.GetWindowRect();
  ASSERT_TRUE(picture->CreatePixels(place.Width(), place.Height()));
  SMemoryDC memory;
  SSelectObject select(memory, *picture);
  const HDC dc = ::GetWindowDC(window.m_hWnd);
  EXPECT_TRUE(::BitBlt(memory, 0, 0, place.Width(), place.Height(), dc, 0, 0, SRCCOPY));
  ::ReleaseDC(window.m_hWnd, dc);
  GdiFlush();
}

// Compares with the kept picture; some pixels of glyphs may differ with the version of the fonts.
void Check(const char* name, const SBitmap& drawn) {
#ifdef _WIN32
  const SString target = WTEXT("-windows.png");
#else
  const SString target = WTEXT("-linux.png");
#endif
  const SString file = SString(QXCORE_SOURCE_DIR "/docs/pictures/") + SString(name) + target;
  if (std::getenv("QXCORE_WRITE_EXPECTED")) {
    ASSERT_EQ(SWritePicture(file, drawn), S_OK);
  }
  SBitmap kept;
  ASSERT_EQ(SReadPicture(file, &kept), S_OK);
  ASSERT_EQ(kept.GetSize(), drawn.GetSize());
  const int all = kept.GetSize().cx * kept.GetSize().cy;
  int different = 0;
  for (int i = 0; i < all; ++i) different += (drawn.GetBits()[i] & 0xFFFFFF) != (kept.GetBits()[i] & 0xFFFFFF);
  EXPECT_LT(different, all / 50) << name;
}

class Pictures : public test::UiTest {
 protected:
  SetInteractiveMode m_shown{kInteractiveShow};
};

TEST_F(Pictures, TheGuidesProgram) {
  class Photographed : public CircleApp {
   public:
    int OnIdle(long count) override {
      if (count == 0 && m_mainWnd != nullptr) {
        // The key has cleared the view: a click more, for the picture.
        static_cast<SFrameWnd*>(m_mainWnd)->GetActiveView()->SendMessageW(WM_LBUTTONDOWN, MK_LBUTTON,
                                                                          MAKELPARAM(140, 110));
        m_mainWnd->UpdateWindow();
        Photograph(*m_mainWnd, &m_picture);
      }
      return CircleApp::OnIdle(count);
    }
    SBitmap m_picture;
  } app;
  ASSERT_TRUE(app.Init(nullptr, nullptr, nullptr, SW_SHOW));
  ASSERT_TRUE(app.InitInstance());
  EXPECT_EQ(app.Run(), 0);
  Check("circles", app.m_picture);
}

TEST_F(Pictures, ADialogBoxWithControls) {
  constexpr WORD kButton = 0x80, kEdit = 0x81, kStatic = 0x82, kScrollBar = 0x84;
  test::DialogTemplate made(WTEXT("Controls"), WS_POPUP | WS_CAPTION | WS_SYSMENU | DS_MODALFRAME);
  made.Item(kStatic, WTEXT("&Name of the model:"), SS_LEFT, 101, 6)
      .Item(kEdit, WTEXT("first draft"), WS_BORDER | WS_TABSTOP, 102, 20)
      .Item(kButton, WTEXT("&Checked"), BS_AUTOCHECKBOX, 103, 36)
      .Item(kButton, WTEXT("&Radio"), BS_AUTORADIOBUTTON, 104, 50)
      .Item(kScrollBar, WTEXT(""), SBS_HORZ, 105, 66)
      .Item(kButton, WTEXT("Frame"), BS_GROUPBOX, 106, 6)
      .Item(kButton, WTEXT("OK"), BS_DEFPUSHBUTTON, IDOK, 20)
      .Item(kButton, WTEXT("Cancel"), BS_PUSHBUTTON, IDCANCEL, 36)
      .Item(kButton, WTEXT("Disabled"), BS_PUSHBUTTON | WS_DISABLED, 107, 52);
  test::App app;
  SDlg dialog;
  ASSERT_TRUE(dialog.CreateDlgIndirect(made.Data()));
  dialog.MoveWindow(SRect(60, 60, 340, 260));
  const auto place = [&](int id, int x, int y, int width, int height) {
    dialog.GetDlgItem(id)->MoveWindow(SRect(x, y, x + width, y + height));
  };
  place(101, 12, 10, 130, 16);
  place(102, 12, 30, 130, 22);
  place(103, 12, 62, 130, 18);
  place(104, 12, 84, 130, 18);
  place(105, 12, 112, 130, 17);
  place(106, 154, 8, 112, 130);
  place(IDOK, 166, 30, 86, 26);
  place(IDCANCEL, 166, 62, 86, 26);
  place(107, 166, 94, 86, 26);
  dialog.GetDlgItem(103)->SendMessageW(BM_SETCHECK, BST_CHECKED);
  dialog.GetDlgItem(104)->SendMessageW(BM_SETCHECK, BST_CHECKED);
  SScrollBar bar;
  ASSERT_TRUE(bar.SubclassWindow(::GetDlgItem(dialog.m_hWnd, 105)));
  bar.SetRange(0, 100);
  bar.SetPos(40);
  SProgressCtrl progress;
  ASSERT_TRUE(progress.Create(WS_VISIBLE, SRect(12, 142, 142, 158), &dialog, 108));
  progress.SetPos(60);
  dialog.ShowWindow(SW_SHOW);
  dialog.GetDlgItem(IDCANCEL)->SetFocus();
  test::PumpAll();
  dialog.UpdateWindow();
  SBitmap picture;
  Photograph(dialog, &picture);
  dialog.DestroyWindow();
  Check("controls", picture);
}

}  // namespace
