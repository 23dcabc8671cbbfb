// What the painting of frames and of the control classes shares.
#pragma once

#include "qxcore/platform/posix/controls/control.h"
#include "qxcore/platform/posix/window/scroll.h"

namespace platform::controls {

// Adds the frames and menus to the table of painting functions that the window model asks.
void InstallPainter();

// The font of menus, captions and controls that were given none. It is the layer's own and stays.
HFONT InterfaceFont();

// A text by DrawTextW's rules, in a COLOR_ colour; a null font is the interface font.
void PaintText(HDC dc, RECT rect, LPCWSTR text, int color, HFONT font, UINT format);

void PaintScrollBar(HDC dc, const RECT& rect, const model::ScrollBar& bar, bool isVertical);

// The procedures of the control classes.
LRESULT CALLBACK ButtonProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
LRESULT CALLBACK StaticProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
LRESULT CALLBACK EditProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
LRESULT CALLBACK ScrollBarProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
LRESULT CALLBACK StatusBarProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);
LRESULT CALLBACK ProgressProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam);

}  // namespace platform::controls
