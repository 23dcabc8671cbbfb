// A bar on standard error that shows how far a file has been read, or how many files a walk has seen. It
// appears on a terminal only, and only when the work takes longer than a second; it also carries the
// user's wish to end.
#pragma once

#include <chrono>
#include <string>

#include "qxcore/stream/progress_indicator.h"

class ProgressBar : public SProgressIndicatorEx {
 public:
  // `unit` is what is counted where the end is not known: empty for bytes.
  explicit ProgressBar(std::string name, std::string unit = {});
  ProgressBar(const ProgressBar&) = delete;
  ProgressBar& operator=(const ProgressBar&) = delete;
  ~ProgressBar() { Clear(); }

  // Takes the bar off the screen.
  void Clear();

  void SetRange(std::uint64_t from, std::uint64_t to) override { m_range = to - from; }
  void SetPos(std::uint64_t position) override;
  std::uint64_t GetPos() const override { return m_position; }
  bool IsCancelled() override;

 private:
  using Clock = std::chrono::steady_clock;

  void Draw();
  // The bar, or where the size is not known how much has been done.
  std::string Amount() const;

  std::string m_name;
  std::string m_unit;
  std::uint64_t m_range = 0;
  std::uint64_t m_position = 0;
  bool m_isTerminal;
  bool m_isShown = false;
  Clock::time_point m_nextDraw;
};
