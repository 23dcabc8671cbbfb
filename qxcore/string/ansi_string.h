// Owning converters between wide text and the ANSI code page, for calls into narrow interfaces.
//
// Copying and assigning either of them copies the pointer, not the text, so that a temporary can be
// handed on; the object that owns the text must outlive the others, and only one of them may end it
// with Done (the destructor of an object that was copied from would end it a second time, so the
// copy constructor is deleted and an assigned-to object should be given Detach before it ends).
// Threads: an object belongs to one thread at a time; g_bSwcstombszHadLoss is shared and not locked.
#pragma once

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"

class SString;

// Wide text as narrow text of the ANSI code page. Characters that the page lacks become its default
// character, and g_bSwcstombszHadLoss is set.
class QXCORE_API SAnsiString {
 public:
  SAnsiString() = default;
  explicit SAnsiString(const WCHAR* text);    // null gives a null pointer
  SAnsiString(const WCHAR* text, int count);  // at most `count` characters of it
  // The whole text, up to its first NUL.
  explicit SAnsiString(const SString& text);
  SAnsiString(const SAnsiString&) = delete;
  SAnsiString& operator=(const SAnsiString&) = default;  // member by member: the pointer is copied
  ~SAnsiString() { Done(); }

  void Done();             // frees the text and clears the pointer
  char* Detach();          // gives the pointer up without freeing the text (free with std::free)
  int Length() const;      // characters of the multi-byte text
  int LengthByte() const;  // bytes
  // The text; null where none was converted. Valid until Done.
  operator char*() { return m_text; }
  operator const char*() const { return m_text; }

 private:
  void Convert(const WCHAR* text, int count);

  char* m_text = nullptr;  // from malloc
  char m_flag = 0;
};

// Narrow text of the ANSI code page as wide text.
class QXCORE_API SUnicodeString {
 public:
  SUnicodeString() = default;
  explicit SUnicodeString(const char* text);    // null gives a null pointer
  SUnicodeString(const char* text, int count);  // at most `count` bytes of it
  SUnicodeString(const SUnicodeString&) = delete;
  SUnicodeString& operator=(const SUnicodeString&) = default;  // member by member: the pointer is copied
  ~SUnicodeString() { Done(); }

  void Done();         // frees the text and clears the pointer
  WCHAR* Detach();     // gives the pointer up without freeing the text (free with std::free)
  int Length() const;  // characters
  // The text; null where none was converted. Valid until Done.
  operator WCHAR*() { return m_text; }
  operator const WCHAR*() const { return m_text; }

 private:
  void Convert(const char* text, int count);

  WCHAR* m_text = nullptr;  // from malloc
};
