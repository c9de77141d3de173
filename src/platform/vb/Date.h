#pragma once
// Dates as OLE Automation keeps them: days since 30 December 1899, the time of day as
// the fraction. 1 January 1900 (serial 2) is what the date pickers show for "no date".

#include <cstdint>
#include <optional>
#include <string>

namespace vb {

struct Date {
  double serial = 0.0;

  friend bool operator==(const Date&, const Date&) = default;
  friend auto operator<=>(const Date&, const Date&) = default;
};

struct DateParts {
  int year = 1899, month = 12, day = 30;
  int hour = 0, minute = 0, second = 0;
  int weekday = 0;  // 1 = Sunday ... 7 = Saturday, as Basic's Weekday
};

// Builds a date; returns nullopt for a day that does not exist or a time out of range.
std::optional<Date> DateSerial(int year, int month, int day, int hour = 0, int minute = 0,
                               int second = 0);
DateParts SplitDate(Date d);
// The calendar day of d at 00:00:00.
Date DateOnly(Date d);
// The local wall-clock time now.
Date Now();

// 1 January 1900 at midnight: the "no date" of the date pickers.
inline constexpr Date kEmptyDate{2.0};

}  // namespace vb
