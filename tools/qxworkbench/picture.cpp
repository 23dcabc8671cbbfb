#include "tools/qxworkbench/picture.h"

#include "qxcore/graphics/picture.h"
#include "qxcore/graphics/window_dc.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

void SavePicture(SWnd& window, const SString& file) {
  ::RedrawWindow(window.m_hWnd, nullptr, nullptr, RDW_UPDATENOW | RDW_ALLCHILDREN);
  const SRect whole(SPoint(0, 0), window.GetWindowRect().Size());
  SWindowDC screen(window.m_hWnd);
  SMemoryDC dc(screen);
  SBitmap bitmap;
  bitmap.CreatePixels(whole.Width(), whole.Height());
  {
    const SSelectObject selected(dc, bitmap.m_hObject);
    dc.BitBlt(whole, screen, SPoint(0, 0));
  }
  const HRESULT result = SWritePicture(file, static_cast<HBITMAP>(bitmap.m_hObject));
  if (result != S_OK) throw Failure{SystemText(static_cast<DWORD>(result) & 0xFFFF), kFailed, ToUtf8(file)};
}
