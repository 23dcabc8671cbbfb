#include "qxcore/platform/posix/draw/sized_face.h"

#include <ft2build.h>
#include FT_FREETYPE_H
#include FT_OUTLINE_H
#include FT_TRUETYPE_TABLES_H

#include <algorithm>
#include <cmath>
#include <cstring>
#include <map>
#include <mutex>
#include <tuple>

#include "qxcore/platform/posix/draw/font_object.h"

namespace draw {

namespace {

// FreeType's objects are used by one thread at a time.
std::recursive_mutex g_lock;

FT_Library TheLibrary() {
  static const FT_Library library = [] {
    FT_Library made = nullptr;
    return FT_Init_FreeType(&made) == 0 ? made : nullptr;
  }();
  return library;
}

int Scale(long units, LONG em, const FT_Face face) { return MulDiv(static_cast<int>(units), em, face->units_per_EM); }

// What the face's tables say of its line, in units of the em. The Windows ascent and descent are the line's, as
// OpenType (ISO/IEC 14496-22, table OS/2) describes them; a face without that table has the general ones.
struct Line {
  long ascent, descent, leading;
};

Line LineOf(const FT_Face face) {
  auto* os2 = static_cast<TT_OS2*>(FT_Get_Sfnt_Table(face, FT_SFNT_OS2));
  auto* header = static_cast<TT_HoriHeader*>(FT_Get_Sfnt_Table(face, FT_SFNT_HHEA));
  if (!os2 || os2->version == 0xFFFF || os2->usWinAscent + os2->usWinDescent == 0)
    return {face->ascender, -face->descender, face->height - face->ascender + face->descender};
  long ascent = os2->usWinAscent, descent = os2->usWinDescent, leading = 0;
  if (header) leading = std::max(0L, header->Line_Gap - (ascent + descent - (header->Ascender - header->Descender)));
  return {ascent, descent, leading};
}

// The em for a height: below 0 it is the em itself; above 0 ascent and descent must not be higher.
LONG EmOf(const FT_Face face, LONG height) {
  if (height < 0) return -height;
  if (height == 0) height = 16;
  Line line = LineOf(face);
  int units = static_cast<int>(line.ascent + line.descent);
  LONG em = MulDiv(face->units_per_EM, height, units);
  if (em > 1 && MulDiv(units, em, face->units_per_EM) > height) --em;
  return std::max(em, 1);
}

}  // namespace

SizedFace* FontObject::Face() const {
  SizedFace* face = m_face.load(std::memory_order_acquire);
  if (!face) {
    face = SizedFace::For(m_description);
    m_face.store(face, std::memory_order_release);
  }
  return face;
}

SizedFace* SizedFace::For(const LOGFONTW& description, double scaleX, double scaleY) {
  std::lock_guard guard(g_lock);
  LONG height = static_cast<LONG>(std::lround(description.lfHeight * scaleY));
  if (scaleY != 1 && description.lfHeight == 0) height = static_cast<LONG>(std::lround(16 * scaleY));
  LONG width = static_cast<LONG>(std::lround(std::abs(description.lfWidth) * scaleX));
  return Open(FindFontFile(description), height, width, description.lfQuality != NONANTIALIASED_QUALITY);
}

SizedFace* SizedFace::Open(const FontFile& file, LONG height, LONG width, bool smooth) {
  if (file.path.empty() || !TheLibrary()) return nullptr;
  using Key = std::tuple<std::string, int, bool, bool, LONG, LONG, bool>;
  static std::map<Key, SizedFace*>& faces = *new std::map<Key, SizedFace*>;
  SizedFace*& face = faces[Key(file.path, file.index, file.embolden, file.slant, height, width, smooth)];
  if (face) return face;
  std::unique_ptr<SizedFace> made(new SizedFace);
  made->m_smooth = smooth;
  if (!made->Load(file, height, width)) return nullptr;
  return face = made.release();
}

bool SizedFace::Load(const FontFile& file, LONG height, LONG width) {
  m_file = file;
  if (FT_New_Face(TheLibrary(), file.path.c_str(), file.index, &m_face) != 0) return false;
  constexpr LONG kLargest = 2000;  // pixels an em
  m_em = std::clamp(m_face->units_per_EM ? EmOf(m_face, height) : std::abs(height), 1, kLargest);
  m_width = width;
  FT_Set_Pixel_Sizes(m_face, 0, static_cast<FT_UInt>(m_em));
  Measure();
  if (width > 0 && m_metrics.tmAveCharWidth > 0) {
    // An average width that was asked for stretches all widths.
    double stretch = double(width) / m_metrics.tmAveCharWidth;
    FT_Set_Char_Size(m_face, static_cast<FT_F26Dot6>(std::lround(m_em * 64 * stretch)), m_em * 64, 72, 72);
    m_metrics.tmMaxCharWidth = static_cast<LONG>(std::lround(m_metrics.tmMaxCharWidth * stretch));
    m_metrics.tmAveCharWidth = width;
  }
  return true;
}

void SizedFace::Measure() {
  auto* os2 = static_cast<TT_OS2*>(FT_Get_Sfnt_Table(m_face, FT_SFNT_OS2));
  Line line = LineOf(m_face);
  bool fixed = FT_IS_FIXED_WIDTH(m_face);
  m_metrics.tmAscent = Scale(line.ascent, m_em, m_face);
  m_metrics.tmDescent = Scale(line.descent, m_em, m_face);
  m_metrics.tmHeight = m_metrics.tmAscent + m_metrics.tmDescent;
  m_metrics.tmInternalLeading = m_metrics.tmHeight - m_em;
  m_metrics.tmExternalLeading = Scale(line.leading, m_em, m_face);
  m_metrics.tmAveCharWidth = os2 ? Scale(os2->xAvgCharWidth, m_em, m_face) : m_em / 2;
  m_metrics.tmMaxCharWidth = Scale(m_face->bbox.xMax - m_face->bbox.xMin, m_em, m_face);
  m_metrics.tmWeight = m_face->style_flags & FT_STYLE_FLAG_BOLD || m_file.embolden ? FW_BOLD : FW_NORMAL;
  m_metrics.tmItalic = m_face->style_flags & FT_STYLE_FLAG_ITALIC || m_file.slant ? 255 : 0;
  m_metrics.tmDigitizedAspectX = m_metrics.tmDigitizedAspectY = static_cast<LONG>(GetDpiForSystem());
  m_metrics.tmFirstChar = 0x20;
  m_metrics.tmLastChar = os2 ? os2->usLastCharIndex : 0xFFFC;
  m_metrics.tmDefaultChar = 0x1F;
  m_metrics.tmBreakChar = 0x20;
  m_metrics.tmPitchAndFamily =
      static_cast<BYTE>((fixed ? FF_MODERN : FF_SWISS | TMPF_FIXED_PITCH) | TMPF_VECTOR | TMPF_TRUETYPE);
  // FreeType gives the middle of the underline.
  m_underlineThick = std::max(1, Scale(m_face->underline_thickness, m_em, m_face));
  m_underlineAt = std::max(1, -Scale(m_face->underline_position, m_em, m_face) - m_underlineThick / 2);
  m_strikeAt = os2 ? Scale(os2->yStrikeoutPosition, m_em, m_face) : m_metrics.tmAscent / 3;
}

// --- glyphs ---

const Glyph& SizedFace::Make(char32_t character) {
  std::lock_guard guard(g_lock);
  std::atomic<Page*>& slot = m_pages[character >> 8 & (kPages - 1)];
  if (!slot.load(std::memory_order_relaxed)) slot.store(new Page, std::memory_order_release);
  std::atomic<const Glyph*>& place = slot.load(std::memory_order_relaxed)->glyphs[character & 0xFF];
  if (const Glyph* there = place.load(std::memory_order_relaxed)) return *there;
  unsigned index = FT_Get_Char_Index(m_face, character);
  const Glyph* glyph = nullptr;
  if (index == 0 && character > 0x7F) {
    SizedFace* other = Open(FindFontFileWith(character, m_file), -m_em, 0, m_smooth);
    if (other && other != this && FT_Get_Char_Index(other->m_face, character) != 0) glyph = &other->Of(character);
  }
  if (!glyph) glyph = Render(index).release();
  place.store(glyph, std::memory_order_release);
  return *glyph;
}

std::unique_ptr<Glyph> SizedFace::Render(unsigned index) {
  auto glyph = std::make_unique<Glyph>();
  if (FT_Load_Glyph(m_face, index, m_smooth ? FT_LOAD_DEFAULT : FT_LOAD_TARGET_MONO) != 0) return glyph;
  FT_GlyphSlot slot = m_face->glyph;
  glyph->advance = static_cast<int>((slot->metrics.horiAdvance + 32) >> 6);
  if (m_file.embolden && slot->format == FT_GLYPH_FORMAT_OUTLINE) {
    FT_Outline_Embolden(&slot->outline, m_em * 64 / 24);
    ++glyph->advance;
  }
  if (m_file.slant && slot->format == FT_GLYPH_FORMAT_OUTLINE) {
    FT_Matrix slant{0x10000, 0x10000 / 5, 0, 0x10000};
    FT_Outline_Transform(&slot->outline, &slant);
  }
  if (FT_Render_Glyph(slot, m_smooth ? FT_RENDER_MODE_NORMAL : FT_RENDER_MODE_MONO) != 0) return glyph;
  const FT_Bitmap& bitmap = slot->bitmap;
  glyph->left = slot->bitmap_left;
  glyph->top = slot->bitmap_top;
  glyph->width = static_cast<int>(bitmap.width);
  glyph->height = static_cast<int>(bitmap.rows);
  glyph->stride = (glyph->width + 3) / 4 * 4;
  glyph->mask.resize(static_cast<std::size_t>(glyph->stride) * glyph->height);
  for (int y = 0; y < glyph->height; ++y) {
    const unsigned char* row = bitmap.buffer + static_cast<std::ptrdiff_t>(bitmap.pitch) * y;
    std::uint8_t* to = glyph->mask.data() + static_cast<std::ptrdiff_t>(glyph->stride) * y;
    for (int x = 0; x < glyph->width; ++x)
      to[x] = bitmap.pixel_mode == FT_PIXEL_MODE_MONO ? (row[x / 8] >> (7 - x % 8) & 1 ? 255 : 0) : row[x];
  }
  return glyph;
}

}  // namespace draw
