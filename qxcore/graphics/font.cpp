#include "qxcore/graphics/font.h"

#include <cstdlib>

#include "qxcore/graphics/internal/wrapper_map.h"
#include "qxcore/system/settings/registry.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SFontOld, SGdiObject, 1)
QXCORE_IMPLEMENT_CREATABLE_CLASS(SFont, SFontOld, 1)

using FontMap = TWrapperMap<SFontOld, &SFontOld::m_hObject>;

SFontOld::SFontOld() : SGdiObject(FontMap::Instance()) {}

SFontOld::SFontOld(HFONT font) : SFontOld() { Attach(font); }

SFontOld::~SFontOld() = default;

SFontOld* SFontOld::FromHandle(HFONT font) { return static_cast<SFontOld*>(FontMap::Instance().FromHandle(font)); }

SFontOld* SFontOld::FromHandlePermanent(HFONT font) {
  return static_cast<SFontOld*>(FontMap::Instance().FromHandlePermanent(font));
}

void SFontOld::DeleteTempMap() { FontMap::Instance().DeleteTempMap(); }

// --- size and style ---

namespace {

constexpr int kPointsPerInch = 72, kSmallest = 4, kLargest = 288;

int DpiOr(unsigned int dpi) {
  if (dpi) return static_cast<int>(dpi);
  HDC screen = ::GetDC(nullptr);
  int ofSystem = ::GetDeviceCaps(screen, LOGPIXELSY);
  ::ReleaseDC(nullptr, screen);
  return ofSystem > 0 ? ofSystem : 96;
}

LOGFONTW Description(const SString& face, int height, unsigned int style) {
  LOGFONTW description{};
  description.lfHeight = height;
  description.lfWeight = style & SFont::kBold ? FW_BOLD : FW_NORMAL;
  description.lfItalic = (style & SFont::kItalic) != 0;
  description.lfUnderline = (style & SFont::kUnderline) != 0;
  description.lfStrikeOut = (style & SFont::kStrikeOut) != 0;
  description.lfCharSet = DEFAULT_CHARSET;
  for (int i = 0; i < static_cast<int>(face.Length()) && i < LF_FACESIZE - 1; ++i) description.lfFaceName[i] = face[i];
  return description;
}

}  // namespace

int SFont::Create(const SString& face, int points, unsigned int style, unsigned int dpi) {
  DeleteObject();
  if (points < kSmallest || points > kLargest) return 0;
  LOGFONTW description = Description(face, -::MulDiv(points, DpiOr(dpi), kPointsPerInch), style);
  return CreateFontIndirectW(&description);
}

SString SFont::GetFaceName() const {
  LOGFONTW description{};
  GetLogFont(&description);
  return SString(description.lfFaceName);
}

int SFont::GetPointSize(unsigned int dpi) const {
  LOGFONTW description{};
  if (!GetLogFont(&description)) return 0;
  return ::MulDiv(std::abs(description.lfHeight), kPointsPerInch, DpiOr(dpi));
}

unsigned int SFont::GetStyle() const {
  LOGFONTW description{};
  if (!GetLogFont(&description)) return kRegular;
  return (description.lfWeight >= FW_SEMIBOLD ? kBold : 0u) | (description.lfItalic ? kItalic : 0u) |
         (description.lfUnderline ? kUnderline : 0u) | (description.lfStrikeOut ? kStrikeOut : 0u);
}

// --- the user's choices ---

namespace {

// A font's three values below "Controls", each name with "UI" or "RTF" in front.
struct Choice {
  SString face;
  long points = 0, style = 0;

  bool IsUsable() const { return !face.IsEmpty() && points >= kSmallest && points <= kLargest; }
};

SString Controls(const WCHAR* below) { return SRegistry::GetApplicationPath(SString(WTEXT("Controls")) + below); }

Choice ReadChoice(const SString& prefix) {
  Choice choice;
  SRegistry key(HKEY_CURRENT_USER, Controls(WTEXT("")), 0);
  if (!key.IsOpen()) return choice;
  key.GetProfile(prefix + WTEXT(" Font Name"), &choice.face, SString());
  key.GetProfile(prefix + WTEXT(" Font Size"), &choice.points, 0);
  key.GetProfile(prefix + WTEXT(" Font Style"), &choice.style, 0);
  return choice;
}

// The first failure of several writes.
class Writes {
 public:
  Writes(const SString& path) : m_key(HKEY_CURRENT_USER, path, 1) {
    if (!m_key.IsOpen()) m_result = E_FAIL;
  }
  void Text(const SString& name, const SString& value) { Note(m_key.WriteProfile(name, value)); }
  void Number(const SString& name, long value) { Note(m_key.WriteProfile(name, value, 1)); }
  void Truth(const SString& name, bool value) { Note(m_key.WriteProfile(name, value ? 1 : 0)); }
  HRESULT Result() const { return m_result; }

 private:
  void Note(HRESULT result) {
    if (m_result == S_OK) m_result = result;
  }
  SRegistry m_key;
  HRESULT m_result = S_OK;
};

HRESULT WriteChoice(const SString& prefix, const SFont& font) {
  Writes writes(Controls(WTEXT("")));
  writes.Text(prefix + WTEXT(" Font Name"), font.GetFaceName());
  writes.Number(prefix + WTEXT(" Font Size"), font.GetPointSize());
  writes.Number(prefix + WTEXT(" Font Style"), static_cast<long>(font.GetStyle()));
  return writes.Result();
}

HRESULT WriteFixed(const WCHAR* below, const SFont& font) {
  Writes writes(Controls(below));
  writes.Text(WTEXT("Facename"), font.GetFaceName());
  writes.Number(WTEXT("Size"), font.GetPointSize());
  writes.Truth(WTEXT("Bold"), font.GetStyle() & SFont::kBold);
  writes.Truth(WTEXT("Italic"), font.GetStyle() & SFont::kItalic);
  return writes.Result();
}

// The first key below "Controls" that names a font of fixed width.
Choice ReadFixed() {
  for (const WCHAR* below : {WTEXT("\\Editor\\Font"), WTEXT("\\Editor\\Default\\Font")}) {
    SRegistry key(HKEY_CURRENT_USER, Controls(below), 0);
    if (!key.IsOpen()) continue;
    Choice choice;
    int bold = 0, italic = 0;
    key.GetProfile(WTEXT("Facename"), &choice.face, SString());
    key.GetProfile(WTEXT("Size"), &choice.points, 0);
    key.GetProfile(WTEXT("Bold"), &bold, 0);
    key.GetProfile(WTEXT("Italic"), &italic, 0);
    choice.style =
        static_cast<long>((bold ? SFont::kBold : SFont::kRegular) + (italic ? SFont::kItalic : SFont::kRegular));
    if (choice.IsUsable()) return choice;
  }
  return Choice();
}

int CreateChoice(SFont& font, const Choice& choice, unsigned int dpi) {
  return choice.IsUsable() &&
         font.Create(choice.face, static_cast<int>(choice.points), static_cast<unsigned int>(choice.style), dpi);
}

}  // namespace

int SFont::LoadDefaultUIFont(unsigned int dpi) {
  if (CreateChoice(*this, ReadChoice(WTEXT("UI")), dpi)) return 1;
  LOGFONTW description{};
  ::GetObjectW(::GetStockObject(DEFAULT_GUI_FONT), sizeof description, &description);
  description.lfHeight = ::MulDiv(description.lfHeight, DpiOr(dpi), DpiOr(0));
  return CreateFontIndirectW(&description);
}

int SFont::LoadRtfFont(unsigned int dpi) {
  return CreateChoice(*this, ReadChoice(WTEXT("RTF")), dpi) || LoadDefaultUIFont(dpi);
}

int SFont::LoadFixedUIFont(unsigned int dpi) {
  if (CreateChoice(*this, ReadFixed(), dpi)) return 1;
  constexpr int kStandardPoints = 10;
  LOGFONTW description{};
  ::GetObjectW(::GetStockObject(ANSI_FIXED_FONT), sizeof description, &description);
  description.lfHeight = -::MulDiv(kStandardPoints, DpiOr(dpi), kPointsPerInch);
  return CreateFontIndirectW(&description);
}

HRESULT SFont::SaveDefaultUIFont() const {
  HRESULT result = WriteChoice(WTEXT("UI"), *this);
  Writes grid(Controls(WTEXT("\\Grid")));
  grid.Text(WTEXT("Header Font Name"), GetFaceName());
  return result != S_OK ? result : grid.Result();
}

HRESULT SFont::SaveRtfFont() const { return WriteChoice(WTEXT("RTF"), *this); }

HRESULT SFont::SaveFixedUIFont() const {
  HRESULT result = WriteFixed(WTEXT("\\Editor\\Font"), *this),
          standard = WriteFixed(WTEXT("\\Editor\\Default\\Font"), *this);
  return result != S_OK ? result : standard;
}
