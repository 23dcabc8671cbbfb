#include "qxcore/ui/window/internal/resources.h"

#include <cstring>

#include "qxcore/container/table_dumb.h"
#include "qxcore/core/module_state.h"
#include "qxcore/platform/resource_table.h"

namespace {

const LPCWSTR kMenu = MAKEINTRESOURCEW(4);
const LPCWSTR kAccelerators = MAKEINTRESOURCEW(9);

// One key of an accelerator table in a module's resources.
struct KeyEntry {
  WORD flags, key, command, padding;
};
constexpr WORD kLastEntry = 0x80;

}  // namespace

const void* SFindResource(LPCWSTR name, LPCWSTR type) {
  if (name == nullptr) return nullptr;
  const HINSTANCE module = SGetResInstance(name, type);
  for (const HINSTANCE owner : {module, HINSTANCE{nullptr}}) {
    if (const void* data = platform::FindRegisteredResource(owner, type, name).data) return data;
  }
  for (const HINSTANCE owner : {module, HINSTANCE{nullptr}}) {
    if (const HRSRC resource = ::FindResourceW(owner, name, type)) {
      return ::LockResource(::LoadResource(owner, resource));
    }
  }
  return nullptr;
}

HMENU SLoadMenu(LPCWSTR name) {
  const void* data = SFindResource(name, kMenu);
  return data != nullptr ? ::LoadMenuIndirectW(data) : nullptr;
}

HACCEL SLoadAccelerators(LPCWSTR name) {
  const auto* data = static_cast<const unsigned char*>(SFindResource(name, kAccelerators));
  if (data == nullptr) return nullptr;
  STableDumb<ACCEL> keys;
  for (KeyEntry entry{}; (entry.flags & kLastEntry) == 0; data += sizeof(entry)) {
    std::memcpy(&entry, data, sizeof(entry));
    ACCEL key{};
    key.fVirt = static_cast<BYTE>(entry.flags & 0x7F);
    key.key = entry.key;
    key.cmd = entry.command;
    keys.Add(key);
  }
  return ::CreateAcceleratorTableW(&keys[0], keys.GetCount());
}
