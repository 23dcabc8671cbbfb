// SNotificationSink: the base class of sinks, which counts the references and registers and unregisters.
// ```cpp
// class TitleKeeper : public SNotificationSink {
//   int WINAPI OnNotification(int kind, void* context, unsigned long data) override {
//     return Keep(kind, context, data);
//   }
// };
// TitleKeeper keeper;
// SNotificationManager::Advise(&keeper, SNotificationManager::NotificationKind(WTEXT("TitleChanged")));
// ```
// A sink ends its registrations when it is destroyed. For the user-interface thread only.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/system/notification_manager.h"

class QXCORE_API SNotificationSink : public ISNotificationSink {
 public:
  // Who ends the object's life.
  enum class Lifetime {
    kOwned,   // its owner; the count is only kept
    kCounted  // the last Release deletes it, so it must be made with new; its maker holds the first reference
  };

  // With one reference, the maker's.
  explicit SNotificationSink(Lifetime lifetime = Lifetime::kOwned) : m_references(1), m_lifetime(lifetime) {}
  SNotificationSink(const SNotificationSink&) = delete;
  SNotificationSink& operator=(const SNotificationSink&) = delete;

  // E_NOINTERFACE: there is no other interface.
  HRESULT WINAPI QueryInterface(const GUID& id, void** object) override;
  ULONG WINAPI AddRef() override;
  ULONG WINAPI Release() override;

 protected:
  virtual ~SNotificationSink();

 private:
  ULONG m_references;
  Lifetime m_lifetime;
};
