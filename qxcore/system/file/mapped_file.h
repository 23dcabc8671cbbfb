// SMappedFile: a mapping of a file, with a cursor that reads and writes in sequence through a view.
// ```cpp
// SMappedFile file(path);
// unsigned long count = sizeof buffer;
// HRESULT status = file.Read(buffer, &count);
// ```
// The cursor moves over the view that the object has: one that the caller opened with GetView, at whose first byte
// it begins, or, without a view, one of the whole file that the first operation opens by itself. The view
// does not grow with the file: bytes behind its end are the end. Read and Write survive a file that another
// program cuts: they stop where its pages end, with a failure. In its last page, bytes behind the new end
// read as zero, and what is written there is lost. Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/system/file/file.h"
#include "qxcore/system/file/mapped_view.h"

class QXCORE_API SMappedFile : public SMappedMemory {
 public:
  SMappedFile() = default;
  // For the file with this full name; nothing is opened yet.
  explicit SMappedFile(const SString& fullName) : m_file(fullName) {}
  // Second handles to the same file and mapping, and a cursor at the same place.
  SMappedFile(const SMappedFile& other) : SMappedMemory() { Set(other, true); }
  SMappedFile& operator=(const SMappedFile& other) {
    Set(other, true);
    return *this;
  }
  ~SMappedFile() override;

  // Closes view, mapping and file, in this order, and forgets the file's name. The first failure is the result.
  HRESULT Done() override;

  // The file, to be opened in a way of one's own before it is mapped, and the view.
  SFile& GetFile() { return m_file; }
  SMappedView& GetView() { return m_view; }

  // `count`: bytes wanted on entry, done on return. At the view's end Read delivers fewer; 0. SFile::kReadFailed when
  // pages are missing. Write writes what fits and is SFile::kWriteFailed when that is not all: it does not lengthen
  // the file (OpenMapping does), and writes nothing to a file for reading only. E_POINTER for a null count or
  // buffer. Without a view both open one: SMappedMemory::OpenMapping's and SMappedView::OpenView's failures.
  HRESULT Read(void* buffer, unsigned long* count);
  HRESULT Write(const void* buffer, unsigned long* count);
  // Moves the cursor and stores its position in *position, from the view's start. Origin 0: to *position; 1: by
  // *position, which is then read as a signed number. E_INVALIDARG for other origins; SFile::kSeekFailed before the
  // start (last error ERROR_NEGATIVE_SEEK) and where the position is unknown. Behind the end is allowed.
  HRESULT Seek(unsigned long* position, unsigned long origin);
  // With a view what SMappedView::FlushView returns, inverted: E_FAIL when all went well. Without one the
  // file is flushed, with SFile::Flush's result; 1 when it is not open.
  HRESULT Flush();

  using SMappedMemory::Set;
  // The other's file, mapping and cursor: with `duplicate` handles of its own; without, they move, the view too, and
  // the other is empty. E_FAIL when a handle cannot be duplicated.
  HRESULT Set(const SMappedFile& other, bool duplicate);

 protected:
  // Opens the file where it is not open: as it may be, for writing or reading only; one that does not exist is made.
  // Null for an empty name.
  void* GetFileHandle(int* readOnly, unsigned long* sizeLow, unsigned long* sizeHigh) override;

 private:
  HRESULT NeedView();
  std::size_t CountLeft() const;

  mutable SFile m_file;
  mutable SMappedView m_view;
  mutable unsigned long m_position = 0;  // of the cursor, in the view
};

static_assert(sizeof(void*) != 4 || sizeof(SMappedFile) == 68, "mapping, file, view, cursor");
