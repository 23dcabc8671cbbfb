// The published interfaces of embedded documents that the library calls. On Windows they come from <oleidl.h>;
// elsewhere they are declared here, for programs that implement them.
// Threads: the functions may be called in any thread.
#pragma once

#include "qxcore/platform/win32.h"

#ifdef _WIN32

#include <oleidl.h>

#else

struct IOleInPlaceActiveObject;
struct MSG;
struct OLEMENUGROUPWIDTHS;

// The frame window of an application that shows embedded documents in place; the order of its functions is the
// published one. The library calls EnableModeless alone.
struct IOleInPlaceFrame {
  // As published; the library does not call them.
  virtual HRESULT WINAPI QueryInterface(const GUID& id, void** object) = 0;
  virtual ULONG WINAPI AddRef() = 0;
  virtual ULONG WINAPI Release() = 0;
  virtual HRESULT WINAPI GetWindow(HWND* window) = 0;
  virtual HRESULT WINAPI ContextSensitiveHelp(BOOL enter) = 0;
  virtual HRESULT WINAPI GetBorder(RECT* border) = 0;
  virtual HRESULT WINAPI RequestBorderSpace(const RECT* widths) = 0;
  virtual HRESULT WINAPI SetBorderSpace(const RECT* widths) = 0;
  virtual HRESULT WINAPI SetActiveObject(IOleInPlaceActiveObject* object, LPCWSTR name) = 0;
  virtual HRESULT WINAPI InsertMenus(HMENU menu, OLEMENUGROUPWIDTHS* widths) = 0;
  virtual HRESULT WINAPI SetMenu(HMENU menu, HGLOBAL descriptor, HWND active) = 0;
  virtual HRESULT WINAPI RemoveMenus(HMENU menu) = 0;
  virtual HRESULT WINAPI SetStatusText(LPCWSTR text) = 0;
  // FALSE disables the frame's modeless dialogs, TRUE enables them.
  virtual HRESULT WINAPI EnableModeless(BOOL enable) = 0;
  // As published; the library does not call it.
  virtual HRESULT WINAPI TranslateAccelerator(MSG* message, WORD id) = 0;

 protected:
  ~IOleInPlaceFrame() = default;
};

#endif
