// SProfile: typed access to one section of an initialisation file.
//
// Such a file holds sections, "[name]", of keys, "key=value"; names are found without regard to case. What
// the platform's functions do with the file (text encodings, quotation marks, comments, names without a
// folder) is in docs/settings.md. Nothing is kept in memory: every call reads or writes the file. Nothing
// is thrown but SEOutOfMemory. Values with leading or trailing blanks, quotation marks around them or line
// ends do not come back as they were written. Threads: an object belongs to one thread at a time.
#pragma once

#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SProfile {
 public:
  // What the operations return.
  enum Status : std::uint32_t {
    kOk = 0,
    kWriteFailed = 0xC0000000,  // GetLastError says why
  };

  SProfile() = default;
  // The third argument is not used.
  SProfile(const SString& file, const SString& section, int unused) { Init(file, section, unused); }

  // Remember the file's name and the section, and forget them; both return 0 and touch no file.
  HRESULT Init(const SString& file, const SString& section, int unused);
  void Done();

  const SString& GetFile() const { return m_file; }        // as it was given
  const SString& GetSection() const { return m_section; }  // without brackets

  // Decimal digits (so a truth value becomes 1 or 0), or the text. The file and the section are made where
  // they are missing, the folder is not.
  HRESULT WriteProfile(const SString& key, int value);
  HRESULT WriteProfile(const SString& key, long value);
  HRESULT WriteProfile(const SString& key, const SString& value);

  // Read at most 255 characters of the value. A missing key yields the default, an empty value 0 as
  // truth and number, and the default as text. 0, or E_POINTER.
  HRESULT GetProfile(const SString& key, int* out, int standard) const;    // as SString::ToBOOL
  HRESULT GetProfile(const SString& key, long* out, long standard) const;  // as SString::ToLONG
  HRESULT GetProfile(const SString& key, SString* out, const SString& standard) const;

 private:
  SString Read(const SString& key, const SString& standard) const;

  SString m_file;
  SString m_section;
};

static_assert(sizeof(void*) != 4 || sizeof(SProfile) == 8, "file, section");
