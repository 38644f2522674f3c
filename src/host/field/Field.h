// A named, typed field of an automaton (or a global of the runtime).
//
// Fields are what screens, parameter binding and expressions find by name. A field holds one
// value of its kind and converts what is assigned to it the way a 4GL does ("1" into an Entier
// is 1). A field may be bound by reference to a field of the automaton that created its owner:
// every later assignment is then written through to that caller field, converted to the
// caller's kind. The owner (automaton or global registry) owns the field; a reference binding
// never outlives the synchronous call that made it.
#pragma once

#include <cstdint>
#include <string>

#include "host/value/Valeur.h"

namespace quarvo::host {

class Automate;

class Field {
 public:
  // Access kinds: 0 automaton field, 2 runtime global, 4 value local to a handler.
  Field(std::string name, std::string label, std::string third, int access, Kind kind,
        Valeur initial, Automate* owner);
  Field(const Field&) = delete;
  Field& operator=(const Field&) = delete;

  const std::string& name() const { return name_; }
  const std::string& label() const { return label_; }
  int access() const { return access_; }
  Kind kind() const { return kind_; }
  Automate* owner() const { return owner_; }
  const Valeur& value() const { return value_; }

  // Converts `v` to this field's kind and stores it; returns false (field unchanged) when the
  // value does not convert.
  bool assign(const Valeur& v);
  void reset() { assign(initial_); }

  // Convenience setters and typed reads (reads convert; a failed conversion reads as empty/0).
  void set(std::string text) { assign(Valeur::chaine(std::move(text))); }
  void set(const char* text) { assign(Valeur::chaine(text)); }
  void set(int64_t n) { assign(Valeur::entier(n)); }
  void set(int n) { assign(Valeur::entier(n)); }
  void set(double d) { assign(Valeur::dbl(d)); }
  void set(const Monnaie& m) { assign(Valeur::monnaie(m)); }
  void set(const Date& d) { assign(Valeur::date(d)); }

  std::string text() const { return value_.toChaine(); }
  int64_t entier() const;
  double dbl() const;
  Monnaie monnaie() const;
  Date date() const;

  // Binds this field by reference to `caller`: future assignments are written through to it.
  void bindReference(Field* caller) { reference_ = caller; }

 private:
  std::string name_;
  std::string label_;
  std::string third_;
  int access_;
  Kind kind_;
  Valeur initial_;
  Valeur value_;
  Automate* owner_;
  Field* reference_ = nullptr;
};

// Reads any value as a number kind, 0 / empty when it does not convert.
int64_t toEntier(const Valeur& v);
double toDouble(const Valeur& v);
Monnaie toMonnaie(const Valeur& v);
Date toDate(const Valeur& v);

}  // namespace quarvo::host
