#include "host/automate/Automate.h"

#include <atomic>
#include <charconv>

#include "host/session/Session.h"
#include "host/table/Table.h"
#include "host/ui/Ecran.h"

namespace quarvo::host {

namespace {
std::atomic<uint64_t> instances{0};
}

Automate::Automate(Evt*) : session_(Session::current()), instance_(++instances) {
  // Room for the branches of most automata, so that declaring them never moves the list.
  branches_.reserve(32);
}

Automate::~Automate() = default;

Field& Automate::declare(Kind kind, std::string name, std::string label, Valeur initial,
                         int access) {
  auto field =
      std::make_unique<Field>(name, std::move(label), "", access, kind, std::move(initial), this);
  Field& ref = *field;
  fieldIndex_[name] = &ref;
  fields_.push_back(std::move(field));
  return ref;
}

Field& Automate::chaine(std::string name, std::string label, std::string initial) {
  return declare(Kind::Chaine, std::move(name), std::move(label),
                 Valeur::chaine(std::move(initial)));
}
Field& Automate::entier(std::string name, std::string label, int64_t initial) {
  return declare(Kind::Entier, std::move(name), std::move(label), Valeur::entier(initial));
}
Field& Automate::dbl(std::string name, std::string label) {
  return declare(Kind::Double, std::move(name), std::move(label), Valeur::dbl(0.0));
}
Field& Automate::date(std::string name, std::string label) {
  return declare(Kind::Date, std::move(name), std::move(label), Valeur::date(Date()));
}
Field& Automate::monnaie(std::string name, std::string label) {
  return declare(Kind::Monnaie, std::move(name), std::move(label), Valeur::monnaie(Monnaie()));
}

Field* Automate::champ(const std::string& name) const {
  auto it = fieldIndex_.find(name);
  return it == fieldIndex_.end() ? nullptr : it->second;
}

void Automate::oublierTable(Table* table) {
  // Tables go in the reverse order they came: the search starts from the end.
  for (auto it = tables_.rbegin(); it != tables_.rend(); ++it) {
    if (*it == table) {
      tables_.erase(std::next(it).base());
      return;
    }
  }
}

void Automate::marquerConstruit() {
  construit_ = Construit{fields_.size(), base_, table_, screen_, modes_};
}

void Automate::reprendre() {
  if (!construit_) return;
  fields_.resize(construit_->champs);
  fieldIndex_.clear();
  for (auto& field : fields_) {
    field->bindReference(nullptr);
    field->reset();
    fieldIndex_[field->name()] = field.get();
  }
  base_ = construit_->base;
  table_ = construit_->table;
  screen_ = construit_->screen;
  modes_ = construit_->modes;
  ecran_.reset();
  numero_ = 0;
  outcome_ = 0;
  callOutcome_ = 0;
  ended_ = false;
  rejected_ = false;
}

Table* Automate::tableParContexte(const std::string& contextOrName) const {
  for (Table* t : tables_) {
    if (!t->context().empty() && t->context() == contextOrName) return t;
  }
  for (Table* t : tables_) {
    if (t->name() == contextOrName) return t;
  }
  return nullptr;
}

void Automate::addBranch(const std::string& label, Handler handler) {
  auto open = label.find('(');
  if (open == std::string::npos || label.back() != ')') {
    branches_.push_back(Branch{label, std::move(handler), 0, {}});
    return;
  }
  // "TRANSFORMER(3,4)": one handler reached by "TRANSFORMER3" and "TRANSFORMER4"; "BORNE(1,7)"
  // by the seven labels "BORNE1" to "BORNE7": two numbers are the first and the last of a range.
  std::string stem = label.substr(0, open);
  std::string list = label.substr(open + 1, label.size() - open - 2);
  std::vector<int> numbers;
  size_t start = 0;
  while (start <= list.size()) {
    size_t comma = list.find(',', start);
    std::string item =
        list.substr(start, comma == std::string::npos ? std::string::npos : comma - start);
    int n = 0;
    std::from_chars(item.data(), item.data() + item.size(), n);
    numbers.push_back(n);
    if (comma == std::string::npos) break;
    start = comma + 1;
  }
  if (numbers.size() == 2 && numbers[1] > numbers[0]) {
    int first = numbers[0];
    int last = numbers[1];
    numbers.clear();
    for (int n = first; n <= last; ++n) numbers.push_back(n);
  }
  for (int n : numbers) branches_.push_back(Branch{stem + std::to_string(n), handler, n, label});
}

void Automate::lierParametres(Evt* evt, std::initializer_list<std::pair<Field*, int>> params) {
  if (evt == nullptr) return;
  int index = 0;
  for (const auto& [field, kind] : params) {
    if (evt->nbParams() != 0) evt->param(index, *field, kind);
    ++index;
  }
}

const Automate::Branch* Automate::branche(const std::string& label) const {
  for (auto it = branches_.rbegin(); it != branches_.rend(); ++it) {
    if (it->label == label) return &*it;
  }
  return nullptr;
}

bool Automate::hasBranch(const std::string& label) const {
  return branche(label) != nullptr;
}

bool Automate::raise(const std::string& label, Evt* evt) {
  const Branch* found = branche(label);
  if (found == nullptr) return false;
  // The handler runs from a copy and the branch is found again by position: a handler may
  // declare branches, which moves the list.
  auto position = static_cast<size_t>(found - branches_.data());
  Handler handler = found->handler;
  numero_ = found->numero;
  if (evt != nullptr) {
    evt->setNumero(found->numero);
    evt->setErreur(0);
  }
  rejected_ = false;
  auto signaler = [&](UException& e) {
    const Branch& branch = branches_[position];
    e.setLabel(branch.declared.empty() ? branch.label : branch.declared);
    if (evt != nullptr) {
      evt->adresseC(&e);
      exception(evt);
      evt->adresseC(nullptr);
    } else {
      EvtParamVal temporary;
      temporary.adresseC(&e);
      exception(&temporary);
    }
  };
  try {
    handler(evt);
  } catch (const BaseIndisponible&) {
    throw;  // nothing can go on without the database: the command ends
  } catch (UException& e) {
    signaler(e);
  } catch (const std::exception& e) {
    // Any other fault a handler lets out (an amount out of range, a library's error) is the
    // runtime's too: reported with the handler's label, and the automaton stays alive.
    UException fault(e.what());
    signaler(fault);
  }
  return true;
}

void Automate::exception(Evt* evt) {
  const UException* e = evt ? evt->adresseC() : nullptr;
  std::string where = e ? e->label() : std::string("?");
  std::string what = e ? e->what() : std::string("?");
  session_.ui().incident("Erreur d'exécution dans " + name_ + " (" + where + ") : " + what);
  // A handler interrupted by a fault has not done its work: its caller must not read success.
  erreurMethode(1, evt);
}

void Automate::erreurMethode(int flag, Evt* evt) {
  outcome_ = flag;
  if (evt != nullptr) evt->setErreur(flag);
}

void Automate::sortir(Evt*, int) {
  ended_ = true;
}

void Automate::rejeter(Evt* evt) {
  rejected_ = true;
  if (evt != nullptr) evt->setErreur(1);
}

void Automate::controler(const std::string& control) {
  ecran().focus(control);
}

void Automate::appelerProcedure(const std::string&, const std::string& module, const std::string&,
                                const std::string& label, Evt* evt, int) {
  if (module.empty()) {
    EvtParamVal none;
    Evt* e = evt != nullptr ? evt : &none;
    if (!raise(label, e)) {
      session_.ui().incident("La procédure " + label + " n'existe pas dans " + name_ + ".");
      callOutcome_ = 1;
      return;
    }
    callOutcome_ = e->erreur();
    return;
  }
  callOutcome_ = session_.appelerProcedure(module, label, evt);
}

void Automate::lancerProcedure(const std::string& instance, const std::string& module,
                               const std::string& automaton, const std::string& label, Evt* evt,
                               int flag) {
  Evt copy = evt != nullptr ? evt->byValue() : EvtParamVal();
  if (module.empty()) {
    // Own labels run while this automaton lives; queued work for it ends with it.
    session_.lancer([this, label, copy]() mutable {
      if (!termine()) raise(label, &copy);
    });
    return;
  }
  Session& s = session_;
  s.lancer([&s, module, label, copy]() mutable { s.appelerProcedure(module, label, &copy); });
  (void)instance;
  (void)automaton;
  (void)flag;
}

void Automate::appelerModule(const std::string&, const std::string&, const std::string& name,
                             Evt* evt) {
  callOutcome_ = session_.appelerModule(name, evt);
}

void Automate::lancerModule(const std::string&, const std::string&, const std::string& name,
                            Evt* evt) {
  if (!Registry::instance().find(name)) {
    session_.ui().incident("Le traitement " + name + " n'est pas disponible dans cette version.");
    callOutcome_ = 1;
    return;
  }
  Evt copy = evt != nullptr ? evt->byValue() : EvtParamVal();
  Session& s = session_;
  // Once the launched automaton has ended, the window that launched it, when still open, is
  // told it is active again.
  s.lancer([&s, name, copy, lanceur = this, numero = instance_]() mutable {
    s.appelerModule(name, &copy);
    if (s.estOuverte(lanceur) && lanceur->numeroInstance() == numero &&
        lanceur->hasBranch("DEBUT_ACTIVATION")) {
      EvtParamVal none;
      lanceur->raise("DEBUT_ACTIVATION", &none);
    }
  });
  callOutcome_ = 0;
}

int Automate::BoiteDialogue(const std::string& title, const std::string& text, int icon,
                            const std::vector<std::string>& buttons) {
  return session_.ui().boiteDialogue(title, text, icon, buttons);
}

std::string Automate::BoiteOuvrirFichier(const std::string& filter) {
  auto chosen = session_.ui().choisirFichier("Sélection d'un fichier", filter);
  return chosen ? *chosen : std::string();
}

Ecran& Automate::ecran() {
  if (!ecran_) {
    if (screen_.empty()) throw UException(name_ + " has no screen");
    auto description = DescriptionEcran::de(session_.dataDir(), screen_);
    // A field the screen shows is one of the automaton's: the screen draws its value.
    for (const auto& c : description->champs) {
      if (champ(c.nom) == nullptr) {
        throw UException("the screen " + screen_ + " shows a field " + c.nom + " that " + name_ +
                         " does not have");
      }
    }
    ecran_ = std::make_unique<Ecran>(std::move(description));
  }
  return *ecran_;
}
void Automate::autoriser(const std::string& c) {
  ecran().controle(c).actif = true;
}
void Automate::interdire(const std::string& c) {
  ecran().controle(c).actif = false;
}
void Automate::cacher(const std::string& c) {
  ecran().controle(c).visible = false;
}
void Automate::rendreVisible(const std::string& c) {
  ecran().controle(c).visible = true;
}

void Automate::executer(Evt* evt) {
  for (const char* label : {"INIT", "DEBUT", "FAIRE"}) {
    if (termine()) break;
    raise(label, evt);
  }
  sortir();
}

}  // namespace quarvo::host
