// SColor: a colour with its names, texts, and its hue, saturation and lightness.
//
// A colour is a 32-bit value 0x00BBGGRR: red in the low byte, green in the second, blue in the third. Two values
// beyond that are markers: 0xFF000000 is the default colour (of whoever asks), 0xFFFFFFFF is no colour.
// Threads: a value belongs to one thread at a time; the functions serve any thread.
#pragma once

#include <cstdint>
#include <type_traits>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SColor {
 public:
  // The colours that have names. Gray is 0xA4A0A0 and DarkGray is 0x808080 on purpose.
  enum Colors : std::uint32_t {
    Black = 0x000000,
    DarkRed = 0x000080,
    Red = 0x0000FF,
    DarkGreen = 0x008000,
    DarkYellow = 0x008080,
    Green = 0x00FF00,
    Yellow = 0x00FFFF,
    DarkBlue = 0x800000,
    DarkMagenta = 0x800080,
    DarkCyan = 0x808000,
    DarkGray = 0x808080,
    Gray = 0xA4A0A0,
    LightGray = 0xC0C0C0,
    LightGreen = 0xC0DCC0,
    LightBlue = 0xF0CAA6,
    Cream = 0xF0FBFF,
    LightRed = 0x8080FF,
    LightYellow = 0x80FFFF,
    LightMagenta = 0xFF80FF,
    Blue = 0xFF0000,
    Magenta = 0xFF00FF,
    Cyan = 0xFFFF00,
    LightCyan = 0xFFFF80,
    White = 0xFFFFFF,
    Default = 0xFF000000,
    None = 0xFFFFFFFF,
  };

  // The default colour, a value, a named colour, or what SetAsString makes of a text (else the default colour).
  constexpr SColor() = default;
  constexpr SColor(unsigned long value) : m_value(static_cast<std::uint32_t>(value)) {}
  constexpr SColor(std::uint32_t value) : m_value(value) {}
  constexpr SColor(int value) : m_value(static_cast<std::uint32_t>(value)) {}
  constexpr SColor(Colors color) : m_value(color) {}
  explicit SColor(const SString& text) { SetAsString(text); }
  // A text that SetAsString does not know leaves the colour as it was.
  SColor& operator=(const SString& text) {
    SetAsString(text);
    return *this;
  }

  // The value.
  constexpr operator COLORREF() const { return m_value; }
  constexpr bool operator==(const SColor& other) const { return m_value == other.m_value; }
  constexpr bool operator!=(const SColor& other) const { return m_value != other.m_value; }
  // By the value, as an unsigned number.
  constexpr bool operator<(const SColor& other) const { return m_value < other.m_value; }
  // With a value or a named colour.
  template <class T>
  requires(std::is_integral_v<T> || std::is_same_v<T, Colors>) constexpr bool operator==(T other) const {
    return *this == SColor(other);
  }
  template <class T>
  requires(std::is_integral_v<T> || std::is_same_v<T, Colors>) constexpr bool operator<(T other) const {
    return *this < SColor(other);
  }
  constexpr bool IsDefault() const { return m_value == Default; }  // the marker
  constexpr bool IsNone() const { return m_value == None; }        // the marker

  // --- texts ---

  // The name when `names` is not 0 and the colour has one (the markers are "Default" and "None"), else red, green and
  // blue through a printf format of three integers.
  SString Format(int names = 1, const WCHAR* format = WTEXT("%d %d %d")) const;
  // Format(1).
  SString GetAsString() const { return Format(1); }
  // Takes a colour from a text, in any case, blanks around it left out: one of the names above; "%d %d %d" with red,
  // green and blue from 0 to 255, separated by blanks, commas or semicolons, in brackets after "RGB" or alone;
  // "#RRGGBB" or "#RGB"; "0x" and up to eight hexadecimal digits of the value 0x00BBGGRR, only the markers beyond
  // 0xFFFFFF; a name of a system colour ("ButtonFace", "3DFace", "GradientActiveCaption", ... : the platform's COLOR_
  // names without underscores, and those of the style sheets' system colours), which gives that colour's present
  // value. Returns 1; 0 for any other text, and the colour is as it was.
  int SetAsString(const SString& text);

  // --- hue, saturation, lightness ---

  // Hue in degrees [0, 360), 0 being red, 120 green, 240 blue and 0 for greys; saturation and lightness in [0, 1]: the
  // hexcone model of G. Joblove and D. Greenberg, "Color spaces for computer graphics" (1978), as the style sheets'
  // hsl() has it. For the markers all three are 0.
  void GetHSLColor(double* hue, double* saturation, double* lightness) const;
  // The nearest colour; a hue is taken modulo 360, the other two are limited to [0, 1]. Values from GetHSLColor give
  // the same colour back exactly, for every colour.
  void SetHSLColor(double hue, double saturation, double lightness);

  // --- blends ---

  // The colour at `step` of `steps` on the way between two. `from` when `step` or `steps` is 0 or both colours are
  // equal; `to` when `step` equals `steps`; these returns keep the top byte. Otherwise each channel moves by
  // (to - from) * step / steps, truncated, then increased by 0.5 and truncated again, so that a falling channel moves
  // one less; the top byte is 0.
  static unsigned long GetMediumColor(unsigned long from, unsigned long to, int step, int steps);

  // The colour moved 10 to 90 % toward black.
  static unsigned long GetDarkColor1(unsigned long color) { return GetMediumColor(color, Black, 10, 100); }
  static unsigned long GetDarkColor2(unsigned long color) { return GetMediumColor(color, Black, 20, 100); }
  static unsigned long GetDarkColor3(unsigned long color) { return GetMediumColor(color, Black, 30, 100); }
  static unsigned long GetDarkColor4(unsigned long color) { return GetMediumColor(color, Black, 40, 100); }
  static unsigned long GetDarkColor5(unsigned long color) { return GetMediumColor(color, Black, 50, 100); }
  static unsigned long GetDarkColor6(unsigned long color) { return GetMediumColor(color, Black, 60, 100); }
  static unsigned long GetDarkColor7(unsigned long color) { return GetMediumColor(color, Black, 70, 100); }
  static unsigned long GetDarkColor8(unsigned long color) { return GetMediumColor(color, Black, 80, 100); }
  static unsigned long GetDarkColor9(unsigned long color) { return GetMediumColor(color, Black, 90, 100); }
  // The colour moved 10 to 90 % toward white.
  static unsigned long GetLightColor1(unsigned long color) { return GetMediumColor(color, White, 10, 100); }
  static unsigned long GetLightColor2(unsigned long color) { return GetMediumColor(color, White, 20, 100); }
  static unsigned long GetLightColor3(unsigned long color) { return GetMediumColor(color, White, 30, 100); }
  static unsigned long GetLightColor4(unsigned long color) { return GetMediumColor(color, White, 40, 100); }
  static unsigned long GetLightColor5(unsigned long color) { return GetMediumColor(color, White, 50, 100); }
  static unsigned long GetLightColor6(unsigned long color) { return GetMediumColor(color, White, 60, 100); }
  static unsigned long GetLightColor7(unsigned long color) { return GetMediumColor(color, White, 70, 100); }
  static unsigned long GetLightColor8(unsigned long color) { return GetMediumColor(color, White, 80, 100); }
  static unsigned long GetLightColor9(unsigned long color) { return GetMediumColor(color, White, 90, 100); }

 private:
  std::uint32_t m_value = Default;
};

static_assert(sizeof(SColor) == 4, "the value alone");
