// What long work reports to, and asks whether to go on. Implemented by programs.
// Threads: the indicator is called in the thread that reads.
#pragma once

#include <cstdint>

class SProgressIndicatorEx {
 public:
  virtual ~SProgressIndicatorEx() = default;
  // The positions that the work goes through.
  virtual void SetRange(std::uint64_t from, std::uint64_t to) = 0;
  // How far the work has come, within that range.
  virtual void SetPos(std::uint64_t position) = 0;
  virtual std::uint64_t GetPos() const = 0;
  // True when the user wants the work to end; it then throws SEIOAbortedException.
  virtual bool IsCancelled() = 0;
};
