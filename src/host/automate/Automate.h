// The automaton: the unit of work the runtime creates by registered name and drives by events.
//
// An automaton owns its fields (declared in order, destroyed in reverse), borrows the cursors
// and columns its class declares as members, and binds event labels to handlers with
// `addBranch`. Raising a label runs its handler under the exception guard: a UException thrown
// by the handler gets the branch label written into it and is reported through `exception`
// with the handler's event; the automaton stays alive. Handlers report their own outcome with
// `erreurMethode(flag, evt)`; after calling a procedure or another automaton, a handler asks
// `erreurMethode()` for that call's outcome.
//
// Automata live in one session (one user of one company) and reach the database, memory tables,
// dialogs and other automata through it. Not thread-safe: the session drives one at a time.
#pragma once

#include <cstdint>
#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

#include "host/event/Evt.h"
#include "host/field/Field.h"

namespace quarvo::host {

class Session;
class Table;
class Ecran;

class Automate {
 public:
  using Handler = std::function<void(Evt*)>;

  explicit Automate(Evt* creating);
  virtual ~Automate();
  Automate(const Automate&) = delete;
  Automate& operator=(const Automate&) = delete;

  Session& session() const { return session_; }
  // A number no other automaton of the process has had: tells an automaton from one made later
  // at the same address.
  uint64_t numeroInstance() const { return instance_; }
  const std::string& nomAutomate() const { return name_; }
  void setNomAutomate(std::string name) { name_ = std::move(name); }

  // Declarations made by constructors.
  Field& declare(Kind kind, std::string name, std::string label = {}, Valeur initial = {},
                 int access = 0);
  Field& chaine(std::string name, std::string label = {}, std::string initial = {});
  Field& entier(std::string name, std::string label = {}, int64_t initial = 0);
  Field& dbl(std::string name, std::string label = {});
  Field& date(std::string name, std::string label = {});
  Field& monnaie(std::string name, std::string label = {});
  void addBranch(const std::string& label, Handler handler);
  // Binds the creating event's parameters in positional order: for each index, when the event
  // carries parameters at all, `Evt::param` with the field and its kind (0 value, 1 reference).
  void lierParametres(Evt* evt, std::initializer_list<std::pair<Field*, int>> params);
  void nomBase(std::string base) { base_ = std::move(base); }
  const std::string& nomBase() const { return base_; }
  void nomTable(std::string table) { table_ = std::move(table); }
  const std::string& nomTable() const { return table_; }
  void nomEcran(std::string screen) { screen_ = std::move(screen); }
  const std::string& nomEcran() const { return screen_; }
  void modeSaisie(std::string modes) { modes_ = std::move(modes); }
  const std::string& modeSaisie() const { return modes_; }

  // Finding things by name (screens, expressions, parameter binding).
  Field* champ(const std::string& name) const;
  const std::vector<std::unique_ptr<Field>>& champs() const { return fields_; }
  Table* tableParContexte(const std::string& contextOrName) const;
  void enregistrerTable(Table* table) { tables_.push_back(table); }
  void oublierTable(Table* table);

  // Reuse by the session (interface automata are kept between calls). marquerConstruit() notes
  // what construction left; reprendre() brings the automaton back to that: fields declared
  // since are dropped, the others hold their initial values unbound, outcome and end cleared.
  void marquerConstruit();
  void reprendre();
  // True for automata the session may keep between calls: they hold nothing of their own from
  // one call to the next beyond what construction made (no member cursors, no member state).
  virtual bool reutilisable() const { return false; }

  // Dispatch. Returns false when no branch is bound to `label`.
  bool hasBranch(const std::string& label) const;
  bool raise(const std::string& label, Evt* evt);
  // The number of the numbered label that ran last ("TRANSFORMER4" → 4). A label declared with
  // two numbers ("BORNE(1,7)") binds every number from the first to the last.
  int numeroBranche() const { return numero_; }

  // Outcomes.
  void erreurMethode(int flag, Evt* evt);
  int erreurMethode() const { return callOutcome_; }
  int erreurMethode(Evt* evt) const { return evt ? evt->erreur() : callOutcome_; }
  // The automaton's own last reported outcome (what its caller reads).
  int outcome() const { return outcome_; }

  // Ends the automaton; pending work of its own is dropped.
  void sortir(Evt* evt = nullptr, int code = 0);
  bool termine() const { return ended_; }
  void rejeter(Evt* evt);
  bool rejete() const { return rejected_; }
  void controler(const std::string& control);

  // Calls. With an empty module: a label of this automaton, now. With a module name: a label of
  // that module's "INTERFACE" automaton. The outcome is read with erreurMethode() afterwards.
  void appelerProcedure(const std::string& instance, const std::string& module,
                        const std::string& automaton, const std::string& label, Evt* evt, int flag);
  // The same, queued on the session's event loop (parameters are copied by value).
  void lancerProcedure(const std::string& instance, const std::string& module,
                       const std::string& automaton, const std::string& label, Evt* evt, int flag);
  // Creates automaton `name` and runs it to its end before returning.
  void appelerModule(const std::string& instance, const std::string& module,
                     const std::string& name, Evt* evt);
  // Opens automaton `name` on its own, on the session's event loop.
  void lancerModule(const std::string& instance, const std::string& module, const std::string& name,
                    Evt* evt);

  // Dialogs: returns the button chosen (1-based).
  int BoiteDialogue(const std::string& title, const std::string& text, int icon,
                    const std::vector<std::string>& buttons);
  std::string BoiteOuvrirFichier(const std::string& filter);

  // Screen controls. The screen state is built from the description of `nomEcran()` when first
  // asked for; an automaton without a screen, or a control its screen does not declare, is a
  // runtime fault (UException).
  Ecran& ecran();
  bool aUnEcran() const { return !screen_.empty(); }
  void autoriser(const std::string& control);
  void interdire(const std::string& control);
  void cacher(const std::string& control);
  void rendreVisible(const std::string& control);

  // How the runtime drives an automaton of this base class from creation to end. A window
  // returns while it is still open; the session keeps it until it ends.
  virtual void executer(Evt* evt);
  virtual bool estFenetre() const { return false; }

  // Standard operations reached through their labels.
  virtual void init(Evt*) {}
  virtual void debut(Evt*) {}
  virtual void debut1(Evt*) {}
  virtual void fin1(Evt*) {}
  virtual void fin(Evt*) {}
  virtual void faire(Evt*) {}
  virtual void pour_tout(Evt*) {}
  virtual void sortie(Evt*) {}
  virtual void validation(Evt*) {}
  virtual void gestion(Evt*) {}
  // The waiting box of a long treatment (progress shown while it runs).
  virtual void debut_attente(Evt*) {}
  virtual void valeur_attente(Evt*) {}
  virtual void fin_attente(Evt*) {}
  virtual void stop_attente(Evt*) {}
  virtual void abandon_attente(Evt*) {}
  // Reports a runtime exception caught in a handler (its label is in evt->adresseC()).
  virtual void exception(Evt* evt);

 protected:
  struct Branch {
    std::string label;  // the label raised ("TRANSFORMER3")
    Handler handler;
    int numero = 0;
    std::string declared;  // the label as declared ("TRANSFORMER(3,4)"); empty when the same
  };

 private:
  Session& session_;
  uint64_t instance_;
  std::string name_;
  std::string base_ = "VOVOVA";
  std::string table_;
  std::string screen_;
  std::string modes_;
  std::vector<std::unique_ptr<Field>> fields_;
  std::map<std::string, Field*> fieldIndex_;
  std::vector<Table*> tables_;
  // In order of declaration; a label declared again (by a derived class) replaces the earlier
  // one, so lookups go from the end. An automaton is made for one or two raises, most often:
  // a plain list is cheaper to build than a tree.
  std::vector<Branch> branches_;
  const Branch* branche(const std::string& label) const;
  std::unique_ptr<Ecran> ecran_;
  struct Construit {
    size_t champs = 0;
    std::string base, table, screen, modes;
  };
  std::optional<Construit> construit_;
  int numero_ = 0;
  int outcome_ = 0;
  int callOutcome_ = 0;
  bool ended_ = false;
  bool rejected_ = false;
};

}  // namespace quarvo::host
