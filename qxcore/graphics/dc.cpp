#include "qxcore/graphics/dc.h"

#include <utility>

#include "qxcore/graphics/internal/wrapper_map.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SDC, SObject, 1)
QXCORE_IMPLEMENT_CREATABLE_CLASS(SMemoryDC, SDC, 1)

using ContextMap = TWrapperMap<SDC, &SDC::m_hDC>;

SDC::~SDC() { DeleteDC(); }

SDC* SDC::FromHandle(HDC dc) { return static_cast<SDC*>(ContextMap::Instance().FromHandle(dc)); }

SDC* SDC::FromHandlePermanent(HDC dc) { return static_cast<SDC*>(ContextMap::Instance().FromHandlePermanent(dc)); }

void SDC::DeleteTempMap() { ContextMap::Instance().DeleteTempMap(); }

int SDC::Attach(HDC dc) {
  if (!dc) return 0;
  if (dc == m_hDC) return 1;
  ContextMap::Instance().SetPermanent(dc, this);
  DeleteDC();
  m_hDC = dc;
  return 1;
}

HDC SDC::Detach() {
  HDC dc = std::exchange(m_hDC, nullptr);
  if (dc) ContextMap::Instance().RemovePermanent(dc);
  return dc;
}

int SDC::DeleteDC() {
  HDC dc = Detach();
  return dc && ::DeleteDC(dc) ? 1 : 0;
}

static HDC HandleOrNull(const SDC* dc) { return dc != nullptr ? dc->m_hDC : nullptr; }

HDC SDC::GetSafeHdc() const { return HandleOrNull(this); }

bool SDC::IsMetafile() const {
  DWORD type = ::GetObjectType(m_hDC);
  return type == OBJ_METADC || type == OBJ_ENHMETADC;
}

// --- settings whose former value the system returns through a pointer ---

template <class Value, class Call>
static Value Former(Call call, HDC dc, int first, int second) {
  Value former;
  call(dc, first, second, &former);
  return former;
}

SPoint SDC::SetBrushOrg(const POINT& origin) { return Former<SPoint>(::SetBrushOrgEx, m_hDC, origin.x, origin.y); }
SPoint SDC::SetViewportOrg(const POINT& origin) {
  return Former<SPoint>(::SetViewportOrgEx, m_hDC, origin.x, origin.y);
}
SPoint SDC::OffsetViewportOrg(const SIZE& distance) {
  return Former<SPoint>(::OffsetViewportOrgEx, m_hDC, distance.cx, distance.cy);
}
SPoint SDC::SetWindowOrg(const POINT& origin) { return Former<SPoint>(::SetWindowOrgEx, m_hDC, origin.x, origin.y); }
SSize SDC::SetViewportExt(const SIZE& extent) { return Former<SSize>(::SetViewportExtEx, m_hDC, extent.cx, extent.cy); }
SSize SDC::SetWindowExt(const SIZE& extent) { return Former<SSize>(::SetWindowExtEx, m_hDC, extent.cx, extent.cy); }
SPoint SDC::MoveTo(const POINT& to) { return Former<SPoint>(::MoveToEx, m_hDC, to.x, to.y); }

SRect SDC::GetClipBox() const {
  SRect box;
  ::GetClipBox(m_hDC, &box);
  return box;
}

SSize SDC::GetTextExtent(SStringView text) const {
  SSize size;
  ::GetTextExtentPoint32W(m_hDC, text.data(), static_cast<int>(text.size()), &size);
  return size;
}

// --- fills ---

void SDC::FillSolidRect(const RECT& rect, COLORREF color) {
  COLORREF former = SetBkColor(color);
  ::ExtTextOutW(m_hDC, 0, 0, ETO_OPAQUE, &rect, WTEXT(""), 0, nullptr);
  SetBkColor(former);
}

void SDC::Draw3dRect(const RECT& rect, COLORREF topLeft, COLORREF bottomRight) {
  FillSolidRect(SRect(rect.left, rect.top, rect.right - 1, rect.top + 1), topLeft);
  FillSolidRect(SRect(rect.left, rect.top, rect.left + 1, rect.bottom - 1), topLeft);
  FillSolidRect(SRect(rect.right - 1, rect.top, rect.right, rect.bottom), bottomRight);
  FillSolidRect(SRect(rect.left, rect.bottom - 1, rect.right, rect.bottom), bottomRight);
}
