// The workbench's commands, as menus, accelerators and scripts name them.
#pragma once

#include "qxcore/platform/win32.h"

enum Command : UINT {
  kOpenFolder = 0x8001,
  kRefresh,
  kConvert,
  kPreview,
  kClosePreview,
  kSelectAll,
  kCancelWork,
  kNextPart,
  kPreviousPart,
  kExit,
  kAbout,
  kSelectionChanged,    // sent by the list, in no menu
  kSortFirst = 0x8020,  // by the columns, in their order
  kSortLast = 0x8023,
  kViewDetected = 0x8040,  // the preview in the encoding that was detected
  kViewFirst = 0x8041,     // in those of kUsualEncodings
  kViewLast = 0x805F,
  kViewOther = 0x8060,  // in one that is asked for
};

// Posted by the thread that looks at a large file when it is done.
inline constexpr UINT kMsgWorkIsDone = WM_APP + 1;
// Posted when the program is interrupted: by Ctrl-C, or by a request to end.
inline constexpr UINT kMsgInterrupted = WM_APP + 2;

// What the menu offers, by the names of the table.
inline constexpr const char* kUsualEncodings[] = {"UTF-8",  "UTF-16LE", "UTF-16BE", "Cp1252", "Cp1250",
                                                  "Cp1251", "Cp437",    "Cp850",    "Cp866",  "Cp932",
                                                  "Cp936",  "Cp949",    "Cp950"};
