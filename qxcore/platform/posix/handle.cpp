#include "qxcore/platform/posix/handle.h"

#include <unistd.h>

#include <cerrno>
#include <mutex>
#include <vector>

namespace platform {
namespace {

struct Slot {
  std::shared_ptr<HandleObject> object;
  DWORD access;
};

// Handle values are four times the slot's number, counted from one.
struct Table {
  std::mutex mutex;
  std::vector<Slot> slots;
  std::vector<std::size_t> unused;
};

Table& TheTable() {
  static Table* table = new Table;  // outlives every static object that may hold a handle
  return *table;
}

Slot* Find(Table& table, HANDLE handle) {
  const auto value = reinterpret_cast<std::uintptr_t>(handle);
  if (value == 0 || value % 4 != 0 || value / 4 > table.slots.size()) return nullptr;
  Slot& slot = table.slots[value / 4 - 1];
  return slot.object != nullptr ? &slot : nullptr;
}

}  // namespace

DWORD OpenFile::Close() {
  if (m_descriptor < 0) return ERROR_SUCCESS;
  const bool isStillNamed = !m_deleteAtClose.empty() && IsNameOf(m_deleteAtClose.c_str(), m_descriptor);
  const int result = close(m_descriptor);
  const int error = errno;
  m_descriptor = -1;
  if (isStillNamed) unlink(m_deleteAtClose.c_str());
  // An interrupted close has closed, too.
  return result == 0 || error == EINTR ? ERROR_SUCCESS : ErrorFromErrno(error);
}

HANDLE AddHandle(std::shared_ptr<HandleObject> object, DWORD access) {
  Table& table = TheTable();
  const std::lock_guard lock(table.mutex);
  return Guarded(INVALID_HANDLE_VALUE, [&] {
    table.unused.reserve(table.slots.size() + 1);
    std::size_t number = table.slots.size();
    if (!table.unused.empty()) {
      number = table.unused.back();
      table.unused.pop_back();
      table.slots[number] = {std::move(object), access};
    } else {
      table.slots.push_back({std::move(object), access});
    }
    return reinterpret_cast<HANDLE>((number + 1) * 4);
  });
}

HandleUse UseHandle(HANDLE handle) {
  Table& table = TheTable();
  const std::lock_guard lock(table.mutex);
  const Slot* slot = Find(table, handle);
  return slot != nullptr ? HandleUse{slot->object, slot->access} : HandleUse{};
}

std::shared_ptr<HandleObject> RemoveHandle(HANDLE handle) {
  Table& table = TheTable();
  const std::lock_guard lock(table.mutex);
  Slot* slot = Find(table, handle);
  if (slot == nullptr) return nullptr;
  std::shared_ptr<HandleObject> object = std::move(slot->object);
  slot->object = nullptr;
  table.unused.push_back(static_cast<std::size_t>(slot - table.slots.data()));  // room was reserved
  return object;
}

FileUse UseFile(HANDLE handle, DWORD access) {
  HandleUse use = UseHandle(handle);
  const auto* file = dynamic_cast<OpenFile*>(use.object.get());
  if (file == nullptr) return FailWith<FileUse>(ERROR_INVALID_HANDLE);
  if ((use.access & access) != access) return FailWith<FileUse>(ERROR_ACCESS_DENIED);
  const int descriptor = file->Descriptor();
  return {std::move(use.object), descriptor};
}

}  // namespace platform
