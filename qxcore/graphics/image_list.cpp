#include "qxcore/graphics/image_list.h"

#include <utility>

#include "qxcore/graphics/internal/wrapper_map.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(SImageList, SObject, 1)

using ImageListMap = TWrapperMap<SImageList, &SImageList::m_hImageList>;

SImageList::~SImageList() { DeleteImageList(); }

SImageList* SImageList::FromHandle(HIMAGELIST list) {
  return static_cast<SImageList*>(ImageListMap::Instance().FromHandle(list));
}

SImageList* SImageList::FromHandlePermanent(HIMAGELIST list) {
  return static_cast<SImageList*>(ImageListMap::Instance().FromHandlePermanent(list));
}

void SImageList::DeleteTempMap() { ImageListMap::Instance().DeleteTempMap(); }

int SImageList::Attach(HIMAGELIST list) {
  if (!list) return 0;
  if (list == m_hImageList) return 1;
  ImageListMap::Instance().SetPermanent(list, this);
  DeleteImageList();
  m_hImageList = list;
  return 1;
}

HIMAGELIST SImageList::Detach() {
  HIMAGELIST list = std::exchange(m_hImageList, nullptr);
  if (list) ImageListMap::Instance().RemovePermanent(list);
  return list;
}

int SImageList::Create(int width, int height) {
  DeleteImageList();
  return Attach(::ImageList_Create(width, height, ILC_COLOR32 | ILC_MASK, 0, 4));
}

int SImageList::DeleteImageList() {
  HIMAGELIST list = Detach();
  return list && ::ImageList_Destroy(list) ? 1 : 0;
}

SSize SImageList::GetImageSize() const {
  int width = 0, height = 0;
  ::ImageList_GetIconSize(m_hImageList, &width, &height);
  return SSize(width, height);
}

int SImageList::Add(HBITMAP images, HBITMAP mask) { return ::ImageList_Add(m_hImageList, images, mask); }

int SImageList::AddMasked(HBITMAP images, COLORREF transparent) {
  return ::ImageList_AddMasked(m_hImageList, images, transparent);
}

int SImageList::Remove(int index) { return ::ImageList_Remove(m_hImageList, index); }

int SImageList::GetImageCount() const { return ::ImageList_GetImageCount(m_hImageList); }

int SImageList::Draw(HDC dc, int index, const POINT& at, unsigned int style) const {
  return ::ImageList_Draw(m_hImageList, index, dc, at.x, at.y, style);
}
