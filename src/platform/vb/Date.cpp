#include "platform/vb/Date.h"

#include <cmath>
#include <ctime>

namespace vb {
namespace {

// Days from the civil date to 1970-01-01 (proleptic Gregorian), after H. Hinnant.
int64_t DaysFromCivil(int64_t y, unsigned m, unsigned d) {
  y -= m <= 2;
  const int64_t era = (y >= 0 ? y : y - 399) / 400;
  const unsigned yoe = static_cast<unsigned>(y - era * 400);
  const unsigned doy = (153 * (m + (m > 2 ? -3 : 9)) + 2) / 5 + d - 1;
  const unsigned doe = yoe * 365 + yoe / 4 - yoe / 100 + doy;
  return era * 146097 + static_cast<int64_t>(doe) - 719468;
}

void CivilFromDays(int64_t z, int& y, int& m, int& d) {
  z += 719468;
  const int64_t era = (z >= 0 ? z : z - 146096) / 146097;
  const unsigned doe = static_cast<unsigned>(z - era * 146097);
  const unsigned yoe = (doe - doe / 1460 + doe / 36524 - doe / 146096) / 365;
  const int64_t yy = static_cast<int64_t>(yoe) + era * 400;
  const unsigned doy = doe - (365 * yoe + yoe / 4 - yoe / 100);
  const unsigned mp = (5 * doy + 2) / 153;
  d = static_cast<int>(doy - (153 * mp + 2) / 5 + 1);
  m = static_cast<int>(mp < 10 ? mp + 3 : mp - 9);
  y = static_cast<int>(yy + (m <= 2));
}

// 30 December 1899, the day zero of OLE dates, counted from 1970-01-01.
constexpr int64_t kEpochOffset = -25569;

bool IsLeap(int y) { return (y % 4 == 0 && y % 100 != 0) || y % 400 == 0; }

int DaysInMonth(int y, int m) {
  static constexpr int kDays[] = {31, 28, 31, 30, 31, 30, 31, 31, 30, 31, 30, 31};
  return m == 2 && IsLeap(y) ? 29 : kDays[m - 1];
}

}  // namespace

std::optional<Date> DateSerial(int year, int month, int day, int hour, int minute, int second) {
  if (year < 100 || year > 9999 || month < 1 || month > 12 || day < 1 ||
      day > DaysInMonth(year, month))
    return std::nullopt;
  if (hour < 0 || hour > 23 || minute < 0 || minute > 59 || second < 0 || second > 59)
    return std::nullopt;
  const int64_t days = DaysFromCivil(year, static_cast<unsigned>(month),
                                     static_cast<unsigned>(day)) - kEpochOffset;
  const double time = (hour * 3600 + minute * 60 + second) / 86400.0;
  // OLE dates before day zero keep the time as a positive fraction after the minus sign.
  const double serial = days >= 0 ? static_cast<double>(days) + time
                                  : static_cast<double>(days) - time;
  return Date{serial};
}

DateParts SplitDate(Date d) {
  const double whole = std::trunc(d.serial);
  // Round to the second: 23:59:59.9999 stored as a double is still 23:59:59 + epsilon.
  int64_t seconds = std::llround(std::fabs(d.serial - whole) * 86400.0);
  int64_t days = static_cast<int64_t>(whole);
  if (seconds >= 86400) {
    seconds -= 86400;
    days += d.serial >= 0 ? 1 : -1;
  }
  DateParts p;
  CivilFromDays(days + kEpochOffset, p.year, p.month, p.day);
  p.hour = static_cast<int>(seconds / 3600);
  p.minute = static_cast<int>(seconds / 60 % 60);
  p.second = static_cast<int>(seconds % 60);
  // 1970-01-01 was a Thursday (5 in Basic's numbering).
  const int64_t unixDays = days + kEpochOffset;
  p.weekday = static_cast<int>(((unixDays % 7) + 7 + 4) % 7) + 1;
  return p;
}

Date DateOnly(Date d) {
  const DateParts p = SplitDate(d);
  return DateSerial(p.year, p.month, p.day).value_or(Date{std::trunc(d.serial)});
}

Date Now() {
  const std::time_t t = std::time(nullptr);
  std::tm local{};
  localtime_r(&t, &local);
  return DateSerial(local.tm_year + 1900, local.tm_mon + 1, local.tm_mday, local.tm_hour,
                    local.tm_min, std::min(local.tm_sec, 59))
      .value_or(Date{});
}

}  // namespace vb
