// Colours to and from texts.
#include <iterator>

#include "qxcore/graphics/color.h"

namespace {

struct Name {
  std::uint32_t value;
  const WCHAR* text;
};

constexpr Name kNames[] = {
    {SColor::Black, WTEXT("Black")},
    {SColor::DarkRed, WTEXT("DarkRed")},
    {SColor::Red, WTEXT("Red")},
    {SColor::DarkGreen, WTEXT("DarkGreen")},
    {SColor::DarkYellow, WTEXT("DarkYellow")},
    {SColor::Green, WTEXT("Green")},
    {SColor::Yellow, WTEXT("Yellow")},
    {SColor::DarkBlue, WTEXT("DarkBlue")},
    {SColor::DarkMagenta, WTEXT("DarkMagenta")},
    {SColor::DarkCyan, WTEXT("DarkCyan")},
    {SColor::DarkGray, WTEXT("DarkGray")},
    {SColor::Gray, WTEXT("Gray")},
    {SColor::LightGray, WTEXT("LightGray")},
    {SColor::LightGreen, WTEXT("LightGreen")},
    {SColor::LightBlue, WTEXT("LightBlue")},
    {SColor::Cream, WTEXT("Cream")},
    {SColor::LightRed, WTEXT("LightRed")},
    {SColor::LightYellow, WTEXT("LightYellow")},
    {SColor::LightMagenta, WTEXT("LightMagenta")},
    {SColor::Blue, WTEXT("Blue")},
    {SColor::Magenta, WTEXT("Magenta")},
    {SColor::Cyan, WTEXT("Cyan")},
    {SColor::LightCyan, WTEXT("LightCyan")},
    {SColor::White, WTEXT("White")},
    {SColor::Default, WTEXT("Default")},
    {SColor::None, WTEXT("None")},
};

struct SystemName {
  int index;
  const WCHAR* text;
};

// The names of the registry's "Control Panel\Colors" and of CSS Color Module Level 3's system colours, and the
// platform's constants without "COLOR_".
constexpr SystemName kSystemNames[] = {
    {COLOR_SCROLLBAR, WTEXT("ScrollBar")},
    {COLOR_BACKGROUND, WTEXT("Background")},
    {COLOR_BACKGROUND, WTEXT("Desktop")},
    {COLOR_ACTIVECAPTION, WTEXT("ActiveCaption")},
    {COLOR_ACTIVECAPTION, WTEXT("ActiveTitle")},
    {COLOR_INACTIVECAPTION, WTEXT("InactiveCaption")},
    {COLOR_INACTIVECAPTION, WTEXT("InactiveTitle")},
    {COLOR_MENU, WTEXT("Menu")},
    {COLOR_WINDOW, WTEXT("Window")},
    {COLOR_WINDOWFRAME, WTEXT("WindowFrame")},
    {COLOR_MENUTEXT, WTEXT("MenuText")},
    {COLOR_WINDOWTEXT, WTEXT("WindowText")},
    {COLOR_CAPTIONTEXT, WTEXT("CaptionText")},
    {COLOR_CAPTIONTEXT, WTEXT("TitleText")},
    {COLOR_ACTIVEBORDER, WTEXT("ActiveBorder")},
    {COLOR_INACTIVEBORDER, WTEXT("InactiveBorder")},
    {COLOR_APPWORKSPACE, WTEXT("AppWorkspace")},
    {COLOR_HIGHLIGHT, WTEXT("Highlight")},
    {COLOR_HIGHLIGHT, WTEXT("Hilight")},
    {COLOR_HIGHLIGHTTEXT, WTEXT("HighlightText")},
    {COLOR_HIGHLIGHTTEXT, WTEXT("HilightText")},
    {COLOR_BTNFACE, WTEXT("ButtonFace")},
    {COLOR_BTNFACE, WTEXT("BtnFace")},
    {COLOR_3DFACE, WTEXT("3DFace")},
    {COLOR_3DFACE, WTEXT("ThreeDFace")},
    {COLOR_BTNSHADOW, WTEXT("ButtonShadow")},
    {COLOR_BTNSHADOW, WTEXT("BtnShadow")},
    {COLOR_3DSHADOW, WTEXT("3DShadow")},
    {COLOR_3DSHADOW, WTEXT("ThreeDShadow")},
    {COLOR_GRAYTEXT, WTEXT("GrayText")},
    {COLOR_BTNTEXT, WTEXT("ButtonText")},
    {COLOR_BTNTEXT, WTEXT("BtnText")},
    {COLOR_INACTIVECAPTIONTEXT, WTEXT("InactiveCaptionText")},
    {COLOR_INACTIVECAPTIONTEXT, WTEXT("InactiveTitleText")},
    {COLOR_BTNHIGHLIGHT, WTEXT("ButtonHighlight")},
    {COLOR_BTNHIGHLIGHT, WTEXT("BtnHighlight")},
    {COLOR_BTNHIGHLIGHT, WTEXT("ButtonHilight")},
    {COLOR_3DHIGHLIGHT, WTEXT("3DHighlight")},
    {COLOR_3DHIGHLIGHT, WTEXT("ThreeDHighlight")},
    {COLOR_3DDKSHADOW, WTEXT("3DDkShadow")},
    {COLOR_3DDKSHADOW, WTEXT("ButtonDkShadow")},
    {COLOR_3DDKSHADOW, WTEXT("ThreeDDarkShadow")},
    {COLOR_3DLIGHT, WTEXT("3DLight")},
    {COLOR_3DLIGHT, WTEXT("ButtonLight")},
    {COLOR_3DLIGHT, WTEXT("ThreeDLightShadow")},
    {COLOR_INFOTEXT, WTEXT("InfoText")},
    {COLOR_INFOBK, WTEXT("InfoBk")},
    {COLOR_INFOBK, WTEXT("InfoWindow")},
    {COLOR_INFOBK, WTEXT("InfoBackground")},
    {COLOR_HOTLIGHT, WTEXT("HotLight")},
    {COLOR_HOTLIGHT, WTEXT("HotTrackingColor")},
    {COLOR_GRADIENTACTIVECAPTION, WTEXT("GradientActiveCaption")},
    {COLOR_GRADIENTACTIVECAPTION, WTEXT("GradientActiveTitle")},
    {COLOR_GRADIENTINACTIVECAPTION, WTEXT("GradientInactiveCaption")},
    {COLOR_GRADIENTINACTIVECAPTION, WTEXT("GradientInactiveTitle")},
    {COLOR_MENUHILIGHT, WTEXT("MenuHilight")},
    {COLOR_MENUHILIGHT, WTEXT("MenuHighlight")},
    {COLOR_MENUBAR, WTEXT("MenuBar")},
};

// --- reading ---

int HexDigit(WCHAR character) {
  if (character >= '0' && character <= '9') return character - '0';
  if (character >= 'a' && character <= 'f') return character - 'a' + 10;
  if (character >= 'A' && character <= 'F') return character - 'A' + 10;
  return -1;
}

// All of a text as a hexadecimal number of up to eight digits.
bool ReadHex(SStringView text, std::uint32_t* number) {
  if (text.empty() || text.size() > 8) return false;
  *number = 0;
  for (WCHAR character : text) {
    int digit = HexDigit(character);
    if (digit < 0) return false;
    *number = *number << 4 | static_cast<std::uint32_t>(digit);
  }
  return true;
}

// "RRGGBB" or "RGB".
bool ReadWeb(SStringView text, std::uint32_t* value) {
  std::uint32_t number;
  if ((text.size() != 6 && text.size() != 3) || !ReadHex(text, &number)) return false;
  if (text.size() == 3) number = (number >> 8 & 0xF) * 0x110000 | (number >> 4 & 0xF) * 0x1100 | (number & 0xF) * 0x11;
  *value = (number & 0xFF) << 16 | (number & 0xFF00) | number >> 16;
  return true;
}

bool ReadValue(SStringView text, std::uint32_t* value) {
  return ReadHex(text, value) && (*value <= SColor::White || *value == SColor::Default || *value == SColor::None);
}

bool IsSeparator(WCHAR character) {
  return character == ' ' || character == '\t' || character == ',' || character == ';';
}

// Three numbers from 0 to 255, with separators between them and blanks around.
bool ReadChannels(SStringView text, std::uint32_t* value) {
  std::uint32_t channels[3];
  int count = 0;
  for (std::size_t at = 0; at < text.size();) {
    if (IsSeparator(text[at])) {
      ++at;
      continue;
    }
    std::uint32_t number = 0;
    std::size_t start = at;
    for (; at < text.size() && text[at] >= '0' && text[at] <= '9' && number <= 255; ++at)
      number = number * 10 + (text[at] - '0');
    if (at == start || number > 255 || count == 3) return false;
    channels[count++] = number;
  }
  if (count != 3) return false;
  *value = channels[0] | channels[1] << 8 | channels[2] << 16;
  return true;
}

bool ReadNumbers(SStringView text, std::uint32_t* value) {
  if (text.starts_with('#')) return ReadWeb(text.substr(1), value);
  if (text.starts_with(WTEXT("0x")) || text.starts_with(WTEXT("0X"))) return ReadValue(text.substr(2), value);
  if (text.size() > 3 && SString(text.substr(0, 3)).CompareNoCase(WTEXT("RGB")) == 0) {
    text.remove_prefix(3);
    while (!text.empty() && text.front() == ' ') text.remove_prefix(1);
  }
  if (text.starts_with('(') && text.ends_with(')')) text = text.substr(1, text.size() - 2);
  return ReadChannels(text, value);
}

bool ReadName(const SString& text, std::uint32_t* value) {
  for (const Name& name : kNames) {
    if (text.CompareNoCase(name.text) == 0) return *value = name.value, true;
  }
  for (const SystemName& name : kSystemNames) {
    if (text.CompareNoCase(name.text) == 0) return *value = ::GetSysColor(name.index), true;
  }
  return false;
}

}  // namespace

SString SColor::Format(int names, const WCHAR* format) const {
  for (const Name& name : kNames) {
    if (names && name.value == m_value) return SString(name.text);
  }
  SString text;
  text.Format(format, GetRValue(m_value), GetGValue(m_value), GetBValue(m_value));
  return text;
}

int SColor::SetAsString(const SString& text) {
  SString trimmed = text;
  trimmed.Trim();
  std::uint32_t value;
  if (!ReadNumbers(trimmed, &value) && !ReadName(trimmed, &value)) return 0;
  m_value = value;
  return 1;
}
