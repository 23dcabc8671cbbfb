// SDrawBackground: the gradient background of a window. Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/graphics/gradient.h"

class QXCORE_API SDrawBackground {
 public:
  SDrawBackground() = default;
  // With a gradient, which is copied.
  explicit SDrawBackground(const SDrawGradient& gradient) : m_gradient(gradient) {}

  // The gradient; what is changed in it counts for the next drawing.
  SDrawGradient& GetGradient() { return m_gradient; }
  const SDrawGradient& GetGradient() const { return m_gradient; }
  // Takes a copy.
  void SetGradient(const SDrawGradient& gradient) { m_gradient = gradient; }

  // Fills a rectangle, which becomes the gradient's start rectangle.
  void Draw(SDC& dc, const SRect& rect);
  // Fills a window's client area; for its WM_ERASEBKGND. Returns 1; 0 for an invalid window, and then nothing is
  // drawn.
  int Erase(SDC& dc, HWND window);

 private:
  SDrawGradient m_gradient;
};
