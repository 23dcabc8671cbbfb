// The parts of DefWindowProcW, each in the source of its subject. Called without the lock.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

// text.cpp
bool SetText(HWND window, LPCWSTR text);
LRESULT DefaultSetText(HWND window, LPCWSTR text);
LRESULT DefaultGetText(HWND window, WPARAM capacity, LPWSTR buffer);
LRESULT DefaultGetTextLength(HWND window);

// frame.cpp
bool IsTopLevel(HWND window);
void PaintFrame(HWND window);
LRESULT DefaultCalcSize(HWND window, BOOL valid, LPARAM lParam);
LRESULT DefaultHitTest(HWND window, POINT point);
LRESULT DefaultNcActivate(HWND window, BOOL active);

// place.cpp
LRESULT DefaultPosChanging(HWND window, WINDOWPOS* place);
LRESULT DefaultPosChanged(HWND window, const WINDOWPOS* place);

// show.cpp
LRESULT DefaultShowWindow(HWND window, BOOL show, LPARAM why);

// paint.cpp
LRESULT DefaultSetRedraw(HWND window, BOOL redraw);
LRESULT DefaultEraseBackground(HWND window, HDC context);
LRESULT DefaultPaint(HWND window);

// mouse.cpp
LRESULT DefaultMouseActivate(HWND window, WPARAM wParam, LPARAM lParam);
LRESULT DefaultSetCursor(HWND window, WPARAM wParam, LPARAM lParam);

// sys_command.cpp
LRESULT DefaultNcButtonDown(HWND window, WPARAM hit, LPARAM lParam);
LRESULT DefaultNcDoubleClick(HWND window, WPARAM hit, LPARAM lParam);
LRESULT DefaultSysCommand(HWND window, WPARAM command, LPARAM lParam);
LRESULT DefaultKey(HWND window, UINT message, WPARAM wParam, LPARAM lParam);

}  // namespace platform::model
