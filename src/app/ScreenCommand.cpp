#include "app/ScreenCommand.h"

#include <fstream>
#include <iostream>

#include "app/Workspace.h"
#include "host/table/Table.h"
#include "host/ui/ModeleEcran.h"

namespace quarvo::app {

using namespace host;

namespace {

constexpr const char* kAide =
    "actions: set FIELD VALUE | cell LIST ROW COLUMN VALUE | select LIST ROW | tab NAME | "
    "press BUTTON | new LIST | delete LIST ROW | answer N|TEXT|PATH | close; quit ends\n";

}  // namespace

std::vector<LigneScript> lireScript(std::istream& in, const std::string& source) {
  std::vector<LigneScript> lignes;
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

std::vector<LigneScript> lireScript(const std::string& file, std::istream& standard) {
  if (file == "-") return lireScript(standard, "the standard input");
  std::ifstream in(file);
  if (!in) throw UsageError("cannot read the script " + file);
  return lireScript(in, file);
}

void imprimerEtat(const EtatEcrans& etat, bool json, std::ostream& out) {
  if (json) {
    out << enJson(etat) << "\n";
  } else {
    out << enTexte(etat);
  }
  out.flush();
}

int jouerScript(ModeleEcran& model, const std::vector<LigneScript>& script, bool json,
                std::ostream& out, std::ostream& err) {
  for (const auto& ligne : script) {
    if (!json) out << "> " << ligne.texte << "\n";
    bool accepted = model.agir(ligne.action);
    imprimerEtat(model.etat(), json, out);
    if (!accepted) {
      err << "line " << ligne.numero
          << ": refused: " << (model.etat().refus ? model.etat().refus->texte : std::string("?"))
          << "\n";
      return 1;
    }
  }
  return 0;
}

int runScreen(Session& session, const ScreenOptions& o, std::istream& in, bool interactive,
              std::ostream& out, std::ostream& err) {
  std::vector<LigneScript> script;
  bool prompt = false;
  if (!o.script.empty() || !interactive) {
    script = lireScript(o.script.empty() ? "-" : o.script, in);
  } else {
    prompt = true;
  }
  auto imprimer = [&](const EtatEcrans& etat) { imprimerEtat(etat, o.json, out); };

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
