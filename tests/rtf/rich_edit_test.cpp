// The rich-edit control, and the hidden one of documents.

#include "qxcore/ui/control/rich_edit.h"

#include <gtest/gtest.h>

#include <string>

#include "qxcore/ui/app/application.h"
#include "qxcore/ui/frame/frame.h"
#include "qxcore/ui/rtf/document.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"

namespace {

// An application, so that there is a frame to be the owner window.
class RichEdit : public testing::Test {
 protected:
  void SetUp() override {
    SWnd::DeleteTempMap();
    ASSERT_TRUE(frame.Create(nullptr, WTEXT("frame"), WS_OVERLAPPEDWINDOW, SRect(0, 0, 300, 200)));
    app.m_mainWnd = &frame;
    ASSERT_TRUE(edit.Create(WS_VISIBLE | ES_MULTILINE, SRect(0, 0, 200, 100), &frame, 7));
  }
  void TearDown() override {
    if (frame.m_hWnd != nullptr) frame.DestroyWindow();
    app.m_mainWnd = nullptr;
  }

  // The bounds of the selection.
  std::string Selection() const {
    long start, end;
    edit.GetSel(&start, &end);
    return std::to_string(start) + "-" + std::to_string(end);
  }
  DWORD EffectsOf(long start, long end, DWORD* common = nullptr) {
    edit.SetSel(start, end);
    CHARFORMAT2W format = {};
    const DWORD mask = edit.GetSelectionCharFormat(format);
    if (common != nullptr) *common = mask;
    return format.dwEffects;
  }

  struct Frame : SFrameWnd {
    void PostNcDestroy() override {}
  };
  SWinApp app;
  Frame frame;
  SRichEditCtrl edit;
};

TEST_F(RichEdit, ContentGoesInAndComesOut) {
  EXPECT_EQ(edit.GetParent(), &frame);
  EXPECT_EQ(edit.GetDlgCtrlID(), 7);
  EXPECT_EQ(edit.SetPlainText(WTEXT("one\r\ntwo \x4E2D")), 1);
  EXPECT_EQ(edit.GetPlainText(), WTEXT("one\r\ntwo \x4E2D"));
  EXPECT_EQ(edit.GetTextLength(), 9);
  SString text;
  edit.GetWindowTextW(&text);
  EXPECT_EQ(text, WTEXT("one\r\ntwo \x4E2D"));
  EXPECT_EQ(edit.SetTextMode(TM_PLAINTEXT), 0);  // there is a text

  EXPECT_EQ(edit.SetRtf(WTEXT("{\\rtf1\\ansi a\\b b\\b0 c\\par d}")), 1);
  EXPECT_EQ(edit.GetPlainText(), WTEXT("abc\r\nd"));
  EXPECT_TRUE(edit.GetRtf().IsRtf());
  EXPECT_EQ(edit.SetRtf(WTEXT("no RTF")), 0);
}

TEST_F(RichEdit, SelectionsAreReplaced) {
  edit.SetPlainText(WTEXT("one\r\ntwo\r\nthree"));
  edit.SetSel(2, 5);
  EXPECT_EQ(Selection(), "2-5");
  EXPECT_EQ(edit.GetSelText(), WTEXT("e\r\nt"));
  EXPECT_EQ(edit.GetModify(), 0);
  edit.ReplaceSel(WTEXT("X\r\nY"));
  EXPECT_EQ(edit.GetPlainText(), WTEXT("onX\r\nYwo\r\nthree"));
  EXPECT_EQ(Selection(), "5-5");
  EXPECT_NE(edit.GetModify(), 0);
  edit.SetModify(0);
  edit.SetSel(100, 200);
  edit.ReplaceSel(WTEXT("!"));
  EXPECT_EQ(edit.GetPlainText(), WTEXT("onX\r\nYwo\r\nthree!"));
  edit.SetSel(0, -1);
  edit.ReplaceSel(WTEXT(""));
  EXPECT_EQ(edit.GetPlainText(), WTEXT(""));
  EXPECT_EQ(edit.GetSelText(), WTEXT(""));
  EXPECT_NE(edit.GetModify(), 0);
}

TEST_F(RichEdit, CharactersHaveFormats) {
  edit.SetRtf(
      WTEXT("{\\rtf1\\ansi{\\fonttbl{\\f0\\fswiss\\fcharset0 Arial;}{\\f1\\froman\\fcharset204 Times;}}"
            "{\\colortbl;\\red255\\green0\\blue16;}\\plain\\f0\\fs20 ab\\f1\\b\\cf1 cd\\plain\\f0\\fs20 ef}"));
  edit.SetSel(2, 4);
  CHARFORMAT2W format = {};
  EXPECT_NE(edit.GetSelectionCharFormat(format) & CFM_FACE, 0u);
  EXPECT_EQ(SString(format.szFaceName), WTEXT("Times"));
  EXPECT_EQ(format.bCharSet, 204);
  EXPECT_EQ(format.yHeight, 200);
  EXPECT_EQ(format.crTextColor, RGB(255, 0, 16));
  EXPECT_EQ(format.dwEffects & (CFE_BOLD | CFE_ITALIC | CFE_AUTOCOLOR), static_cast<DWORD>(CFE_BOLD));
  DWORD common;
  EffectsOf(1, 3, &common);
  EXPECT_EQ(common & (CFM_BOLD | CFM_FACE | CFM_COLOR | CFM_SIZE), static_cast<DWORD>(CFM_SIZE));

  format = {};
  format.dwMask = CFM_ITALIC | CFM_SIZE | CFM_COLOR | CFM_FACE;
  format.dwEffects = CFE_ITALIC;
  format.yHeight = 300;
  format.crTextColor = RGB(0, 128, 0);
  SString(WTEXT("Courier")).View().copy(format.szFaceName, LF_FACESIZE - 1);
  edit.SetSel(1, 3);
  EXPECT_NE(edit.SetSelectionCharFormat(format), 0);
  EXPECT_EQ(edit.GetPlainText(), WTEXT("abcdef"));
  EXPECT_EQ(EffectsOf(0, 1) & CFE_ITALIC, 0u);
  EXPECT_EQ(EffectsOf(1, 2) & (CFE_ITALIC | CFE_BOLD), static_cast<DWORD>(CFE_ITALIC));
  EXPECT_EQ(EffectsOf(2, 3) & (CFE_ITALIC | CFE_BOLD), static_cast<DWORD>(CFE_ITALIC | CFE_BOLD));
  EXPECT_EQ(EffectsOf(3, 4) & (CFE_ITALIC | CFE_BOLD), static_cast<DWORD>(CFE_BOLD));

  // The formats survive RTF, and text that is put in has that of its place.
  SRichEditCtrl other;
  ASSERT_TRUE(other.Create(ES_MULTILINE, SRect(0, 0, 200, 100), &frame, 8));
  EXPECT_EQ(other.SetRtf(edit.GetRtf()), 1);
  other.SetSel(1, 2);
  other.ReplaceSel(WTEXT("new"));
  other.SetSel(1, 5);
  format = {};
  EXPECT_NE(other.GetSelectionCharFormat(format) & CFM_FACE, 0u);
  EXPECT_EQ(SString(format.szFaceName), WTEXT("Courier"));
  EXPECT_EQ(format.yHeight, 300);
  EXPECT_EQ(format.crTextColor, RGB(0, 128, 0));

  // Of an empty selection the format is that of what comes next; of all it is that of every character.
  format.dwMask = CFM_UNDERLINE;
  format.dwEffects = CFE_UNDERLINE;
  edit.SetSel(6, 6);
  edit.SetSelectionCharFormat(format);
  edit.ReplaceSel(WTEXT("g"));
  EXPECT_NE(EffectsOf(6, 7) & CFE_UNDERLINE, 0u);
  EXPECT_EQ(EffectsOf(5, 6) & CFE_UNDERLINE, 0u);
  edit.SetAllCharFormat(format);
  EXPECT_NE(EffectsOf(0, 7, &common) & common & CFE_UNDERLINE, 0u);
}

struct Bytes {
  std::string bytes;
  static DWORD CALLBACK Take(DWORD_PTR cookie, BYTE* buffer, LONG size, LONG* moved) {
    reinterpret_cast<Bytes*>(cookie)->bytes.append(reinterpret_cast<char*>(buffer), static_cast<std::size_t>(size));
    *moved = size;
    return 0;
  }
  // One byte at a time, but the first six at once: Wine looks for the sign of RTF there alone.
  static DWORD CALLBACK Give(DWORD_PTR cookie, BYTE* buffer, LONG, LONG* moved) {
    std::string& rest = reinterpret_cast<Bytes*>(cookie)->bytes;
    const std::size_t count = rest.copy(reinterpret_cast<char*>(buffer), rest.compare(0, 5, "{\\rtf") == 0 ? 6 : 1);
    *moved = static_cast<LONG>(count);
    rest.erase(0, count);
    return 0;
  }
  static DWORD CALLBACK Refuse(DWORD_PTR, BYTE*, LONG, LONG*) { return 5; }
};

TEST_F(RichEdit, StreamsMoveTheSelection) {
  edit.SetRtf(WTEXT(
      "{\\rtf1\\ansi{\\fonttbl{\\f0\\fswiss Arial;}}{\\colortbl;\\red1\\green2\\blue3;}\\f0 ab\\b\\cf1 cd\\par e}"));
  edit.SetSel(2, 4);
  Bytes piece;
  EDITSTREAM stream = {reinterpret_cast<DWORD_PTR>(&piece), 0, &Bytes::Take};
  edit.StreamOut(SF_RTF | SFF_SELECTION, stream);
  EXPECT_EQ(stream.dwError, 0u);

  SRichEditCtrl other;
  ASSERT_TRUE(other.Create(ES_MULTILINE, SRect(0, 0, 200, 100), &frame, 8));
  other.SetRtf(WTEXT("{\\rtf1\\ansi{\\fonttbl{\\f0\\froman Times;}}{\\colortbl;\\red9\\green9\\blue9;}\\f0\\cf1 xyz}"));
  other.SetSel(1, 2);
  stream = {reinterpret_cast<DWORD_PTR>(&piece), 0, &Bytes::Give};
  other.StreamIn(SF_RTF | SFF_SELECTION, stream);
  EXPECT_EQ(stream.dwError, 0u);
  const SString text = other.GetPlainText();
  EXPECT_EQ(text.Left(3), WTEXT("xcd"));
  EXPECT_EQ(text.Right(1), WTEXT("z"));
  CHARFORMAT2W format = {};
  other.SetSel(1, 3);
  other.GetSelectionCharFormat(format);
  EXPECT_EQ(SString(format.szFaceName), WTEXT("Arial"));
  EXPECT_EQ(format.crTextColor, RGB(1, 2, 3));
  other.SetSel(0, 1);
  other.GetSelectionCharFormat(format);
  EXPECT_EQ(SString(format.szFaceName), WTEXT("Times"));
  EXPECT_EQ(format.crTextColor, RGB(9, 9, 9));

  stream = {0, 0, &Bytes::Refuse};
  other.StreamIn(SF_RTF, stream);
  EXPECT_EQ(stream.dwError, 5u);
}

TEST_F(RichEdit, PlainTextIsStreamedInUpToTheLimit) {
  if (IsWine()) GTEST_SKIP() << "Wine's control takes any length";
  const auto kept = [this](long size) {
    Bytes plain{std::string(static_cast<std::size_t>(size), 'x')};
    EDITSTREAM stream = {reinterpret_cast<DWORD_PTR>(&plain), 0, &Bytes::Give};
    edit.StreamIn(SF_TEXT, stream);
    return edit.GetTextLength();
  };
  EXPECT_EQ(kept(33000), 32767) << "at the start";
  for (const long limit : {5L, 600L, 40000L}) {
    edit.SetTextLimit(limit);
    EXPECT_EQ(kept(limit + 100), limit);
    EXPECT_EQ(kept(limit - 1), limit - 1);
  }
}

// The hidden control hangs below the owner window and goes with it; the document makes another one.
TEST_F(RichEdit, TheHiddenControlBelongsToTheOwnerWindow) {
  edit.DestroyWindow();
  SRtfDocument document;
  SString text;
  EXPECT_EQ(document.RtfToText(&text, WTEXT("{\\rtf1 a\\b b}")), 1);
  EXPECT_EQ(text, WTEXT("ab"));
  const HWND hidden = ::GetWindow(frame.m_hWnd, GW_CHILD);
  ASSERT_NE(hidden, nullptr);
  EXPECT_EQ(::GetWindowLongPtrW(hidden, GWL_STYLE) & WS_VISIBLE, 0);
  document.CreateEditCtrl();
  EXPECT_EQ(::GetWindow(hidden, GW_HWNDNEXT), nullptr);

  frame.DestroyWindow();
  app.m_mainWnd = nullptr;
  EXPECT_FALSE(::IsWindow(hidden));
  EXPECT_EQ(document.RtfToText(&text, WTEXT("{\\rtf1 again}")), 1);
  EXPECT_EQ(text, WTEXT("again"));
  EXPECT_NE(::GetWindow(SDummyWindow()->m_hWnd, GW_CHILD), nullptr);
  document.DeleteEditCtrl();
  EXPECT_EQ(::GetWindow(SDummyWindow()->m_hWnd, GW_CHILD), nullptr);
}

}  // namespace
