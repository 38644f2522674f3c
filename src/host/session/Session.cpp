#include "host/session/Session.h"

#include <algorithm>
#include <utility>

#include "host/UException.h"
#include "host/automate/Automate.h"

namespace quarvo::host {

namespace {
thread_local Session* currentSession = nullptr;
}

Session::Session(Database& db, UiDriver& ui, std::string company, std::string user)
    : db_(db), ui_(&ui), company_(std::move(company)), user_(std::move(user)) {}

UiDriver& Session::remplacerUi(UiDriver& ui) {
  return *std::exchange(ui_, &ui);
}

Session::~Session() = default;

Session& Session::current() {
  if (currentSession == nullptr) throw UException("no session is open");
  return *currentSession;
}
bool Session::hasCurrent() {
  return currentSession != nullptr;
}

Session::Scope::Scope(Session& s) : previous_(currentSession) {
  currentSession = &s;
}
Session::Scope::~Scope() {
  currentSession = previous_;
}

bool Session::isMemoryName(const std::string& name) {
  return name.rfind("M_", 0) == 0 || name.rfind("MEM:", 0) == 0 || name.rfind("I_", 0) == 0;
}

MemoryStore& Session::memoire(const std::string& name) {
  auto it = memory_.find(name);
  if (it != memory_.end()) return *it->second;
  // "I_AFLBUD" and "MEM:QUARVO" take the layout of the persistent table they mirror.
  std::string mirrored;
  if (name.rfind("I_", 0) == 0) mirrored = name.substr(2);
  if (name.rfind("MEM:", 0) == 0) mirrored = name.substr(4);
  std::unique_ptr<MemoryStore> store;
  TableStore* persistent = mirrored.empty() ? nullptr : db_.store(mirrored);
  if (persistent != nullptr) {
    TableSchema layout = persistent->schema();
    // An interface record is one row written in place: it has no key to keep in order.
    if (name.rfind("I_", 0) == 0) layout.setKey({});
    store = std::make_unique<MemoryStore>(name, layout);
  } else {
    store = std::make_unique<MemoryStore>(name);
  }
  return *memory_.emplace(name, std::move(store)).first->second;
}

TableStore* Session::store(const std::string& table) {
  if (isMemoryName(table)) return &memoire(table);
  return db_.store(table);
}

AutomatePtr Session::creer(const std::string& name, Evt* evt) {
  Fabrique factory = Registry::instance().find(name);
  if (factory == nullptr) return nullptr;
  Scope scope(*this);
  AutomatePtr automate(factory(evt));
  if (automate) automate->setNomAutomate(name);
  return automate;
}

int Session::appelerModule(const std::string& name, Evt* evt) {
  AutomatePtr automate = creer(name, evt);
  if (!automate) {
    ui_->incident("Le traitement " + name + " n'est pas disponible dans cette version.");
    return 1;
  }
  return executerAutomate(std::move(automate), evt);
}

int Session::executerAutomate(AutomatePtr automate, Evt* evt) {
  Scope scope(*this);
  automate->executer(evt);
  if (!automate->estFenetre() || automate->termine()) return automate->outcome();
  if (!boucleModale_) {
    int outcome = automate->outcome();
    windows_.push_back(std::move(automate));
    return outcome;
  }
  // The window's own loop: the work it launches runs within it, even when this call itself
  // runs from the event loop (a window launched by another).
  struct Empilee {
    Session& s;
    bool running;
    ~Empilee() {
      s.modales_.pop_back();
      s.running_ = running;
    }
  } empilee{*this, running_};
  modales_.push_back(automate.get());
  running_ = false;
  boucleModale_(*automate);
  return automate->outcome();
}

bool Session::estOuverte(const Automate* automate) {
  // Found among the windows before it is looked at: `automate` may be gone.
  bool found = std::find(modales_.begin(), modales_.end(), automate) != modales_.end() ||
               std::any_of(windows_.begin(), windows_.end(),
                           [automate](const AutomatePtr& w) { return w.get() == automate; });
  return found && !automate->termine();
}

Automate* Session::fenetre(const std::string& name) {
  fenetresOuvertes();
  for (auto it = windows_.rbegin(); it != windows_.rend(); ++it) {
    if ((*it)->nomAutomate() == name) return it->get();
  }
  return nullptr;
}

size_t Session::fenetresOuvertes() {
  std::erase_if(windows_, [](const AutomatePtr& w) { return w->termine(); });
  return windows_.size();
}

int Session::appelerProcedure(const std::string& module, const std::string& label, Evt* evt) {
  AutomatePtr automate;
  std::vector<AutomatePtr>& libres = interfaces_[module];
  if (!libres.empty()) {
    automate = std::move(libres.back());
    libres.pop_back();
    automate->reprendre();
  } else {
    automate = creer(module + "-INTERFACE", nullptr);
    if (!automate) {
      ui_->incident("Le module " + module + " n'est pas disponible.");
      return 1;
    }
    automate->marquerConstruit();
  }
  Scope scope(*this);
  EvtParamVal none;
  Evt* e = evt != nullptr ? evt : &none;
  if (automate->hasBranch("INIT")) automate->raise("INIT", e);
  if (!automate->raise(label, e)) {
    ui_->incident("La procédure " + label + " n'existe pas dans le module " + module + ".");
    return 1;
  }
  int outcome = e->erreur();
  // Kept for the next call when it may be, and unless it ended itself.
  if (automate->reutilisable() && !automate->termine()) {
    interfaces_[module].push_back(std::move(automate));
  }
  return outcome;
}

void Session::lancer(std::function<void()> work) {
  pending_.push_back(std::move(work));
}

void Session::executerEnAttente() {
  if (running_) return;  // the loop that is running will reach the new work
  running_ = true;
  Scope scope(*this);
  while (!pending_.empty()) {
    auto work = std::move(pending_.front());
    pending_.pop_front();
    work();
  }
  running_ = false;
}

}  // namespace quarvo::host
