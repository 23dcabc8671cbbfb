// Paints a window's invalid part in memory first, so that nothing flickers.
#pragma once

#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/window_dc.h"

class SBufferedPaint {
 public:
  explicit SBufferedPaint(HWND window) : m_paint(window), m_memory(m_paint.GetSafeHdc()) {
    const SRect part = m_paint.m_ps.rcPaint;
    if (part.IsEmpty() || !m_bitmap.CreateCompatibleBitmap(m_paint, part.Width(), part.Height())) return;
    m_former = m_memory.SelectObject(m_bitmap.GetSafeHandle());
    m_memory.SetViewportOrg(SPoint(-part.left, -part.top));
  }
  ~SBufferedPaint() {
    const SRect part = m_paint.m_ps.rcPaint;
    if (m_former != nullptr) {
      m_paint.BitBlt(part, m_memory, part.TopLeft());
      m_memory.SelectObject(m_former);
    }
  }
  SBufferedPaint(const SBufferedPaint&) = delete;
  SBufferedPaint& operator=(const SBufferedPaint&) = delete;

  // What to draw on, in the window's coordinates: the memory, or, without any, the window. Null when nothing needs
  // to be painted.
  SDC* Get() {
    if (m_former != nullptr) return &m_memory;
    return m_paint.GetSafeHdc() != nullptr && !SRect(m_paint.m_ps.rcPaint).IsEmpty() ? &m_paint : nullptr;
  }

 private:
  SPaintDC m_paint;
  SMemoryDC m_memory;
  SBitmap m_bitmap;
  HGDIOBJ m_former = nullptr;
};
