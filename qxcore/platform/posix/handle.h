// Handles: numbers that name an open file or a search, so that a stale one is an error and no crash.
#pragma once

#include <memory>

#include "qxcore/platform/posix/path.h"

namespace platform {

class HandleObject {
 public:
  virtual ~HandleObject() = default;
  // Lets go of what the object holds. Returns the error that the system reports only now.
  virtual DWORD Close() { return ERROR_SUCCESS; }
};

class OpenFile final : public HandleObject {
 public:
  OpenFile(int descriptor, std::string deleteAtClose)
      : m_descriptor(descriptor), m_deleteAtClose(std::move(deleteAtClose)) {}
  ~OpenFile() override { Close(); }
  DWORD Close() override;
  int Descriptor() const { return m_descriptor; }

 private:
  int m_descriptor;
  std::string m_deleteAtClose;  // the path, for FILE_FLAG_DELETE_ON_CLOSE
};

// `access` are the rights of this handle; a duplicate may have fewer. INVALID_HANDLE_VALUE, with the last
// error set, when memory is out.
HANDLE AddHandle(std::shared_ptr<HandleObject> object, DWORD access);

struct HandleUse {
  std::shared_ptr<HandleObject> object;  // null for no handle
  DWORD access = 0;
};
HandleUse UseHandle(HANDLE handle);
// Takes the handle out of the table.
std::shared_ptr<HandleObject> RemoveHandle(HANDLE handle);

// The descriptor of a file handle with all of `access`; -1, with the last error set, otherwise.
struct FileUse {
  std::shared_ptr<HandleObject> object;  // keeps the descriptor open while it is used
  int descriptor = -1;
};
FileUse UseFile(HANDLE handle, DWORD access);

}  // namespace platform
