#include "host/value/Monnaie.h"

#include <charconv>
#include <cmath>
#include <limits>
#include <stdexcept>
#include <system_error>

#include "host/Texte.h"

namespace quarvo::host {

namespace {

using Wide = __int128;

constexpr Wide kMax = std::numeric_limits<int64_t>::max();

// Amounts are kept symmetric (never INT64_MIN) so negation and abs() cannot overflow.
int64_t checked(Wide v) {
  if (v > kMax || v < -kMax) throw std::overflow_error("Monnaie: amount out of range");
  return static_cast<int64_t>(v);
}

// n / d rounded half away from zero; d != 0.
Wide divideRounded(Wide n, Wide d) {
  Wide q = n / d;
  Wide r = n % d;
  if (r != 0) {
    Wide ar = r < 0 ? -r : r;
    Wide ad = d < 0 ? -d : d;
    if (2 * ar >= ad) q += ((n < 0) != (d < 0)) ? -1 : 1;
  }
  return q;
}

void checkRounding(int decimals, char mode) {
  if (decimals < 0 || decimals > Monnaie::kDecimals)
    throw std::invalid_argument("valeurArrondie: decimals must be 0..6");
  if (mode != '=' && mode != '+' && mode != '-')
    throw std::invalid_argument("valeurArrondie: mode must be '=', '+' or '-'");
}

// A decimal number as read from text: sign and digit strings, no exponent.
struct DecimalText {
  bool negative = false;
  std::string whole;
  std::string frac;
};

bool isDigit(char c) {
  return c >= '0' && c <= '9';
}

std::optional<DecimalText> readDecimal(std::string_view s) {
  s = sansBlancs(s);
  DecimalText d;
  size_t i = 0;
  if (i < s.size() && (s[i] == '+' || s[i] == '-')) d.negative = s[i++] == '-';
  while (i < s.size() && isDigit(s[i])) d.whole += s[i++];
  if (i < s.size() && (s[i] == '.' || s[i] == ',')) {
    ++i;
    while (i < s.size() && isDigit(s[i])) d.frac += s[i++];
  }
  if (i != s.size() || (d.whole.empty() && d.frac.empty())) return std::nullopt;
  return d;
}

// Keeps exactly `decimals` fraction digits, rounding the dropped ones by `mode`.
void roundDecimal(DecimalText& d, int decimals, char mode) {
  size_t keep = static_cast<size_t>(decimals);
  if (d.frac.size() <= keep) {
    d.frac.resize(keep, '0');
    return;
  }
  std::string_view dropped = std::string_view(d.frac).substr(keep);
  bool up;
  if (mode == '=') {
    up = dropped.front() >= '5';
  } else {
    bool inexact = dropped.find_first_not_of('0') != std::string_view::npos;
    up = inexact && ((mode == '+') != d.negative);
  }
  d.frac.resize(keep);
  if (!up) return;
  std::string digits = d.whole + d.frac;
  size_t i = digits.size();
  while (i > 0 && digits[i - 1] == '9') digits[--i] = '0';
  if (i == 0) {
    digits.insert(digits.begin(), '1');
  } else {
    ++digits[i - 1];
  }
  d.whole = digits.substr(0, digits.size() - keep);
  d.frac = digits.substr(digits.size() - keep);
}

std::optional<int64_t> toMicros(DecimalText d) {
  roundDecimal(d, Monnaie::kDecimals, '=');
  Wide v = 0;
  for (char c : d.whole + d.frac) {
    v = v * 10 + (c - '0');
    if (v > kMax) return std::nullopt;
  }
  return static_cast<int64_t>(d.negative ? -v : v);
}

// Shortest text that reads back as `v`, in plain positional notation.
std::string fixedText(double v) {
  char buf[512];  // enough for any finite double in fixed notation
  auto r = std::to_chars(buf, buf + sizeof buf, v, std::chars_format::fixed);
  return std::string(buf, r.ptr);
}

double readDouble(const std::string& text) {
  double v = 0;
  std::from_chars(text.data(), text.data() + text.size(), v);
  return v;
}

}  // namespace

Monnaie::Monnaie(int64_t wholeUnits) : micros_(checked(Wide(wholeUnits) * kScale)) {}

Monnaie Monnaie::fromMicros(int64_t micros) {
  Monnaie m;
  m.micros_ = checked(micros);
  return m;
}

std::optional<Monnaie> Monnaie::parse(std::string_view text) {
  auto d = readDecimal(text);
  if (!d) return std::nullopt;
  auto micros = toMicros(*d);
  if (!micros) return std::nullopt;
  return fromMicros(*micros);
}

Monnaie Monnaie::fromDouble(double value) {
  if (!std::isfinite(value)) throw std::domain_error("Monnaie: not a finite number");
  auto micros = toMicros(*readDecimal(fixedText(value)));
  if (!micros) throw std::overflow_error("Monnaie: amount out of range");
  return fromMicros(*micros);
}

double Monnaie::toDouble() const {
  return readDouble(text());
}

std::string Monnaie::text() const {
  // Written into a buffer once: amounts are formatted for every row written to the database.
  uint64_t magnitude = micros_ < 0 ? 0 - uint64_t(micros_) : uint64_t(micros_);
  char buf[32];
  char* p = buf;
  if (micros_ < 0) *p++ = '-';
  p = std::to_chars(p, buf + sizeof buf, magnitude / kScale).ptr;
  *p++ = '.';
  uint64_t frac = magnitude % kScale;
  char* debut = p;
  for (uint64_t div = kScale / 10; div > 0; div /= 10)
    *p++ = static_cast<char>('0' + frac / div % 10);
  while (p - debut > 2 && p[-1] == '0') --p;
  return std::string(buf, p);
}

Monnaie& Monnaie::operator+=(Monnaie other) {
  micros_ = checked(Wide(micros_) + other.micros_);
  return *this;
}

Monnaie& Monnaie::operator-=(Monnaie other) {
  micros_ = checked(Wide(micros_) - other.micros_);
  return *this;
}

Monnaie& Monnaie::operator*=(Monnaie other) {
  micros_ = checked(divideRounded(Wide(micros_) * other.micros_, kScale));
  return *this;
}

Monnaie& Monnaie::operator/=(Monnaie other) {
  if (other.micros_ == 0) throw std::domain_error("Monnaie: division by zero");
  micros_ = checked(divideRounded(Wide(micros_) * kScale, other.micros_));
  return *this;
}

Monnaie Monnaie::multipliedBy(int64_t n) const {
  return fromMicros(checked(Wide(micros_) * n));
}

Monnaie Monnaie::dividedBy(int64_t n) const {
  if (n == 0) throw std::domain_error("Monnaie: division by zero");
  return fromMicros(checked(divideRounded(micros_, n)));
}

Monnaie valeurArrondie(Monnaie v, int decimals, char mode) {
  checkRounding(decimals, mode);
  int64_t step = 1;
  for (int i = decimals; i < Monnaie::kDecimals; ++i) step *= 10;
  int64_t q = v.micros() / step;
  int64_t r = v.micros() % step;
  if (mode == '=' && 2 * (r < 0 ? -r : r) >= step) q += r < 0 ? -1 : 1;
  if (mode == '+' && r > 0) ++q;
  if (mode == '-' && r < 0) --q;
  return Monnaie::fromMicros(checked(Wide(q) * step));
}

double valeurArrondie(double v, int decimals, char mode) {
  checkRounding(decimals, mode);
  // From 2^53 on every double is a whole number already.
  if (!std::isfinite(v) || std::fabs(v) >= 9007199254740992.0) return v;
  DecimalText d = *readDecimal(fixedText(v));
  roundDecimal(d, decimals, mode);
  std::string text = d.negative ? "-" : "";
  text += d.whole.empty() ? "0" : d.whole;
  if (!d.frac.empty()) {
    text += '.';
    text += d.frac;
  }
  double r = readDouble(text);
  return r == 0 ? 0.0 : r;
}

}  // namespace quarvo::host
