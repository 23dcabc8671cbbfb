#include "qxcore/platform/posix/draw/recorder.h"

using namespace draw;

namespace {

// A frame is in 0.01 mm, by the screen's size in both units.
RECT InPixels(HDC dc, const RECT& frame) {
  int width = GetDeviceCaps(dc, HORZRES), height = GetDeviceCaps(dc, VERTRES);
  int across = GetDeviceCaps(dc, HORZSIZE) * 100, down = GetDeviceCaps(dc, VERTSIZE) * 100;
  return {MulDiv(frame.left, width, across), MulDiv(frame.top, height, down), MulDiv(frame.right, width, across),
          MulDiv(frame.bottom, height, down)};
}

HDC BeginRecording(DWORD type, LPCWSTR file, const RECT* frame) {
  if (file) return Fail<HDC>(nullptr, ERROR_NOT_SUPPORTED);
  auto recorder = std::make_unique<Recorder>();
  Ref<Context> dc(new Context(type));
  if (!dc) return NoMemory(HDC{});
  dc->m_recorder = std::move(recorder);
  HDC handle = EnterAs<HDC>(dc.get());
  if (handle && frame) dc->m_recorder->m_frame = InPixels(handle, *frame);
  return handle;
}

template <class Handle>
Handle EndRecording(HDC handle, DWORD contextType, DWORD type) {
  auto* dc = Find<Context>(handle);
  if (!dc || dc->m_type != contextType) return Fail<Handle>(nullptr, ERROR_INVALID_HANDLE);
  Ref<Object> keep = Remove(handle);
  if (dc->m_recorder->m_isBroken) return NoMemory(Handle{});
  return EnterAs<Handle>(new Metafile(type, std::move(dc->m_recorder->m_calls), dc->m_recorder->m_frame));
}

Ref<Metafile> FindMetafile(HANDLE handle, DWORD type) {
  auto* metafile = Find<Metafile>(handle);
  return metafile && metafile->m_type == type ? metafile : nullptr;
}

BOOL DeleteMetafile(HANDLE handle, DWORD type) { return FindMetafile(handle, type) && Remove(handle); }

void Play(HDC dc, const Metafile& metafile) {
  for (const Call& call : metafile.m_calls) call(dc);
}

}  // namespace

HDC CreateMetaFileW(LPCWSTR file) try {
  return BeginRecording(OBJ_METADC, file, nullptr);
} catch (const std::bad_alloc&) {
  return NoMemory(HDC{});
}

HMETAFILE CloseMetaFile(HDC dc) { return EndRecording<HMETAFILE>(dc, OBJ_METADC, OBJ_METAFILE); }

// What the calls select stays selected no longer than they play.
BOOL PlayMetaFile(HDC handle, HMETAFILE metafileHandle) {
  auto* dc = Find<Context>(handle);
  Ref<Metafile> metafile = FindMetafile(metafileHandle, OBJ_METAFILE);
  if (!dc || !metafile) return FALSE;
  Settings& set = dc->m_settings;
  Ref<Pen> pen = set.pen;
  Ref<Brush> brush = set.brush;
  Ref<FontObject> font = set.font;
  Play(handle, *metafile);
  set.pen = pen, set.brush = brush, set.font = font;
  return TRUE;
}

BOOL DeleteMetaFile(HMETAFILE metafile) { return DeleteMetafile(metafile, OBJ_METAFILE); }

HDC CreateEnhMetaFileW(HDC, LPCWSTR file, const RECT* frame, LPCWSTR) try {
  return BeginRecording(OBJ_ENHMETADC, file, frame);
} catch (const std::bad_alloc&) {
  return NoMemory(HDC{});
}

HENHMETAFILE CloseEnhMetaFile(HDC dc) { return EndRecording<HENHMETAFILE>(dc, OBJ_ENHMETADC, OBJ_ENHMETAFILE); }

// All settings are the target's again afterwards. Without a frame the picture plays unscaled at the corner of `rect`.
BOOL PlayEnhMetaFile(HDC handle, HENHMETAFILE metafileHandle, const RECT* rect) {
  auto* dc = Find<Context>(handle);
  Ref<Metafile> metafile = FindMetafile(metafileHandle, OBJ_ENHMETAFILE);
  if (!dc || !metafile) return FALSE;
  Box box = dc->Map(*rect);
  const RECT& frame = metafile->m_frame;
  int width = frame.right - frame.left, height = frame.bottom - frame.top;
  double scaleX = width > 0 ? double(box.x2 - box.x1) / width : 1;
  double scaleY = height > 0 ? double(box.y2 - box.y1) / height : 1;
  int saved = SaveDC(handle);
  if (saved == 0) return FALSE;
  SetMapMode(handle, MM_TEXT);
  SetViewportOrgEx(handle, 0, 0, nullptr);
  SetWindowOrgEx(handle, 0, 0, nullptr);
  dc->SetPlayback(scaleX, scaleY, box.x1 - dc->m_origin.x - frame.left * scaleX,
                  box.y1 - dc->m_origin.y - frame.top * scaleY);
  Play(handle, *metafile);
  dc->EndPlayback();
  return RestoreDC(handle, saved);
}

BOOL DeleteEnhMetaFile(HENHMETAFILE metafile) { return DeleteMetafile(metafile, OBJ_ENHMETAFILE); }
