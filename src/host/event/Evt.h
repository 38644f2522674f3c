// Events: a named request sent to an automaton, with positional parameters.
//
// An event carries its parameters by value (`EvtParamVal`: the values are copied when the event
// is built) or by reference (`EvtParamRef`: the caller's fields themselves; the callee writes
// through them). The sender owns the event and keeps it alive for the whole synchronous call.
// The callee binds parameters with `param`; an index past the count leaves the target unchanged.
// An event also carries the outcome the handler reported (`erreurMethode`), the number raised
// for a numbered label ("TRANSFORMER3" reaching "TRANSFORMER(3,4)") and, on the exception path,
// the runtime exception that interrupted its handler.
#pragma once

#include <initializer_list>
#include <string>
#include <variant>
#include <vector>

#include "host/UException.h"
#include "host/field/Field.h"

namespace quarvo::host {

// One positional argument: a value, or a caller's field (by reference when the event says so).
using Arg = std::variant<Valeur, Field*>;

class Evt {
 public:
  explicit Evt(std::string label = {}) : label_(std::move(label)) {}
  virtual ~Evt() = default;
  Evt(const Evt&) = default;
  Evt& operator=(const Evt&) = default;

  const std::string& label() const { return label_; }
  void setLabel(std::string label) { label_ = std::move(label); }

  int nbParams() const { return static_cast<int>(args_.size()); }

  // Binds parameter `index` into `target`. kind 0 copies the value in; kind 1 also binds the
  // target by reference when the event carries the caller's field, so the callee's later
  // assignments reach the caller. An index past the count leaves `target` unchanged.
  void param(int index, Field& target, int kind) const;

  // Indices of parameters that did not convert to the kind of the field they were bound to.
  const std::vector<int>& refus() const { return refused_; }

  // The value of parameter `index` (empty text past the count).
  Valeur valeur(int index) const;

  // Outcome reported by the handler that ran this event (1 = failed).
  int erreur() const { return erreur_; }
  void setErreur(int flag) { erreur_ = flag; }

  // Number of a numbered label that was raised ("TRANSFORMER4" gives 4), 0 otherwise.
  int numero() const { return numero_; }
  void setNumero(int n) { numero_ = n; }

  // The runtime exception attached on the exception path (null otherwise). Not owned.
  void adresseC(const UException* e) { exception_ = e; }
  const UException* adresseC() const { return exception_; }

  // A copy that carries only values (for work queued past the caller's lifetime).
  Evt byValue() const;

 protected:
  std::vector<Arg> args_;
  bool byReference_ = false;
  mutable std::vector<int> refused_;

 private:
  std::string label_;
  int erreur_ = 0;
  int numero_ = 0;
  const UException* exception_ = nullptr;
};

// Parameters copied in when the event is built (fields given are read now).
class EvtParamVal : public Evt {
 public:
  EvtParamVal() = default;
  EvtParamVal(std::initializer_list<Arg> args);
  explicit EvtParamVal(std::vector<Arg> args);
};

// Parameters by reference: fields are passed as themselves; values may be mixed in.
class EvtParamRef : public Evt {
 public:
  EvtParamRef(std::initializer_list<Arg> args);
  explicit EvtParamRef(std::vector<Arg> args);
};

// Shorthands for building argument lists.
inline Arg val(std::string s) {
  return Valeur::chaine(std::move(s));
}
inline Arg val(const char* s) {
  return Valeur::chaine(s);
}
inline Arg val(int64_t n) {
  return Valeur::entier(n);
}
inline Arg val(int n) {
  return Valeur::entier(n);
}
inline Arg ref(Field& f) {
  return &f;
}

}  // namespace quarvo::host
