#include "tools/common/progress_bar.h"

#include <cstdio>
#include <utility>

#include "tools/common/console.h"

namespace {

constexpr std::chrono::milliseconds kPatience{1000};
constexpr std::chrono::milliseconds kBetweenDraws{100};
constexpr const char* kEraseLine = "\r\x1b[K";

}  // namespace

ProgressBar::ProgressBar(std::string name, std::string unit)
    : m_name(std::move(name)),
      m_unit(std::move(unit)),
      m_isTerminal(console::IsTerminal(stderr)),
      m_nextDraw(Clock::now() + kPatience) {}

void ProgressBar::Clear() {
  if (!m_isShown) return;
  std::fputs(kEraseLine, stderr);
  m_isShown = false;
}

void ProgressBar::SetPos(std::uint64_t position) {
  m_position = position;
  Draw();
}

bool ProgressBar::IsCancelled() { return console::Interrupted(); }

std::string ProgressBar::Amount() const {
  if (!m_unit.empty()) return std::to_string(m_position) + " " + m_unit;
  char text[32];
  if (m_position > m_range) {  // a pipe, or a file that does not tell its size
    std::snprintf(text, sizeof text, "%.1f MB", static_cast<double>(m_position) / 1e6);
    return text;
  }
  constexpr int kWidth = 30;
  int done = m_range > 0 ? static_cast<int>(100.0 * static_cast<double>(m_position) / static_cast<double>(m_range)) : 0;
  std::string bar(static_cast<std::size_t>(done * kWidth / 100), '#');
  bar.resize(kWidth, '.');
  std::snprintf(text, sizeof text, "] %3d%%", done);
  return "[" + bar + text;
}

void ProgressBar::Draw() {
  if (!m_isTerminal || Clock::now() < m_nextDraw) return;
  m_nextDraw = Clock::now() + kBetweenDraws;
  std::fprintf(stderr, "%s%s  %s", kEraseLine, Amount().c_str(), m_name.c_str());
  std::fflush(stderr);
  m_isShown = true;
}
