#include "app/ScreenCommand.h"

#include <fstream>
#include <iostream>

#include "app/Workspace.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"

namespace quarvo::app {

using namespace host;

namespace {

struct Ligne {
  size_t numero;
  std::string texte;
  Action action;
};

// Every action of a script, read before any is played: a script that does not read as actions
// changes nothing.
std::vector<Ligne> lireScript(std::istream& in, const std::string& source) {
  std::vector<Ligne> lignes;
  std::string line;
  size_t numero = 0;
  while (std::getline(in, line)) {
    ++numero;
    std::string erreur;
    auto action = lireAction(line, &erreur);
    if (!action) {
      if (erreur.empty()) continue;
      throw UsageError(source + " line " + std::to_string(numero) + ": " + erreur);
    }
    lignes.push_back({numero, line, *action});
  }
  return lignes;
}

constexpr const char* kAide =
    "actions: set FIELD VALUE | cell LIST ROW COLUMN VALUE | select LIST ROW | tab NAME | "
    "press BUTTON | new LIST | delete LIST ROW | answer N|TEXT|PATH | close; quit ends\n";

}  // namespace

int runScreen(Session& session, const ScreenOptions& o, std::istream& in, bool interactive,
              std::ostream& out, std::ostream& err) {
  std::vector<Ligne> script;
  bool prompt = false;
  if (!o.script.empty() && o.script != "-") {
    std::ifstream file(o.script);
    if (!file) throw UsageError("cannot read the script " + o.script);
    script = lireScript(file, o.script);
  } else if (o.script == "-" || !interactive) {
    script = lireScript(in, "the standard input");
  } else {
    prompt = true;
  }

  auto imprimer = [&](const EtatEcrans& etat) {
    if (o.json) {
      out << enJson(etat) << "\n";
    } else {
      out << enTexte(etat);
    }
    out.flush();
  };

  // The waiting box goes to the terminal as a progress bar; everything else is in the state.
  ModeleEcran model(session, &session.ui(), false);
  auto ouverture =
      o.module.empty() ? model.ouvrir(o.name, o.args) : model.appeler(o.module, o.label, o.args);
  switch (ouverture) {
    case ModeleEcran::Ouverture::Inconnue:
      throw UsageError("unknown screen " + o.name + " (see 'quarvo automata')");
    case ModeleEcran::Ouverture::PasUnEcran:
      throw UsageError(o.name + " is not a screen: run it with 'quarvo run'");
    case ModeleEcran::Ouverture::Refusee:
      imprimer(model.etat());
      return 1;
    case ModeleEcran::Ouverture::Ouverte:
      break;
  }
  imprimer(model.etat());

  if (prompt) {
    err << kAide;
    std::string line;
    while (!model.etat().fenetres.empty()) {
      err << "> " << std::flush;
      if (!std::getline(in, line) || line == "quit") break;
      std::string erreur;
      auto action = lireAction(line, &erreur);
      if (!action) {
        if (!erreur.empty()) err << erreur << "\n" << kAide;
        continue;
      }
      model.agir(*action);
      imprimer(model.etat());
    }
    model.fermerTout();
    return 0;
  }

  for (const auto& ligne : script) {
    if (!o.json) out << "> " << ligne.texte << "\n";
    bool accepted = model.agir(ligne.action);
    imprimer(model.etat());
    if (!accepted) {
      err << "line " << ligne.numero
          << ": refused: " << (model.etat().refus ? model.etat().refus->texte : std::string("?"))
          << "\n";
      model.fermerTout();
      return 1;
    }
  }
  model.fermerTout();
  return 0;
}

int runLink(Session& session, const std::string& line, const std::string& modes, ScreenOptions o,
            std::istream& in, bool interactive, std::ostream& out, std::ostream& err) {
  if (modes.empty() || modes.find_first_not_of("VCMAvcma") != std::string::npos) {
    throw UsageError("--mode expects letters among V, C, M, A (and their lower case), not '" +
                     modes + "'");
  }
  // The budget is the one the line's number starts with.
  std::string budget;
  {
    Session::Scope scope(session);
    Table lignes(nullptr, "VOVOVA", "AFLBUD", "LINK");
    if (lignes.chercher(3, "IDENT", '=', Valeur::chaine(line)) != 0) {
      throw UsageError("unknown budget line " + line + " (see 'quarvo dump AFLBUD')");
    }
    std::string numero = lignes.valeur("NUMERO").toChaine();
    budget = numero.substr(0, numero.find('|'));
  }
  o.name = "QUARVO-GESTION";
  o.module = "QUARVO";
  o.label = "GESTION";
  o.args = {budget, line, modes};
  return runScreen(session, o, in, interactive, out, err);
}

}  // namespace quarvo::app
