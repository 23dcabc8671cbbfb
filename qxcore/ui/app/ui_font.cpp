#include "qxcore/ui/app/ui_font.h"

#include <cstring>

#include "qxcore/container/table_dumb.h"
#include "qxcore/graphics/font.h"
#include "qxcore/ui/app/ui_sys_data.h"

namespace {

// Fonts are kept: a control may still have one.
struct SizedFont {
  int m_dpi;
  HFONT m_font;
  bool m_isCurrent;
};

STableDumb<SizedFont>& Fonts() {
  static STableDumb<SizedFont>& fonts = *new STableDumb<SizedFont>;
  return fonts;
}

bool AreAlike(HFONT a, HFONT b) {
  LOGFONTW descriptions[2] = {};
  ::GetObjectW(a, sizeof(LOGFONTW), &descriptions[0]);
  ::GetObjectW(b, sizeof(LOGFONTW), &descriptions[1]);
  return std::memcmp(&descriptions[0], &descriptions[1], sizeof(LOGFONTW)) == 0;
}

HFONT LoadFont(int dpi) {
  SFont font;
  if (!font.LoadDefaultUIFont(static_cast<unsigned>(dpi))) return nullptr;
  for (SizedFont& known : Fonts()) {
    if (known.m_dpi != dpi || !AreAlike(known.m_font, font)) continue;
    known.m_isCurrent = true;
    return known.m_font;
  }
  Fonts().Add({dpi, font, true});
  return static_cast<HFONT>(font.Detach());
}

}  // namespace

HFONT SGetDefaultUIFont(int dpi) {
  if (dpi <= 0) dpi = SGetUISysData()->m_dpi;
  for (const SizedFont& known : Fonts()) {
    if (known.m_dpi == dpi && known.m_isCurrent) return known.m_font;
  }
  return LoadFont(dpi);
}

void SUpdateDefaultUIFont() {
  for (SizedFont& known : Fonts()) known.m_isCurrent = false;
}
