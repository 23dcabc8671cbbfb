// SRegistry: an open key of the system registry, with typed values.
//
// On Windows this is the registry; elsewhere a database of the user's that holds the same trees
// (docs/settings.md). Results are 32-bit codes: 0, kDefaultUsed, E_FAIL, E_POINTER, E_INVALIDARG.
// Nothing is thrown but SEOutOfMemory. Reads never leave an output undefined: on any failure the default
// stands in it. Without an open key, writes and deletions return 0 and do nothing. An object belongs to
// one thread at a time.
//
// Truth values are kept as the texts Yes and No. Read, a text is true when it is Yes, True or 1 in any
// case, blanks, tabs and line ends around it left out; everything else is false.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SRegistry {
 public:
  // What the operations return besides the platform-wide codes.
  enum Status : std::uint32_t {
    kOk = 0,
    kDefaultUsed = 1,  // the value or the key is not there
  };

  // --- opening ---

  SRegistry() = default;
  // As Init; IsOpen says whether it worked.
  SRegistry(HKEY root, const SString& path, int create) { Init(root, path, create); }
  SRegistry(const SRegistry&) = delete;
  SRegistry& operator=(const SRegistry&) = delete;
  ~SRegistry() { Close(); }

  // Opens the key `path` below `root`; backslashes at the path's end are left out. With `create` not 0 a key
  // that is missing is made, but never below HKEY_LOCAL_MACHINE. A key that exists and cannot be opened for
  // writing is opened for reading only, unless `create` asks for more. A null root looks below
  // HKEY_CURRENT_USER, then below HKEY_LOCAL_MACHINE, and makes a key that is in neither below the first.
  // E_FAIL; no key is open then.
  // When a key is open and path and `create` are those of the last opening, it stays open, whatever the
  // root, on purpose. (A key found through a null root was opened with `create` 0.)
  HRESULT Init(HKEY root, const SString& path, int create);
  // Closes the key and forgets the path.
  void Done();

  int IsOpen() const { return m_key != nullptr; }
  HKEY GetKey() const { return m_key; }  // still owned by the object; null when closed
  const SString& GetPath() const { return m_path; }
  int GetCreate() const { return m_create; }

  // `subKey` below the key where an application keeps its settings, a text of the string table:
  // "Software\Quorix\Stratomodeler 11\".
  static SString GetApplicationPath(const SString& subKey);

  // --- writing; an empty name is the key's unnamed value. E_FAIL where the platform refuses ---

  // Yes or No.
  HRESULT WriteProfile(const SString& name, int value);
  // A 32-bit number, or its decimal digits as a text when `asNumber` is 0.
  HRESULT WriteProfile(const SString& name, long value, int asNumber);
  // A text. Its size is given as twice the length plus 1, half a terminator, on purpose, and what reads
  // texts here knows it.
  HRESULT WriteProfile(const SString& name, const SString& value);
  // At most `size` bytes of a block of global memory, which stays the caller's; E_INVALIDARG for none of them.
  HRESULT WriteProfile(const SString& name, void* globalBlock, unsigned long size);

  // --- reading: 0, kDefaultUsed, E_FAIL for a type that cannot be read as asked for, E_POINTER ---

  // A truth value, of any type that can be read as text.
  HRESULT GetProfile(const SString& name, int* out, int standard) const;
  // A number: decimal digits with or without a sign, clipped to 32 bits; 1 for Yes and True, 0 for every
  // other text. *type (if not null) gets the platform's type, when there is a value.
  HRESULT GetProfile(const SString& name, long* out, long standard, unsigned long* type = nullptr) const;
  // A text, up to its first NUL; an expandable one with its references to variables replaced; the decimal
  // digits of a 32-bit number of either byte order, with its sign. The unnamed value fails when it is empty.
  HRESULT GetProfile(const SString& name, SString* out, const SString& standard, unsigned long* type = nullptr) const;
  // A binary value, in a block of movable global memory that the caller must free. Otherwise null and 0, and
  // kDefaultUsed.
  HRESULT GetProfile(const SString& name, void** globalBlock, unsigned long* size) const;

  // --- enumeration, from index 0; the order is the platform's ---

  // The platform's result code: 0, ERROR_NO_MORE_ITEMS (259) at the end. Outputs may be null; on failure they
  // are empty. Class texts are mostly empty.
  long GetEnumKey(long index, SString* name, SString* className = nullptr) const;
  // 32-bit numbers come as their digits, without a sign, all other values as the text that their bytes are.
  // Values with names of more than 255 characters yield ERROR_MORE_DATA (234).
  long GetEnumValue(long index, SString* name, SString* value = nullptr, unsigned long* type = nullptr) const;

  // --- deletion; what is not there counts as deleted ---

  // The value, or, where no value has the name, the sub-key as DeleteKey.
  HRESULT DeleteProfile(const SString& name, int recursive);
  // The sub-key `name`, with everything below it when `recursive` is not 0; an empty name is this key itself.
  // E_FAIL for a key with sub-keys that are to stay or cannot be deleted; the others are gone then.
  HRESULT DeleteKey(const SString& name, int recursive);

 private:
  HRESULT Open(HKEY root, const SString& path, int create);
  void Close();
  HRESULT Write(const SString& name, DWORD type, const void* data, DWORD size);

  HKEY m_key = nullptr;
  SString m_path;
  int m_create = 0;
};

static_assert(sizeof(void*) != 4 || sizeof(SRegistry) == 12, "key, path, flag");
