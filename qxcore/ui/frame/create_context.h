// SCreateContext: what a frame's client is created from; passed on through Create to WM_CREATE.
// For the user-interface thread.
#pragma once

#include "qxcore/core/object.h"

class SCmdTarget;
class SFrameWnd;

struct SCreateContext {
  SClassInfo* m_viewClass = nullptr;    // the class of the view that fills the frame; null for no view
  SCmdTarget* m_document = nullptr;     // what the view shows, or null; not owned
  SFrameWnd* m_currentFrame = nullptr;  // the frame on which a new one is modelled, or null
};
