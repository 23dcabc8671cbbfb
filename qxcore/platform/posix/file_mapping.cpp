// File mappings and their views.

#include <fcntl.h>
#include <sys/mman.h>
#include <sys/stat.h>
#include <sys/uio.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <limits>
#include <map>
#include <mutex>
#include <string>

#include "qxcore/platform/internal/view.h"
#include "qxcore/platform/posix/handle.h"
#include "qxcore/platform/posix/shared_name.h"

namespace {

using namespace platform;

constexpr std::uint64_t kGranularity = 65536;  // of offsets, as GetSystemInfo says

class Mapping final : public HandleObject {
 public:
  Mapping(int descriptor, std::uint64_t size, DWORD protection, std::string sharedName)
      : m_descriptor(descriptor), m_size(size), m_protection(protection), m_sharedName(std::move(sharedName)) {}
  Mapping(const Mapping&) = delete;
  Mapping& operator=(const Mapping&) = delete;
  ~Mapping() override {
    if (m_sharedName.empty()) {
      close(m_descriptor);
    } else {
      CloseSharedMemory(m_sharedName, m_descriptor);
    }
  }

  int Descriptor() const { return m_descriptor; }
  std::uint64_t Size() const { return m_size; }
  DWORD Protection() const { return m_protection; }

 private:
  int m_descriptor;
  std::uint64_t m_size;
  DWORD m_protection;
  std::string m_sharedName;  // empty when other processes do not know it
};

struct View {
  std::size_t length;
  std::uint64_t offset;
  int protection;
  bool isFlushed;  // shared with the file
  std::shared_ptr<Mapping> mapping;
};

struct Tables {
  std::mutex mutex;
  std::map<std::uintptr_t, View> views;                    // by their start
  std::map<std::u16string, std::weak_ptr<Mapping>> names;  // of this process
};

Tables& TheTables() {
  static Tables* tables = new Tables;  // outlives every static object that may hold a view
  return *tables;
}

// The descriptor of the mapping, which lives on when the file's handle is closed; without the locks of
// the handle's sharing mode, where the system can do that.
int Reopen(int descriptor, bool writes) {
  const std::string path = "/proc/self/fd/" + std::to_string(descriptor);
  const int again = open(path.c_str(), (writes ? O_RDWR : O_RDONLY) | O_CLOEXEC);
  return again >= 0 ? again : fcntl(descriptor, F_DUPFD_CLOEXEC, 0);
}

// The size of a mapping of a file, which grows to it; 0 and the error set on failure.
std::uint64_t FitFile(int descriptor, std::uint64_t wanted, bool writes) {
  struct stat info;
  DWORD error = ERROR_SUCCESS;
  if (fstat(descriptor, &info) != 0) {
    error = ErrorFromErrno(errno);
  } else if (const auto size = static_cast<std::uint64_t>(info.st_size); wanted == 0) {
    if (size > 0) return size;
    error = ERROR_FILE_INVALID;
  } else if (wanted <= size) {
    return wanted;
  } else if (!writes) {
    error = ERROR_NOT_ENOUGH_MEMORY;
  } else if (wanted <= static_cast<std::uint64_t>(std::numeric_limits<off_t>::max()) &&
             ftruncate(descriptor, static_cast<off_t>(wanted)) == 0) {
    return wanted;
  } else {
    error = ERROR_DISK_FULL;
  }
  return FailWith<std::uint64_t>(error);
}

std::shared_ptr<Mapping> MapFile(HANDLE handle, DWORD protection, std::uint64_t size) {
  const bool writes = protection == PAGE_READWRITE;
  const FileUse file = UseFile(handle, writes ? GENERIC_READ | GENERIC_WRITE : GENERIC_READ);
  if (file.descriptor < 0) return nullptr;
  size = FitFile(file.descriptor, size, writes);
  if (size == 0) return nullptr;
  const int descriptor = Reopen(file.descriptor, writes);
  if (descriptor < 0) return FailWith<std::shared_ptr<Mapping>>(ErrorFromErrno(errno));
  return std::make_shared<Mapping>(descriptor, size, protection, std::string());
}

std::shared_ptr<Mapping> MapMemory(DWORD protection, std::uint64_t size, LPCWSTR name, bool& existed) {
  SharedMemory memory;
  std::string object;
  if (size == 0 || size > static_cast<std::uint64_t>(std::numeric_limits<off_t>::max())) {
    memory.error = size == 0 ? ERROR_INVALID_PARAMETER : ERROR_NOT_ENOUGH_MEMORY;
  } else if (name != nullptr) {
    memory.error = NameOfSharedMemory(name, object);
    if (memory.error == ERROR_SUCCESS) memory = OpenSharedMemory(object, size);
  } else {
    memory.size = size;
    memory.descriptor = memfd_create("qxcore", MFD_CLOEXEC);
    if (memory.descriptor < 0 || ftruncate(memory.descriptor, static_cast<off_t>(size)) != 0)
      memory.error = ErrorFromErrno(errno);
  }
  existed = memory.existed;
  if (memory.error == ERROR_SUCCESS)
    return std::make_shared<Mapping>(memory.descriptor, memory.size, protection, std::move(object));
  if (memory.descriptor >= 0) close(memory.descriptor);
  return FailWith<std::shared_ptr<Mapping>>(memory.error);
}

std::shared_ptr<Mapping> MakeMapping(HANDLE file, DWORD protection, std::uint64_t size, LPCWSTR name, bool& existed) {
  if (protection != PAGE_READONLY && protection != PAGE_READWRITE && protection != PAGE_WRITECOPY)
    return FailWith<std::shared_ptr<Mapping>>(ERROR_INVALID_PARAMETER);
  if (name != nullptr && *name == 0) name = nullptr;
  std::shared_ptr<Mapping> mapping;
  Tables& tables = TheTables();
  const std::lock_guard lock(tables.mutex);
  if (name != nullptr) mapping = tables.names[name].lock();
  existed = mapping != nullptr;
  if (existed) return mapping;
  mapping = file == INVALID_HANDLE_VALUE ? MapMemory(protection, size, name, existed) : MapFile(file, protection, size);
  if (name != nullptr && mapping != nullptr) {
    tables.names[name] = mapping;
  } else if (name != nullptr) {
    tables.names.erase(name);
  }
  return mapping;
}

// The protection that the access asks for, or -1 when the mapping does not allow it.
int ProtectionFor(DWORD access, DWORD mapping, bool& isPrivate) {
  isPrivate = (access & FILE_MAP_WRITE) == 0 && (access & FILE_MAP_COPY) != 0;
  if ((access & FILE_MAP_WRITE) != 0) return mapping == PAGE_READWRITE ? PROT_READ | PROT_WRITE : -1;
  if (isPrivate) return PROT_READ | PROT_WRITE;
  return PROT_READ;
}

std::map<std::uintptr_t, View>::iterator FindView(Tables& tables, const void* address) {
  const auto value = reinterpret_cast<std::uintptr_t>(address);
  auto found = tables.views.upper_bound(value);
  if (found == tables.views.begin()) return tables.views.end();
  --found;
  return value - found->first < found->second.length ? found : tables.views.end();
}

// For sandboxes that forbid the guarded copy: as much as the file has at this moment, which another program
// can still change under the copy.
std::size_t CopyPlainly(void* target, const void* source, std::size_t count, const void* viewed, int protection) {
  Tables& tables = TheTables();
  const std::lock_guard lock(tables.mutex);
  const auto found = FindView(tables, viewed);
  struct stat info;
  if (found == tables.views.end() || (found->second.protection & protection) == 0) return 0;
  if (fstat(found->second.mapping->Descriptor(), &info) != 0) return 0;
  const std::uint64_t at = found->second.offset + reinterpret_cast<std::uintptr_t>(viewed) - found->first;
  const auto size = static_cast<std::uint64_t>(info.st_size);
  count = static_cast<std::size_t>(std::min<std::uint64_t>(count, size > at ? size - at : 0));
  std::memcpy(target, source, count);
  return count;
}

std::size_t RoundToPages(std::size_t length) {
  const auto page = static_cast<std::size_t>(sysconf(_SC_PAGESIZE));
  return (length + page - 1) / page * page;
}

}  // namespace

HANDLE CreateFileMappingW(HANDLE file, SECURITY_ATTRIBUTES*, DWORD protection, DWORD sizeHigh, DWORD sizeLow,
                          LPCWSTR name) {
  return Guarded<HANDLE>(nullptr, [&]() -> HANDLE {
    bool existed = false;
    const std::uint64_t size = static_cast<std::uint64_t>(sizeHigh) << 32 | sizeLow;
    std::shared_ptr<Mapping> mapping = MakeMapping(file, protection, size, name, existed);
    if (mapping == nullptr) return nullptr;
    const HANDLE handle = AddHandle(std::move(mapping), FILE_MAP_ALL_ACCESS);
    if (handle == INVALID_HANDLE_VALUE) return nullptr;
    SetLastError(existed ? ERROR_ALREADY_EXISTS : ERROR_SUCCESS);
    return handle;
  });
}

LPVOID MapViewOfFile(HANDLE handle, DWORD access, DWORD offsetHigh, DWORD offsetLow, SIZE_T size) {
  const HandleUse use = UseHandle(handle);
  const auto mapping = std::dynamic_pointer_cast<Mapping>(use.object);
  if (mapping == nullptr) return FailWith<HANDLE>(ERROR_INVALID_HANDLE);
  // A copy of one's own needs no more than reading, and no access at all means that.
  const DWORD needed = (access & FILE_MAP_WRITE) != 0 ? FILE_MAP_WRITE : access != 0 ? FILE_MAP_READ : 0;
  if ((use.access & needed) != needed) return FailWith<HANDLE>(ERROR_ACCESS_DENIED);
  const std::uint64_t offset = static_cast<std::uint64_t>(offsetHigh) << 32 | offsetLow;
  if (offset % kGranularity != 0) return FailWith<HANDLE>(ERROR_MAPPED_ALIGNMENT);
  bool isPrivate = false;
  const int protection = ProtectionFor(access, mapping->Protection(), isPrivate);
  if (protection < 0 || offset >= mapping->Size() || size > mapping->Size() - offset)
    return FailWith<HANDLE>(ERROR_ACCESS_DENIED);
  const std::uint64_t length = size != 0 ? size : mapping->Size() - offset;
  if (length > std::numeric_limits<std::size_t>::max()) return FailWith<HANDLE>(ERROR_NOT_ENOUGH_MEMORY);
  void* view = mmap(nullptr, static_cast<std::size_t>(length), protection, isPrivate ? MAP_PRIVATE : MAP_SHARED,
                    mapping->Descriptor(), static_cast<off_t>(offset));
  if (view == MAP_FAILED) return FailWith<HANDLE>(errno == ENOMEM ? ERROR_NOT_ENOUGH_MEMORY : ErrorFromErrno(errno));
  Tables& tables = TheTables();
  const std::lock_guard lock(tables.mutex);
  const bool isKept = Guarded(false, [&] {
    tables.views.emplace(reinterpret_cast<std::uintptr_t>(view),
                         View{static_cast<std::size_t>(length), offset, protection, !isPrivate, mapping});
    return true;
  });
  if (!isKept) munmap(view, static_cast<std::size_t>(length));
  return isKept ? view : nullptr;
}

BOOL UnmapViewOfFile(LPCVOID view) {
  std::shared_ptr<Mapping> last;  // let go without the lock
  Tables& tables = TheTables();
  const std::lock_guard lock(tables.mutex);
  const auto found = tables.views.find(reinterpret_cast<std::uintptr_t>(view));
  if (found == tables.views.end()) return FailWith(ERROR_INVALID_ADDRESS);
  munmap(const_cast<void*>(view), found->second.length);
  last = std::move(found->second.mapping);
  tables.views.erase(found);
  return TRUE;
}

BOOL FlushViewOfFile(LPCVOID address, SIZE_T size) {
  Tables& tables = TheTables();
  std::shared_ptr<Mapping> held;
  std::uintptr_t start, end;
  {
    const std::lock_guard lock(tables.mutex);
    const auto found = FindView(tables, address);
    if (found == tables.views.end()) return FailWith(ERROR_INVALID_ADDRESS);
    start = reinterpret_cast<std::uintptr_t>(address);
    end = found->first + found->second.length;
    if (size > RoundToPages(end - start)) return FailWith(ERROR_INVALID_ADDRESS);
    if (!found->second.isFlushed) return TRUE;
    if (size != 0) end = std::min(end, start + size);
    held = found->second.mapping;
  }
  start -= start % static_cast<std::uintptr_t>(sysconf(_SC_PAGESIZE));
  if (msync(reinterpret_cast<void*>(start), end - start, MS_SYNC) == 0) return TRUE;
  return FailWith(ErrorFromErrno(errno));
}

namespace platform {

std::size_t ViewLength(const void* view) {
  Tables& tables = TheTables();
  const std::lock_guard lock(tables.mutex);
  const auto found = tables.views.find(reinterpret_cast<std::uintptr_t>(view));
  return found != tables.views.end() ? RoundToPages(found->second.length) : 0;
}

std::size_t CopyFromView(void* target, const void* source, std::size_t count) {
  const iovec to{target, count}, from{const_cast<void*>(source), count};
  const ssize_t done = process_vm_readv(getpid(), &to, 1, &from, 1, 0);
  if (done >= 0) return static_cast<std::size_t>(done);
  SetLastError(ERROR_NOACCESS);
  return errno == EFAULT ? 0 : CopyPlainly(target, source, count, source, PROT_READ);
}

std::size_t CopyToView(void* target, const void* source, std::size_t count) {
  const iovec from{const_cast<void*>(source), count}, to{target, count};
  const ssize_t done = process_vm_writev(getpid(), &from, 1, &to, 1, 0);
  if (done >= 0) return static_cast<std::size_t>(done);
  SetLastError(ERROR_NOACCESS);
  return errno == EFAULT ? 0 : CopyPlainly(target, source, count, target, PROT_WRITE);
}

}  // namespace platform
