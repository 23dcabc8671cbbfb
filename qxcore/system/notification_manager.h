// SNotificationManager: broadcasts events of numbered kinds to whoever registered.
//
// A sink registers for a kind, for events about one context object or about any. Notify calls the sinks of
// a kind in a fixed order: those of AdviseFirst, the last one registered first; those of Advise and then
// those of AdviseLast, each in the order of registration. The same registration made twice is called twice.
//
// For the user-interface thread only; nothing is locked. A sink may advise, unadvise and notify while it is
// being called: a pass goes over the registrations that there were when it began. So a sink that is
// unregistered during a pass can still be called in it: keep it alive until the pass has ended.
//
// Registering, and a pass over more than 32 registrations, take memory: failures throw SEOutOfMemory, leave the
// registrations as they were and call nobody. Unregistering takes none.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

// Receives notifications. The object counts its references by itself, and its first three functions are those of the
// platform's IUnknown.
class ISNotificationSink {
 public:
  // Asks for another interface of the object; nobody in the library does. S_OK and a new reference in *object,
  // or E_NOINTERFACE and null.
  virtual HRESULT WINAPI QueryInterface(const GUID& id, void** object) = 0;
  // Count references; both return the new count, and the object may delete itself at 0.
  virtual ULONG WINAPI AddRef() = 0;
  virtual ULONG WINAPI Release() = 0;
  // An event of the kind; context and data are those of Notify. The result is ignored.
  virtual int WINAPI OnNotification(int kind, void* context, unsigned long data) = 0;

 protected:
  ~ISNotificationSink() = default;
};

class QXCORE_API SNotificationManager {
 public:
  SNotificationManager() = delete;

  // The number of the kind with this name, from 1 on; a new name gets the next number. Names are distinguished
  // by case; a null name is an empty one. Numbers hold for the life of the process.
  static int NotificationKind(const WCHAR* name);

  // Register a sink, which is not owned, for a kind; a null context stands for any. The manager takes one
  // reference on a sink at its first registration, and releases it in UnadviseAll. Always 1.
  // The places of later registrations follow from how many were ever made with AdviseFirst and AdviseLast
  // while the kind has had registrations without a break, also if some are gone, on purpose.
  static int Advise(ISNotificationSink* sink, int kind, void* context = nullptr);
  static int AdviseFirst(ISNotificationSink* sink, int kind, void* context = nullptr);
  static int AdviseLast(ISNotificationSink* sink, int kind, void* context = nullptr);

  // Removes the sink's registrations for the kind: with a null context all, else those for this context and
  // those for any. 1 when something was removed, else 0. The manager's reference stays until UnadviseAll, also
  // when nothing is registered any more, on purpose.
  static int Unadvise(ISNotificationSink* sink, int kind, void* context = nullptr);
  // Removes all registrations of the sink and releases it. 1, or 0 when it was never registered since the last
  // call.
  static int UnadviseAll(ISNotificationSink* sink);

  // Calls the sinks that are registered for the kind and for any context, for this one, or, with a null
  // context, for whichever. Returns the number of the kind's registrations, called or not; 0 when there are none
  // or the kind is below 1.
  static int Notify(int kind, void* context, unsigned long data);
};
