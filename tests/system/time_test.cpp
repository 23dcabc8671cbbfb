// STime and STimeSpan: fields and ways back in the zone of the environment against another reading of it,
// formats, packed and file times.

#include "qxcore/system/time/time.h"

#include <gtest/gtest.h>

#include <climits>
#include <random>

#include "tests/support/registry_root.h"
#include "tests/support/text.h"
#include "tests/support/wine.h"
#include "tests/support/zone_peer.h"

namespace {

using test::FieldsOf;
using test::ZonePeer;

testing::AssertionResult AreSame(const std::tm& a, const std::tm& b) {
  if (a.tm_year == b.tm_year && a.tm_mon == b.tm_mon && a.tm_mday == b.tm_mday && a.tm_hour == b.tm_hour &&
      a.tm_min == b.tm_min && a.tm_sec == b.tm_sec && a.tm_wday == b.tm_wday && a.tm_yday == b.tm_yday)
    return testing::AssertionSuccess();
  char texts[2][64];
  std::strftime(texts[0], 64, "%Y-%m-%d %H:%M:%S %j %w", &a);
  std::strftime(texts[1], 64, "%Y-%m-%d %H:%M:%S %j %w", &b);
  return testing::AssertionFailure() << texts[0] << " and " << texts[1];
}

void CheckMoment(const ZonePeer& peer, std::int32_t time) {
  SCOPED_TRACE(time);
  const STime moment(time);
  std::tm local, utc;
  ASSERT_TRUE(moment.GetLocalTm(&local));
  ASSERT_TRUE(AreSame(local, FieldsOf(std::int64_t{time} + peer.Offset(time))));
  ASSERT_TRUE(moment.GetGmtTm(&utc));
  ASSERT_TRUE(AreSame(utc, FieldsOf(time)));
  // The fields name the moment, together with the flag for the hour that comes twice. Where both of these
  // hours have the same flag, they name one of the two.
  STime back;
  std::tm again;
  ASSERT_EQ(back.SetLocalTm(&local), 1);
  ASSERT_TRUE(back == moment || (back.GetLocalTm(&again) && AreSame(again, local) && again.tm_isdst == local.tm_isdst));
  ASSERT_EQ(STime(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, local.tm_hour, local.tm_min, local.tm_sec,
                  local.tm_isdst),
            back);
  ASSERT_EQ(back.SetGmtTm(&utc), 1);
  ASSERT_EQ(back, moment);
  ASSERT_EQ(moment.GetYear(), local.tm_year + 1900);
  ASSERT_EQ(moment.GetMonth(), local.tm_mon + 1);
  ASSERT_EQ(moment.GetDayOfWeek(), local.tm_wday);
  ASSERT_EQ(moment.GetGmtYear() - 1900, utc.tm_year);
  ASSERT_EQ(moment.GetGmtMonth() - 1, utc.tm_mon);
  ASSERT_EQ(moment.GetGmtDay(), utc.tm_mday);
  ASSERT_EQ(moment.GetGmtHour(), utc.tm_hour);
  ASSERT_EQ(moment.GetGmtMinute(), utc.tm_min);
  ASSERT_EQ(moment.GetGmtSecond(), utc.tm_sec);
  ASSERT_EQ(moment.GetGmtDayOfWeek(), utc.tm_wday);
}

TEST(Zones, WholeRange) {
  const ZonePeer peer;
  std::mt19937 random(6);
  for (std::int64_t time = peer.First(); time <= INT32_MAX; time += 40000 + static_cast<int>(random() % 40000))
    ASSERT_NO_FATAL_FAILURE(CheckMoment(peer, static_cast<std::int32_t>(time)));
  ASSERT_NO_FATAL_FAILURE(CheckMoment(peer, 0x7FFFFFFF - 86400));
}

TEST(Zones, EveryChange) {
  const ZonePeer peer;
  for (const std::int32_t change : peer.Changes()) {
    SCOPED_TRACE(change);
    for (const int distance : {-86400, -7200, -3601, -3600, -1800, -1, 0, 1, 1799, 1800, 3599, 3600, 7199, 7200, 86400})
      ASSERT_NO_FATAL_FAILURE(CheckMoment(peer, change + distance));
  }
}

// Hours of a day that the daylight-saving flag settles, and those that it leaves to the runtime.
TEST(Zones, TheFlagMovesByTheSaving) {
  const ZonePeer peer;
  for (std::int32_t time = 1500000000; time < 1600000000; time += 86400 * 5 + 1234) {
    std::tm fields;
    ASSERT_TRUE(STime(time).GetLocalTm(&fields));
    const auto with = [&](int flag) {
      return STime(fields.tm_year + 1900, fields.tm_mon + 1, fields.tm_mday, fields.tm_hour, fields.tm_min,
                   fields.tm_sec, flag)
          .GetTime();
    };
    ASSERT_EQ(with(fields.tm_isdst), time);
    ASSERT_TRUE(fields.tm_isdst <= 0 || with(0) > time) << time;
  }
}

TEST(Times, RuntimeBreaksDownNoTimeBefore1970OnWindows) {
  const STime early(-86400 * 365);
  std::tm fields;
  if (!IsWindows()) {
    EXPECT_EQ(early.GetGmtYear(), 1969);
    EXPECT_FALSE(early.Format(WTEXT("%Y")).IsEmpty());
    return;
  }
  EXPECT_EQ(early.GetLocalTm(&fields), 0);
  EXPECT_EQ(early.GetYear(), -1);
  EXPECT_EQ(early.GetGmtHour(), -1);
  EXPECT_TRUE(early.Format(WTEXT("%Y")).IsEmpty());
  EXPECT_EQ(early.GetShortDateTimeString(), SString::Space);
  EXPECT_EQ(STime(1960, 1, 1, 0, 0, 0).GetTime(), -1);
}

TEST(Times, ImpossibleDatesAndCarriedFields) {
  EXPECT_EQ(STime(2040, 1, 1, 0, 0, 0).GetTime(), -1);
  EXPECT_EQ(STime(1890, 1, 1, 0, 0, 0).GetTime(), -1);
  EXPECT_EQ(STime(INT_MAX, 1, 1, 0, 0, 0).GetTime(), -1);
  EXPECT_EQ(STime(2023, 2, 31, 12, 0, 0), STime(2023, 3, 3, 12, 0, 0));
  EXPECT_EQ(STime(2024, 14, 1, 12, 0, 0), STime(2025, 2, 1, 12, 0, 0));
  std::tm fields = {};
  fields.tm_year = 200;
  fields.tm_mday = 1;
  STime time(5);
  EXPECT_EQ(time.SetGmtTm(&fields), 0);
  EXPECT_EQ(time.GetTime(), -1);
  EXPECT_EQ(time.SetLocalTm(&fields), 0);
  fields = {};
  fields.tm_year = 100 + 400 * 5000;  // carried back by as many days
  fields.tm_mday = 1 - 146097 * 5000;
  EXPECT_EQ(time.SetGmtTm(&fields), 1);
  EXPECT_EQ(time.FormatGmt(WTEXT("%Y-%m-%d %H:%M:%S")), SString(WTEXT("2000-01-01 00:00:00")));
  fields = {};
  fields.tm_year = 100;
  fields.tm_mon = -13;
  EXPECT_EQ(time.SetGmtTm(&fields), 1);
  EXPECT_EQ(time.FormatGmt(WTEXT("%Y-%m-%d")), SString(WTEXT("1998-11-30")));
}

TEST(Times, PackedFields) {
  EXPECT_EQ(STime(static_cast<unsigned short>(0x2821), 0, -1), STime(2000, 1, 1, 0, 0, 0));
  EXPECT_EQ(STime(0x2821, 0x0000).Format(WTEXT("%Y-%m-%d %H:%M:%S")), SString(WTEXT("2000-01-01 00:00:00")));
  // 23 July 2011 17:42:38
  EXPECT_EQ(STime(31 << 9 | 7 << 5 | 23, 17 << 11 | 42 << 5 | 19), STime(2011, 7, 23, 17, 42, 38));
}

TEST(Times, FileTimesAreReadWithTodaysBias) {
  const SYSTEMTIME utc = {2015, 6, 0, 15, 12, 30, 15, 999};
  FILETIME time, local;
  ASSERT_TRUE(SystemTimeToFileTime(&utc, &time));
  SYSTEMTIME there;
  FileTimeToLocalFileTime(&time, &local);
  FileTimeToSystemTime(&local, &there);
  EXPECT_EQ(STime(time), STime(there));
  EXPECT_EQ(STime(there), STime(there.wYear, there.wMonth, there.wDay, there.wHour, there.wMinute, there.wSecond));
  const SYSTEMTIME early = {1899, 6, 0, 15, 0, 0, 0, 0}, late = {2050, 1, 0, 1, 0, 0, 0, 0};
  SystemTimeToFileTime(&early, &time);
  EXPECT_EQ(STime(time).GetTime(), 0);
  SystemTimeToFileTime(&late, &time);
  EXPECT_EQ(STime(time).GetTime(), -1);
  time = {0, 0xF0000000};
  EXPECT_EQ(STime(time).GetTime(), 0);
}

// Every code, on each day of a leap year and its neighbours, against the runtime's narrow one.
TEST(Times, FormatsAgreeWithTheNarrowRuntime) {
  static const char* const kBoth[] = {"%a %A %b %B", "%d.%m.%Y %H:%M:%S", "%I %p", "%j %U %W %w", "%y%%", "%x|%X",
                                      "plain"};
  static const char* const kLinux[] = {"%C %D %e %F", "%g %G %V %u", "%h%n%t", "%r %R %T", "%Z %z"};
  for (std::int32_t time = 1672531200; time < 1767225600; time += 86400 + 3607) {
    std::tm fields;
    ASSERT_TRUE(STime(time).GetLocalTm(&fields));
    const auto check = [&](const char* format) {
      char expected[256];
      std::strftime(expected, sizeof expected, format, &fields);
      ASSERT_EQ(STime(time).Format(SString(format)), SString(expected)) << format << " " << time;
    };
    for (const char* format : kBoth) ASSERT_NO_FATAL_FAILURE(check(format));
    if (!IsWindows()) {
      for (const char* format : kLinux) ASSERT_NO_FATAL_FAILURE(check(format));
    }
  }
}

TEST(Times, FormatsOfTheirOwn) {
  // Without a locale, the runtimes of the two systems would differ.
  EXPECT_EQ(STime(1672531200).FormatGmt(WTEXT("%c")), SString(WTEXT("01/01/23 00:00:00")));
  const STime time(2003, 4, 5, 6, 7, 8);
  EXPECT_EQ(time.Format(WTEXT("%#d.%#m. %#H:%#M:%#S %#j %#I %#y")), SString(WTEXT("5.4. 6:7:8 95 6 3")));
  EXPECT_EQ(time.Format(WTEXT("%#x")), SString(WTEXT("Saturday, April 05, 2003")));
  EXPECT_EQ(time.Format(WTEXT("%#c")), SString(WTEXT("Saturday, April 05, 2003 06:07:08")));
  EXPECT_EQ(time.Format(WTEXT("\x4E2D%Y\xE9\xD83D")), SString(WTEXT("\x4E2D"
                                                                    "2003\xE9\xD83D")));
  for (const WCHAR* bad : {WTEXT("%Q"), WTEXT("%"), WTEXT("a%"), WTEXT("%#"), WTEXT("x %1d"), WTEXT("")})
    EXPECT_TRUE(time.Format(bad).IsEmpty()) << SString(bad).Length();
  EXPECT_TRUE(time.Format(static_cast<const WCHAR*>(nullptr)).IsEmpty());
  WideString text(126, 'x');
  EXPECT_EQ(time.Format((text + WTEXT("%d")).c_str()).Length(), 128);
  EXPECT_TRUE(time.Format((text + WTEXT("%d!")).c_str()).IsEmpty());
  EXPECT_TRUE(time.Format((text + WTEXT("xx!")).c_str()).IsEmpty());
  EXPECT_EQ(time.Format(181u), SString(nullptr, 181u));  // a text without codes
  EXPECT_EQ(time.FormatGmt(181u), SString(nullptr, 181u));
  EXPECT_TRUE(time.Format(65000u).IsEmpty());
}

TEST(Times, LocaleTexts) {
  const STime time(2003, 4, 5, 16, 7, 8);
  const SString shortDate = time.GetShortDateString(), longDate = time.GetLongDateString(), clock = time.GetTimeStr();
  EXPECT_NE(longDate.Find(WTEXT("2003")), nullptr);
  EXPECT_NE(shortDate.Find('5'), nullptr);
  EXPECT_NE(clock.Find(WTEXT("07")), nullptr);
  EXPECT_GT(longDate.Length(), shortDate.Length());
  EXPECT_EQ(time.GetShortDateTimeString(), shortDate + WTEXT(" ") + clock);
  EXPECT_EQ(time.GetLongDateTimeString(), longDate + WTEXT(" ") + clock);
}

TEST(Times, LocaleOfTheUser) {
  if (IsWindows()) GTEST_SKIP() << "the locale is the system's there";
  const char* former = std::getenv("LC_ALL");
  const std::string kept = former == nullptr ? "" : former;
  const STime time(2003, 4, 5, 16, 7, 8);
  const auto texts = [&](const char* locale) {
    test::SetVariable("LC_ALL", locale);
    return time.GetShortDateString() + WTEXT("|") + time.GetLongDateString() + WTEXT("|") + time.GetTimeStr();
  };
  EXPECT_EQ(texts("C"), SString(WTEXT("4/5/2003|Saturday, April 5, 2003|4:07:08 PM")));
  EXPECT_EQ(texts("de_DE.UTF-8"), SString(WTEXT("5.4.2003|Samstag, 5. April 2003|16:07:08")));
  EXPECT_EQ(texts("ja_JP.UTF-8"), SString(WTEXT("2003/4/5|2003\x5E74"
                                                "4\x6708"
                                                "5\x65E5\x571F\x66DC\x65E5|16:07:08")));
  EXPECT_EQ(texts("en_US"), SString(WTEXT("4/5/2003|Saturday, April 5, 2003|4:07:08 PM")));
  EXPECT_FALSE(texts("no such locale").IsEmpty());
  test::SetVariable("LC_ALL", kept);
}

TEST(Times, ArithmeticWraps) {
  const STime time(2003, 4, 5, 16, 7, 8);
  const STimeSpan span(2, 3, 4, 5);
  EXPECT_EQ((time + span) - time, span);
  EXPECT_EQ(time + span - span, time);
  EXPECT_LT(time, time + span);
  EXPECT_EQ((STime(INT32_MAX) + STimeSpan(1)).GetTime(), INT32_MIN);
  EXPECT_EQ(-STimeSpan(INT32_MIN), STimeSpan(INT32_MIN));
  EXPECT_EQ(STime().GetTime(), 0);
  const STime before = STime::GetTickCount();
  EXPECT_LE(std::abs(static_cast<long>(before.GetTime() - std::time(nullptr))), 2);
  EXPECT_GE(STime::GetCurrentTime(), before);  // by the Windows headers' name for it
}

TEST(Spans, Formats) {
  EXPECT_EQ(STimeSpan(90061).Format(WTEXT("%D %H:%M:%S")), SString(WTEXT("1 01:01:01")));
  EXPECT_EQ(STimeSpan(90061).Format(WTEXT("%x")), SString(WTEXT("x")));
  EXPECT_EQ(STimeSpan(1).Format(WTEXT("100%% %")), SString(WTEXT("100% %")));
  EXPECT_EQ(STimeSpan(-3661).Format(WTEXT("%D %H:%M:%S")), SString(WTEXT("0 -1:-1:-1")));
  EXPECT_EQ(STimeSpan(INT32_MIN).Format(WTEXT("%D %H:%M:%S")), SString(WTEXT("-24855 -3:-14:-8")));
  EXPECT_EQ(STimeSpan(5).Format(static_cast<const WCHAR*>(nullptr)), SString());
  EXPECT_EQ(STimeSpan(5).Format(181u), SString(nullptr, 181u));
  WideString codes, expected;
  for (int i = 0; i < 40; ++i) codes += WTEXT("%D%S-");
  const STimeSpan span(86400 * 1234 + 7);
  for (int i = 0; i < 40; ++i) expected += WTEXT("123407-");
  EXPECT_EQ(span.Format(codes.c_str()), SString(expected.substr(0, 128).c_str()));
  for (int seconds : {0, 59, 60, 3599, 86399, 86400, 2147483647}) {
    const STimeSpan whole(seconds);
    EXPECT_EQ(STimeSpan(whole.GetDays(), whole.GetHours(), whole.GetMinutes(), whole.GetSeconds()), whole);
  }
}

}  // namespace
