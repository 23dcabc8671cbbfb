#include "qxcore/system/notification_sink.h"

SNotificationSink::~SNotificationSink() {
  m_lifetime = Lifetime::kOwned;  // giving the manager's reference back must not delete it again
  SNotificationManager::UnadviseAll(this);
}

HRESULT SNotificationSink::QueryInterface(const GUID&, void** object) {
  if (object != nullptr) *object = nullptr;
  return E_NOINTERFACE;
}

ULONG SNotificationSink::AddRef() { return ++m_references; }

ULONG SNotificationSink::Release() {
  const ULONG left = --m_references;
  if (left == 0 && m_lifetime == Lifetime::kCounted) delete this;
  return left;
}
