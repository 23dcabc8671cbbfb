// Contexts and drawing objects: who owns what, what a scope brings back, and what stale handles do.
#include <gtest/gtest.h>

#include <random>

#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/brush.h"
#include "qxcore/graphics/dc.h"
#include "qxcore/graphics/font.h"
#include "qxcore/graphics/image_list.h"
#include "qxcore/graphics/pen.h"
#include "qxcore/graphics/region.h"
#include "tests/support/text.h"

namespace {

TEST(Rectangles, AgreeWithTheSystemsCalls) {
  std::mt19937 random(1);
  auto number = [&] { return static_cast<int>(random() % 21) - 10; };
  for (int i = 0; i < 20000; ++i) {
    SRect a(number(), number(), number(), number()), b(number(), number(), number(), number());
    RECT expected;
    IntersectRect(&expected, a, b);
    ASSERT_EQ(a & b, expected);
    ASSERT_EQ(a.Intersects(b), IntersectRect(&expected, a, b) != 0);
    UnionRect(&expected, a, b);
    ASSERT_EQ(a | b, expected);
    ASSERT_EQ(a.IsEmpty(), IsRectEmpty(a) != 0);
    SPoint point(number(), number());
    ASSERT_EQ(a.Contains(point), PtInRect(a, point) != 0);
    SRect moved = a;
    InflateRect(moved, 2, -3);
    SRect inflated = a;
    inflated.Inflate(2, -3);
    ASSERT_EQ(inflated, moved);
    SRect ordered = a;
    ordered.Normalize();
    ASSERT_TRUE(ordered.Width() >= 0 && ordered.Height() >= 0);
    ASSERT_EQ(ordered.Width(), std::abs(a.Width()));
    ASSERT_EQ((a + SSize(3, 4)) - SSize(3, 4), a);
    ASSERT_EQ(SRect(a.TopLeft(), a.Size()), a);
  }
  EXPECT_EQ(SRect(0, 0, 5, 4).CenterPoint(), SPoint(2, 2));
  EXPECT_EQ(SPoint::FromLParam(MAKELPARAM(-2, 7)), SPoint(-2, 7));
}

TEST(DrawingObjects, OwnTheirHandles) {
  HGDIOBJ pen, brush;
  {
    SPen owned(PS_SOLID, 1, RGB(1, 2, 3));
    SBrush first(RGB(4, 5, 6));
    pen = owned.GetSafeHandle();
    brush = first.GetSafeHandle();
    EXPECT_EQ(GetObjectType(pen), static_cast<DWORD>(OBJ_PEN));
    EXPECT_TRUE(first.CreateSolidBrush(RGB(7, 8, 9)));
    EXPECT_EQ(GetObjectType(brush), 0u) << "the former one is deleted";
    brush = first.GetSafeHandle();
    first.Detach();
    LOGPEN description;
    ASSERT_TRUE(owned.GetLogPen(&description));
    EXPECT_EQ(description.lopnColor, static_cast<COLORREF>(RGB(1, 2, 3)));
  }
  EXPECT_EQ(GetObjectType(pen), 0u);
  EXPECT_EQ(GetObjectType(brush), static_cast<DWORD>(OBJ_BRUSH)) << "given up";
  EXPECT_TRUE(DeleteObject(brush));
  EXPECT_FALSE(DeleteObject(brush));
  const SPen* volatile none = nullptr;
  EXPECT_EQ(none->GetSafeHandle(), nullptr);
}

TEST(DrawingObjects, ASelectedObjectOutlivesItsHandle) {
  SBitmap bitmap;
  ASSERT_TRUE(bitmap.CreatePixels(4, 4));
  SMemoryDC dc;
  SSelectObject selectBitmap(dc, bitmap);
  {
    SBrush brush(RGB(10, 20, 30));
    SSelectObject select(dc, brush);
    EXPECT_TRUE(brush.DeleteObject());
    EXPECT_TRUE(dc.PatBlt(SRect(0, 0, 4, 4), PATCOPY));
    GdiFlush();
    EXPECT_EQ(bitmap.GetBits()[5] & 0xFFFFFF, 0x0A141Eu) << "still drawn with";
  }
  EXPECT_EQ(dc.GetCurrentObject(OBJ_BRUSH), GetStockObject(WHITE_BRUSH)) << "and gone with the scope";
}

TEST(DrawingObjects, StockObjectsCannotBeDeleted) {
  for (int index : {WHITE_BRUSH, BLACK_PEN, NULL_BRUSH, DEFAULT_GUI_FONT}) {
    HGDIOBJ object = GetStockObject(index);
    DWORD type = GetObjectType(object);
    DeleteObject(object);
    EXPECT_NE(type, 0u);
    EXPECT_EQ(GetObjectType(GetStockObject(index)), type);
  }
}

TEST(DrawingObjects, ABitmapIsSelectedIntoOneContext) {
  SBitmap bitmap;
  ASSERT_TRUE(bitmap.CreatePixels(4, 4));
  SMemoryDC one, two;
  {
    SSelectObject select(one, bitmap);
    ASSERT_TRUE(static_cast<bool>(select));
    EXPECT_EQ(two.SelectObject(bitmap), nullptr);
  }
  SSelectObject select(two, bitmap);
  EXPECT_TRUE(static_cast<bool>(select)) << "the scope gave it back";
}

TEST(DrawingObjects, HandlesFindTheirObjects) {
  SPen pen(PS_SOLID, 1, 0);
  EXPECT_EQ(SGdiObject::FromHandle(pen), &pen);
  HBRUSH raw = CreateSolidBrush(0);
  SGdiObject* temporary = SGdiObject::FromHandle(raw);
  ASSERT_NE(temporary, nullptr);
  EXPECT_EQ(SGdiObject::FromHandle(raw), temporary);
  EXPECT_EQ(SGdiObject::FromHandlePermanent(raw), nullptr);
  SGdiObject::DeleteTempMap();
  EXPECT_EQ(GetObjectType(raw), static_cast<DWORD>(OBJ_BRUSH)) << "a temporary object does not own";
  DeleteObject(raw);
  EXPECT_EQ(SGdiObject::FromHandle(nullptr), nullptr);

  SFontOld font;
  LOGFONTW description{};
  font.CreateFontIndirectW(&description);
  EXPECT_EQ(SFontOld::FromHandle(font), &font);
  SMemoryDC dc;
  EXPECT_EQ(SDC::FromHandle(dc), &dc);
  HDC handle = dc.Detach();
  EXPECT_NE(SDC::FromHandle(handle), &dc);
  SDC::DeleteTempMap();
  EXPECT_TRUE(DeleteDC(handle));
}

TEST(Contexts, AScopeBringsAllSettingsBack) {
  SMemoryDC dc;
  SBitmap bitmap;
  bitmap.CreatePixels(30, 30);
  SSelectObject select(dc, bitmap);
  dc.SetTextColor(RGB(1, 1, 1));
  SRect whole = dc.GetClipBox();
  {
    SSaveDC save(dc);
    SBrush brush(0);
    dc.SelectObject(brush);
    dc.SetTextColor(RGB(2, 2, 2));
    dc.SetViewportOrg(SPoint(5, 6));
    dc.IntersectClipRect(SRect(0, 0, 4, 4));
    EXPECT_EQ(dc.GetClipBox(), SRect(0, 0, 4, 4));
    SSaveDC inner(dc);
    dc.SetROP2(R2_NOT);
  }
  EXPECT_EQ(dc.GetTextColor(), static_cast<COLORREF>(RGB(1, 1, 1)));
  EXPECT_EQ(dc.GetClipBox(), whole);
  EXPECT_EQ(dc.GetROP2(), R2_COPYPEN);
  EXPECT_EQ(dc.GetCurrentObject(OBJ_BRUSH), GetStockObject(WHITE_BRUSH));
  EXPECT_FALSE(dc.RestoreDC(1)) << "nothing is saved any more";
}

TEST(Contexts, VisibleIsWhatTheClipRegionHolds) {
  SMemoryDC dc;
  SBitmap bitmap;
  bitmap.CreatePixels(30, 30);
  SSelectObject select(dc, bitmap);
  dc.IntersectClipRect(SRect(10, 10, 20, 20));
  EXPECT_TRUE(dc.RectVisible(SRect(19, 19, 40, 40)));
  EXPECT_FALSE(dc.RectVisible(SRect(20, 10, 30, 20))) << "touching only";
  EXPECT_FALSE(dc.RectVisible(SRect(12, 12, 12, 15))) << "empty";
  EXPECT_FALSE(dc.RectVisible(SRect(0, 0, 5, 5)));
}

TEST(Contexts, StaleAndForeignHandlesAreRefused) {
  SMemoryDC dc;
  HDC stale = dc;
  dc.DeleteDC();
  RECT rect{0, 0, 1, 1};
  EXPECT_EQ(SetBkColor(stale, 0), CLR_INVALID);
  EXPECT_FALSE(ExtTextOutW(stale, 0, 0, ETO_OPAQUE, &rect, WTEXT(""), 0, nullptr));
  EXPECT_EQ(SaveDC(stale), 0);
  EXPECT_FALSE(DeleteDC(stale));
  SMemoryDC live;
  EXPECT_EQ(live.SelectObject(reinterpret_cast<HGDIOBJ>(static_cast<INT_PTR>(0x12345678))), nullptr);
}

TEST(ImageLists, DrawWhatTheMaskLeaves) {
  SBitmap images, canvas;
  images.CreatePixels(8, 4);
  for (int i = 0; i < 32; ++i) images.GetBits()[i] = i % 2 ? 0xFF00FFu : static_cast<std::uint32_t>(i);
  SImageList list;
  ASSERT_TRUE(list.Create(4, 4));
  EXPECT_EQ(list.AddMasked(images, RGB(255, 0, 255)), 0);
  EXPECT_EQ(list.GetImageCount(), 2);
  EXPECT_EQ(list.GetImageSize(), SSize(4, 4));
  canvas.CreatePixels(6, 6);
  SMemoryDC dc;
  SSelectObject select(dc, canvas);
  dc.PatBlt(SRect(0, 0, 6, 6), WHITENESS);
  EXPECT_TRUE(list.Draw(dc, 1, SPoint(1, 1), ILD_TRANSPARENT));
  GdiFlush();
  EXPECT_EQ(canvas.GetBits()[1 * 6 + 1] & 0xFFFFFF, 4u);
  EXPECT_EQ(canvas.GetBits()[1 * 6 + 2] & 0xFFFFFF, 0xFFFFFFu);
  EXPECT_EQ(canvas.GetBits()[0] & 0xFFFFFF, 0xFFFFFFu);
  EXPECT_FALSE(list.Draw(dc, 2, SPoint(0, 0)));
  EXPECT_TRUE(list.Remove(-1));
  EXPECT_EQ(list.GetImageCount(), 0);
  const HIMAGELIST former = list.m_hImageList;
  EXPECT_EQ(SImageList::FromHandlePermanent(former), &list);
  EXPECT_TRUE(list.DeleteImageList());
  EXPECT_EQ(list.m_hImageList, nullptr);
  EXPECT_EQ(SImageList::FromHandlePermanent(former), nullptr);
  EXPECT_FALSE(list.DeleteImageList());
  EXPECT_TRUE(list.Create(2, 3));
  EXPECT_EQ(list.GetImageSize(), SSize(2, 3));
}

// A point goes to (point - window's origin) * viewport's extent / window's extent + viewport's origin, and back; each
// setting answers with the one before.
TEST(Contexts, PointsAreMappedByOriginsAndExtents) {
  SMemoryDC dc;
  EXPECT_EQ(dc.SetMapMode(MM_ANISOTROPIC), MM_TEXT);
  SSize window(1, 1), viewport(1, 1);
  SPoint windowOrigin, viewportOrigin;
  for (const int scale : {1, 3, -2}) {
    const SSize extent(7 + scale, 11), drawn(extent.cx * scale, extent.cy * -scale);
    EXPECT_EQ(dc.SetWindowExt(extent), window);
    EXPECT_EQ(dc.SetViewportExt(drawn), viewport);
    const SPoint from(scale * 5, -4), to(9, scale * 8);
    EXPECT_EQ(dc.SetWindowOrg(from), windowOrigin);
    EXPECT_EQ(dc.SetViewportOrg(to), viewportOrigin);
    const SSize further(2, scale);
    EXPECT_EQ(dc.OffsetViewportOrg(further), to);
    window = extent, viewport = drawn, windowOrigin = from, viewportOrigin = to + further;
    for (const SPoint& point : {SPoint(0, 0), SPoint(13, -6), from}) {
      const SPoint mapped(viewportOrigin.x + (point.x - from.x) * scale, viewportOrigin.y - (point.y - from.y) * scale);
      SPoint there = point;
      ASSERT_TRUE(dc.LPtoDP(&there, 1));
      EXPECT_EQ(there, mapped) << scale;
      ASSERT_TRUE(dc.DPtoLP(&there, 1));
      EXPECT_EQ(there, point) << scale;
    }
  }
}

TEST(Fonts, SizesAndStyles) {
  SFont font;
  ASSERT_TRUE(font.Create(WTEXT("Liberation Sans"), 12, SFont::kBold + SFont::kUnderline, 96));
  EXPECT_EQ(font.GetFaceName(), WTEXT("Liberation Sans"));
  EXPECT_EQ(font.GetPointSize(96), 12);
  EXPECT_EQ(font.GetStyle(), static_cast<unsigned>(SFont::kBold + SFont::kUnderline));
  EXPECT_FALSE(font.Create(WTEXT("Liberation Sans"), 3, 0));
  EXPECT_EQ(font.GetSafeHandle(), nullptr);
}

// Widths are sums of the characters' widths; marks add none, and a line's height is ascent and descent.
TEST(Texts, ExtentsAddUp) {
  SMemoryDC dc;
  SFont font;
  ASSERT_TRUE(font.Create(WTEXT("Liberation Sans"), 10, 0, 96));
  SSelectObject select(dc, font);
  TEXTMETRICW metrics;
  ASSERT_TRUE(dc.GetTextMetricsW(&metrics));
  EXPECT_EQ(metrics.tmHeight, metrics.tmAscent + metrics.tmDescent);
  int sum = 0;
  SString text(WTEXT("Sphinx of black quartz"));
  for (WCHAR character : text) sum += dc.GetTextExtent(SStringView(&character, 1)).cx;
  EXPECT_EQ(dc.GetTextExtent(text), SSize(sum, metrics.tmHeight));
  EXPECT_EQ(dc.GetTextExtent(SStringView()).cx, 0);
  int widths[3];
  ASSERT_TRUE(GetCharWidth32W(dc, 'a', 'c', widths));
  EXPECT_EQ(widths[0] + widths[1] + widths[2], dc.GetTextExtent(WTEXT("abc")).cx);
}

}  // namespace
