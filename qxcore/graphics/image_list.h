// SImageList: small pictures of one size, drawn by number. Threads: an object belongs to one thread at a time.
#pragma once

#include "qxcore/core/object.h"
#include "qxcore/graphics/rect.h"

// Owns its handle, as SGdiObject does. Results are 1, or 0 on failure, unless said otherwise.
class QXCORE_API SImageList : public SObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SImageList)

  SImageList() = default;
  explicit SImageList(HIMAGELIST list) { Attach(list); }
  ~SImageList() override;
  SImageList(const SImageList&) = delete;
  SImageList& operator=(const SImageList&) = delete;

  // As those of SGdiObject.
  static SImageList* FromHandle(HIMAGELIST list);
  static SImageList* FromHandlePermanent(HIMAGELIST list);
  static void DeleteTempMap();
  int Attach(HIMAGELIST list);
  HIMAGELIST Detach();

  // An empty list of pictures of this size in pixels, with masks.
  int Create(int width, int height);
  // Deletes the list.
  int DeleteImageList();
  // Adds the pictures that stand side by side in a bitmap; black in `mask`, or every colour but `transparent`, is
  // drawn. Returns the number of the first one, or -1. The bitmap stays the caller's.
  int Add(HBITMAP images, HBITMAP mask);
  int AddMasked(HBITMAP images, COLORREF transparent);
  // Removes one; those behind it move up. -1 removes all.
  int Remove(int index);
  // How many there are.
  int GetImageCount() const;
  // The size of each in pixels.
  SSize GetImageSize() const;
  // Draws one with its top left corner at a point; `style` is ILD_NORMAL or ILD_TRANSPARENT.
  int Draw(HDC dc, int index, const POINT& at, unsigned int style = ILD_NORMAL) const;

  HIMAGELIST m_hImageList = nullptr;  // the handle; set it by Attach and Detach
};
