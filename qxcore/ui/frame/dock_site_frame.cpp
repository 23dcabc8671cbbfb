#include "qxcore/ui/frame/dock_site_frame.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SDockSiteFrameWnd, SFrameWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(SDockSiteFrameWnd, SFrameWnd)

SDockSiteFrameWnd::~SDockSiteFrameWnd() = default;
