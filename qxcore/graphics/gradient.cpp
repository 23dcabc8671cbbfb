#include "qxcore/graphics/gradient.h"

void SDrawGradient::SetGradient(int mode, unsigned long startColor, unsigned long endColor, const SRect& rect) {
  SetGradient(mode, startColor, endColor, rect, rect);
}

void SDrawGradient::SetGradient(int mode, unsigned long startColor, unsigned long endColor, const SRect& startRect,
                                const SRect& endRect) {
  SetGradientMode(mode);
  SetStartColor(startColor);
  SetEndColor(endColor);
  SetStartRect(startRect);
  SetEndRect(endRect);
}

void SDrawGradient::DrawGradient(SDC& dc) const {
  switch (m_mode & 0xFFF0) {
    case HORZ:
      return DrawHorzGradient(dc, m_startRect, m_startColor, m_endColor, m_mode);
    case VERT:
      return DrawVertGradient(dc, m_startRect, m_startColor, m_endColor, m_mode);
    case DIAG_UP:
      return DrawDiagUpGradient(dc, m_startRect, m_startColor, m_endColor, m_mode);
    case DIAG_DOWN:
      return DrawDiagDownGradient(dc, m_startRect, m_startColor, m_endColor, m_mode);
    case CORNER:
      return DrawCornerGradient(dc, m_startRect, m_startColor, m_endColor, m_mode, m_frameType);
    case CENTER:
      return DrawCenterGradient(dc, m_startRect, m_startColor, m_endColor, m_mode, m_frameType);
    case BUTTON:
      return DrawButtonGradient(dc, m_startRect, m_startColor, m_mode, m_frameType);
    case PANEL_3D:
      return Draw3DGradient(dc, m_startRect, m_startColor, m_endColor, m_mode, m_frameType);
    case GRAD_BUTTON:
      return DrawGradButtonGradient(dc, m_startRect, m_startColor, m_endColor, m_mode, m_frameType);
    default:
      return;
  }
}
