// How long a step of work may take, so that the windows stay fluid between two messages.
#pragma once

#include <chrono>

class TimeSlice {
 public:
  // Begins now. A step does at least one file or piece, and looks at the clock behind each.
  explicit TimeSlice(std::chrono::milliseconds length = std::chrono::milliseconds(4)) : m_end(Clock::now() + length) {}
  bool IsOver() const { return Clock::now() >= m_end; }

 private:
  using Clock = std::chrono::steady_clock;
  Clock::time_point m_end;
};
