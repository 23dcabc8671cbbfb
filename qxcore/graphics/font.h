// SFontOld, the object around a font handle, and SFont, a font with the settings of the default fonts.
//
// A font is described by the face's name, a height and a style. A height above 0 is the whole line's, ascent
// and descent; below 0 that of the letters alone (the em), both in pixels; 0 takes a default of the system.
// Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/gdi_object.h"
#include "qxcore/string/string.h"

class QXCORE_API SFontOld : public SGdiObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SFontOld)

  SFontOld();
  explicit SFontOld(HFONT font);
  ~SFontOld() override;

  // As those of SGdiObject, in the map of fonts.
  static SFontOld* FromHandle(HFONT font);
  static SFontOld* FromHandlePermanent(HFONT font);
  static void DeleteTempMap();

  // A font as the description asks for it, or the system's nearest. Returns 1, or 0 on failure.
  int CreateFontIndirectW(const LOGFONTW* description) { return Hold(::CreateFontIndirectW(description)); }
  // The description that the font was made from; 0 without a font.
  int GetLogFont(LOGFONTW* description) const { return GetObjectW(sizeof *description, description) != 0; }

  // The handle; stays the object's.
  operator HFONT() const { return static_cast<HFONT>(m_hObject); }
};

// A font by name, size in points and style, and the fonts that the user chose for the program.
//
// The choices are values below the application's key of the registry (the SRegistry class): the font of the
// user interface and of RTF texts below "Controls" ("UI Font Name", "UI Font Size", "UI Font Style" and the same
// with "RTF"), that of fixed width below "Controls\Editor\Font" and "Controls\Editor\Default\Font" ("Facename",
// "Size", "Bold", "Italic"). What is missing or out of range counts as not chosen.
class QXCORE_API SFont : public SFontOld {
  QXCORE_DECLARE_CREATABLE_CLASS(SFont)

  // Style bits; their sum is the value of "UI Font Style" and "RTF Font Style".
  enum Style : unsigned int { kRegular = 0, kBold = 1, kItalic = 2, kUnderline = 4, kStrikeOut = 8 };

  SFont() = default;
  explicit SFont(HFONT font) : SFontOld(font) {}

  // A font of a face, a size in points (4 to 288) and a sum of style bits, for `dpi` dots an inch; 0 takes those of
  // the system. Returns 1; 0 when the size is out of range or the system refuses.
  int Create(const SString& face, int points, unsigned int style, unsigned int dpi = 0);
  // The face that the font was asked for.
  SString GetFaceName() const;
  // The size in points at `dpi` dots an inch (0: those of the system), rounded; 0 without a font.
  int GetPointSize(unsigned int dpi = 0) const;
  // The sum of its style bits.
  unsigned int GetStyle() const;

  // Makes this the user interface's font: the user's choice, or else the system's
  // DEFAULT_GUI_FONT. 1 on success.
  int LoadDefaultUIFont(unsigned int dpi = 0);
  // Keeps this font as the user's choice, and its face for the headers of grids ("Controls\Grid", "Header Font
  // Name"). Returns 0, or the error of the registry.
  HRESULT SaveDefaultUIFont() const;
  // The same for the font of RTF texts; not chosen, it is the user interface's.
  int LoadRtfFont(unsigned int dpi = 0);
  HRESULT SaveRtfFont() const;
  // The same for the font of fixed width; not chosen, it is the system's fixed font of 10 points.
  int LoadFixedUIFont(unsigned int dpi = 0);
  HRESULT SaveFixedUIFont() const;
};
