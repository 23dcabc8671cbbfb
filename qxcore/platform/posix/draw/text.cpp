// Text: drawn with FreeType's masks, measured by the same glyphs.
#include <cmath>
#include <cstring>

#include "qxcore/platform/posix/draw/blend.h"
#include "qxcore/platform/posix/draw/fill.h"
#include "qxcore/platform/posix/draw/font_object.h"
#include "qxcore/platform/posix/draw/recorder.h"
#include "qxcore/platform/posix/draw/text_layout.h"

namespace draw {

namespace {

// The selected font at the size that the mapping makes of it; null when there is no font at all.
SizedFace* FaceOf(const Context& dc) {
  const Mapping& map = dc.Map();
  if (map.shiftOnly) return dc.m_settings.font->Face();
  return SizedFace::For(dc.m_settings.font->m_description, std::fabs(map.scaleX), std::fabs(map.scaleY));
}

// A size in pixels as logical units.
int ToLogicalX(const Context& dc, int pixels) {
  return dc.Map().shiftOnly ? pixels : Mapping::Round(pixels / std::fabs(dc.Map().scaleX));
}
int ToLogicalY(const Context& dc, int pixels) {
  return dc.Map().shiftOnly ? pixels : Mapping::Round(pixels / std::fabs(dc.Map().scaleY));
}

int TotalOf(const std::vector<PlacedGlyph>& line) {
  int width = 0;
  for (const PlacedGlyph& placed : line) width += placed.advance;
  return width;
}

// Where the text's box begins for a reference point, as the alignment says.
POINT CornerOf(const Context& dc, const TEXTMETRICW& metrics, POINT at, int width) {
  UINT align = dc.m_settings.textAlign;
  if ((align & TA_CENTER) == TA_CENTER)
    at.x -= width / 2;
  else if (align & TA_RIGHT)
    at.x -= width;
  if ((align & TA_BASELINE) == TA_BASELINE)
    at.y -= metrics.tmAscent;
  else if (align & TA_BOTTOM)
    at.y -= metrics.tmHeight;
  return at;
}

// The position moves behind the text, where the alignment asks for it.
void MovePosition(Context& dc, int width) {
  UINT align = dc.m_settings.textAlign;
  if (!(align & TA_UPDATECP) || (align & TA_CENTER) == TA_CENTER) return;
  dc.m_settings.position.x += (align & TA_RIGHT ? -1 : 1) * ToLogicalX(dc, width);
}

// Draws the glyphs from a pen position within one box.
void DrawGlyphs(const Context& dc, const Box& clip, const std::vector<PlacedGlyph>& line, POINT pen,
                std::uint32_t pixel) {
  for (const PlacedGlyph& placed : line) {
    if (placed.glyph->width)
      BlendGlyph(dc.m_surface, clip, pen.x + placed.glyph->left, pen.y - placed.glyph->top, *placed.glyph, pixel);
    pen.x += placed.advance;
  }
}

void DrawRules(const Context& dc, const Box& clip, const SizedFace& face, POINT pen, int width, const Paint& paint) {
  const LOGFONTW& font = dc.m_settings.font->m_description;
  auto rule = [&](int top) {
    PaintBox(dc, Intersect(clip, {pen.x, top, pen.x + width, top + face.m_underlineThick}), paint, R2_COPYPEN);
  };
  if (font.lfUnderline) rule(pen.y + face.m_underlineAt);
  if (font.lfStrikeOut) rule(pen.y - face.m_strikeAt);
}

// How far glyphs may reach beyond the box of their text.
Box Reach(const Box& box, const TEXTMETRICW& metrics) {
  int around = metrics.tmMaxCharWidth + metrics.tmHeight;
  return {box.x1 - around, box.y1 - around, box.x2 + around, box.y2 + around};
}

void DrawLineOfText(Context& dc, POINT at, UINT options, const Box* rect, SStringView text, const int* advances) {
  SizedFace* face = FaceOf(dc);
  if (!face) return;
  bool rightToLeft = options & ETO_RTLREADING || dc.m_settings.textAlign & TA_RTLREADING;
  std::vector<PlacedGlyph> line = LayOut(*face, text, advances, rightToLeft);
  int width = TotalOf(line);
  const TEXTMETRICW& metrics = face->Metrics();
  POINT corner = CornerOf(dc, metrics, at, width);
  Box box{corner.x, corner.y, corner.x + width, corner.y + metrics.tmHeight};
  Box reach = Reach(box, metrics);
  if (options & ETO_CLIPPED && rect) {
    reach = Intersect(reach, *rect);
    box = Intersect(box, *rect);
  }
  if (dc.m_settings.bkMode == OPAQUE && !IsEmpty(box))
    PaintBox(dc, box, SolidPaint(dc, dc.m_settings.bkColor), R2_COPYPEN);
  POINT pen{corner.x, corner.y + metrics.tmAscent};
  Paint ink = SolidPaint(dc, dc.m_settings.textColor);
  ForVisible(dc, reach, [&](const Box& part) { DrawGlyphs(dc, part, line, pen, ink.pixel); });
  DrawRules(dc, reach, *face, pen, width, ink);
  MovePosition(dc, width);
}

BOOL RecordText(Context& dc, int x, int y, UINT options, const RECT* rect, SStringView text, const int* advances) {
  std::vector<int> keptAdvances;
  if (advances) keptAdvances.assign(advances, advances + text.size());
  RECT keptRect = rect ? *rect : RECT{};
  dc.m_recorder->Add([=, hasRect = rect != nullptr, kept = std::basic_string<WCHAR>(text)](HDC to) {
    ExtTextOutW(to, x, y, options, hasRect ? &keptRect : nullptr, kept.data(), static_cast<UINT>(kept.size()),
                keptAdvances.empty() ? nullptr : keptAdvances.data());
  });
  return TRUE;
}

}  // namespace

}  // namespace draw

using namespace draw;

BOOL ExtTextOutW(HDC handle, int x, int y, UINT options, const RECT* rect, LPCWSTR text, UINT count,
                 const int* advances) try {
  auto* dc = Find<Context>(handle);
  if (!dc) return FALSE;
  SStringView view(text ? text : WTEXT(""), text ? count : 0);
  if (dc->m_recorder) [[unlikely]]
    return RecordText(*dc, x, y, options, rect, view, advances);
  Box box{};
  if (rect) box = dc->Map(*rect);
  if (rect && options & ETO_OPAQUE) PaintBox(*dc, box, SolidPaint(*dc, dc->m_settings.bkColor), R2_COPYPEN);
  if (view.empty() || options & ETO_GLYPH_INDEX) return TRUE;
  POINT at = dc->m_settings.textAlign & TA_UPDATECP ? dc->m_settings.position : POINT{x, y};
  DrawLineOfText(*dc, {dc->X(at.x), dc->Y(at.y)}, options, rect ? &box : nullptr, view, advances);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL TextOutW(HDC dc, int x, int y, LPCWSTR text, int count) {
  return ExtTextOutW(dc, x, y, 0, nullptr, text, static_cast<UINT>(std::max(count, 0)), nullptr);
}

// --- measuring ---

BOOL GetTextExtentPoint32W(HDC handle, LPCWSTR text, int count, SIZE* size) try {
  auto* dc = Find<Context>(handle);
  if (!dc || count < 0) return Fail(FALSE);
  SizedFace* face = FaceOf(*dc);
  if (!face) return Fail(FALSE, ERROR_FILE_NOT_FOUND);
  size->cx = ToLogicalX(*dc, WidthOf(*face, SStringView(text, static_cast<std::size_t>(count))));
  size->cy = ToLogicalY(*dc, face->Metrics().tmHeight);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL GetTextExtentExPointW(HDC handle, LPCWSTR text, int count, int maxExtent, int* fit, int* extents, SIZE* size) try {
  if (!GetTextExtentPoint32W(handle, text, count, size)) return FALSE;
  auto* dc = Find<Context>(handle);
  SizedFace* face = FaceOf(*dc);
  bool plain = IsPlain(text, static_cast<std::size_t>(count));
  int width = 0;
  for (int i = 0; i < count; ++i) {
    // Elsewhere a character's form and place depend on those before it.
    width =
        plain ? width + face->Of(text[i]).advance : WidthOf(*face, SStringView(text, static_cast<std::size_t>(i) + 1));
    int total = ToLogicalX(*dc, width);
    if (fit && total > maxExtent) {
      *fit = i;
      return TRUE;
    }
    if (extents) extents[i] = total;
  }
  if (fit) *fit = count;
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL GetCharWidth32W(HDC handle, UINT first, UINT last, int* widths) try {
  auto* dc = Find<Context>(handle);
  SizedFace* face = dc ? FaceOf(*dc) : nullptr;
  if (!face || last < first || last > 0x10FFFF) return Fail(FALSE);
  for (UINT character = first; character <= last; ++character) *widths++ = ToLogicalX(*dc, face->Of(character).advance);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

BOOL GetTextMetricsW(HDC handle, TEXTMETRICW* metrics) try {
  auto* dc = Find<Context>(handle);
  SizedFace* face = dc ? FaceOf(*dc) : nullptr;
  if (!face) return Fail(FALSE, dc ? ERROR_FILE_NOT_FOUND : ERROR_INVALID_HANDLE);
  *metrics = face->Metrics();
  const LOGFONTW& font = dc->m_settings.font->m_description;
  metrics->tmUnderlined = font.lfUnderline ? 255 : 0;
  metrics->tmStruckOut = font.lfStrikeOut ? 255 : 0;
  metrics->tmCharSet = font.lfCharSet == DEFAULT_CHARSET ? ANSI_CHARSET : font.lfCharSet;
  for (LONG* height : {&metrics->tmHeight, &metrics->tmAscent, &metrics->tmDescent, &metrics->tmInternalLeading,
                       &metrics->tmExternalLeading})
    *height = ToLogicalY(*dc, *height);
  for (LONG* width : {&metrics->tmAveCharWidth, &metrics->tmMaxCharWidth}) *width = ToLogicalX(*dc, *width);
  return TRUE;
} catch (const std::bad_alloc&) {
  return NoMemory(FALSE);
}

int GetTextFaceW(HDC handle, int count, LPWSTR name) try {
  auto* dc = Find<Context>(handle);
  SizedFace* face = dc ? FaceOf(*dc) : nullptr;
  if (!face) return 0;
  const std::string& family = face->File().family;
  int length = static_cast<int>(family.size()) + 1;
  if (!name) return length;
  if (count < 1) return Fail(0);
  int copied = std::min(length, count) - 1;
  for (int i = 0; i < copied; ++i) name[i] = static_cast<unsigned char>(family[static_cast<std::size_t>(i)]);
  name[copied] = 0;
  return copied + 1;
} catch (const std::bad_alloc&) {
  return NoMemory(0);
}

// --- fonts ---

HFONT CreateFontIndirectW(const LOGFONTW* font) {
  if (!font) return nullptr;
  return EnterAs<HFONT>(new FontObject(*font));
}

HFONT CreateFontW(int height, int width, int escapement, int orientation, int weight, DWORD italic, DWORD underline,
                  DWORD strikeOut, DWORD charSet, DWORD outPrecision, DWORD clipPrecision, DWORD quality,
                  DWORD pitchAndFamily, LPCWSTR face) {
  auto byte = [](DWORD value) { return static_cast<BYTE>(value); };
  LOGFONTW font{height,
                width,
                escapement,
                orientation,
                weight,
                byte(italic),
                byte(underline),
                byte(strikeOut),
                byte(charSet),
                byte(outPrecision),
                byte(clipPrecision),
                byte(quality),
                byte(pitchAndFamily),
                {}};
  for (int i = 0; face && face[i] && i < LF_FACESIZE - 1; ++i) font.lfFaceName[i] = face[i];
  return CreateFontIndirectW(&font);
}
