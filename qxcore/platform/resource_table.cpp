#include "qxcore/platform/resource_table.h"

#include <mutex>
#include <new>
#include <string>
#include <vector>

#include "qxcore/platform/bmp.h"

namespace platform {
namespace {

// A name, folded; a number is the text "#123".
using Name = std::basic_string<WCHAR>;

Name NameOf(LPCWSTR given) {
  const auto number = reinterpret_cast<std::uintptr_t>(given);
  if (number > 0xFFFF) {
    Name text(given);
    for (WCHAR& c : text) c = ToUpperBmp(c);
    return text;
  }
  Name name(1, '#');
  for (std::uintptr_t place = 10000; place > 0; place /= 10)
    if (number >= place || place == 1) name += static_cast<WCHAR>('0' + number / place % 10);
  return name;
}

struct Entry {
  HINSTANCE module;
  Name type, name;
  ResourceBytes bytes;
};

struct Table {
  std::mutex mutex;
  std::vector<Entry> entries;
};

Table& TheTable() {
  static Table* table = new Table;  // outlives every static object that may ask
  return *table;
}

Entry* Find(Table& table, HINSTANCE module, const Name& type, const Name& name) {
  for (Entry& entry : table.entries)
    if (entry.module == module && entry.type == type && entry.name == name) return &entry;
  return nullptr;
}

HINSTANCE Module(HINSTANCE given) { return given != nullptr ? given : GetModuleHandleW(nullptr); }

}  // namespace

bool RegisterResource(HINSTANCE given, LPCWSTR type, LPCWSTR name, const void* data, std::size_t size) {
  try {
    const HINSTANCE module = Module(given);
    const Name typeName = NameOf(type), ownName = NameOf(name);
    Table& table = TheTable();
    const std::lock_guard lock(table.mutex);
    if (Entry* entry = Find(table, module, typeName, ownName)) {
      entry->bytes = {data, size};
    } else {
      table.entries.push_back({module, typeName, ownName, {data, size}});
    }
    return true;
  } catch (const std::bad_alloc&) {
    return false;
  }
}

ResourceBytes FindRegisteredResource(HINSTANCE given, LPCWSTR type, LPCWSTR name) noexcept {
  try {
    const HINSTANCE module = Module(given);
    const Name typeName = NameOf(type), ownName = NameOf(name);
    Table& table = TheTable();
    const std::lock_guard lock(table.mutex);
    const Entry* entry = Find(table, module, typeName, ownName);
    return entry != nullptr ? entry->bytes : ResourceBytes{};
  } catch (const std::bad_alloc&) {
    return {};
  }
}

std::size_t RegisteredResourceSize(const void* data) noexcept {
  Table& table = TheTable();
  const std::lock_guard lock(table.mutex);
  for (const Entry& entry : table.entries)
    if (entry.bytes.data == data) return entry.bytes.size;
  return 0;
}

}  // namespace platform
