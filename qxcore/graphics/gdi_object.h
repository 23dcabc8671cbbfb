// SGdiObject: an object around the handle of a drawing object (pen, brush, bitmap, region; fonts: font.h).
//
// The object owns its handle: it deletes it when it ends, when it attaches another one and in DeleteObject.
// Handles of stock objects may be attached; the system ignores their deletion. A drawing object may be deleted
// while it is selected into a context: the system keeps it for that context until another one is selected, and
// only its handle is gone. Objects cannot be copied. They belong to the thread of the user interface.
//
// What makes a handle returns 1, or 0 when the system refuses (GetLastError says why); then the object is
// without a handle.
#pragma once

#include "qxcore/core/object.h"

class SHandleMap;

class QXCORE_API SGdiObject : public SObject {
  QXCORE_DECLARE_CREATABLE_CLASS(SGdiObject)

  // Without a handle, or the owner of `object`.
  SGdiObject();
  explicit SGdiObject(HGDIOBJ object);
  ~SGdiObject() override;
  SGdiObject(const SGdiObject&) = delete;
  SGdiObject& operator=(const SGdiObject&) = delete;

  // The object that holds a handle: the one that attached it, or else a temporary one that lives until the
  // application is idle and never deletes the handle. Null for null.
  static SGdiObject* FromHandle(HGDIOBJ object);
  // The object that attached a handle, or null.
  static SGdiObject* FromHandlePermanent(HGDIOBJ object);
  // Ends the temporary objects.
  static void DeleteTempMap();

  // Takes over a handle; what was held before is deleted. Returns 0 and changes nothing for null. When
  // SEOutOfMemory is thrown the handle stays the caller's.
  int Attach(HGDIOBJ object);
  // Gives the handle up without deleting it, and returns it.
  HGDIOBJ Detach();
  // Deletes the handle. Returns 1 if there was one and the system took it back.
  int DeleteObject();

  // The handle; null for a null object pointer, too.
  HGDIOBJ GetSafeHandle() const;
  // The OBJ_ number of the kind, 0 without a valid handle.
  unsigned int GetType() const { return ::GetObjectType(m_hObject); }
  // Copies the description (LOGPEN, LOGBRUSH, BITMAP, LOGFONTW) as GetObjectW does; returns its bytes, or 0.
  int GetObjectW(int size, void* buffer) const { return ::GetObjectW(m_hObject, size, buffer); }

  HGDIOBJ m_hObject = nullptr;  // the handle; set it by Attach and Detach

 protected:
  // For a class whose handles stand in a map of their own.
  explicit SGdiObject(SHandleMap& map) : m_map(&map) {}
  // Takes over the result of a system call; 0 for null, and then nothing is held.
  int Hold(HGDIOBJ made);

 private:
  SHandleMap* m_map;
};
