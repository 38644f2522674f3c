// The screen model: the one way every driver (a script, the terminal, the web page) works the
// windows of a session.
//
// The model runs its session on a thread of its own, the session thread, for as long as it
// lives, and is the session's UI driver meanwhile: one model works a session at a time (make the
// next one once the last is gone), and the session is not used from another thread while an
// action runs. A driver calls `ouvrir` and `agir` from one
// thread of its own, one call at a time; each call hands the work to the session thread and
// returns once the session waits for a person again:
// - the action ended (and the work it launched, such as a report, ran);
// - a handler asks a question: the dialog is pending in the state, the handler waits on the
//   session thread, and the only action then accepted is `answer`. A message with a single
//   button asks nothing: its text is among the state's messages and the handler goes on;
// - a handler opened another window: that window runs its own actions until it ends, while the
//   handler that opened it waits (it reads what the window did once it returns).
// No handler may wait for a person while a write transaction is open: a question asked then is
// a runtime fault of that handler.
//
// Each action runs exactly what a person's action runs (Fenetre_simple's operations), after
// the model has checked it: the window is the innermost one, the control is declared, enabled,
// visible and on the current tab, the text converts to the field's kind (a bad number or date is
// refused naming the field and the value, and the field keeps its value). A refused action
// changes nothing but the refusal in the state. A handler's own rejection (`rejeter`) refuses
// the action, and so does a runtime fault reported while it ran (an incident). Faults of the
// runtime that end the command (the database lost) are thrown again from the driver's call.
#pragma once

#include <condition_variable>
#include <exception>
#include <functional>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <thread>
#include <vector>

#include "host/ui/Action.h"
#include "host/ui/EtatEcran.h"
#include "host/ui/UiDriver.h"

namespace quarvo::host {

class Automate;
class Session;

class ModeleEcran {
 public:
  // `echo`, when given, is also shown the waiting box (a progress bar on a terminal) and, with
  // `echoMessages`, the messages and incidents (the command line prints them as they come).
  explicit ModeleEcran(Session& session, UiDriver* echo = nullptr, bool echoMessages = false);
  // Closes every window still open (`fermerTout`), then stops the session thread.
  ~ModeleEcran();
  ModeleEcran(const ModeleEcran&) = delete;
  ModeleEcran& operator=(const ModeleEcran&) = delete;

  enum class Ouverture { Ouverte, Refusee, Inconnue, PasUnEcran };
  // Opens the screen automaton `name` with `params` as its positional parameters (text values
  // bound by value). Refusee: the window ended while opening (its messages are in the state).
  Ouverture ouvrir(const std::string& name, const std::vector<std::string>& params = {});
  // Runs `label` of `module`'s interface with `params` as a menu runs it: the window that label
  // opens is the one the actions then work. Inconnue: no such module; Refusee: no window opened
  // (the interface's messages say why).
  Ouverture appeler(const std::string& module, const std::string& label,
                    const std::vector<std::string>& params = {});
  // Plays one action; false when it was refused (the refusal is in the state).
  bool agir(const Action& action);
  // Closes every window still open, innermost first, as `close` does: a pending dialog gets its
  // last button (the refusal); a window that stays open after its own question is ended
  // without it.
  void fermerTout();

  // The state as it was when the last call returned.
  const EtatEcrans& etat() const { return etat_; }
  // Called on the session thread each time the waiting box changes while an action runs (its
  // title, text, done and total; nothing when it closes): live progress for a driver that shows
  // it as it goes (the web page pushes it). Set it between two calls.
  void suivreProgression(std::function<void(const std::optional<EtatProgression>&)> suivi) {
    suivi_ = std::move(suivi);
  }
  // What a command reads of a window once it has closed: the last window that closed, its
  // fields as text by name, and its outcome.
  const std::map<std::string, std::string>& champsFermes() const { return champsFermes_; }
  int resultatFerme() const { return resultatFerme_; }

 private:
  class Pilote;
  struct Reponse {
    int numero = 0;                    // a button or an item, from 1; 0 for none
    std::optional<std::string> texte;  // a path
  };

  // Driver side.
  void attendre(std::unique_lock<std::mutex>& lock);
  bool soumettre(std::function<void()> travail);
  bool refuserIci(const std::string& controle, const std::string& texte);
  bool repondre(const Action& action);

  // Session thread.
  void boucle();
  void servir(const std::function<bool()>& fini);
  void publier();
  Reponse attendreReponse();
  EtatEcrans photographier();
  void executer(const Action& action);
  bool appliquer(Automate& window, const Action& action);
  void refuser(const std::string& controle, const std::string& texte);
  void noterFermeture(Automate& window);

  Session& session_;
  UiDriver* echo_;
  bool echoMessages_;
  std::unique_ptr<Pilote> pilote_;
  UiDriver* precedent_ = nullptr;

  // Between the two threads, under m_.
  std::mutex m_;
  std::condition_variable cv_;
  std::function<void()> travail_;   // the next work for the session thread
  std::optional<Reponse> reponse_;  // the answer to the pending question
  bool pret_ = false;               // the session waits for a person again
  bool arret_ = false;
  bool refuse_ = false;
  EtatEcrans publie_;
  std::map<std::string, std::string> publieFermes_;
  int publieResultat_ = 0;
  std::exception_ptr faute_;

  // The driver's side: the state of the last call.
  EtatEcrans etat_;
  std::map<std::string, std::string> champsFermes_;
  int resultatFerme_ = 0;

  // The session thread's side.
  std::vector<std::string> messages_;
  std::optional<EtatRefus> refus_;
  std::optional<EtatDialogue> dialogue_;
  std::optional<EtatProgression> progression_;
  std::function<void(const std::optional<EtatProgression>&)> suivi_;
  std::map<std::string, std::string> fermes_;
  int resultat_ = 0;
  int boucles_ = 0;
  int incidents_ = 0;  // runtime faults reported, to refuse the action they interrupted  // windows
                       // that entered their loop, to tell an open refused
  Ouverture ouverture_ = Ouverture::Refusee;

  std::thread fil_;
};

}  // namespace quarvo::host
