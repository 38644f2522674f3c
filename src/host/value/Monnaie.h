// Monnaie: the exact decimal type for every money amount handled by the runtime.
//
// An amount is a signed count of millionths (6 decimals) held in an int64_t, so sums and
// comparisons are exact and nothing goes through binary floating point unless a caller asks
// for a double. Products and quotients are computed in 128 bits and rounded half away from
// zero to 6 decimals. Results outside +/-9223372036854.775807 throw std::overflow_error and a
// division by zero throws std::domain_error. A Monnaie is a plain value: it owns nothing.
#pragma once

#include <compare>
#include <concepts>
#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace quarvo::host {

class Monnaie {
 public:
  static constexpr int kDecimals = 6;
  static constexpr int64_t kScale = 1'000'000;

  Monnaie() = default;
  explicit Monnaie(int64_t wholeUnits);
  // A double is never silently truncated into an amount: use fromDouble().
  template <std::floating_point F>
  Monnaie(F) = delete;

  static Monnaie fromMicros(int64_t micros);
  // "12.5", " -3,25 ", "+42": optional spaces around, optional sign, '.' or ',' as decimal
  // separator. Decimals beyond 6 are rounded half away from zero. nullopt when the text is
  // not a number or the amount is out of range.
  static std::optional<Monnaie> parse(std::string_view text);
  // Rounds the shortest decimal text of `value` to 6 decimals (0.1 gives exactly 0.100000).
  // Throws std::domain_error for NaN/infinity, std::overflow_error when out of range.
  static Monnaie fromDouble(double value);

  int64_t micros() const { return micros_; }
  double toDouble() const;
  // "12.50", "-3.00", "0.125": at least 2 decimals, no trailing zeros beyond.
  std::string text() const;
  bool isZero() const { return micros_ == 0; }
  Monnaie abs() const { return Monnaie::fromMicros(micros_ < 0 ? -micros_ : micros_); }

  Monnaie operator-() const { return Monnaie::fromMicros(-micros_); }
  Monnaie& operator+=(Monnaie other);
  Monnaie& operator-=(Monnaie other);
  Monnaie& operator*=(Monnaie other);
  Monnaie& operator/=(Monnaie other);
  template <std::integral I>
  Monnaie& operator*=(I n) {
    return *this = multipliedBy(static_cast<int64_t>(n));
  }
  template <std::integral I>
  Monnaie& operator/=(I n) {
    return *this = dividedBy(static_cast<int64_t>(n));
  }
  // The double operand is first taken as an amount through fromDouble().
  Monnaie& operator*=(double factor) { return *this *= fromDouble(factor); }
  Monnaie& operator/=(double divisor) { return *this /= fromDouble(divisor); }

  friend Monnaie operator+(Monnaie a, Monnaie b) { return a += b; }
  friend Monnaie operator-(Monnaie a, Monnaie b) { return a -= b; }
  friend Monnaie operator*(Monnaie a, Monnaie b) { return a *= b; }
  friend Monnaie operator/(Monnaie a, Monnaie b) { return a /= b; }
  template <std::integral I>
  friend Monnaie operator*(Monnaie a, I n) {
    return a *= n;
  }
  template <std::integral I>
  friend Monnaie operator*(I n, Monnaie a) {
    return a *= n;
  }
  template <std::integral I>
  friend Monnaie operator/(Monnaie a, I n) {
    return a /= n;
  }
  friend Monnaie operator*(Monnaie a, double f) { return a *= f; }
  friend Monnaie operator*(double f, Monnaie a) { return a *= f; }
  friend Monnaie operator/(Monnaie a, double f) { return a /= f; }

  auto operator<=>(const Monnaie&) const = default;

 private:
  Monnaie multipliedBy(int64_t n) const;
  Monnaie dividedBy(int64_t n) const;

  int64_t micros_ = 0;
};

// Rounds to `decimals` (0..6) decimals. Mode '=' nearest with halves away from zero, '+' toward
// +infinity, '-' toward -infinity. Throws std::invalid_argument for another mode or decimals.
Monnaie valeurArrondie(Monnaie v, int decimals, char mode);
// Same modes, applied to the shortest decimal text of `v`, so 2.675 gives 2.68 with '='.
double valeurArrondie(double v, int decimals, char mode);

}  // namespace quarvo::host
