// Why the runtime or the platform refused: an error number beside an exception.
//
// The library's exceptions have a fixed layout, so what lies behind one of them is not a member but a second base of
// what is thrown. Who catches an SException asks SGetErrorCause:
// ```cpp
// catch (const SException& failure) {
//   Show(failure.GetText(), std::strerror(SGetErrorCause(failure)));
// }
// ```
// Threads: an exception belongs to the thread that caught it.
#pragma once

#include "qxcore/core/exception.h"
#include "qxcore/platform/export.h"

// An error number of the C runtime, as errno has it: ENOENT, EISDIR, EACCES, ENOSPC ...
class QXCORE_API SErrorCause {
 public:
  explicit SErrorCause(int error) : m_error(error) {}  // keeps the number
  SErrorCause(const SErrorCause&) = default;
  SErrorCause& operator=(const SErrorCause&) = default;
  virtual ~SErrorCause();
  int GetError() const { return m_error; }  // 0 when unknown

 private:
  int m_error;
};

// An exception that carries its cause; caught as `Exception` or one of its bases.
template <class Exception>
class SEWithError : public Exception, public SErrorCause {
 public:
  explicit SEWithError(int error) : SErrorCause(error) {}  // as the exception alone, with its cause
};

// The cause of an exception, as errno has it; 0 where it carries none.
QXCORE_API int SGetErrorCause(const SException& exception) noexcept;
