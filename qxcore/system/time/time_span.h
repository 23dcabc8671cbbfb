// STimeSpan: a length of time in whole seconds, in 32 bits (68 years either way).
//
// Arithmetic wraps around at the ends of the range. Threads: an object belongs to one thread at a time.
#pragma once

#include <compare>
#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API STimeSpan {
 public:
  constexpr STimeSpan() noexcept = default;  // of no length
  // A length of so many seconds, or the sum of the parts, each of which may have any size and sign.
  constexpr explicit STimeSpan(std::int32_t seconds) noexcept : m_seconds(seconds) {}
  constexpr STimeSpan(int days, int hours, int minutes, int seconds) noexcept
      : m_seconds(static_cast<std::int32_t>(
            ((static_cast<std::uint32_t>(days) * 24 + static_cast<std::uint32_t>(hours)) * 60 +
             static_cast<std::uint32_t>(minutes)) *
                60 +
            static_cast<std::uint32_t>(seconds))) {}

  // --- parts; all have the sign of the span ---
  std::int32_t GetTotalSeconds() const { return m_seconds; }
  int GetDays() const { return m_seconds / 86400; }
  int GetHours() const { return m_seconds / 3600 % 24; }  // within the day
  int GetMinutes() const { return m_seconds / 60 % 60; }  // within the hour
  int GetSeconds() const { return m_seconds % 60; }       // within the minute

  // %D days ("%ld"), %H hours within the day, %M minutes within the hour, %S seconds within the minute (each
  // "%02d"); a percent sign before any other character yields that character. Everything else is copied, a
  // percent sign at the end, too. What exceeds 128 characters is cut off.
  SString Format(const WCHAR* format) const;
  SString Format(unsigned int id) const;  // the format is a text of the library's string table

  // --- arithmetic and order ---
  STimeSpan& operator+=(STimeSpan other) {
    m_seconds = Plus(other);
    return *this;
  }
  STimeSpan& operator-=(STimeSpan other) {
    m_seconds = Minus(other);
    return *this;
  }
  friend STimeSpan operator+(STimeSpan a, STimeSpan b) { return a += b; }
  friend STimeSpan operator-(STimeSpan a, STimeSpan b) { return a -= b; }
  STimeSpan operator-() const { return STimeSpan() - *this; }
  friend constexpr auto operator<=>(STimeSpan a, STimeSpan b) = default;

 private:
  friend class STime;

  std::int32_t Plus(STimeSpan other) const {
    return static_cast<std::int32_t>(static_cast<std::uint32_t>(m_seconds) +
                                     static_cast<std::uint32_t>(other.m_seconds));
  }
  std::int32_t Minus(STimeSpan other) const {
    return static_cast<std::int32_t>(static_cast<std::uint32_t>(m_seconds) -
                                     static_cast<std::uint32_t>(other.m_seconds));
  }

  std::int32_t m_seconds = 0;
};

static_assert(sizeof(STimeSpan) == 4, "a span is its count of seconds");
