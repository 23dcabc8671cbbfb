#include "qxcore/platform/posix/registry_store.h"

#include <cstdlib>

namespace platform {

// Never destroyed: programs may use the registry in their own last moments. What is open when the process
// ends is closed before, which tidies the files up.
RegistryStore& RegistryStore::Instance() {
  static RegistryStore* const store = [] {
    auto* made = new RegistryStore;
    std::atexit([] {
      const std::lock_guard<std::mutex> lock(Instance().m_mutex);
      Instance().database.Close();
    });
    return made;
  }();
  return *store;
}

}  // namespace platform
