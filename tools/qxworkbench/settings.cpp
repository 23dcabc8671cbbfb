#include "tools/qxworkbench/settings.h"

#include "qxcore/system/settings/registry.h"

static SString Key() { return SRegistry::GetApplicationPath(WTEXT("Workbench")); }

SString ReadSetting(const SString& name) {
  SString value;
  const SRegistry key(HKEY_CURRENT_USER, Key(), 0);
  key.GetProfile(name, &value, SString());
  return value;
}

void KeepSetting(const SString& name, const SString& value) {
  if (ReadSetting(name) == value) return;  // writing waits for the disk
  SRegistry(HKEY_CURRENT_USER, Key(), 1).WriteProfile(name, value);
}
