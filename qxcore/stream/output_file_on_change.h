// Writes a file only if its content changes, so that an unchanged file keeps its time stamp.
//
// A file that does not exist yet is written straight away. For an existing one all output is kept in memory
// until Close, which compares it with the file and writes only what differs from it.
// Threads: a stream belongs to one thread at a time.
#pragma once

#include "qxcore/stream/output_stream.h"
#include "qxcore/string/string.h"

class SOutputGlobal;

class QXCORE_API SOutputFileOnChange : public SOutputStream {
  QXCORE_DECLARE_CLASS(SOutputFileOnChange)

  // Throws SEIOCantOpenForWriting when the file does not exist and cannot be created.
  explicit SOutputFileOnChange(const SString& path);
  SOutputFileOnChange(const SOutputFileOnChange&) = delete;
  SOutputFileOnChange& operator=(const SOutputFileOnChange&) = delete;
  // Closes, unless Close was called and failed; a failure is lost here: call Close before.
  ~SOutputFileOnChange() override;

  // Throw what SOutputFile and SOutputGlobal throw; SEIOWriteFailed when the stream is closed.
  void Write(int byte) override;
  unsigned long Write(const void* buffer, unsigned long count) override;
  // Nothing is written to an existing file before Close.
  void Flush() override;
  void Close() override { Close(nullptr); }
  // Ends the output and sets *changed (if not null) to 1 when the file was new or was written, to 0 when it
  // was left as it is; a later Close only reports that again. Throws SEIOCantOpenForWriting, SEIOWriteFailed,
  // SEIOCouldNotTrunc, and for a new file what SOutputFile::Close throws. After a failure with an existing
  // file the output is still there, and Close can be tried again.
  void Close(int* changed);

 private:
  SOutputStream* OpenTarget();
  bool HasChanged() const;
  void Replace() const;

  SString m_path;
  SOutputStream* m_target;   // owned; null when closed
  SOutputGlobal* m_content;  // the target, when it is memory; else null
  int m_changed = 1;
  bool m_hasFailed = false;  // Close threw: only the caller tries again
};
