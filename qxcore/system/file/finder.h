// SFinder: the one interface of everything that looks for files and folders.
//
// FindFile starts a search and stands on its first entry, FindNextFileW goes on, and between them the
// accessors describe the current entry; without one (before the search, behind its end, after
// Close) texts are empty, lengths 0, and everything else 0. Results are 1 for true and 0 for false, and
// where one is 0 the platform's last-error value says why: ERROR_FILE_NOT_FOUND when nothing fits the
// mask, ERROR_NO_MORE_FILES at the end. Nothing is thrown but SEOutOfMemory; a search that
// it interrupts is closed. A finder holds its search, and with it a handle of the platform, until
// Close, the next FindFile or its end; it belongs to one thread at a time.
//
// What is found (the same for all finders): an entry that is a link has the attribute
// FILE_ATTRIBUTE_REPARSE_POINT (0x400), together with the attributes of what it leads to. A link that
// leads nowhere is an entry on Linux (Wine does not list those). Entries come in the order of the file
// system; names that differ only in case are entries of their own. Names that Windows cannot hold come
// mapped on Linux (docs/portable-layer.md) and can be opened by what the finder returns.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/core/memory.h"
#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class STime;

class QXCORE_API SFinder {
 public:
  virtual ~SFinder() = default;

  // Ends the search, if one runs; 0 when the platform fails to.
  virtual int Close() = 0;
  // `mask` is a path whose last part may hold * and ?; null stands for "*.*", everything in the current
  // directory. What the attributes mean is the class's matter.
  virtual int FindFile(const WCHAR* mask = nullptr, unsigned long attributes = 0) = 0;
  virtual int FindNextFileW() = 0;

  // --- the current entry ---

  virtual SString GetFileName() const = 0;  // with extension, without folder
  virtual SString GetFilePath() const = 0;  // absolute
  // The name without its extension: up to its last dot. A name that would be empty then (".profile") stays whole.
  virtual SString GetFileTitleW() const = 0;
  virtual SString GetFileURL() const = 0;  // SFile::PathToURL of the path
  // The folder of the search, also at its end; without a backslash behind it ("C:" for "C:\").
  virtual SString GetRoot() const = 0;
  virtual std::uint64_t GetLength() const = 0;  // bytes; 0 for folders
  // Store the time in *time, in whole seconds, by way of today's difference to UTC (see STime's constructor from
  // file times; SFile::GetDateTime has the exact one). 0, and *time as it was, without an entry.
  virtual int GetCreationTime(STime* time) const = 0;
  virtual int GetLastAccessTime(STime* time) const = 0;
  virtual int GetLastWriteTime(STime* time) const = 0;
  // 1 when the entry has at least one of these FILE_ATTRIBUTE bits.
  virtual int MatchesMask(unsigned long mask) const = 0;
  // 1 for a folder named "." or "..".
  virtual int IsDots() const = 0;

  int IsDirectory() const { return MatchesMask(FILE_ATTRIBUTE_DIRECTORY); }
  int IsLink() const { return MatchesMask(FILE_ATTRIBUTE_REPARSE_POINT); }

  // Finders live on the library's heap. Failure throws SEOutOfMemory.
  static void* operator new(std::size_t size) { return SMemAlloc(size); }
  static void* operator new(std::size_t, void* where) noexcept { return where; }
  static void operator delete(void* block) noexcept { SMemFree(block); }
  static void operator delete(void*, void*) noexcept {}

 protected:
  SFinder() = default;
  SFinder(const SFinder&) = delete;
  SFinder& operator=(const SFinder&) = delete;
};
