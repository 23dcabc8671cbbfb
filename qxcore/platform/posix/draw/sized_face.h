// A face at a size: its metrics and its glyphs, kept once made. Never ended, so that pointers to it stay valid.
//
// Reading glyphs that are there takes no lock; making one does.
#pragma once

#include <atomic>
#include <memory>
#include <vector>

#include "qxcore/platform/posix/draw/font_files.h"

struct FT_FaceRec_;

namespace draw {

struct Glyph {
  int advance = 0;        // pixels to the next one
  int left = 0, top = 0;  // from the pen to the mask's corner; up is positive
  int width = 0, height = 0;
  int stride = 0;                  // bytes of a row of the mask: the width and zeros up to a multiple of four
  std::vector<std::uint8_t> mask;  // 255 is full cover
};

class SizedFace {
 public:
  // The face for a description whose sizes are multiplied by these factors; null when there is no font.
  static SizedFace* For(const LOGFONTW& description, double scaleX = 1, double scaleY = 1);

  // The glyph of a character; one of another font, or the missing-glyph sign, where the face has none.
  const Glyph& Of(char32_t character) {
    Page* page = m_pages[character >> 8 & (kPages - 1)].load(std::memory_order_acquire);
    if (page) [[likely]] {
      if (const Glyph* glyph = page->glyphs[character & 0xFF].load(std::memory_order_acquire)) [[likely]]
        return *glyph;
    }
    return Make(character);
  }

  const TEXTMETRICW& Metrics() const { return m_metrics; }
  const FontFile& File() const { return m_file; }
  // The underline: its upper edge below the base line, its thickness; the strike-out: its upper edge above it.
  int m_underlineAt = 1, m_underlineThick = 1, m_strikeAt = 1;

 private:
  static constexpr unsigned kPages = 0x2000;  // of 256 characters each: more than all of Unicode
  struct Page {
    std::atomic<const Glyph*> glyphs[256] = {};
  };

  SizedFace() = default;
  static SizedFace* Open(const FontFile& file, LONG height, LONG width, bool smooth);
  bool Load(const FontFile& file, LONG height, LONG width);
  void Measure();
  const Glyph& Make(char32_t character);
  std::unique_ptr<Glyph> Render(unsigned index);

  FontFile m_file;
  FT_FaceRec_* m_face = nullptr;
  bool m_smooth = true;
  LONG m_em = 0, m_width = 0;  // pixels an em; the average width that was asked for, or 0
  TEXTMETRICW m_metrics{};
  std::atomic<Page*> m_pages[kPages] = {};
};

}  // namespace draw
