// Valeur: one value of one of the runtime's kinds, with the conversions of a 4GL.
//
// Fields, expressions, event parameters and cursor criteria all move data around as Valeur.
// A Valeur owns its payload (text, number, date or amount) by value; there is no sharing and
// no null: an unset value is the empty text, 0 or the empty date. convertTo() applies the
// assignment rules ("12,5" into a Monnaie is 12.50, "abc" into an Entier fails) and compare()
// is the ordering used for sorting and criteria.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <variant>

#include "host/value/Date.h"
#include "host/value/Monnaie.h"

namespace quarvo::host {

// The order matches the alternatives of Valeur's variant.
enum class Kind { Chaine, Entier, Double, Simple, Date, Monnaie };

const char* kindName(Kind kind);

class Valeur {
 public:
  Valeur() = default;

  static Valeur chaine(std::string text) { return Valeur(Payload(std::move(text))); }
  static Valeur entier(int64_t n) { return Valeur(Payload(n)); }
  static Valeur dbl(double d) { return Valeur(Payload(d)); }
  static Valeur simple(float f) { return Valeur(Payload(f)); }
  static Valeur date(Date d) { return Valeur(Payload(d)); }
  static Valeur monnaie(Monnaie m) { return Valeur(Payload(m)); }
  // The value a fresh variable of `kind` starts with: "", 0 or the empty date.
  static Valeur initial(Kind kind);

  Kind kind() const { return static_cast<Kind>(value_.index()); }

  // Each accessor requires the value to be of that kind.
  const std::string& asChaine() const;
  int64_t asEntier() const;
  double asDouble() const;
  float asSimple() const;
  const Date& asDate() const;
  Monnaie asMonnaie() const;

  // Makes the value the text `text`, reusing the storage of a text it already holds: rows read
  // again and again into the same cursor do not allocate.
  void assignerChaine(std::string_view text) {
    if (auto* s = std::get_if<std::string>(&value_)) {
      s->assign(text);
    } else {
      value_.emplace<std::string>(text);
    }
  }

  // Display text: "12", "1.5", "0.1", "dd/mm/yyyy" (or "" for the empty date), "12.50".
  std::string toChaine() const;
  // The value as `target`, or nullopt when a 4GL assignment would refuse it. Text is trimmed,
  // blank text is 0 (or the empty date), and ',' or '.' is the decimal separator. Doubles and
  // amounts become an Entier rounded half away from zero. Dates only convert to text.
  std::optional<Valeur> convertTo(Kind target) const;
  bool isEmptyOrZero() const;

  // <0, 0 or >0. Numbers of any kind compare by value; dates by date, text against a date as a
  // date when it reads as one; everything else by display text, bytewise.
  static int compare(const Valeur& a, const Valeur& b);
  // Equal by compare() and of the same family (text, number, date): "12" != 12.
  bool operator==(const Valeur& other) const;

 private:
  using Payload = std::variant<std::string, int64_t, double, float, Date, Monnaie>;
  explicit Valeur(Payload value) : value_(std::move(value)) {}

  Payload value_;
};

}  // namespace quarvo::host
