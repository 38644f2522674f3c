// A session: one user of one company working on one database.
//
// The session holds the user's memory tables and interface records (shared by name between its
// automata), its event loop for launched work, and borrows the database and the UI driver from
// whoever opened it. It creates automata by registered name and runs the procedures of module
// interface automata. Exactly one session is current on a thread while it runs (`Scope`);
// automata built by factories attach to the current session.
#pragma once

#include <deque>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <unordered_map>
#include <vector>

#include "host/automate/Registry.h"
#include "host/table/Database.h"
#include "host/table/MemoryStore.h"
#include "host/ui/UiDriver.h"

namespace quarvo::host {

class Session {
 public:
  Session(Database& db, UiDriver& ui, std::string company, std::string user);
  ~Session();
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  // REQUIRES: a Scope is open on this thread.
  static Session& current();
  static bool hasCurrent();
  class Scope {
   public:
    explicit Scope(Session& s);
    ~Scope();
    Scope(const Scope&) = delete;
    Scope& operator=(const Scope&) = delete;

   private:
    Session* previous_;
  };

  Database& db() { return db_; }
  UiDriver& ui() { return *ui_; }
  // Puts `ui` in place of the driver the session was opened with (the screen model does, for
  // as long as it lives); returns the one it replaces. REQUIRES: `ui` outlives its use.
  UiDriver& remplacerUi(UiDriver& ui);
  const std::string& societe() const { return company_; }
  const std::string& utilisateur() const { return user_; }
  // Folder of the catalogues and data files (db/); set by whoever opens the session.
  const std::filesystem::path& dataDir() const { return dataDir_; }
  void setDataDir(std::filesystem::path dir) { dataDir_ = std::move(dir); }

  // The store behind a table name: memory tables ("M_...", "MEM:...", "I_...") are the
  // session's; other names are the database's. Null for an unknown persistent table.
  TableStore* store(const std::string& table);
  MemoryStore& memoire(const std::string& name);
  static bool isMemoryName(const std::string& name);

  // Automata.
  AutomatePtr creer(const std::string& name, Evt* evt);
  // Creates `name` and drives it to its end. Returns its outcome (1 when it could not be made).
  int appelerModule(const std::string& name, Evt* evt);
  // Drives `automate`, made by `creer`, as appelerModule does.
  int executerAutomate(AutomatePtr automate, Evt* evt);
  // Runs `label` of `module`'s interface automaton. Returns the outcome.
  int appelerProcedure(const std::string& module, const std::string& label, Evt* evt);

  // Open windows (automata still running after their start), most recent last. A window that
  // has ended is released the next time the session looks.
  Automate* fenetre(const std::string& name);
  size_t fenetresOuvertes();
  // Whether `automate` is a window of this session still open. `automate` may be an automaton
  // that no longer exists (it is only compared with the open windows).
  bool estOuverte(const Automate* automate);

  // Modal windows. With a loop set (the screen model sets one), a window that `appelerModule`
  // opens runs that loop until it ends, and only then does the call return: its caller waits,
  // and reads what the window did. The loop receives the window; the window stays on the stack
  // of `fenetresModales` (innermost last) while its loop runs. Without a loop, an opened window
  // stays in the session and the call returns at once (batch drivers raise its events).
  void setBoucleModale(std::function<void(Automate&)> boucle) { boucleModale_ = std::move(boucle); }
  const std::vector<Automate*>& fenetresModales() const { return modales_; }

  // Event loop: launched work runs in order when the loop is run, each item to its end.
  void lancer(std::function<void()> work);
  void executerEnAttente();
  size_t enAttente() const { return pending_.size(); }

 private:
  Database& db_;
  UiDriver* ui_;
  std::string company_;
  std::string user_;
  std::filesystem::path dataDir_ = "db";
  std::unordered_map<std::string, std::unique_ptr<MemoryStore>> memory_;
  std::deque<std::function<void()>> pending_;
  std::vector<AutomatePtr> windows_;
  std::vector<Automate*> modales_;
  std::function<void(Automate&)> boucleModale_;
  bool running_ = false;
  // Interface automata between two calls, by module: a batch calls the same few interfaces
  // for every line, and making one costs more than most calls. Several are kept when calls
  // nest. Declared last, so destroyed first.
  std::unordered_map<std::string, std::vector<AutomatePtr>> interfaces_;
};

}  // namespace quarvo::host
