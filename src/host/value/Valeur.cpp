#include "host/value/Valeur.h"

#include <cassert>
#include <charconv>
#include <cmath>
#include <limits>
#include <system_error>

#include "host/Texte.h"

namespace quarvo::host {

namespace {

using Wide = __int128;

template <typename T>
int sign(T a, T b) {
  return a < b ? -1 : (b < a ? 1 : 0);
}

bool isDigit(char c) {
  return c >= '0' && c <= '9';
}

// Shortest text that reads back as `v`: positional for ordinary magnitudes, scientific for very
// large or very small ones. Zero is "0" whatever its sign.
template <typename F>
std::string floatingText(F v) {
  if (v == 0) return "0";
  char buf[64];
  F a = std::fabs(v);
  bool positional = std::isfinite(v) && a >= F(1e-6) && a < F(1e21);
  auto r = positional ? std::to_chars(buf, buf + sizeof buf, v, std::chars_format::fixed)
                      : std::to_chars(buf, buf + sizeof buf, v);
  return std::string(buf, r.ptr);
}

// Shortest positional text of `v` ("nan"/"inf" when not finite), as read by Monnaie::parse.
template <typename F>
std::string fixedText(F v) {
  char buf[512];
  auto r = std::to_chars(buf, buf + sizeof buf, v, std::chars_format::fixed);
  return std::string(buf, r.ptr);
}

template <typename F>
std::optional<Monnaie> floatingToMonnaie(F v) {
  return Monnaie::parse(fixedText(v));
}

std::optional<int64_t> roundToEntier(double v) {
  if (!std::isfinite(v)) return std::nullopt;
  double r = std::round(v);  // halves away from zero
  if (r < -9223372036854775808.0 || r >= 9223372036854775808.0) return std::nullopt;
  return static_cast<int64_t>(r);
}

std::optional<int64_t> textToEntier(std::string_view s) {
  s = sansBlancs(s);
  if (s.empty()) return 0;
  std::string digits;
  if (s.front() == '+' || s.front() == '-') {
    if (s.front() == '-') digits = "-";
    s.remove_prefix(1);
  }
  if (s.empty()) return std::nullopt;
  for (char c : s) {
    if (!isDigit(c)) return std::nullopt;
  }
  digits += s;
  int64_t n = 0;
  auto r = std::from_chars(digits.data(), digits.data() + digits.size(), n);
  if (r.ec != std::errc{}) return std::nullopt;
  return n;
}

// Reads "-12,5", "3.", ".25", "1e-3" (the exponent form is what toChaine() writes for extreme
// magnitudes). Blank text is 0.
template <typename F>
std::optional<F> textToFloating(std::string_view s) {
  s = sansBlancs(s);
  if (s.empty()) return F(0);
  std::string text;
  size_t i = 0;
  if (s[i] == '+' || s[i] == '-') {
    if (s[i] == '-') text = "-";
    ++i;
  }
  size_t digits = 0;
  for (; i < s.size() && isDigit(s[i]); ++i, ++digits) text += s[i];
  if (i < s.size() && (s[i] == '.' || s[i] == ',')) {
    text += '.';
    for (++i; i < s.size() && isDigit(s[i]); ++i, ++digits) text += s[i];
  }
  if (digits == 0) return std::nullopt;
  if (i < s.size() && (s[i] == 'e' || s[i] == 'E')) {
    text += 'e';
    ++i;
    if (i < s.size() && (s[i] == '+' || s[i] == '-')) text += s[i++];
    size_t expDigits = 0;
    for (; i < s.size() && isDigit(s[i]); ++i, ++expDigits) text += s[i];
    if (expDigits == 0) return std::nullopt;
  }
  if (i != s.size()) return std::nullopt;
  F v = 0;
  auto r = std::from_chars(text.data(), text.data() + text.size(), v);
  if (r.ec != std::errc{}) return std::nullopt;
  return v;
}

std::optional<Valeur> fromText(const std::string& s, Kind target) {
  switch (target) {
    case Kind::Entier:
      if (auto n = textToEntier(s)) return Valeur::entier(*n);
      return std::nullopt;
    case Kind::Double:
      if (auto d = textToFloating<double>(s)) return Valeur::dbl(*d);
      return std::nullopt;
    case Kind::Simple:
      if (auto f = textToFloating<float>(s)) return Valeur::simple(*f);
      return std::nullopt;
    case Kind::Monnaie:
      if (sansBlancs(s).empty()) return Valeur::monnaie(Monnaie());
      if (auto m = Monnaie::parse(s)) return Valeur::monnaie(*m);
      return std::nullopt;
    case Kind::Date:
      if (auto d = Date::parse(s)) return Valeur::date(*d);
      return std::nullopt;
    case Kind::Chaine:
      return Valeur::chaine(s);
  }
  return std::nullopt;
}

std::optional<Valeur> fromEntier(int64_t n, Kind target) {
  switch (target) {
    case Kind::Double:
      return Valeur::dbl(static_cast<double>(n));
    case Kind::Simple:
      return Valeur::simple(static_cast<float>(n));
    case Kind::Monnaie:
      if (n > std::numeric_limits<int64_t>::max() / Monnaie::kScale ||
          n < -std::numeric_limits<int64_t>::max() / Monnaie::kScale)
        return std::nullopt;
      return Valeur::monnaie(Monnaie(n));
    default:
      return std::nullopt;
  }
}

template <typename F>
std::optional<Valeur> fromFloating(F v, Kind target) {
  switch (target) {
    case Kind::Entier:
      if (auto n = roundToEntier(v)) return Valeur::entier(*n);
      return std::nullopt;
    case Kind::Double:
      return Valeur::dbl(static_cast<double>(v));
    case Kind::Simple:
      return Valeur::simple(static_cast<float>(v));
    case Kind::Monnaie:
      if (auto m = floatingToMonnaie(v)) return Valeur::monnaie(*m);
      return std::nullopt;
    default:
      return std::nullopt;
  }
}

std::optional<Valeur> fromMonnaie(Monnaie m, Kind target) {
  switch (target) {
    case Kind::Entier:
      return Valeur::entier(valeurArrondie(m, 0, '=').micros() / Monnaie::kScale);
    case Kind::Double:
      return Valeur::dbl(m.toDouble());
    case Kind::Simple: {
      // Read from the decimal text so the float is the one nearest to the exact amount.
      std::string text = m.text();
      float f = 0;
      std::from_chars(text.data(), text.data() + text.size(), f);
      return Valeur::simple(f);
    }
    default:
      return std::nullopt;
  }
}

bool isNumeric(Kind k) {
  return k != Kind::Chaine && k != Kind::Date;
}

int family(Kind k) {
  return k == Kind::Chaine ? 0 : (k == Kind::Date ? 2 : 1);
}

double floating(const Valeur& v) {
  return v.kind() == Kind::Simple ? static_cast<double>(v.asSimple()) : v.asDouble();
}

// NaN sorts before every number and equal to itself, so sorting stays a strict weak order.
int compareDoubles(double a, double b) {
  if (std::isnan(a) || std::isnan(b)) return int(!std::isnan(a)) - int(!std::isnan(b));
  return sign(a, b);
}

// Exact, even where the int64 is not representable as a double.
int compareEntierDouble(int64_t n, double d) {
  if (std::isnan(d)) return 1;
  if (d >= 9223372036854775808.0) return -1;
  if (d < -9223372036854775808.0) return 1;
  double whole = std::trunc(d);
  int64_t w = static_cast<int64_t>(whole);
  if (n != w) return sign(n, w);
  double frac = d - whole;
  return frac > 0 ? -1 : (frac < 0 ? 1 : 0);
}

// `f` is a Double or a Simple, compared as the amount it reads as.
int compareMonnaieFloating(Monnaie m, const Valeur& f) {
  auto fm =
      f.kind() == Kind::Simple ? floatingToMonnaie(f.asSimple()) : floatingToMonnaie(f.asDouble());
  if (fm) return sign(m.micros(), fm->micros());
  return compareDoubles(m.toDouble(), floating(f));  // NaN or beyond any amount
}

Wide exactMicros(const Valeur& v) {
  return v.kind() == Kind::Entier ? Wide(v.asEntier()) * Monnaie::kScale
                                  : Wide(v.asMonnaie().micros());
}

int compareNumbers(const Valeur& a, const Valeur& b) {
  Kind ka = a.kind();
  Kind kb = b.kind();
  auto exact = [](Kind k) { return k == Kind::Entier || k == Kind::Monnaie; };
  if (ka == Kind::Entier && kb == Kind::Entier) return sign(a.asEntier(), b.asEntier());
  if (exact(ka) && exact(kb)) return sign(exactMicros(a), exactMicros(b));
  if (ka == Kind::Monnaie) return compareMonnaieFloating(a.asMonnaie(), b);
  if (kb == Kind::Monnaie) return -compareMonnaieFloating(b.asMonnaie(), a);
  if (ka == Kind::Entier) return compareEntierDouble(a.asEntier(), floating(b));
  if (kb == Kind::Entier) return -compareEntierDouble(b.asEntier(), floating(a));
  return compareDoubles(floating(a), floating(b));
}

int compareDates(const Date& a, const Date& b) {
  auto c = a <=> b;
  return c < 0 ? -1 : (c > 0 ? 1 : 0);
}

int compareTexts(const std::string& a, const std::string& b) {
  int c = a.compare(b);  // char_traits<char> compares as unsigned char: bytewise
  return c < 0 ? -1 : (c > 0 ? 1 : 0);
}

}  // namespace

const char* kindName(Kind kind) {
  switch (kind) {
    case Kind::Chaine:
      return "Chaine";
    case Kind::Entier:
      return "Entier";
    case Kind::Double:
      return "Double";
    case Kind::Simple:
      return "Simple";
    case Kind::Date:
      return "Date";
    case Kind::Monnaie:
      return "Monnaie";
  }
  return "?";
}

Valeur Valeur::initial(Kind kind) {
  switch (kind) {
    case Kind::Entier:
      return entier(0);
    case Kind::Double:
      return dbl(0);
    case Kind::Simple:
      return simple(0);
    case Kind::Date:
      return date(Date());
    case Kind::Monnaie:
      return monnaie(Monnaie());
    case Kind::Chaine:
      break;
  }
  return Valeur();
}

const std::string& Valeur::asChaine() const {
  assert(kind() == Kind::Chaine);
  return std::get<std::string>(value_);
}

int64_t Valeur::asEntier() const {
  assert(kind() == Kind::Entier);
  return std::get<int64_t>(value_);
}

double Valeur::asDouble() const {
  assert(kind() == Kind::Double);
  return std::get<double>(value_);
}

float Valeur::asSimple() const {
  assert(kind() == Kind::Simple);
  return std::get<float>(value_);
}

const Date& Valeur::asDate() const {
  assert(kind() == Kind::Date);
  return std::get<Date>(value_);
}

Monnaie Valeur::asMonnaie() const {
  assert(kind() == Kind::Monnaie);
  return std::get<Monnaie>(value_);
}

std::string Valeur::toChaine() const {
  switch (kind()) {
    case Kind::Chaine:
      return asChaine();
    case Kind::Entier:
      return std::to_string(asEntier());
    case Kind::Double:
      return floatingText(asDouble());
    case Kind::Simple:
      return floatingText(asSimple());
    case Kind::Date:
      return asDate().text();
    case Kind::Monnaie:
      return asMonnaie().text();
  }
  return "";
}

std::optional<Valeur> Valeur::convertTo(Kind target) const {
  if (target == kind()) return *this;
  if (target == Kind::Chaine) return chaine(toChaine());
  switch (kind()) {
    case Kind::Chaine:
      return fromText(asChaine(), target);
    case Kind::Entier:
      return fromEntier(asEntier(), target);
    case Kind::Double:
      return fromFloating(asDouble(), target);
    case Kind::Simple:
      return fromFloating(asSimple(), target);
    case Kind::Monnaie:
      return fromMonnaie(asMonnaie(), target);
    case Kind::Date:
      break;  // a date only becomes text
  }
  return std::nullopt;
}

bool Valeur::isEmptyOrZero() const {
  switch (kind()) {
    case Kind::Chaine:
      return asChaine().empty();
    case Kind::Entier:
      return asEntier() == 0;
    case Kind::Double:
      return asDouble() == 0;
    case Kind::Simple:
      return asSimple() == 0;
    case Kind::Date:
      return asDate().empty();
    case Kind::Monnaie:
      return asMonnaie().isZero();
  }
  return false;
}

int Valeur::compare(const Valeur& a, const Valeur& b) {
  Kind ka = a.kind();
  Kind kb = b.kind();
  if (isNumeric(ka) && isNumeric(kb)) return compareNumbers(a, b);
  if (ka == Kind::Date && kb == Kind::Date) return compareDates(a.asDate(), b.asDate());
  if (ka == Kind::Date && kb == Kind::Chaine) {
    if (auto d = Date::parse(b.asChaine())) return compareDates(a.asDate(), *d);
  }
  if (ka == Kind::Chaine && kb == Kind::Date) {
    if (auto d = Date::parse(a.asChaine())) return compareDates(*d, b.asDate());
  }
  return compareTexts(a.toChaine(), b.toChaine());
}

bool Valeur::operator==(const Valeur& other) const {
  return family(kind()) == family(other.kind()) && compare(*this, other) == 0;
}

}  // namespace quarvo::host
