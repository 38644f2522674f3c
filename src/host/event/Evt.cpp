#include "host/event/Evt.h"

namespace quarvo::host {

void Evt::param(int index, Field& target, int kind) const {
  if (index < 0 || index >= nbParams()) return;
  const Arg& arg = args_[static_cast<size_t>(index)];
  if (const auto* v = std::get_if<Valeur>(&arg)) {
    if (!target.assign(*v)) refused_.push_back(index);
    return;
  }
  Field* caller = std::get<Field*>(arg);
  if (!target.assign(caller->value())) refused_.push_back(index);
  if (kind == 1 && byReference_) target.bindReference(caller);
}

Valeur Evt::valeur(int index) const {
  if (index < 0 || index >= nbParams()) return Valeur();
  const Arg& arg = args_[static_cast<size_t>(index)];
  if (const auto* v = std::get_if<Valeur>(&arg)) return *v;
  return std::get<Field*>(arg)->value();
}

Evt Evt::byValue() const {
  Evt copy(*this);
  for (auto& arg : copy.args_) {
    if (auto* f = std::get_if<Field*>(&arg)) arg = (*f)->value();
  }
  copy.byReference_ = false;
  return copy;
}

static std::vector<Arg> copied(std::vector<Arg> args) {
  for (auto& arg : args) {
    if (auto* f = std::get_if<Field*>(&arg)) arg = (*f)->value();
  }
  return args;
}

EvtParamVal::EvtParamVal(std::initializer_list<Arg> args) : EvtParamVal(std::vector<Arg>(args)) {}
EvtParamVal::EvtParamVal(std::vector<Arg> args) {
  args_ = copied(std::move(args));
}

EvtParamRef::EvtParamRef(std::initializer_list<Arg> args) : EvtParamRef(std::vector<Arg>(args)) {}
EvtParamRef::EvtParamRef(std::vector<Arg> args) {
  args_ = std::move(args);
  byReference_ = true;
}

}  // namespace quarvo::host
