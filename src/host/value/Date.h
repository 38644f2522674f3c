// Date: a calendar date of the runtime, possibly empty (a blank date field).
//
// Built on std::chrono::year_month_day; only valid dates of years 1..9999 are held, anything
// else becomes the empty date. Screens show dates as "dd/mm/yyyy", the database stores them as
// ISO "yyyy-mm-dd". An empty date sorts before every date. A Date is a plain value that owns
// nothing; arithmetic on an empty date gives an empty date.
#pragma once

#include <chrono>
#include <compare>
#include <optional>
#include <string>
#include <string_view>

namespace quarvo::host {

class Date {
 public:
  Date() = default;
  explicit Date(std::chrono::year_month_day ymd);
  static Date of(int year, unsigned month, unsigned day);
  // "dd/mm/yyyy" (or "d/m/yyyy") and "yyyy-mm-dd". Blank text is the empty date; an impossible
  // date or any other shape (two-digit years included) is nullopt.
  static std::optional<Date> parse(std::string_view text);
  // The current local date.
  static Date today();
  static bool isLeapYear(int year);

  bool empty() const { return !ymd_.has_value(); }
  std::string text() const;  // "dd/mm/yyyy", "" when empty
  std::string iso() const;   // "yyyy-mm-dd", "" when empty
  int year() const;          // 0 when empty
  unsigned month() const;    // 0 when empty
  unsigned day() const;      // 0 when empty
  // Precondition: !empty().
  std::chrono::year_month_day ymd() const { return *ymd_; }

  Date addDays(int days) const;
  // The day is clamped to the last day of the target month (31/01/2024 + 1 = 29/02/2024).
  Date addMonths(int months) const;
  Date firstOfMonth() const;
  Date lastOfMonth() const;
  // Days from this date to `other` (negative when `other` is earlier); 0 if either is empty.
  int daysUntil(Date other) const;

  auto operator<=>(const Date&) const = default;

 private:
  std::optional<std::chrono::year_month_day> ymd_;
};

}  // namespace quarvo::host
