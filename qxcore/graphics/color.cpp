#include "qxcore/graphics/color.h"

#include <algorithm>
#include <cmath>

unsigned long SColor::GetMediumColor(unsigned long from, unsigned long to, int step, int steps) {
  if (steps == 0 || step == 0) return from;
  if (step == steps) return to;
  if (from == to) return from;
  constexpr int kShort = 1 << 23;  // a difference of channels times less than that fits into an int
  bool isShort = -kShort < step && step < kShort;
  auto channel = [&](int shift) {
    int first = from >> shift & 0xFF, last = to >> shift & 0xFF, way = last - first;
    int moved = isShort ? way * step / steps : static_cast<int>(static_cast<long long>(way) * step / steps);
    int rounded = moved + (moved < 0);  // adding 0.5 and truncating leaves what rises and shortens what falls by one
    return static_cast<unsigned long>((first + rounded) & 0xFF) << shift;
  };
  return channel(0) | channel(8) | channel(16);
}

// --- hue, saturation, lightness ---

void SColor::GetHSLColor(double* hue, double* saturation, double* lightness) const {
  *hue = *saturation = *lightness = 0;
  if (m_value > White) return;
  double red = GetRValue(m_value) / 255.0, green = GetGValue(m_value) / 255.0, blue = GetBValue(m_value) / 255.0;
  double most = std::max({red, green, blue}), least = std::min({red, green, blue}), range = most - least;
  *lightness = (most + least) / 2;
  if (range == 0) return;
  *saturation = range / (1 - std::fabs(2 * *lightness - 1));
  if (most == red)
    *hue = 60 * (green - blue) / range;
  else if (most == green)
    *hue = 60 * (blue - red) / range + 120;
  else
    *hue = 60 * (red - green) / range + 240;
  if (*hue < 0) *hue += 360;
}

void SColor::SetHSLColor(double hue, double saturation, double lightness) {
  hue = std::fmod(hue, 360);
  if (hue < 0) hue += 360;
  saturation = std::clamp(saturation, 0.0, 1.0);
  lightness = std::clamp(lightness, 0.0, 1.0);
  double range = saturation * std::min(lightness, 1 - lightness);
  // Each channel is the same trapezoid over the circle of hues, shifted by a third.
  auto channel = [&](int shift) {
    double place = std::fmod(shift + hue / 30, 12);
    double value = lightness - range * std::clamp(std::min(place - 3, 9 - place), -1.0, 1.0);
    return static_cast<std::uint32_t>(std::lround(value * 255));
  };
  m_value = channel(0) | channel(8) << 8 | channel(4) << 16;
}
