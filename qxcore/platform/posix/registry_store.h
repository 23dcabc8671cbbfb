// The registry of the process: its database, keys and values, for one thread at a time.
#pragma once

#include <mutex>

#include "qxcore/platform/posix/registry_keys.h"
#include "qxcore/platform/posix/registry_values.h"

namespace platform {

class RegistryStore {
 public:
  // The store of the process, locked and up to date.
  class Use {
   public:
    explicit Use(bool mayChangeDatabase) : m_lock(Instance().m_mutex) {
      Instance().database.Refresh(mayChangeDatabase);
    }
    RegistryStore* operator->() const { return &Instance(); }

   private:
    std::lock_guard<std::mutex> m_lock;
  };

  RegistryDatabase database;
  RegistryKeys keys{database};
  RegistryValues values{database};

 private:
  static RegistryStore& Instance();

  std::mutex m_mutex;
};

}  // namespace platform
