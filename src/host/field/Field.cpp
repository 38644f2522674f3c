#include "host/field/Field.h"

namespace quarvo::host {

Field::Field(std::string name, std::string label, std::string third, int access, Kind kind,
             Valeur initial, Automate* owner)
    : name_(std::move(name)),
      label_(std::move(label)),
      third_(std::move(third)),
      access_(access),
      kind_(kind),
      owner_(owner) {
  auto converted = initial.convertTo(kind);
  initial_ = converted ? *converted : *Valeur().convertTo(kind);
  value_ = initial_;
}

bool Field::assign(const Valeur& v) {
  auto converted = v.convertTo(kind_);
  if (!converted) return false;
  value_ = std::move(*converted);
  if (reference_ != nullptr) reference_->assign(value_);
  return true;
}

int64_t toEntier(const Valeur& v) {
  auto c = v.convertTo(Kind::Entier);
  return c ? c->asEntier() : 0;
}
double toDouble(const Valeur& v) {
  auto c = v.convertTo(Kind::Double);
  return c ? c->asDouble() : 0.0;
}
Monnaie toMonnaie(const Valeur& v) {
  auto c = v.convertTo(Kind::Monnaie);
  return c ? c->asMonnaie() : Monnaie();
}
Date toDate(const Valeur& v) {
  auto c = v.convertTo(Kind::Date);
  return c ? c->asDate() : Date();
}

int64_t Field::entier() const {
  return toEntier(value_);
}
double Field::dbl() const {
  return toDouble(value_);
}
Monnaie Field::monnaie() const {
  return toMonnaie(value_);
}
Date Field::date() const {
  return toDate(value_);
}

}  // namespace quarvo::host
