// What the bars' control classes share: a record each, and painting.
//
// A class keeps its record behind the first pointer of its window's extra bytes, from WM_NCCREATE to WM_NCDESTROY.
#pragma once

#include <new>

#include "qxcore/platform/win32.h"

namespace platform::controls {

// The extra bytes that a control class registers.
inline constexpr int kRecordBytes = sizeof(void*);

// The record of a control; null before WM_NCCREATE and after WM_NCDESTROY.
template <class Record>
Record* RecordOf(HWND control) {
  return reinterpret_cast<Record*>(GetWindowLongPtrW(control, 0));
}

// Makes the record; false without memory, and creating the window fails.
template <class Record>
bool MakeRecord(HWND control) {
  auto* record = new (std::nothrow) Record;
  SetWindowLongPtrW(control, 0, reinterpret_cast<LONG_PTR>(record));
  return record != nullptr;
}

// Ends the record.
template <class Record>
void EndRecord(HWND control) {
  delete RecordOf<Record>(control);
  SetWindowLongPtrW(control, 0, 0);
}

inline DWORD StyleOf(HWND control) { return static_cast<DWORD>(GetWindowLongPtrW(control, GWL_STYLE)); }

// The area inside the window, from the origin on.
RECT ClientOf(HWND control);

inline POINT PointOf(LPARAM lParam) { return {static_cast<short>(LOWORD(lParam)), static_cast<short>(HIWORD(lParam))}; }

// The context of a WM_PAINT or WM_PRINTCLIENT message with the control's font selected; the system's own paint
// cycle unless wParam brings a context.
class Painting {
 public:
  Painting(HWND control, WPARAM wParam, HFONT font);
  ~Painting();
  Painting(const Painting&) = delete;
  Painting& operator=(const Painting&) = delete;
  operator HDC() const { return m_dc; }

 private:
  HWND m_control;
  PAINTSTRUCT m_paint{};
  bool m_isOwn;
  HDC m_dc;
  HGDIOBJ m_formerFont = nullptr;
};

// The classes' procedures.
LRESULT CALLBACK StatusBarProcedure(HWND control, UINT message, WPARAM wParam, LPARAM lParam);
LRESULT CALLBACK ProgressProcedure(HWND control, UINT message, WPARAM wParam, LPARAM lParam);

}  // namespace platform::controls
