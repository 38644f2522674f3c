#include "host/value/Date.h"

#include <algorithm>
#include <cstdio>
#include <ctime>

#include "host/Texte.h"

namespace quarvo::host {

namespace chr = std::chrono;

namespace {

constexpr int kMinYear = 1;
constexpr int kMaxYear = 9999;

// Reads 1..maxDigits decimal digits making up the whole of `s`.
std::optional<int> readNumber(std::string_view s, size_t minDigits, size_t maxDigits) {
  if (s.size() < minDigits || s.size() > maxDigits) return std::nullopt;
  int v = 0;
  for (char c : s) {
    if (c < '0' || c > '9') return std::nullopt;
    v = v * 10 + (c - '0');
  }
  return v;
}

// Splits "a<sep>b<sep>c" into its three parts; false for any other number of parts.
bool split3(std::string_view s, char sep, std::string_view parts[3]) {
  for (int i = 0; i < 2; ++i) {
    size_t pos = s.find(sep);
    if (pos == std::string_view::npos) return false;
    parts[i] = s.substr(0, pos);
    s.remove_prefix(pos + 1);
  }
  parts[2] = s;
  return s.find(sep) == std::string_view::npos;
}

}  // namespace

Date::Date(chr::year_month_day ymd) {
  int y = static_cast<int>(ymd.year());
  if (ymd.ok() && y >= kMinYear && y <= kMaxYear) ymd_ = ymd;
}

Date Date::of(int year, unsigned month, unsigned day) {
  // chrono::month and chrono::day keep only 8 bits: reject large values before they wrap.
  if (year < kMinYear || year > kMaxYear || month > 12 || day > 31) return Date();
  return Date(chr::year_month_day(chr::year(year), chr::month(month), chr::day(day)));
}

std::optional<Date> Date::parse(std::string_view text) {
  text = sansBlancs(text);
  if (text.empty()) return Date();

  std::string_view parts[3];
  std::optional<int> y, m, d;
  if (split3(text, '/', parts)) {
    d = readNumber(parts[0], 1, 2);
    m = readNumber(parts[1], 1, 2);
    y = readNumber(parts[2], 4, 4);
  } else if (split3(text, '-', parts)) {
    y = readNumber(parts[0], 4, 4);
    m = readNumber(parts[1], 1, 2);
    d = readNumber(parts[2], 1, 2);
  }
  if (!y || !m || !d) return std::nullopt;
  Date date = of(*y, static_cast<unsigned>(*m), static_cast<unsigned>(*d));
  if (date.empty()) return std::nullopt;
  return date;
}

Date Date::today() {
  std::time_t now = std::time(nullptr);
  std::tm local{};
#ifdef _WIN32
  localtime_s(&local, &now);
#else
  localtime_r(&now, &local);
#endif
  return of(local.tm_year + 1900, static_cast<unsigned>(local.tm_mon + 1),
            static_cast<unsigned>(local.tm_mday));
}

bool Date::isLeapYear(int year) {
  return year % 4 == 0 && (year % 100 != 0 || year % 400 == 0);
}

std::string Date::text() const {
  if (empty()) return "";
  char buf[16];
  std::snprintf(buf, sizeof buf, "%02u/%02u/%04d", day(), month(), year());
  return buf;
}

std::string Date::iso() const {
  if (empty()) return "";
  // By hand rather than snprintf: dates are formatted for every row written to the database.
  int y = year();
  unsigned m = month();
  unsigned d = day();
  if (y < 0 || y > 9999) {
    char buf[24];
    std::snprintf(buf, sizeof buf, "%04d-%02u-%02u", y, m, d);
    return buf;
  }
  char buf[10] = {static_cast<char>('0' + y / 1000),
                  static_cast<char>('0' + y / 100 % 10),
                  static_cast<char>('0' + y / 10 % 10),
                  static_cast<char>('0' + y % 10),
                  '-',
                  static_cast<char>('0' + m / 10),
                  static_cast<char>('0' + m % 10),
                  '-',
                  static_cast<char>('0' + d / 10),
                  static_cast<char>('0' + d % 10)};
  return std::string(buf, sizeof buf);
}

int Date::year() const {
  return empty() ? 0 : static_cast<int>(ymd_->year());
}
unsigned Date::month() const {
  return empty() ? 0 : static_cast<unsigned>(ymd_->month());
}
unsigned Date::day() const {
  return empty() ? 0 : static_cast<unsigned>(ymd_->day());
}

Date Date::addDays(int days) const {
  if (empty()) return Date();
  return Date(chr::year_month_day(chr::sys_days(*ymd_) + chr::days(days)));
}

Date Date::addMonths(int months) const {
  if (empty()) return Date();
  chr::year_month ym = chr::year_month(ymd_->year(), ymd_->month()) + chr::months(months);
  chr::day last = chr::year_month_day_last(ym.year(), chr::month_day_last(ym.month())).day();
  return Date(chr::year_month_day(ym.year(), ym.month(), std::min(ymd_->day(), last)));
}

Date Date::firstOfMonth() const {
  if (empty()) return Date();
  return Date(chr::year_month_day(ymd_->year(), ymd_->month(), chr::day(1)));
}

Date Date::lastOfMonth() const {
  if (empty()) return Date();
  return Date(chr::year_month_day(
      chr::year_month_day_last(ymd_->year(), chr::month_day_last(ymd_->month()))));
}

int Date::daysUntil(Date other) const {
  if (empty() || other.empty()) return 0;
  return static_cast<int>((chr::sys_days(*other.ymd_) - chr::sys_days(*ymd_)).count());
}

}  // namespace quarvo::host
