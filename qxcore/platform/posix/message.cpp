// System message texts, in the words of the published list of system error codes.

#include <algorithm>
#include <cstdlib>
#include <string_view>

#include "qxcore/platform/posix/failure.h"

namespace {

struct Message {
  DWORD code;
  std::u16string_view text;
};

// Ascending by code.
constexpr Message kMessages[] = {
    {ERROR_SUCCESS, u"The operation completed successfully."},
    {ERROR_INVALID_FUNCTION, u"Incorrect function."},
    {ERROR_FILE_NOT_FOUND, u"The system cannot find the file specified."},
    {ERROR_PATH_NOT_FOUND, u"The system cannot find the path specified."},
    {ERROR_TOO_MANY_OPEN_FILES, u"The system cannot open the file."},
    {ERROR_ACCESS_DENIED, u"Access is denied."},
    {ERROR_INVALID_HANDLE, u"The handle is invalid."},
    {7, u"The storage control blocks were destroyed."},
    {ERROR_NOT_ENOUGH_MEMORY, u"Not enough memory resources are available to process this command."},
    {9, u"The storage control block address is invalid."},
    {10, u"The environment is incorrect."},
    {11, u"An attempt was made to load a program with an incorrect format."},
    {12, u"The access code is invalid."},
    {ERROR_INVALID_DATA, u"The data is invalid."},
    {ERROR_OUTOFMEMORY, u"Not enough memory resources are available to complete this operation."},
    {ERROR_INVALID_DRIVE, u"The system cannot find the drive specified."},
    {16, u"The directory cannot be removed."},
    {ERROR_NOT_SAME_DEVICE, u"The system cannot move the file to a different disk drive."},
    {ERROR_NO_MORE_FILES, u"There are no more files."},
    {ERROR_WRITE_PROTECT, u"The media is write protected."},
    {20, u"The system cannot find the device specified."},
    {21, u"The device is not ready."},
    {22, u"The device does not recognize the command."},
    {23, u"Data error (cyclic redundancy check)."},
    {24, u"The program issued a command but the command length is incorrect."},
    {25, u"The drive cannot locate a specific area or track on the disk."},
    {26, u"The specified disk or diskette cannot be accessed."},
    {27, u"The drive cannot find the sector requested."},
    {28, u"The printer is out of paper."},
    {ERROR_WRITE_FAULT, u"The system cannot write to the specified device."},
    {ERROR_READ_FAULT, u"The system cannot read from the specified device."},
    {ERROR_GEN_FAILURE, u"A device attached to the system is not functioning."},
    {ERROR_SHARING_VIOLATION, u"The process cannot access the file because it is being used by another process."},
    {33, u"The process cannot access the file because another process has locked a portion of the file."},
    {36, u"Too many files opened for sharing."},
    {ERROR_HANDLE_EOF, u"Reached the end of the file."},
    {ERROR_HANDLE_DISK_FULL, u"The disk is full."},
    {ERROR_NOT_SUPPORTED, u"The request is not supported."},
    {ERROR_BAD_NETPATH, u"The network path was not found."},
    {55, u"The specified network resource or device is no longer available."},
    {59, u"An unexpected network error occurred."},
    {64, u"The specified network name is no longer available."},
    {65, u"Network access is denied."},
    {66, u"The network resource type is not correct."},
    {67, u"The network name cannot be found."},
    {ERROR_FILE_EXISTS, u"The file exists."},
    {82, u"The directory or file cannot be created."},
    {ERROR_INVALID_PARAMETER, u"The parameter is incorrect."},
    {ERROR_BROKEN_PIPE, u"The pipe has been ended."},
    {110, u"The system cannot open the device or file specified."},
    {ERROR_BUFFER_OVERFLOW, u"The file name is too long."},
    {ERROR_DISK_FULL, u"There is not enough space on the disk."},
    {ERROR_CALL_NOT_IMPLEMENTED, u"This function is not supported on this system."},
    {ERROR_INSUFFICIENT_BUFFER, u"The data area passed to a system call is too small."},
    {ERROR_INVALID_NAME, u"The filename, directory name, or volume label syntax is incorrect."},
    {ERROR_MOD_NOT_FOUND, u"The specified module could not be found."},
    {127, u"The specified procedure could not be found."},
    {ERROR_NEGATIVE_SEEK, u"An attempt was made to move the file pointer before the beginning of the file."},
    {ERROR_DIR_NOT_EMPTY, u"The directory is not empty."},
    {ERROR_NOT_LOCKED, u"The segment is already unlocked."},
    {ERROR_BAD_PATHNAME, u"The specified path is invalid."},
    {167, u"Unable to lock a region of a file."},
    {ERROR_BUSY, u"The requested resource is in use."},
    {ERROR_ALREADY_EXISTS, u"Cannot create a file when that file already exists."},
    {ERROR_FILENAME_EXCED_RANGE, u"The filename or extension is too long."},
    {216,
     u"This version of %1 is not compatible with the version of Windows you're running. Check your computer's system "
     u"information and then contact the software publisher."},
    {ERROR_FILE_TOO_LARGE, u"The file size exceeds the limit allowed and cannot be saved."},
    {ERROR_MORE_DATA, u"More data is available."},
    {258, u"The wait operation timed out."},
    {ERROR_NO_MORE_ITEMS, u"No more data is available."},
    {ERROR_DIRECTORY, u"The directory name is invalid."},
    {ERROR_MR_MID_NOT_FOUND,
     u"The system cannot find message text for message number 0x%1 in the message file for %2."},
    {ERROR_INVALID_ADDRESS, u"Attempt to access invalid address."},
    {534, u"Arithmetic result exceeded 32 bits."},
    {ERROR_OPERATION_ABORTED,
     u"The I/O operation has been aborted because of either a thread exit or an application request."},
    {ERROR_NOACCESS, u"Invalid access to memory location."},
    {ERROR_INVALID_FLAGS, u"Invalid flags."},
    {ERROR_FILE_INVALID,
     u"The volume for a file has been externally altered so that the opened file is no longer valid."},
    {ERROR_BADDB, u"The configuration registry database is corrupt."},
    {1010, u"The configuration registry key is invalid."},
    {1011, u"The configuration registry key could not be opened."},
    {1012, u"The configuration registry key could not be read."},
    {1013, u"The configuration registry key could not be written."},
    {ERROR_REGISTRY_IO_FAILED,
     u"An I/O operation initiated by the registry failed unrecoverably. The registry could not read in, or write out, "
     u"or flush, one of the files that contain the system's image of the registry."},
    {ERROR_KEY_DELETED, u"Illegal operation attempted on a registry key that has been marked for deletion."},
    {ERROR_NO_UNICODE_TRANSLATION, u"No mapping for the Unicode character exists in the target multi-byte code page."},
    {ERROR_IO_DEVICE, u"The request could not be performed because of an I/O device error."},
    {ERROR_MAPPED_ALIGNMENT, u"The base address or the file offset specified does not have the proper alignment."},
    {ERROR_CANCELLED, u"The operation was canceled by the user."},
    {ERROR_INVALID_WINDOW_HANDLE, u"Invalid window handle."},
    {1784, u"The supplied user buffer is not valid for the requested operation."},
    {ERROR_RESOURCE_TYPE_NOT_FOUND, u"The specified resource type cannot be found in the image file."},
    {ERROR_RESOURCE_NAME_NOT_FOUND, u"The specified resource name cannot be found in the image file."},
    {ERROR_CANT_RESOLVE_FILENAME, u"The name of the file cannot be resolved by the system."},
    {0x80004001, u"Not implemented"},
    {0x80004002, u"No such interface supported"},
    {0x80004003, u"Invalid pointer"},
    {0x80004004, u"Operation aborted"},
    {0x80004005, u"Unspecified error"},
    {0x8000FFFF, u"Catastrophic failure"},
};
static_assert(std::is_sorted(std::begin(kMessages), std::end(kMessages),
                             [](const Message& a, const Message& b) { return a.code < b.code; }));

// The text of a code; a result code made from a Win32 error has that error's.
std::u16string_view FindMessage(DWORD code) {
  if ((code & 0xFFFF0000) == 0x80070000) code &= 0xFFFF;
  const auto* found = std::lower_bound(std::begin(kMessages), std::end(kMessages), code,
                                       [](const Message& message, DWORD wanted) { return message.code < wanted; });
  return found != std::end(kMessages) && found->code == code ? found->text : std::u16string_view();
}

}  // namespace

DWORD FormatMessageW(DWORD flags, LPCVOID, DWORD messageId, DWORD, LPWSTR buffer, DWORD size, std::va_list*) {
  using platform::FailWith;
  const bool allocate = (flags & FORMAT_MESSAGE_ALLOCATE_BUFFER) != 0;
  if (buffer == nullptr) return FailWith(ERROR_INVALID_PARAMETER, DWORD{0});
  if (allocate) *reinterpret_cast<WCHAR**>(buffer) = nullptr;
  if ((flags & FORMAT_MESSAGE_FROM_SYSTEM) == 0) return FailWith(ERROR_INVALID_PARAMETER, DWORD{0});
  const std::u16string_view text = FindMessage(messageId);
  if (text.empty()) return FailWith(ERROR_MR_MID_NOT_FOUND, DWORD{0});
  const std::size_t length = text.size() + 2;
  WCHAR* target = buffer;
  if (allocate) {
    target = static_cast<WCHAR*>(std::malloc(std::max<std::size_t>(length + 1, size) * sizeof(WCHAR)));
    if (target == nullptr) return FailWith(ERROR_NOT_ENOUGH_MEMORY, DWORD{0});
    *reinterpret_cast<WCHAR**>(buffer) = target;
  } else if (size < length + 1) {
    return FailWith(ERROR_INSUFFICIENT_BUFFER, DWORD{0});
  }
  text.copy(target, text.size());
  target[length - 2] = u'\r';
  target[length - 1] = u'\n';
  target[length] = 0;
  return static_cast<DWORD>(length);
}

HLOCAL LocalFree(HLOCAL block) {
  std::free(block);
  return nullptr;
}
