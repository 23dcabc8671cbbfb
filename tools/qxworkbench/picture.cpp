#include "tools/qxworkbench/picture.h"

#include "qxcore/graphics/picture.h"
#include "qxcore/graphics/window_dc.h"
#include "tools/common/failure.h"
#include "tools/common/utf8.h"

void SavePicture(SWnd& window, const SString& file) {
  ::RedrawWindow(window.m_hWnd, nullptr, nullptr, RDW_UPDATENOW | RDW_ALLCHILDREN);
  const SRect whole(SPoint(0, 0), window.GetWindowRect().Size());
  const HRESULT result = SWritePicture(file, SWindowDC(window.m_hWnd), whole);
  if (result != S_OK) throw Failure{SystemText(static_cast<DWORD>(result) & 0xFFFF), kFailed, ToUtf8(file)};
}
